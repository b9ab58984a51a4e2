# Sourced by the cases about object managers: an installed tree, and stand-ins for the managers.
# shellcheck shell=sh
: "${work:?}" "${KORVA_BINARY_DIR:?}" "${KORVA_WORD_SIZE:?}"

tree=$work/tree
managers=$work/managers
tools=$work/tools
temporary=$work/tmp
path=$managers/bin:$tools

# What the command under test may use besides object managers.
tool_names="basename cat cp dirname grep id ldd ln mkdir mktemp mv od readlink rm rmdir sed touch tr"

prepare() {
    mkdir -p "$managers/bin" "$managers/fail" "$managers/half" "$managers/says" "$tools" "$temporary" \
        "$tree/share/korva-osstatus"
    for name in $tool_names; do ln -s "$(command -v "$name")" "$tools/$name"; done
    cp -R "$KORVA_BINARY_DIR/sbin" "$tree/"
    for folder in schema registration register; do
        cp -R "$KORVA_BINARY_DIR/share/korva-osstatus/$folder" "$tree/share/korva-osstatus/"
    done
    ln -s "$KORVA_BINARY_DIR/lib" "$tree/lib"
    : >"$managers/calls"
}

without_companion() { rm "$tree"/share/korva-osstatus/registration/korva-osstatus-companion*; }

stand_in() {
    for name in "$@"; do cp stand-in "$managers/bin/$name"; done
}

# fails COMMAND TEXT, half COMMAND TEXT, says COMMAND TEXT: how a stand-in does its work from now on.
behaves() {
    manner=$1
    name=$2
    shift 2
    echo "$*" >"$managers/$manner/$name"
}
fails() { behaves fail "$@"; }
half() { behaves half "$@"; }
says() { behaves says "$@"; }

with_sfcb() { stand_in sfcbstage sfcbunstage sfcbrepos; }
with_running() {
    stand_in "$1"
    echo "$2" >"$managers/active"
}

# elf WORD-SIZE: the beginning of a program or library.
elf() { if [ "$1" = 32 ]; then printf '\177ELF\001'; else printf '\177ELF\002'; fi; }

server_has_bits() {
    elf "$1" >"$managers/bin/cimserver"
    chmod +x "$managers/bin/cimserver"
}

with_pegasus() {
    stand_in cimmof cimmofl cimprovider cimconfig
    echo "/usr/nowhere:$tree/lib" >"$managers/providerDir"
    server_has_bits "$KORVA_WORD_SIZE"
}
server_is_stopped() { echo "cimserver does not answer" >"$managers/fail/cimprovider"; }

# Runs the command under test with the stand-ins; see capture.
register() {
    capture env -i PATH="$path" TMPDIR="$temporary" "$tree/sbin/korva-osstatus-register" "$@"
}

expect_code() { [ "$code" -eq "$1" ] || fail "${row:-}status $code, not $1: $output"; }

# The recorded calls, with names for the folders, and nothing of what only asks.
calls() {
    sed "/^cimprovider -l/d; /^cimconfig/d; /^cimcli/d; /^wbemcli/d; /^p[gi]/d; /is-active/d; /status$/d
        s|$tree/share/korva-osstatus|SHARE|g; s|$work/tmp/[^/]*|TMP|g" "$managers/calls"
}

forget_calls() { : >"$managers/calls"; }

expect_calls() { expect_equal "${row:-}what the object manager was told" "$1" "$(calls)"; }

# Nothing is registered, runs or fails any more.
start_afresh() {
    rm -rf "${managers:?}/var" "${tree:?}/var" "$managers/active" "$managers/modules" "$managers/registration.mof"
    rm -f "$managers"/fail/* "$managers"/half/* "$managers"/says/*
    for name in systemctl service pgrep pidof; do rm -f "$managers/bin/$name"; done
    forget_calls
}
start_again() { start_afresh; }

# expect_told WORDS: the calls that they stand for in the tables of a script.
expect_told() { expect_calls "$(for word in $1; do call_named "$word"; done)"; }

# expect_rows TABLE: each line has what is done before, the arguments, the status, what the object manager
# is told, and texts of the output.
expect_rows() {
    "$1" >"$work/rows"
    while IFS='|' read -r before arguments status words texts <&3; do
        row="'$before' '$arguments': "
        start_again
        eval "$before"
        # Options, without blanks in them.
        # shellcheck disable=SC2086
        register $arguments
        expect_code "$status"
        expect_told "$words"
        while [ -n "$texts" ]; do
            expect_text "${texts%%|*}" "$output"
            case $texts in *'|'*) texts=${texts#*|} ;; *) texts= ;; esac
        done
    done 3<"$work/rows"
    row=
    start_again
}

prepare
