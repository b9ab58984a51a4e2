# Registering with sfcb.
# shellcheck shell=sh
# shellcheck source=managers.sh
. ./managers.sh
with_sfcb

# The call that a word of a table stands for; with "elsewhere-" before it, for another namespace.
call_named() {
    provider="KORVA_OperatingSystem.mof KORVA_OperatingSystemCapabilities.mof KORVA_InstalledOS.mof\
 KORVA_RunningOS.mof KORVA_OSElementCapabilities.mof"
    case $1 in
        stage) echo "sfcbstage -n root/cimv2 -r SHARE/registration/korva-osstatus.reg" \
            "$(echo "$provider" | sed 's|KORVA|SHARE/schema/&|g')" ;;
        stage-companion) echo "sfcbstage -n root/cimv2 -r SHARE/registration/korva-osstatus-companion.reg" \
            "SHARE/schema/KORVA_ComputerSystem.mof" ;;
        unstage) echo "sfcbunstage -n root/cimv2 -r korva-osstatus.reg $provider" ;;
        unstage-companion) echo "sfcbunstage -n root/cimv2 -r korva-osstatus-companion.reg KORVA_ComputerSystem.mof" ;;
        repository) echo "sfcbrepos -f" ;;
        elsewhere-*) call_named "${1#elsewhere-}" |
            sed "s|-n root/cimv2|-n root/other|; s|SHARE/registration/|TMP/|" ;;
        *) echo "$1" | tr '_' ' ' ;;
    esac
}

staged() { ls "$managers/var/lib/sfcb/stage/regs"; }
classes_in() { ls "$managers/var/lib/sfcb/stage/mofs/$1"; }
registered() { register "$@" register && forget_calls; }

# Each line: what is done before, the operation, its status, what sfcb is told, and texts of the output.
registrations() {
    cat <<'EOF'
|--without-companion register|0|stage repository
|register|0|stage-companion stage repository
|--only-companion register|0|stage-companion repository
registered|register|0|stage-companion stage repository
registered|unregister|0|unstage-companion unstage repository
|unregister|0||sfcb: the provider is not registered
without_companion|register|0|stage repository
EOF
}

RegistersWhatItIsToldTo() { expect_rows registrations; }

restarts() {
    cat <<'EOF'
with_running systemctl sfcb.service|--without-companion register|0|stage repository|sfcb: the broker must be restarted before this takes effect
with_running systemctl sfcb.service|--without-companion --restart register|0|stage repository systemctl_restart_sfcb.service
with_running systemctl sblim-sfcb.service|--only-companion --restart register|0|stage-companion repository systemctl_restart_sblim-sfcb.service
with_running service sfcb|--only-companion --restart register|0|stage-companion repository service_sfcb_restart
with_running systemctl other.service|--only-companion --restart register|0|stage-companion repository|sfcb: no running broker was found; it reads this when it is started
with_running pgrep sfcbd|--only-companion --restart register|3|stage-companion repository|sfcbd runs, but not as a service|stop it and start it again; everything else is done
with_running pidof sfcbd|--only-companion --restart register|3|stage-companion repository|sfcbd runs, but not as a service|stop it and start it again; everything else is done
with_running pidof sfcbd; fails sfcbrepos disk full|--only-companion --restart register|1|stage-companion repository unstage-companion
with_running systemctl sfcb.service; fails systemctl sfcb.service is masked|--restart register|1|stage-companion stage repository systemctl_restart_sfcb.service|systemctl restart sfcb.service failed with exit status 3|    sfcb.service is masked|restart the broker by hand
EOF
}

RestartsARunningBrokerOnRequest() { expect_rows restarts; }

failures() {
    cat <<'EOF'
fails sfcbrepos CIM_ManagedElement is unknown|--without-companion register|1|stage repository unstage|sfcbrepos failed with exit status 3|    CIM_ManagedElement is unknown|the broker keeps its former repository; mend what sfcbrepos names
fails sfcbstage cannot write to the stage|--without-companion register|1|stage|sfcbstage failed with exit status 3|    cannot write to the stage|mend what it names and register again
EOF
}

NamesTheCommandThatFailsAndTheWayOut() { expect_rows failures; }

moves() {
    cat <<'EOF'
registered --without-companion --namespace root/other|--without-companion unregister|0|elsewhere-unstage repository
registered --without-companion --namespace root/other|--without-companion register|0|elsewhere-stage repository
registered --without-companion --namespace root/other|--without-companion --namespace root/cimv2 register|0|elsewhere-unstage stage repository|sfcb: the provider moves from root/other to root/cimv2
registered --without-companion; fails sfcbrepos root/other is unknown|--without-companion --namespace root/other register|1|unstage elsewhere-stage repository elsewhere-unstage stage
EOF
}

KnowsTheNamespaceThatItIsIn() {
    expect_rows moves
    register --without-companion --namespace root/other register
    register --without-companion --namespace root/cimv2 register
    expect_equal "the classes that are left" "" "$(classes_in root/other)"
    register --without-companion unregister
    expect_equal "what is staged" "" "$(staged)"
    expect_equal "the classes" "" "$(classes_in root/cimv2)"
}

StaysWhereItIsWhenAClassCannotBeRead() {
    registered --without-companion
    rm "$tree/share/korva-osstatus/schema/KORVA_RunningOS.mof"
    register --without-companion --namespace root/other register
    expect_code 1
    expect_calls ""
    expect_equal "what is staged" korva-osstatus.reg "$(staged)"
}

UnregistersTheCompanionAlone() {
    register register
    register --only-companion unregister
    expect_code 0
    expect_equal "what is staged" korva-osstatus.reg "$(staged)"
    register unregister
    expect_equal "what is staged" "" "$(staged)"
}

KeepsAnOlderRegistrationWhenTheRepositoryCannotBeBuilt() {
    register register
    fails sfcbrepos disk full
    register register
    expect_code 1
    expect_equal "what is staged" "korva-osstatus-companion.reg
korva-osstatus.reg" "$(staged)"
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
    fails sfcbrepos disk full
    register --without-companion register
    expect_code 1
    expect_equal "what is staged" "OperatingSystemProvider korzbosstatusprofileprovider" "$(staged_provider)"
}
