# What becomes of a machine that the Debian packages are installed on. That machine is a folder, with the
# few commands in it that the packages' scripts need.
# shellcheck shell=sh
# shellcheck source=packed.sh
. ./packed.sh
machine=$work/machine

as_root() { if [ "$(id -u)" -eq 0 ]; then "$@"; else unshare --user --map-root-user "$@"; fi; }

on_machine() {
    expect_success as_root dpkg --root="$machine" --force-depends --no-pager "$@"
}

# Copies a command and the libraries that it needs.
bring() {
    file=$(command -v "$1")
    cp -L "$file" "$machine/usr/bin/"
    ldd "$file" | grep -o '/[^ ]*' | while read -r library; do
        mkdir -p "$machine$(dirname "$library")"
        cp -Ln "$library" "$machine$library"
    done
}

set_up_machine() {
    mkdir -p "$machine/usr/bin" "$machine/dev" "$machine/tmp" "$machine/var/log"
    mkdir -p "$machine/var/lib/dpkg/info" "$machine/var/lib/dpkg/updates" "$machine/var/lib/dpkg/triggers"
    mkdir -p "$machine/etc/alternatives" "$machine/var/lib/dpkg/alternatives"
    touch "$machine/var/lib/dpkg/status" "$machine/var/log/alternatives.log" "$machine/dev/null"
    ln -s usr/bin "$machine/bin"
    ln -s ../var "$machine/usr/var"
    for name in sh basename cat cp dirname grep id ln mkdir mktemp mv od readlink rm rmdir sed touch tr \
        update-alternatives; do
        bring $name
    done
    for name in "$architecture" "$other"; do
        [ "$name" = "$(dpkg --print-architecture)" ] || on_machine --add-architecture "$name"
    done
}

set_up_machine

with_sfcb() {
    for name in sfcbstage sfcbunstage sfcbrepos; do cp stand-in "$machine/usr/bin/$name"; done
    mkdir -p "$machine/usr/fail"
}

# What sfcb was told, by the names of the files.
calls() { sed 's| /[^ ]*/| |g; s| -n root/cimv2||; s| KORVA.*||' "$machine/usr/calls"; }
expect_told() { expect_equal "what sfcb was told" "$1" "$(calls)"; }
forget_calls() { rm -f "$machine/usr/calls"; }

# All that is on the machine, except what dpkg and the stand-ins remember.
everything() {
    (cd "$machine" && find . ! -path './var/lib/*' ! -path ./usr/calls | LC_ALL=C sort)
}

# install NAME...: the packages of these names.
install() {
    # Names of files, without blanks.
    # shellcheck disable=SC2046
    on_machine -i $(for name in "$@"; do package "$name"; done)
}
install_all() { install provider companion dev tools; }

# remove_all -r|-P
remove_all() {
    on_machine "$1" korva-osstatus-tools korva-osstatus-dev korva-osstatus-companion korva-osstatus-provider
}

state_of() { dpkg-query --admindir="$machine/var/lib/dpkg" -W -f '${db:Status-Status}' "korva-osstatus-$1"; }

InstallationRegistersProviderAndCompanion() {
    with_sfcb
    install_all
    for name in provider companion dev tools; do
        expect_equal "the state of $name" installed "$(state_of $name)"
    done
    expect_told "sfcbstage -r korva-osstatus.reg
sfcbrepos -f
sfcbstage -r korva-osstatus-companion.reg
sfcbrepos -f"
    expect_text "sfcb: the broker must be restarted" "$output"
}

InstallationRegistersTheFacade() {
    with_sfcb
    install provider
    expect_equal "what is staged" "location: korvaosstatusfacade
provider: OSStatusFacade" \
        "$(sed -n 's/^ *\(provider:\|location:\)/\1/p' "$machine/var/lib/sfcb/stage/regs/korva-osstatus.reg" | sort -u)"
    expect_equal "its library" "/usr/lib/$triplet/cmpi/libkorvaosstatusfacade.so" \
        "$(as_root chroot "$machine" /usr/bin/readlink -f /usr/lib/cmpi/libkorvaosstatusfacade.so | sed 's/.1.0.0$//')"
}

InstallationNeedsNoObjectManager() {
    install_all
    expect_equal "the state of the provider" installed "$(state_of provider)"
    expect_text "no object manager was found" "$output"
}

InstallationSurvivesAFailingObjectManager() {
    with_sfcb
    echo "the schema is missing" >"$machine/usr/fail/sfcbrepos"
    install_all
    expect_equal "the state of the provider" installed "$(state_of provider)"
    expect_text "the schema is missing" "$output"
}

InstallationTellsThatRegisteringFailed() {
    on_machine --unpack "$(package provider)"
    printf '#!/bin/sh\nexit 1\n' >"$machine/usr/sbin/korva-osstatus-register"
    on_machine --configure korva-osstatus-provider
    expect_equal "the state of the provider" installed "$(state_of provider)"
    expect_text "korva-osstatus-provider: registering failed; mend what is told above, then run:\
 korva-osstatus-register register" "$output"
    on_machine -r korva-osstatus-provider
    expect_text "korva-osstatus-provider: unregistering failed" "$output"
}

InstalledHostReportsTheOperatingSystem() {
    install_all
    expect_success env -i "$machine/usr/bin/cmpihost" \
        --provider "$machine/usr/lib/$triplet/cmpi/libkorvaosstatusfacade.so" ein KORVA_OperatingSystem
    expect_text 'KORVA_OperatingSystem.CSCreationClassName="KORVA_ComputerSystem"' "$output"
}

RemovalUnregistersAndLeavesNothing() {
    with_sfcb
    everything >"$work/before"
    install_all
    forget_calls
    remove_all -r
    expect_told "sfcbunstage -r korva-osstatus-companion.reg
sfcbrepos -f
sfcbunstage -r korva-osstatus.reg
sfcbrepos -f"
    touch "$machine/var/log/korva-osstatus.log" "$machine/var/log/korva-osstatus.log.1.gz" \
        "$machine/var/log/korva-osstatus.log-20261121" "$machine/var/log/korva-osstatus-other.log-20261121.gz"
    on_machine -P korva-osstatus-provider
    expect_equal "the machine" "$(cat "$work/before")" "$(everything)"
}

# As with a package manager that has a PATH of its own.
RemovalFindsAnObjectManagerOutsideOfPath() {
    everything >"$work/before"
    install_all
    mkdir -p "$machine/opt/sfcb/bin" "$machine/opt/sfcb/fail"
    for name in sfcbstage sfcbunstage sfcbrepos; do cp stand-in "$machine/opt/sfcb/bin/$name"; done
    expect_success as_root env PATH="$PATH:/opt/sfcb/bin" chroot "$machine" /usr/sbin/korva-osstatus-register register
    regs=$machine/opt/sfcb/var/lib/sfcb/stage/regs
    expect_equal "what is staged" "korva-osstatus-companion.reg
korva-osstatus.reg" "$(ls "$regs")"
    remove_all -P
    expect_equal "what is staged" "" "$(ls "$regs")"
    [ ! -e "$machine/var/lib/korva-osstatus" ] || fail "$(ls "$machine/var/lib/korva-osstatus") is left"
    rm -r "$machine/opt"
    expect_equal "the machine" "$(cat "$work/before")" "$(everything)"
}

PurgeForgetsWhereObjectManagersWere() {
    install provider
    mkdir "$machine/var/lib/korva-osstatus"
    ln -s /opt/gone "$machine/var/lib/korva-osstatus/sfcb"
    on_machine -r korva-osstatus-provider
    expect_text "sfcbunstage -n root/cimv2 -r korva-osstatus.reg" "$output"
    on_machine -P korva-osstatus-provider
    [ ! -e "$machine/var/lib/korva-osstatus" ] || fail "$(ls "$machine/var/lib/korva-osstatus") is left"
}

UpgradeKeepsTheBareProvider() {
    with_sfcb
    install provider
    register_on_machine --bare
    install_later_provider
    expect_text "provider: OperatingSystemProvider" "$(cat "$machine/var/lib/sfcb/stage/regs/korva-osstatus.reg")"
}

RemovalOfTheCompanionKeepsTheProviderRegistered() {
    with_sfcb
    install_all
    forget_calls
    on_machine -r korva-osstatus-companion
    expect_told "sfcbunstage -r korva-osstatus-companion.reg
sfcbrepos -f"
    expect_equal "what is staged" korva-osstatus.reg "$(ls "$machine/var/lib/sfcb/stage/regs")"
}

RemovalSurvivesAFailingObjectManager() {
    with_sfcb
    install_all
    echo "disk full" >"$machine/usr/fail/sfcbunstage"
    remove_all -P
    expect_text "sfcbunstage failed with exit status 3" "$output"
    [ ! -e "$machine/usr/sbin/korva-osstatus-register" ] || fail "the command is still there"
}

# Installs the provider's package as a later version.
install_later_provider() {
    dpkg-deb -R "$(package provider)" "$work/later"
    sed -i 's/^Version: .*/Version: 1.0.1-1/' "$work/later/DEBIAN/control"
    dpkg-deb --root-owner-group -b "$work/later" "$work/later.deb" >/dev/null
    on_machine -i "$work/later.deb"
}

UpgradeRegistersAgainAndUnregistersNothing() {
    with_sfcb
    install provider
    forget_calls
    install_later_provider
    expect_told "sfcbstage -r korva-osstatus.reg
sfcbrepos -f"
    expect_equal "the state of the provider" installed "$(state_of provider)"
}

# register_on_machine OPTION...
register_on_machine() { expect_success as_root chroot "$machine" /usr/sbin/korva-osstatus-register "$@" register; }

UpgradeKeepsTheNamespaceThatTheClassesAreIn() {
    with_sfcb
    install provider
    register_on_machine --namespace root/other
    forget_calls
    install_later_provider
    expect_told "sfcbstage -n root/other -r korva-osstatus.reg
sfcbrepos -f"
    forget_calls
    on_machine -r korva-osstatus-provider
    expect_told "sfcbunstage -n root/other -r korva-osstatus.reg
sfcbrepos -f"
}

UpgradeKeepsAChangedRotation() {
    install provider
    echo "# ours" >>"$machine/etc/logrotate.d/korva-osstatus"
    install_later_provider
    expect_text "# ours" "$(cat "$machine/etc/logrotate.d/korva-osstatus")"
}

# Makes one of the packages that of the other architecture, as far as its places go: other_package NAME
other_package() {
    dpkg-deb -R "$(package "$1")" "$work/other"
    mv "$work/other/usr/lib/$triplet" "$work/other/usr/lib/$other_triplet"
    sed -i "s/^Architecture: .*/Architecture: $other/; s/$triplet/$other_triplet/" \
        "$work/other/DEBIAN/control" "$work/other/DEBIAN"/p*
    dpkg-deb --root-owner-group -b "$work/other" "$work/$1-other.deb" >/dev/null
    rm -r "$work/other"
    echo "$work/$1-other.deb"
}

# What object managers find is what is in the folder of that architecture: expect_links TRIPLET
expect_links() {
    for name in libkorvaosstatusfacade libkorzbosstatusprofileprovider libkorvacomputersystemprovider; do
        expect_equal "the link to $name" "/usr/lib/$1/cmpi/$name.so.1.0.0" \
            "$(as_root chroot "$machine" /usr/bin/readlink -f "/usr/lib/cmpi/$name.so")"
    done
}

install_both_architectures() {
    with_sfcb
    install provider companion
    on_machine -i "$(other_package provider)" "$(other_package companion)"
}

ArchitectureThatComesSecondLeavesTheLinksAndTellsWhatSwitches() {
    install_both_architectures
    expect_text "korva-osstatus: /usr/lib/cmpi keeps leading to /usr/lib/$triplet/cmpi.
korva-osstatus: for /usr/lib/$other_triplet/cmpi instead, run this and restart the object manager:
    update-alternatives --set korva-osstatus /usr/lib/$other_triplet/cmpi/libkorvaosstatusfacade.so" "$output"
    expect_links "$triplet"
    expect_success as_root chroot "$machine" /usr/bin/update-alternatives --set korva-osstatus \
        "/usr/lib/$other_triplet/cmpi/libkorvaosstatusfacade.so"
    expect_links "$other_triplet"
    install provider companion
    expect_links "$other_triplet"
}

ArchitectureThatStaysTakesTheLinksAndIsStillRegistered() {
    install_both_architectures
    forget_calls
    on_machine -P "korva-osstatus-companion:$architecture" "korva-osstatus-provider:$architecture"
    expect_links "$other_triplet"
    [ ! -e "$machine/usr/calls" ] || fail "sfcb was told: $(calls)"
    on_machine -P "korva-osstatus-companion:$other" "korva-osstatus-provider:$other"
    expect_told "sfcbunstage -r korva-osstatus-companion.reg
sfcbrepos -f
sfcbunstage -r korva-osstatus.reg
sfcbrepos -f"
    [ ! -e "$machine/usr/lib/cmpi" ] || fail "$(ls "$machine/usr/lib/cmpi") is left"
}
