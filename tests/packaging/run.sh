#!/bin/sh
# Runs one case: run.sh SCRIPT CASE. A case is a function of the script; it fails where a command does.
# Environment: KORVA_SOURCE_DIR, KORVA_BINARY_DIR, KORVA_WORD_SIZE.
set -eu
cd "$(dirname "$0")"

work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT
trap 'exit 1' HUP INT TERM

fail() {
    printf 'FAILED: %s\n' "$*" >&2
    exit 1
}

# expect_equal WHAT EXPECTED FOUND
expect_equal() {
    [ "$2" != "$3" ] || return 0
    printf '%s\n' "$2" >"$work/expected"
    printf '%s\n' "$3" >"$work/found"
    diff -u "$work/expected" "$work/found" >&2 || true
    fail "$1 differs"
}

# expect_text PART TEXT
expect_text() {
    case $2 in
        *"$1"*) ;;
        *) fail "'$1' is missing in: $2" ;;
    esac
}

expect_no_text() {
    case $2 in
        *"$1"*) fail "'$1' is in: $2" ;;
    esac
}

# Runs a command; output is all that it prints, code its exit status.
capture() {
    code=0
    output=$("$@" 2>&1) || code=$?
}

# expect_success COMMAND...: the same for one that must end with status 0.
expect_success() {
    capture "$@"
    [ "$code" -eq 0 ] || fail "status $code of $*: $output"
}

# need_tool COMMAND PACKAGE
need_tool() {
    command -v "$1" >/dev/null || fail "$1 is missing; it is in the package $2"
}

# shellcheck source=/dev/null
. "./$1"
"$2"
