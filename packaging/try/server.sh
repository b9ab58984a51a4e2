# Tries the package of the endpoint: what its unit would start answers wbemcli.
# shellcheck shell=sh
# Functions are run by check, and dpkg-query fills in what stands in its format.
# shellcheck disable=SC2317,SC2016
# shellcheck source=system.sh
. "$(dirname "$0")/system.sh"
: "${architecture:?}" "${packages:?}" "${work:?}" "${root:?}" "${status:?}"
own="korva-osstatus-provider korva-osstatus-companion korva-osstatus-server"
unit=$root/lib/systemd/system/korva-osstatus-server.service
link=$root/etc/systemd/system/sockets.target.wants/korva-osstatus-server.socket
url=http://localhost:5988/root/cimv2

# The packages go in twice: as they are, and as later ones.
bring_packages() {
    mkdir "$root/packages" "$root/later"
    for name in $own; do
        package=$(echo "$packages/${name}"_*_"$architecture.deb")
        cp "$package" "$root/packages/"
        make_later "$package" "$root/later/"
    done
    inside apt-get -y --no-install-recommends install sblim-wbemcli
}

known_packages() { inside dpkg-query -W -f '${db:Status-Abbrev} ${Package}\n' | grep '^i' | sort; }

opens_no_port_by_itself() {
    [ -z "$(find "$root/etc/systemd" -name 'korva-osstatus-server*')" ]
    ! pgrep_endpoint
}
# The processes of the system whose program is that of the endpoint.
pgrep_endpoint() { find /proc -maxdepth 2 -name exe -lname "$root/usr/bin/cmpihost-serve" 2>/dev/null | grep .; }

# Without rights, as the unit has it, and with its command line.
start() {
    : >"$work/told"
    command=$(sed -n 's/^ExecStart=//p' "$unit")
    # A command line, to be split.
    # shellcheck disable=SC2086
    inside setpriv --reuid 65534 --regid 65534 --clear-groups --no-new-privs $command 2>"$work/told" &
    for _ in 1 2 3 4 5 6 7 8 9 10; do
        grep -q "listening on http://127.0.0.1:5988" "$work/told" && break
        sleep 0.5
    done
    cat "$work/told"
    pgrep_endpoint | cut -d / -f 3 >"$work/endpoint"
}

runs_without_rights() { [ "$(sed -n 's/^Uid:\t\([0-9]*\)\t.*/\1/p' "/proc/$(cat "$work/endpoint")/status")" = 65534 ]; }

asks_the_system() {
    check "wbemcli ei KORVA_OperatingSystem" shows 'Name="Debian GNU/Linux",.*Version="12"' \
        wbemcli ei "$url:KORVA_OperatingSystem"
}

stop() {
    kill -TERM "$(cat "$work/endpoint")"
    for _ in 1 2 3 4 5 6 7 8 9 10; do
        pgrep_endpoint || return 0
        sleep 0.5
    done
    return 1
}

# As systemctl does.
enable() {
    mkdir -p "$(dirname "$link")"
    ln -s /lib/systemd/system/korva-osstatus-server.socket "$link"
}

upgrade() {
    inside sh -c 'apt-get -y install /later/*.deb'
    inside dpkg-query -W -f '${Version}' korva-osstatus-server | grep -q '+later$'
}

is_enabled_as_before() {
    [ "$(find "$root/etc/systemd" -name 'korva-osstatus-server*')" = "$link" ]
    [ -e "$root/$(readlink "$link")" ]
}

# What is left are packages of others, and those of Debian that the endpoint needed.
nothing_is_left() {
    inside apt-get -y --purge autoremove
    known_packages | diff "$work/packages.before" -
    ! find "$root" -xdev \( -name '*cmpihost-serve*' -o -name 'korva-osstatus*' \) | grep -Ev "^$root/(packages|later)/"
}

check "the packages, and wbemcli" bring_packages
known_packages >"$work/packages.before"
check "apt-get install" inside sh -c 'apt-get -y install /packages/*.deb'
check "no port is opened by that" opens_no_port_by_itself
check "the command of the unit, without rights" start
check "... runs as nobody" runs_without_rights
asks_the_system
check "wbemcli ein CIM_OperatingSystem" shows 'KORVA_OperatingSystem[.].*Name="Debian GNU/Linux"$' \
    wbemcli ein "$url:CIM_OperatingSystem"
check "wbemcli ain to the computer system" shows 'KORVA_ComputerSystem' \
    wbemcli ain -ac KORVA_RunningOS "http://$(inside wbemcli ein "$url:KORVA_OperatingSystem" 2>/dev/null)"
check "SIGTERM ends it" stop
check "its socket is enabled" enable
check "apt-get install of the later version" upgrade
check "the socket is enabled as before" is_enabled_as_before
check "the command of the later unit" start
asks_the_system
check "SIGTERM ends it" stop
# The names are meant to be split.
# shellcheck disable=SC2086
check "apt-get purge" inside apt-get -y purge $own
check "nothing is left behind" nothing_is_left
exit "$status"
