# Registering with OpenPegasus.
# shellcheck shell=sh
# shellcheck source=managers.sh
. ./managers.sh
with_pegasus

provider_mofs="SHARE/schema/KORVA_OperatingSystem.mof SHARE/schema/KORVA_OperatingSystemCapabilities.mof\
 SHARE/schema/KORVA_InstalledOS.mof SHARE/schema/KORVA_RunningOS.mof SHARE/schema/KORVA_OSElementCapabilities.mof"
companion_mof=SHARE/schema/KORVA_ComputerSystem.mof
provider_registration=SHARE/registration/korva-osstatus-pegasus.mof
companion_registration=SHARE/registration/korva-osstatus-companion-pegasus.mof

CompilesClassesAndRegistrations() {
    register register
    expect_code 0
    expect_calls "cimmof -uc -n root/cimv2 $companion_mof
cimmof -uc -n root/PG_InterOp $companion_registration
cimmof -uc -n root/cimv2 $provider_mofs
cimmof -uc -n root/PG_InterOp $provider_registration"
}

ReplacesAFormerRegistration() {
    register --only-companion register
    forget_calls
    register --only-companion register
    expect_code 0
    expect_calls "cimmof -uc -n root/cimv2 $companion_mof
cimprovider -d -m KorvaComputerSystemModule
cimprovider -r -m KorvaComputerSystemModule
cimmof -uc -n root/PG_InterOp $companion_registration"
}

WritesToTheRepositoryOfAStoppedServer() {
    server_is_stopped
    register --only-companion register
    expect_code 0
    expect_calls "cimmofl -uc -n root/cimv2 $companion_mof
cimmofl -uc -n root/PG_InterOp $companion_registration"
    expect_text "OpenPegasus: cimserver does not answer; its repository is written to directly" "$output"
}

TakesARegistrationThatAStoppedServerHasForDone() {
    server_is_stopped
    echo "CIM_ERR_ALREADY_EXISTS: PG_ProviderModule" >"$managers/fail/cimmofl"
    register --only-companion register
    expect_code 0
    expect_text "OpenPegasus: root/PG_InterOp holds this already, and it stays as it is" "$output"
}

SaysThatAStoppedServerNeedsItsOtherCompiler() {
    server_is_stopped
    rm "$managers/bin/cimmofl"
    register register
    expect_code 1
    expect_calls ""
    expect_text "cimserver does not answer, and cimmofl" "$output"
    expect_text "start cimserver and register again" "$output"
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

ShowsWhatTheCompilerSaysThoughItDidItsWork() {
    echo "Warning: KORVA_ComputerSystem: not updated, same Version" >"$managers/says/cimmof"
    register --only-companion register
    expect_code 0
    expect_text "    cimmof: Warning: KORVA_ComputerSystem: not updated, same Version" "$output"
}

TakesOutWhatAFailedRegistrationLeft() {
    echo "CIM_ERR_FAILED: broken" >"$managers/half/cimmof"
    register --without-companion register
    expect_code 1
    expect_calls "cimmof -uc -n root/cimv2 $provider_mofs
cimmof -uc -n root/PG_InterOp $provider_registration
cimprovider -d -m KorvaOSStatusModule
cimprovider -r -m KorvaOSStatusModule"
    expect_equal "the modules that are left" "" "$(cat "$managers/modules")"
    expect_text "what it left of the provider is taken out; the provider is not registered" "$output"
}

TellsHowToTakeOutWhatAFailedRegistrationLeftInAStoppedServer() {
    server_is_stopped
    echo "CIM_ERR_FAILED: broken" >"$managers/half/cimmofl"
    register --without-companion register
    expect_code 1
    expect_text "once cimserver runs, see whether KorvaOSStatusModule is left: cimprovider -l" "$output"
    expect_text "and take it out: cimprovider -r -m KorvaOSStatusModule" "$output"
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

UsesTheInteropNamespaceThatIsNamed() {
    register --only-companion --interop root/interop register
    expect_calls "cimmof -uc -n root/cimv2 $companion_mof
cimmof -uc -n root/interop $companion_registration"
}

WritesAnotherNamespaceIntoTheRegistration() {
    register --only-companion --namespace root/korva register
    expect_calls "cimmof -uc -n root/korva $companion_mof
cimmof -uc -n root/PG_InterOp TMP/korva-osstatus-companion-pegasus.mof"
}

RemovesTheModulesOnUnregistration() {
    register register
    forget_calls
    register unregister
    expect_code 0
    expect_calls "cimprovider -d -m KorvaComputerSystemModule
cimprovider -r -m KorvaComputerSystemModule
cimprovider -d -m KorvaOSStatusModule
cimprovider -r -m KorvaOSStatusModule"
    expect_equal "the modules that are left" "" "$(cat "$managers/modules")"
    expect_text "OpenPegasus: the classes of the provider stay in root/cimv2" "$output"
}

RemovesAModuleThatIsDisabledAlready() {
    echo "KorvaOSStatusModule    Stopped" >"$managers/modules"
    register --without-companion unregister
    expect_code 0
    expect_equal "the modules that are left" "" "$(cat "$managers/modules")"
}

LeavesModulesOfSimilarNamesAlone() {
    echo "KorvaOSStatusModule2    OK" >"$managers/modules"
    register unregister
    expect_code 0
    expect_calls ""
    expect_text "OpenPegasus: the provider is not registered" "$output"
}

CannotUnregisterWhileTheServerIsStopped() {
    server_is_stopped
    register unregister
    expect_code 1
    expect_text "OpenPegasus forgets a provider only while it runs" "$output"
    expect_text "start cimserver and unregister again" "$output"
}
