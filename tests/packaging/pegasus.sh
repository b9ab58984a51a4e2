# Registering with OpenPegasus.
# shellcheck shell=sh
# shellcheck source=managers.sh
. ./managers.sh
with_pegasus

# The call that a word of a table stands for; "offline-" for the compiler of a stopped server, "interop-"
# and "elsewhere-" for other namespaces.
call_named() {
    provider="KORVA_OperatingSystem KORVA_OperatingSystemCapabilities KORVA_InstalledOS KORVA_RunningOS\
 KORVA_OSElementCapabilities"
    case $1 in
        classes) echo "cimmof -uc -n root/cimv2" "$(echo "$provider" | sed 's|KORVA[^ ]*|SHARE/schema/&.mof|g')" ;;
        classes-companion) echo "cimmof -uc -n root/cimv2 SHARE/schema/KORVA_ComputerSystem.mof" ;;
        registration) echo "cimmof -uc -n root/PG_InterOp SHARE/registration/korva-osstatus-pegasus.mof" ;;
        registration-companion)
            echo "cimmof -uc -n root/PG_InterOp SHARE/registration/korva-osstatus-companion-pegasus.mof" ;;
        disable) echo "cimprovider -d -m KorvaOSStatusModule" ;;
        remove) echo "cimprovider -r -m KorvaOSStatusModule" ;;
        disable-companion | remove-companion) call_named "${1%-companion}" | sed 's/OSStatus/ComputerSystem/' ;;
        offline-*) call_named "${1#offline-}" | sed 's/^cimmof/cimmofl/' ;;
        interop-*) call_named "${1#interop-}" | sed 's|root/PG_InterOp|root/interop|' ;;
        elsewhere-*) call_named "${1#elsewhere-}" | sed 's|root/cimv2|root/korva|; s|SHARE/registration|TMP|' ;;
    esac
}

registered() { register "$@" register && forget_calls; }
has_module() { echo "$1    $2" >"$managers/modules"; }

# Each line: what is done before, the operation, its status, what OpenPegasus is told, and texts of the
# output.
registrations() {
    cat <<'EOF'
|register|0|classes-companion registration-companion classes registration
registered --only-companion|--only-companion register|0|classes-companion disable-companion remove-companion registration-companion
|--only-companion --interop root/interop register|0|classes-companion interop-registration-companion
|--only-companion --namespace root/korva register|0|elsewhere-classes-companion elsewhere-registration-companion
says cimmof Warning: KORVA_ComputerSystem: not updated, same Version|--only-companion register|0|classes-companion registration-companion|    cimmof: Warning: KORVA_ComputerSystem: not updated, same Version
registered|unregister|0|disable-companion remove-companion disable remove|OpenPegasus: the classes of the provider stay in root/cimv2
has_module KorvaOSStatusModule Stopped|--without-companion unregister|0|disable remove
has_module KorvaOSStatusModule2 OK|unregister|0||OpenPegasus: the provider is not registered
EOF
}

RegistersWhatItIsToldTo() {
    expect_rows registrations
    for module in "KorvaOSStatusModule    OK" "KorvaOSStatusModule    Stopped"; do
        echo "$module" >"$managers/modules"
        register --without-companion unregister
        expect_equal "the modules that are left" "" "$(cat "$managers/modules")"
    done
}

registrations_with_a_stopped_server() {
    cat <<'EOF'
|--only-companion register|0|offline-classes-companion offline-registration-companion|OpenPegasus: cimserver does not answer; its repository is written to directly
fails cimmofl CIM_ERR_ALREADY_EXISTS: PG_ProviderModule|--only-companion register|0|offline-classes-companion offline-registration-companion|OpenPegasus: root/PG_InterOp holds this already, and it stays as it is
half cimmofl CIM_ERR_FAILED: broken|--without-companion register|1|offline-classes offline-registration|once cimserver runs, see whether KorvaOSStatusModule is left: cimprovider -l|and take it out: cimprovider -r -m KorvaOSStatusModule
|unregister|1||OpenPegasus forgets a provider only while it runs|start cimserver and unregister again
rm "$managers/bin/cimmofl"|register|1||cimserver does not answer, and cimmofl|start cimserver and register again
EOF
}

WritesToTheRepositoryOfAStoppedServer() {
    start_again() { start_afresh && server_is_stopped; }
    expect_rows registrations_with_a_stopped_server
}

TakesOutWhatAFailedRegistrationLeft() {
    half cimmof CIM_ERR_FAILED: broken
    register --without-companion register
    expect_code 1
    expect_calls "$(for word in classes registration disable remove; do call_named $word; done)"
    expect_equal "the modules that are left" "" "$(cat "$managers/modules")"
    expect_text "what it left of the provider is taken out; the provider is not registered" "$output"
}

# Each line: what the compiler says of its failure, and the way out.
failures_of_the_compiler() {
    cat <<'EOF'
CIM_ERR_INVALID_NAMESPACE: root/cimv2|the namespace root/cimv2 does not exist: make it, or name another one
CIM_ERR_INVALID_SUPERCLASS: CIM_OperatingSystem|mend what it names and register again
disk full|mend what it names and register again
EOF
}

SpeaksOfTheNamespaceOnlyWhereItIsTheCause() {
    stand_in cimcli
    printf '%s\n' root root/cimv2 root/PG_InterOp >"$managers/namespaces"
    failures_of_the_compiler >"$work/failures"
    while IFS='|' read -r said way_out; do
        echo "$said" >"$managers/fail/cimmof"
        register --only-companion register
        expect_code 1
        expect_text "cimmof failed with exit status 3" "$output"
        expect_text "    $said" "$output"
        expect_text "korva-osstatus-register: $way_out" "$output"
        [ "$said" = "${said#*NAMESPACE}" ] || continue
        expect_no_text "namespace" "$output"
    done <"$work/failures"
}

# Each line: what is registered after a registration, and its options.
registrations_in_turn() {
    cat <<EOF
OSStatusFacade
OperatingSystemProvider --bare
OperatingSystemProvider --package
OSStatusFacade
OSStatusFacade --package
EOF
}

RegistersTheFacadeOrTheBareProvider() {
    registrations_in_turn >"$work/turns"
    while read -r expected options; do
        # Options, without blanks in them.
        # shellcheck disable=SC2086
        register --without-companion $options register
        expect_code 0
        expect_equal "the names in the registration after '$options'" "$expected" \
            "$(sed -n 's/^   ProviderName = "\(.*\)";/\1/p' "$managers/registration.mof" | sort -u)"
        expect_equal "the modules" "KorvaOSStatusModule    OK" "$(cat "$managers/modules")"
    done <"$work/turns"
    register --without-companion --bare register
    expect_text 'Location = "korzbosstatusprofileprovider";' "$(cat "$managers/registration.mof")"
    register --without-companion unregister
    expect_equal "the modules" "" "$(cat "$managers/modules")"
}
