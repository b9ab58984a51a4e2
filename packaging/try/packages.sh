# Tries the packages of one architecture on one system.
# shellcheck shell=sh
# Functions are run by check, and dpkg-query fills in what stands in its format.
# shellcheck disable=SC2317,SC2016
# shellcheck source=system.sh
. "$(dirname "$0")/system.sh"
: "${architecture:?}" "${packages:?}" "${work:?}" "${root:?}" "${log:?}" "${status:?}"
stand_in=$(dirname "$0")/../../tests/packaging/stand-in
manager=/opt/manager
own="korva-osstatus-provider korva-osstatus-companion korva-osstatus-dev korva-osstatus-tools"

# The packages go in twice: as they are, and as later ones.
bring_packages() {
    mkdir "$root/packages" "$root/later"
    for name in $own; do
        package=$(echo "$packages/${name}"_*_"$architecture.deb")
        cp "$package" "$root/packages/"
        make_later "$package" "$root/later/"
    done
}

# An object manager that keeps what it is told, outside of the PATH that apt has.
bring_object_manager() {
    mkdir -p "$root$manager/bin" "$root$manager/fail" "$root$manager/says"
    for name in sfcbstage sfcbunstage sfcbrepos; do cp "$stand_in" "$root$manager/bin/$name"; done
}

# All that the system holds: kinds, rights and owners, then the contents; but for the state, caches and
# logs of the package manager.
everything() {
    (
        cd "$root"
        set -- . -xdev \( -path ".$manager" -o -path ./var/lib/dpkg -o -path ./var/lib/apt -o -path ./var/cache/apt \
            -o -path ./var/cache/debconf -o -path ./var/cache/ldconfig -o -path ./var/log/apt \
            -o -path ./var/log/dpkg.log -o -path ./var/log/alternatives.log \) -prune -o
        find "$@" -printf '%y %m %u %g %p %l\n' | LC_ALL=C sort
        find "$@" -type f -exec cksum {} + | LC_ALL=C sort -k 3
    )
}

# Names of the packages that are installed, or that left something.
known_packages() { inside dpkg-query -W -f '${Package}\n' | sort; }
installed_version() { inside dpkg-query -W -f '${db:Status-Status} ${Version}' "$1"; }

# ---- the checks

install_from() { inside sh -c "apt-get -y install /$1/*.deb"; }

only_the_packages_came() {
    known_packages >"$work/packages.now"
    # The names are meant to be split.
    # shellcheck disable=SC2086
    printf '%s\n' $own | sort - "$work/packages.before" | diff - "$work/packages.now"
}

all_have_version() {
    for name in $own; do
        [ "$(installed_version "$name")" = "installed $1" ] || {
            echo "$name: $(installed_version "$name"), not $1"
            return 1
        }
    done
}

# The fifth byte of a binary tells its word size.
has_word_size_of_the_architecture() {
    class=2
    [ "$architecture" = amd64 ] || class=1
    for file in bin/cmpihost lib/cmpi/libkorvaosstatusfacade.so lib/cmpi/libkorzbosstatusprofileprovider.so \
        lib/cmpi/libkorvacomputersystemprovider.so lib/*/libvaprovider.so.1; do
        [ "$(inside sh -c "od -An -tu1 -j4 -N1 /usr/$file" | tr -d ' ')" = "$class" ] || {
            echo "$file has another word size"
            return 1
        }
    done
}

asks_the_host() {
    check "cmpihost ei KORVA_OperatingSystem shows this Debian" \
        shows '^  Name  +Debian GNU/Linux$' cmpihost ei KORVA_OperatingSystem
    check "... and its version" shows '^  Version  +12$' cmpihost ei KORVA_OperatingSystem
    check "cmpihost ein KORVA_OperatingSystem" shows ',Name="Debian GNU/Linux"$' cmpihost ein KORVA_OperatingSystem
    path=$(inside cmpihost ein KORVA_OperatingSystem 2>>"$log") || true
    check "cmpihost ai from it to the computer system" \
        shows '^  CreationClassName  +KORVA_ComputerSystem$' cmpihost ai "$path" --assoc-class KORVA_RunningOS
    check "cmpihost rin from it, which the facade answers" shows '^root/cimv2:KORVA_RunningOS[.]' cmpihost rin "$path"
    check "cmpihost tree" shows 'Debian GNU/Linux 12 .KORVA_OperatingSystem.: Enabled' cmpihost tree
}

# ---- the registration

register() { inside env PATH="/usr/sbin:/usr/bin:$manager/bin" korva-osstatus-register "$@"; }

# The name and the library that the object manager was told of, in the repository that it built.
has_registered() {
    for line in "provider: $1" "location: $2"; do
        grep -q "^ *$line\$" "$root$manager/var/lib/sfcb/registration/providerRegister" || {
            echo "no line '$line'"
            return 1
        }
    done
}

has_registered_facade() { has_registered OSStatusFacade korvaosstatusfacade; }
has_registered_bare() { has_registered OperatingSystemProvider korzbosstatusprofileprovider; }
has_registered_nothing() { [ ! -s "$root$manager/var/lib/sfcb/registration/providerRegister" ]; }

has_man_pages() {
    for page in man1/cmpihost.1 man5/zblog.conf.5 man7/korva-osstatus.7 man8/korva-osstatus-register.8; do
        gzip -t "$root/usr/share/man/$page.gz"
    done
}

keeps_a_log_where_the_configuration_says() {
    cp "$root/usr/share/korva-osstatus/examples/zblog.conf" "$root/etc/zblog.conf"
    inside cmpihost ein KORVA_OperatingSystem
    rm "$root/etc/zblog.conf"
    grep -q ' trace 4000 Zumbrel.OperatingSystemProvider ' "$root/var/log/korva-osstatus.log"
}

nothing_is_left() {
    everything | diff "$work/before" -
    known_packages | diff "$work/packages.before" -
}

check "packages of a later version" bring_packages
check "an object manager that keeps what it is told" bring_object_manager
version=$(dpkg-deb -f "$(find "$root/packages" -name '*-provider_*.deb')" Version)
everything >"$work/before"
known_packages >"$work/packages.before"

check "apt-get install" install_from packages
check "nothing but the packages came in" only_the_packages_came
check "all of them have version $version" all_have_version "$version"
check "word size of $architecture" has_word_size_of_the_architecture
asks_the_host
check "man pages" has_man_pages
check "a log where /etc/zblog.conf says" keeps_a_log_where_the_configuration_says

check "korva-osstatus-register --bare register" register --bare register
check "the object manager knows the provider itself" has_registered_bare
check "korva-osstatus-register register" register register
check "the object manager knows the facade" has_registered_facade
check "korva-osstatus-register status" register status

echo "# ours" >>"$root/etc/logrotate.d/korva-osstatus"
check "apt-get install of the later version" install_from later
check "all of them have version $version+later" all_have_version "$version+later"
check "a changed configuration was kept" grep -q '^# ours$' "$root/etc/logrotate.d/korva-osstatus"
check "the object manager knows the facade" has_registered_facade
asks_the_host

# The names are meant to be split.
# shellcheck disable=SC2086
check "apt-get purge" inside apt-get -y purge $own
check "the object manager knows nothing of it any more" has_registered_nothing
check "nothing is left behind" nothing_is_left
exit "$status"
