# The command that registers: choice of object managers, options, failures, messages.
# shellcheck shell=sh
# shellcheck source=managers.sh
. ./managers.sh
: "${KORVA_SOURCE_DIR:?}"

called() { calls | sed 's/ .*//' | sort -u | paste -sd ' '; }
expect_told() { expect_equal "${row:-}the commands" "$1" "$(called)"; }
start_again() {
    rm -f "$managers"/bin/*
    start_afresh
}

# Each line: what is done before, the arguments, the status, the commands, and texts of the output.
choices() {
    registration=$tree/share/korva-osstatus/registration
    cat <<EOF
with_sfcb; with_pegasus|register|0|cimmof sfcbrepos sfcbstage
with_sfcb; with_pegasus|--cimom=pegasus register|0|cimmof
with_sfcb; with_pegasus; fails sfcbstage disk full|register|1|cimmof sfcbstage
|register|1||no object manager was found|install one, or add the folder of its commands to PATH
with_pegasus|--cimom sfcb register|1||the commands of sfcb are not installed
|register --package|0||no object manager was found|the package itself is in order
with_sfcb; fails sfcbrepos disk full|register --package|0|sfcbrepos sfcbstage sfcbunstage|sfcbrepos failed with exit status 3|once an object manager is, run: korva-osstatus-register register
with_sfcb|--dry-run --only-companion register|0||would run: sfcbstage -n root/cimv2 -r $registration/|would run: sfcbrepos -f
with_sfcb|register|0|sfcbrepos sfcbstage|running: sfcbstage -n root/cimv2|running: sfcbrepos -f
EOF
}

RegistersWithTheManagersThatAreThereOrNamed() { expect_rows choices; }

what_is_missing() {
    shared=$tree/share/korva-osstatus
    cat <<EOF
with_sfcb; temporary=/nowhere|register|1||cannot make a temporary folder in /nowhere|make room there or set TMPDIR
with_sfcb|--package register|0||cannot make a temporary folder in /nowhere
with_sfcb|--package unregister|0||cannot make a temporary folder in /nowhere
with_sfcb; temporary=$work/tmp; rm $shared/schema/KORVA_RunningOS.mof|--without-companion register|1||cannot read $shared/schema/KORVA_RunningOS.mof|install the package again, or name the tree that holds it with --prefix
with_sfcb; rm $shared/register/sfcb.sh|register|1||cannot read $shared/register/sfcb.sh, a part of this command|install the package again
with_sfcb|--package register|0||cannot read $shared/register/sfcb.sh
EOF
}

NamesWhatIsMissingAndTheWayOut() { expect_rows what_is_missing; }

DoesNotBlameThePackageForAFolderOfTheSystem() {
    with_sfcb
    temporary=/nowhere
    register register
    expect_no_text "install the package again" "$output"
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
    expect_success shellcheck -x "$packaging/korva-osstatus-register" "$packaging/build-packages" "$packaging/source-archive" \
        "$packaging/try-packages" "$packaging"/try/*.sh "$packaging"/register/*.sh \
        "$packaging"/register/*.sh.in "$packaging"/debian/*.p[or]* "$packaging/debian/manager-links"
    expect_success shellcheck stand-in ./*.sh
}
