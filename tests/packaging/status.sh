# What the command that registers tells of a registration, and whether the broker answers.
# shellcheck shell=sh
# shellcheck source=managers.sh
. ./managers.sh

register_provider() { register --without-companion "$@" register; }
no_client="; whether it answers is not known: no client (wbemcli, cimcli) is installed"

# expect_status CODE OUTPUT
expect_status() {
    register --without-companion status
    expect_equal "output" "$2" "$output"
    expect_code "$1"
}

SfcbTellsEachPart() {
    with_sfcb
    register_provider
    register status
    expect_code 1
    expect_equal output "sfcb: the companion is not registered
sfcb: the provider (OSStatusFacade in root/cimv2) is staged and in the repository$no_client" "$output"
    expect_status 0 "sfcb: the provider (OSStatusFacade in root/cimv2) is staged and in the repository$no_client"
}

SfcbTellsFormAndNamespace() {
    with_sfcb
    register_provider --bare --namespace root/other
    expect_status 0 \
        "sfcb: the provider (OperatingSystemProvider in root/other) is staged and in the repository$no_client"
}

SfcbTellsWhatTheRepositoryWasNotBuiltWith() {
    with_sfcb
    register_provider
    built=$managers/var/lib/sfcb/registration/providerRegister
    sed 's/OSStatusFacade/OperatingSystemProvider/' "$built" >"$work/older"
    for content in /dev/null "$work/older"; do
        cp "$content" "$built"
        expect_status 1 "sfcb: the provider (OSStatusFacade in root/cimv2) is staged, but not in the\
 repository: run sfcbrepos -f, restart the broker"
    done
}

SfcbTellsWhatIsLeftInTheRepository() {
    with_sfcb
    register_provider
    echo "disk full" >"$managers/fail/sfcbrepos"
    register --without-companion unregister
    expect_code 1
    expect_status 1 "sfcb: the provider is in the repository, but no longer staged: run sfcbrepos -f, restart the broker"
}

# Each line: status expected, that of the client, end of the sentence, and what the client prints.
answers_of_clients() {
    cat <<'EOF'
0|0|, and answers|localhost:5988/root/cimv2:korva_operatingsystem.Name="Debian"
1|3|, but does not answer: wbemcli: Cim: (6) CIM_ERR_NOT_FOUND: not loadable|* wbemcli: Cim: (6) CIM_ERR_NOT_FOUND: not loadable
1|3|, but does not answer: cimcli CIM_ERR_FAILED: broken|cimcli CIM_ERR_FAILED: broken
1|0|, but answers with no instance|
0|3|; whether it answers is not known: wbemcli: Http Exception: Couldn't connect|* wbemcli: Http Exception: Couldn't connect
EOF
}

# expect_answers CLIENT SUBJECT
expect_answers() {
    stand_in "$1"
    answers_of_clients >"$work/answers"
    while IFS='|' read -r expected end clause printed; do
        rm -f "$managers/fail/$1" "$managers/says/$1"
        kind=says
        [ "$end" = 0 ] || kind=fail
        printf '*\n%s\n' "$printed" >"$managers/$kind/$1"
        expect_status "$expected" "$2$clause"
    done <"$work/answers"
}

SfcbIsAskedThroughAClient() {
    with_sfcb
    register_provider
    forget_calls
    for client in cimcli wbemcli; do
        expect_answers "$client" "sfcb: the provider (OSStatusFacade in root/cimv2) is staged and in the repository"
    done
    expect_equal "what the clients were told" "cimcli ni -l localhost:5988 -n root/cimv2 KORVA_OperatingSystem
wbemcli ein http://localhost:5988/root/cimv2:KORVA_OperatingSystem" "$(sort -u "$managers/calls")"
}

OpenPegasusIsAskedThroughAClient() {
    with_pegasus
    register_provider
    forget_calls
    for client in wbemcli cimcli; do
        expect_answers "$client" "OpenPegasus: the provider (OSStatusFacade) is registered"
    done
    expect_equal "what the clients were told" "cimcli ni -n root/cimv2 KORVA_OperatingSystem
wbemcli ein http://localhost:5988/root/cimv2:KORVA_OperatingSystem" \
        "$(grep -E '^(cimcli ni|wbemcli)' "$managers/calls" | sort -u)"
}

OpenPegasusTellsEachPart() {
    with_pegasus
    register_provider --bare
    register status
    expect_code 1
    expect_equal output "OpenPegasus: the companion is not registered
OpenPegasus: the provider (OperatingSystemProvider) is registered$no_client" "$output"
}

OpenPegasusTellsOfADisabledModule() {
    with_pegasus
    register_provider
    echo "KorvaOSStatusModule    Stopped" >"$managers/modules"
    expect_status 1 "OpenPegasus: the provider (OSStatusFacade) is registered, but disabled (Stopped):\
 cimprovider -e -m KorvaOSStatusModule enables it"
}

OpenPegasusTellsOfALibraryThatCannotBeLoaded() {
    with_pegasus
    register_provider
    known="OpenPegasus: the provider (OSStatusFacade) is registered, but cannot be loaded: $tree/lib/libkorvaosstatusfacade.so"
    rm "$tree/lib"
    mkdir "$tree/lib"
    cp -L "$KORVA_BINARY_DIR/lib/libkorvaosstatusfacade.so" "$tree/lib/"
    register --without-companion status
    expect_code 1
    expect_text "$known needs libkorzbosstatusprofileprovider.so.1, which is not found" "$output"
    elf 64 >"$tree/lib/libkorvaosstatusfacade.so"
    server_has_bits 32
    expect_status 1 "$known is a 64-bit library, and the process that loads it is 32-bit"
}

OpenPegasusTellsOfALibraryThatItDoesNotFind() {
    with_pegasus
    register_provider
    echo /usr/nowhere >"$managers/providerDir"
    register --without-companion status
    expect_code 1
    expect_text "OpenPegasus does not find the library of the provider, libkorvaosstatusfacade.so, in\
 providerDir (/usr/nowhere)" "$output"
}

OpenPegasusTellsNothingWhileItIsStopped() {
    with_pegasus
    server_is_stopped
    expect_status 1 "OpenPegasus: cimserver does not answer"
}
