# Registering with OpenPegasus: what is found out about the server before anything is changed.
# shellcheck shell=sh
# shellcheck source=managers.sh
. ./managers.sh
with_pegasus

registers() { register --without-companion "$@" register; }

# refused TEXT OPTION...: fails with this text, and nothing was changed.
refused() {
    expected=$1
    shift
    registers "$@"
    expect_code 1
    expect_text "$expected" "$output"
    expect_calls ""
}

# ---- libraries

# A library that is nothing but its word size, of which no loader can tell more.
library_has_bits() {
    rm "$tree/lib" "$tools/ldd"
    mkdir "$tree/lib"
    elf "$1" >"$tree/lib/libkorvaosstatusfacade.so"
}

RefusesALibraryThatTheServerDoesNotFind() {
    echo "lib:/usr/nowhere" >"$managers/providerDir"
    refused "OpenPegasus does not find the library of the provider, libkorvaosstatusfacade.so, in providerDir\
 (lib:/usr/nowhere)"
    expect_text "    cimconfig -s providerDir=lib:/usr/nowhere:$tree/lib -c
    cimconfig -s providerDir=lib:/usr/nowhere:$tree/lib -p" "$output"
    server_is_stopped
    refused "    cimconfig -s providerDir=lib:/usr/nowhere:$tree/lib -p"
    expect_no_text "$tree/lib -c" "$output"
    rm "$tree/lib"
    refused "it is not in $tree/lib either: install the package again"
}

RegistersWithoutKnowingWhereTheServerLooks() {
    rm "$managers/bin/cimconfig"
    registers
    expect_code 0
    expect_text "whether it finds libkorvaosstatusfacade.so is not known: cimconfig does not tell providerDir" "$output"
}

FindsALibraryInAFolderOfTheServersHome() {
    echo lib >"$managers/providerDir"
    capture env -i PATH="$path" TMPDIR="$temporary" PEGASUS_HOME="$tree" \
        "$tree/sbin/korva-osstatus-register" --without-companion register
    expect_code 0
}

RefusesALibraryThatLacksItsNeighbours() {
    mkdir "$work/alone"
    echo "$work/alone" >"$managers/providerDir"
    for name in libkorvaosstatusfacade libkorzbosstatusprofileprovider; do
        cp -L "$KORVA_BINARY_DIR/lib/$name.so" "$work/alone/"
    done
    refused "OpenPegasus cannot load the provider: $work/alone/libkorvaosstatusfacade.so needs lib"
    refused "OpenPegasus cannot load the provider: $work/alone/libkorzbosstatusprofileprovider.so needs lib" --bare
    expect_text "a provider that cannot be loaded breaks requests to others, so it is not registered" "$output"
}

RefusesWhatIsNoLibrary() {
    library_has_bits 64
    echo text >"$tree/lib/libkorvaosstatusfacade.so"
    refused "OpenPegasus cannot load the provider: $tree/lib/libkorvaosstatusfacade.so is no library"
}

# ---- word sizes

# Each line: word size of the library and of the server (0: not known), state of the server, its 32-bit
# agents, the option, and what comes of it: a Bitness in the registration, none, or a refusal.
word_sizes() {
    cat <<'EOF'
64 64 running without - none
64 64 stopped without - none
64 0 running without - none
64 32 running without - is a 64-bit library, and the process that loads it is 32-bit
64 64 running with 32 is a 64-bit library, and the process that loads it is 32-bit
32 32 running without - none
32 32 stopped without - none
32 64 running without - bitness
32 64 stopped with - bitness
32 64 stopped without - a 64-bit one without 32-bit agents (cimprovagt32)
32 64 stopped without 32 bitness
32 64 running with server is a 32-bit library, and the process that loads it is 64-bit
32 0 running without - bitness
32 0 stopped with - cimserver, which would tell its word size, is not found
32 0 stopped without server none
32 0 stopped without 32 bitness
EOF
}

# set_up LIBRARY SERVER STATE AGENTS
set_up() {
    elf "$1" >"$tree/lib/libkorvaosstatusfacade.so"
    rm -f "$managers/bin/cimserver" "$managers/bin/cimprovagt32" "$managers/fail/cimprovider" "$managers/modules"
    [ "$2" = 0 ] || server_has_bits "$2"
    [ "$3" = running ] || server_is_stopped
    [ "$4" = without ] || stand_in cimprovagt32
    forget_calls
}

BitnessIsForThe32BitAgentsOf64BitServersOnly() {
    library_has_bits 64
    word_sizes >"$work/sizes"
    while read -r library server state agents option expected; do
        set_up "$library" "$server" "$state" "$agents"
        row="$library $server $state $agents $option: "
        set --
        [ "$option" = - ] || set -- --agent-bits "$option"
        case $expected in
            none | bitness)
                registers "$@"
                expect_code 0
                found=none
                ! grep -q '^   Bitness = 2;$' "$managers/registration.mof" || found=bitness
                expect_equal "the registration" "$row$expected" "$row$found"
                ;;
            *) refused "$expected" "$@" ;;
        esac
    done <"$work/sizes"
}

TakesOutAModuleWhoseAgentsTheServerRefuses() {
    library_has_bits 32
    echo "CIM_ERR_NOT_SUPPORTED: Bitness" >"$managers/half/cimmof"
    set_up 32 64 running without
    registers
    expect_code 1
    expect_text "this 64-bit server runs no 32-bit providers: install the amd64 packages" "$output"
    expect_equal "the modules that are left" "" "$(cat "$managers/modules")"
    set_up 32 0 running without
    registers
    expect_code 1
    expect_text "this server knows no 32-bit agents: if it is a 32-bit one, register with --agent-bits server" "$output"
}

# ---- the repository and its namespaces

# A repository with these namespaces: make_repository FOLDER NAME...
make_repository() {
    repository=$1
    shift
    for name in "$@"; do mkdir -p "$repository/$name"; done
}

TakesTheRepositoryOrItsParent() {
    server_is_stopped
    make_repository "$work/Pegasus/repository" root root#cimv2 root#PG_InterOp
    for named in "$work/Pegasus" "$work/Pegasus/" "$work/Pegasus/repository" "$work/Pegasus/repository/"; do
        forget_calls
        register --only-companion --repository "$named" register
        expect_code 0
        expect_calls "cimmofl -R $work/Pegasus -uc -n root/cimv2 SHARE/schema/KORVA_ComputerSystem.mof
cimmofl -R $work/Pegasus -uc -n root/PG_InterOp SHARE/registration/korva-osstatus-companion-pegasus.mof"
    done
}

FindsARepositoryWhoseParentHasItsName() {
    server_is_stopped
    make_repository "$work/repository/repository" root root#cimv2 root#PG_InterOp
    registers --repository "$work/repository"
    expect_code 0
    expect_text "cimmofl -R $work/repository -uc" "$(cat "$managers/calls")"
}

RefusesToMakeASecondRepository() {
    server_is_stopped
    mkdir -p "$work/empty/repository"
    for named in "$work/empty" "$work/empty/repository" "$work/none"; do
        refused "neither $named nor $named/repository is a repository of OpenPegasus" --repository "$named"
    done
}

RefusesANamespaceThatIsMissing() {
    stand_in cimcli
    printf 'root\nroot/CIMV2\nroot/PG_InterOp\n' >"$managers/namespaces"
    registers
    expect_code 0
    forget_calls
    refused "OpenPegasus has no namespace root/other" --namespace root/other
    refused "OpenPegasus has no namespace interop" --interop interop
    expect_text "make it, or name another one (--namespace for the classes, --interop for registrations)" "$output"
}

TellsThatAFailureMayHaveMadeANamespace() {
    echo "CIM_ERR_INVALID_SUPERCLASS" >"$managers/fail/cimmof"
    registers --namespace root/other
    expect_code 1
    expect_text "if there was no namespace root/other before and there is one now, delete it" "$output"
}

RefusesANamespaceThatIsMissingInAStoppedServer() {
    server_is_stopped
    make_repository "$work/data/repository" root root#cimv2 root#PG_InterOp
    refused "OpenPegasus has no namespace root/other" --repository "$work/data" --namespace root/other
    echo "$work/data/repository" >"$managers/repositoryDir"
    refused "OpenPegasus has no namespace interop" --interop interop
    registers
    expect_code 0
}
