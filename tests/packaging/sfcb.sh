# Registering with sfcb.
# shellcheck shell=sh
# shellcheck source=managers.sh
. ./managers.sh
with_sfcb

provider_mofs="SHARE/schema/KORVA_OperatingSystem.mof SHARE/schema/KORVA_OperatingSystemCapabilities.mof\
 SHARE/schema/KORVA_InstalledOS.mof SHARE/schema/KORVA_RunningOS.mof SHARE/schema/KORVA_OSElementCapabilities.mof"
stage_provider="sfcbstage -n root/cimv2 -r SHARE/registration/korva-osstatus.reg $provider_mofs"
stage_companion="sfcbstage -n root/cimv2 -r SHARE/registration/korva-osstatus-companion.reg\
 SHARE/schema/KORVA_ComputerSystem.mof"
unstage_provider="sfcbunstage -n root/cimv2 -r korva-osstatus.reg KORVA_OperatingSystem.mof\
 KORVA_OperatingSystemCapabilities.mof KORVA_InstalledOS.mof KORVA_RunningOS.mof KORVA_OSElementCapabilities.mof"
unstage_companion="sfcbunstage -n root/cimv2 -r korva-osstatus-companion.reg KORVA_ComputerSystem.mof"


# The same calls for another namespace.
elsewhere() { printf '%s\n' "$1" | sed "s|-n root/cimv2|-n root/other|; s|SHARE/registration/|TMP/|"; }

staged() { ls "$managers/var/lib/sfcb/stage/regs"; }

StagesTheClassesAndBuildsTheRepository() {
    register --without-companion register
    expect_code 0
    expect_calls "$stage_provider
sfcbrepos -f"
}

RegistersAnInstalledCompanionFirst() {
    register register
    expect_code 0
    expect_calls "$stage_companion
$stage_provider
sfcbrepos -f"
}

PassesOverACompanionThatIsNotInstalled() {
    without_companion
    register register
    expect_code 0
    expect_calls "$stage_provider
sfcbrepos -f"
}

RegistersTheCompanionAlone() {
    register --only-companion register
    expect_code 0
    expect_calls "$stage_companion
sfcbrepos -f"
}

RegistersAgainWithoutComplaint() {
    register register
    forget_calls
    register register
    expect_code 0
    expect_calls "$stage_companion
$stage_provider
sfcbrepos -f"
}

UnregistersWhatItRegistered() {
    register register
    forget_calls
    register unregister
    expect_code 0
    expect_calls "$unstage_companion
$unstage_provider
sfcbrepos -f"
    expect_equal "what is staged" "" "$(staged)"
}

UnregistersTheCompanionAlone() {
    register register
    register --only-companion unregister
    expect_code 0
    expect_equal "what is staged" korva-osstatus.reg "$(staged)"
}

UnregistersNothingWhereNothingIsRegistered() {
    register unregister
    expect_code 0
    expect_calls ""
    expect_text "sfcb: the provider is not registered" "$output"
}

SaysThatTheBrokerMustBeRestarted() {
    with_running systemctl sfcb.service
    register --without-companion register
    expect_calls "$stage_provider
sfcbrepos -f"
    expect_text "sfcb: the broker must be restarted before this takes effect" "$output"
}

RestartsARunningServiceOnRequest() {
    with_running systemctl sfcb.service
    register --without-companion --restart register
    expect_code 0
    expect_calls "$stage_provider
sfcbrepos -f
systemctl restart sfcb.service"
}

RestartsTheServiceByItsOtherName() {
    with_running systemctl sblim-sfcb.service
    register --only-companion --restart register
    expect_calls "$stage_companion
sfcbrepos -f
systemctl restart sblim-sfcb.service"
}

RestartsAServiceOfAnInitScript() {
    with_running service sfcb
    register --only-companion --restart register
    expect_calls "$stage_companion
sfcbrepos -f
service sfcb restart"
}

RestartsNothingThatDoesNotRun() {
    with_running systemctl other.service
    register --only-companion --restart register
    expect_code 0
    expect_calls "$stage_companion
sfcbrepos -f"
    expect_text "sfcb: no running broker was found; it reads this when it is started" "$output"
}

TellsOfABrokerThatOnlyItsStarterCanRestart() {
    for tool in pgrep pidof; do
        with_running "$tool" sfcbd
        register --only-companion --restart register
        expect_code 3
        expect_text "sfcbd runs, but not as a service" "$output"
        expect_text "stop it and start it again; everything else is done" "$output"
        rm "$managers/bin/$tool"
    done
    echo "disk full" >"$managers/fail/sfcbrepos"
    register --only-companion --restart register
    expect_code 1
}

FailsWhenTheRestartFails() {
    with_running systemctl sfcb.service
    echo "sfcb.service is masked" >"$managers/fail/systemctl"
    register --restart register
    expect_code 1
    expect_text "systemctl restart sfcb.service failed with exit status 3" "$output"
    expect_text "    sfcb.service is masked" "$output"
    expect_text "restart the broker by hand" "$output"
}

TakesBackWhatItStagedWhenTheRepositoryCannotBeBuilt() {
    echo "CIM_ManagedElement is unknown" >"$managers/fail/sfcbrepos"
    register --without-companion register
    expect_code 1
    expect_calls "$stage_provider
sfcbrepos -f
$unstage_provider"
    expect_text "sfcbrepos failed with exit status 3" "$output"
    expect_text "    CIM_ManagedElement is unknown" "$output"
    expect_text "the broker keeps its former repository; mend what sfcbrepos names" "$output"
}

KeepsAnOlderRegistrationWhenTheRepositoryCannotBeBuilt() {
    register register
    echo "disk full" >"$managers/fail/sfcbrepos"
    register register
    expect_code 1
    expect_equal "what is staged" "korva-osstatus-companion.reg
korva-osstatus.reg" "$(staged)"
}

NamesTheCommandThatFailsAndTheWayOut() {
    echo "cannot write to the stage" >"$managers/fail/sfcbstage"
    register --without-companion register
    expect_code 1
    expect_calls "$stage_provider"
    expect_text "sfcbstage failed with exit status 3" "$output"
    expect_text "    cannot write to the stage" "$output"
    expect_text "mend what it names and register again" "$output"
}

WritesAnotherNamespaceIntoTheRegistration() {
    register --only-companion --namespace root/korva register
    expect_code 0
    expect_calls "sfcbstage -n root/korva -r TMP/korva-osstatus-companion.reg SHARE/schema/KORVA_ComputerSystem.mof
sfcbrepos -f"
    expect_equal "the registration" "[KORVA_ComputerSystem]
   provider: ComputerSystemProvider
   location: korvacomputersystemprovider
   type: instance
   namespace: root/korva
#" "$(cat "$managers/var/lib/sfcb/stage/regs/korva-osstatus-companion.reg")"
}

classes_in() { ls "$managers/var/lib/sfcb/stage/mofs/$1"; }

UnregistersFromTheNamespaceThatItIsIn() {
    register --without-companion --namespace root/other register
    forget_calls
    register --without-companion unregister
    expect_code 0
    expect_calls "$(elsewhere "$unstage_provider")
sfcbrepos -f"
    expect_equal "what is staged" "" "$(staged)"
    expect_equal "the classes" "" "$(classes_in root/other)"
}

RegistersAgainInTheNamespaceThatItIsIn() {
    register --without-companion --namespace root/other register
    forget_calls
    register --without-companion register
    expect_code 0
    expect_calls "$(elsewhere "$stage_provider")
sfcbrepos -f"
}

MovesToTheNamespaceThatIsNamed() {
    register --without-companion --namespace root/other register
    forget_calls
    register --without-companion --namespace root/cimv2 register
    expect_code 0
    expect_calls "$(elsewhere "$unstage_provider")
$stage_provider
sfcbrepos -f"
    expect_text "sfcb: the provider moves from root/other to root/cimv2" "$output"
    expect_equal "the classes" "" "$(classes_in root/other)"
}

MovesBackWhenTheRepositoryCannotBeBuilt() {
    register --without-companion register
    forget_calls
    echo "root/other is unknown" >"$managers/fail/sfcbrepos"
    register --without-companion --namespace root/other register
    expect_code 1
    expect_calls "$unstage_provider
$(elsewhere "$stage_provider")
sfcbrepos -f
$(elsewhere "$unstage_provider")
$stage_provider"
}

StaysWhereItIsWhenAClassCannotBeRead() {
    register --without-companion register
    forget_calls
    rm "$tree/share/korva-osstatus/schema/KORVA_RunningOS.mof"
    register --without-companion --namespace root/other register
    expect_code 1
    expect_calls ""
    expect_equal "what is staged" korva-osstatus.reg "$(staged)"
}

# What is staged of the provider: its name and its library.
staged_provider() {
    sed -n 's/^   provider: //p; s/^   location: //p' "$managers/var/lib/sfcb/stage/regs/korva-osstatus.reg" |
        sort -u | paste -sd ' '
}

# Each line: what is staged after a registration, and its options.
registrations_in_turn() {
    cat <<EOF
facade
bare --bare
facade
bare --bare --namespace root/other
bare --package
facade --namespace root/cimv2
facade --package
bare --bare --package
EOF
}

RegistersTheFacadeOrTheBareProvider() {
    facade="OSStatusFacade korvaosstatusfacade"
    bare="OperatingSystemProvider korzbosstatusprofileprovider"
    registrations_in_turn >"$work/turns"
    while read -r expected options; do
        # Options, without blanks in them.
        # shellcheck disable=SC2086
        register --without-companion $options register
        expect_code 0
        case $expected in
            facade) expect_equal "what is staged after '$options'" "$facade" "$(staged_provider)" ;;
            bare) expect_equal "what is staged after '$options'" "$bare" "$(staged_provider)" ;;
        esac
    done <"$work/turns"
    register --without-companion unregister
    expect_equal "what is staged" "" "$(staged)"
}

BareStaysWhenTheRepositoryCannotBeBuiltWithTheFacade() {
    register --without-companion --bare register
    echo "disk full" >"$managers/fail/sfcbrepos"
    register --without-companion register
    expect_code 1
    expect_equal "what is staged" "OperatingSystemProvider korzbosstatusprofileprovider" "$(staged_provider)"
}
