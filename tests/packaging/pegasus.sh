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

WritesToTheRepositoryThatIsNamed() {
    server_is_stopped
    register --only-companion --repository /srv/repository register
    expect_calls "cimmofl -R /srv/repository -uc -n root/cimv2 $companion_mof
cimmofl -R /srv/repository -uc -n root/PG_InterOp $companion_registration"
}

TakesARegistrationThatAStoppedServerHasForDone() {
    server_is_stopped
    echo "CIM_ERR_ALREADY_EXISTS: PG_ProviderModule" >"$managers/fail/cimmofl"
    register --only-companion register
    expect_code 0
    expect_text "OpenPegasus: root/PG_InterOp holds this already" "$output"
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

NamesTheNamespaceThatMayBeMissing() {
    echo "CIM_ERR_INVALID_NAMESPACE" >"$managers/fail/cimmof"
    register --only-companion --interop interop register
    expect_code 1
    expect_text "cimmof failed with exit status 3" "$output"
    expect_text "does the namespace root/cimv2 exist?" "$output"
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

TellsWhatIsRegistered() {
    register --without-companion register
    register status
    expect_code 1
    expect_equal output "OpenPegasus: the companion is not registered
OpenPegasus: the provider is registered" "$output"
    register --without-companion status
    expect_code 0
}

TellsNothingOfAStoppedServer() {
    server_is_stopped
    register status
    expect_code 1
    expect_equal output "OpenPegasus: cimserver does not answer" "$output"
}
