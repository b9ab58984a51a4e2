# The command that registers: choice of object managers, options, failures, manners.
# shellcheck shell=sh
# shellcheck source=managers.sh
. ./managers.sh
: "${KORVA_SOURCE_DIR:?}"

called() { calls | sed 's/ .*//' | sort -u | tr '\n' ' '; }

RegistersWithEveryManagerThatIsInstalled() {
    with_sfcb
    with_pegasus
    register register
    expect_code 0
    expect_equal "the commands" "cimmof sfcbrepos sfcbstage " "$(called)"
}

RegistersWithTheNamedManagerOnly() {
    with_sfcb
    with_pegasus
    register --cimom=pegasus register
    expect_code 0
    expect_equal "the commands" "cimmof " "$(called)"
}

GoesOnWithTheNextManagerWhenOneFails() {
    with_sfcb
    with_pegasus
    echo "disk full" >"$managers/fail/sfcbstage"
    register register
    expect_code 1
    expect_equal "the commands" "cimmof sfcbstage " "$(called)"
}

FailsWithoutAnObjectManager() {
    register register
    expect_code 1
    expect_text "no object manager was found" "$output"
    expect_text "install one, or add the folder of its commands to PATH" "$output"
}

FailsWithoutTheNamedManager() {
    with_pegasus
    register --cimom sfcb register
    expect_code 1
    expect_text "the commands of sfcb are not installed" "$output"
}

ServesAPackageWithoutAnObjectManager() {
    register register --package
    expect_code 0
    expect_text "no object manager was found" "$output"
    expect_text "the package itself is in order" "$output"
}

ServesAPackageWhenTheManagerFails() {
    with_sfcb
    echo "disk full" >"$managers/fail/sfcbrepos"
    register register --package
    expect_code 0
    expect_text "sfcbrepos failed with exit status 3" "$output"
    expect_text "once an object manager is, run: korva-osstatus-register register" "$output"
}

DryRunTellsAndDoesNothing() {
    with_sfcb
    register --dry-run --only-companion register
    expect_code 0
    expect_calls ""
    expect_text "would run: sfcbstage -n root/cimv2 -r $tree/share/korva-osstatus/registration/" "$output"
    expect_text "would run: sfcbrepos -f" "$output"
}

TellsEachCommandBeforeItRuns() {
    with_sfcb
    register register
    expect_text "running: sfcbstage -n root/cimv2" "$output"
    expect_text "running: sfcbrepos -f" "$output"
}

NamesAMissingFileAndTheWayOut() {
    with_sfcb
    rm "$tree/share/korva-osstatus/schema/KORVA_RunningOS.mof"
    register --without-companion register
    expect_code 1
    expect_calls ""
    expect_text "cannot read $tree/share/korva-osstatus/schema/KORVA_RunningOS.mof" "$output"
    expect_text "install the package again, or name the tree that holds it with --prefix" "$output"
}

NamesAMissingPartOfItself() {
    with_sfcb
    rm "$tree/share/korva-osstatus/register/sfcb.sh"
    register register
    expect_code 1
    expect_calls ""
    expect_text "cannot read $tree/share/korva-osstatus/register/sfcb.sh, a part of this command" "$output"
    expect_text "install the package again" "$output"
    register --package register
    expect_code 0
    expect_text "cannot read $tree/share/korva-osstatus/register/sfcb.sh" "$output"
}

NamesAnUnusableFolderForTemporaryFiles() {
    with_sfcb
    temporary=/nowhere
    register register
    expect_code 1
    expect_calls ""
    expect_text "cannot make a temporary folder in /nowhere" "$output"
    expect_text "make room there or set TMPDIR" "$output"
    expect_no_text "install the package again" "$output"
}

ServesAPackageWithoutAFolderForTemporaryFiles() {
    with_sfcb
    temporary=/nowhere
    for operation in register unregister; do
        register --package "$operation"
        expect_code 0
        expect_text "cannot make a temporary folder in /nowhere" "$output"
    done
    expect_calls ""
}

TakesClassesFromTheNamedFolder() {
    with_sfcb
    mv "$tree/share/korva-osstatus/schema" "$work/classes"
    register --only-companion --schema-dir "$work/classes" register
    expect_code 0
    expect_text "$work/classes/KORVA_ComputerSystem.mof" "$(calls)"
}

WorksOnATreeWithBlanksInItsName() {
    with_sfcb
    mkdir "$work/my tree"
    mv "$tree/share" "$work/my tree/"
    cp -R "$work/my tree/share" "$tree/"
    register --prefix "$work/my tree" register
    expect_code 0
    expect_equal "the staged classes" 6 "$(find "$managers/var/lib/sfcb/stage/mofs" -name '*.mof' | wc -l)"
}

WorksThroughASymbolicLink() {
    with_sfcb
    ln -s "$tree/sbin/korva-osstatus-register" "$managers/bin/register"
    capture env -i PATH="$managers/bin:$tools" TMPDIR="$work/tmp" register --only-companion register
    expect_code 0
}

LeavesNoTemporaryFiles() {
    with_sfcb
    register --namespace root/other register
    echo "disk full" >"$managers/fail/sfcbrepos"
    register register
    expect_equal "what is left" "" "$(ls "$work/tmp")"
}

RefusesWrongUsage() {
    with_sfcb
    for arguments in "" "register unregister" "--frob register" "frob" "--namespace" "--namespace= register" \
        "--cimom other register" "--restart=yes register" "--agent-bits 64 register"; do
        # Split into arguments on purpose.
        # shellcheck disable=SC2086
        register $arguments
        [ "$code" -eq 2 ] || fail "status $code for '$arguments': $output"
        expect_text "run korva-osstatus-register --help for the usage" "$output"
    done
    expect_calls ""
}

RefusesOptionsOfOpenPegasusForSfcb() {
    with_sfcb
    with_pegasus
    for option in --repository=srv/x --interop=srv/x --agent-bits=32; do
        register --cimom sfcb "${option%=*}" "${option#*=}" register
        expect_code 2
        expect_text "${option%=*} is for OpenPegasus only, not for --cimom sfcb" "$output"
        register "$option" --cimom=sfcb register
        expect_code 2
    done
    expect_calls ""
}

RefusesNamesThatAreNoNamespaces() {
    with_sfcb
    for name in /root root/ root//cimv2 'root;id' 'a|b' 'a b' '../x'; do
        register --namespace "$name" register
        expect_code 2
        expect_text "not the name of a namespace: $name" "$output"
    done
    expect_calls ""
}

HelpNamesEveryOption() {
    register --help
    expect_code 0
    for option in --cimom --bare --namespace --interop --repository --agent-bits --with-companion --without-companion \
        --only-companion --restart --dry-run --package --prefix --schema-dir --help; do
        expect_text "  $option " "$output"
    done
}

RunsInEveryShell() {
    with_sfcb
    with_pegasus
    for shell in dash bash; do
        ! command -v "$shell" >/dev/null || ln -s "$(command -v "$shell")" "$tools/$shell"
    done
    for shell in "$tools"/*sh; do
        capture env -i PATH="$managers/bin:$tools" TMPDIR="$work/tmp" "$shell" \
            "$tree/sbin/korva-osstatus-register" register
        expect_code 0
    done
}

ShellScriptsAreWithoutFault() {
    need_tool shellcheck shellcheck
    packaging=$KORVA_SOURCE_DIR/packaging
    expect_success shellcheck -x "$packaging/korva-osstatus-register" "$packaging/build-packages" \
        "$packaging/try-packages" "$packaging"/try/*.sh "$packaging"/register/*.sh \
        "$packaging"/register/*.sh.in "$packaging"/debian/*/p*
    expect_success shellcheck stand-in ./*.sh
}
