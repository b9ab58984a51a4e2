# Object managers outside of PATH, as a package manager sees it, and what is told where they are not found.
# shellcheck shell=sh
# shellcheck source=managers.sh
. ./managers.sh
places=$tree/var/lib/korva-osstatus

sfcb_goes_out_of_path() { path=$tools; }

FindsAManagerAgainThatItRegisteredWith() {
    with_sfcb
    register register
    sfcb_goes_out_of_path
    forget_calls
    register --package --without-companion register
    expect_text "sfcbrepos -f" "$(calls)"
    register --package unregister
    expect_code 0
    expect_equal "what is staged" "" "$(ls "$managers/var/lib/sfcb/stage/regs")"
    [ ! -e "$places" ] || fail "what was remembered is left: $(ls "$places")"
}

FindsOpenPegasusAgainThatItRegisteredWith() {
    with_pegasus
    register register
    sfcb_goes_out_of_path
    register --package unregister
    expect_equal "the modules that are left" "" "$(cat "$managers/modules")"
    [ ! -e "$places" ] || fail "what was remembered is left: $(ls "$places")"
}

RemembersAManagerUntilBothPartsAreGone() {
    with_sfcb
    register register
    register --only-companion unregister
    expect_equal "what is remembered" "$managers/bin" "$(readlink "$places/sfcb")"
    register --without-companion unregister
    [ ! -e "$places" ] || fail "what was remembered is left: $(ls "$places")"
}

RemembersNothingOfADryRun() {
    with_sfcb
    register --dry-run register
    [ ! -e "$places" ] || fail "$(ls "$places") is remembered"
    register register
    register --dry-run unregister
    [ -e "$places/sfcb" ] || fail "it is forgotten"
}

PrefersTheManagerInPath() {
    with_sfcb
    register register
    mkdir "$work/other"
    mv "$managers/bin" "$work/other/bin"
    mkdir "$managers/bin" "$work/other/fail" "$work/other/says"
    path=$work/other/bin:$tools
    register --without-companion register
    expect_code 0
    expect_text "sfcbstage" "$(cat "$work/other/calls")"
}

RegistersWhereItCannotRemember() {
    with_sfcb
    echo file >"$tree/var"
    register register
    expect_code 0
    expect_text "cannot remember in $places that the commands of sfcb are in $managers/bin" "$output"
}

TellsCommandsThatAreThereWhenThePackageIsGone() {
    register --package unregister
    expect_code 0
    expect_text "the package goes all the same; where its provider is still registered, this takes it out:
    sfcbunstage -n root/cimv2 -r korva-osstatus-companion.reg KORVA_ComputerSystem.mof
    sfcbunstage -n root/cimv2 -r korva-osstatus.reg KORVA_OperatingSystem.mof\
 KORVA_OperatingSystemCapabilities.mof KORVA_InstalledOS.mof KORVA_RunningOS.mof KORVA_OSElementCapabilities.mof
    sfcbrepos -f
    cimprovider -d -m KorvaComputerSystemModule
    cimprovider -r -m KorvaComputerSystemModule
    cimprovider -d -m KorvaOSStatusModule
    cimprovider -r -m KorvaOSStatusModule" "$output"
    expect_no_text "run: korva-osstatus-register" "$output"
}

TellsTheCommandsOfTheManagerThatFailed() {
    with_sfcb
    with_pegasus
    register --without-companion --cimom sfcb --namespace root/other register
    echo "disk full" >"$managers/fail/sfcbunstage"
    register --without-companion --package unregister
    expect_code 0
    expect_text "this takes it out:
    sfcbunstage -n root/other -r korva-osstatus.reg" "$output"
    expect_no_text "cimprovider" "$output"
}
