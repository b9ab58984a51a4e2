# Sourced by run and check: says what is done, how far it is, and after what time.
# shellcheck shell=sh

started=$(date +%s)
elapsed() { echo $(($(date +%s) - started)); }
step() { echo "== $* (after $(elapsed) s)"; }

# Keeps what comes in in a log. Of a build or a test run it tells how far it is: all the time on a terminal,
# else about ten times.
progress() {
    told=0
    while IFS= read -r line; do
        printf '%s\n' "$line"
        count=${line#"${line%%[![ ]*}"}
        case $count in
            [0-9]*/[0-9]*"] "* | [0-9]*/[0-9]*" Test "*) ;;
            *) continue ;;
        esac
        finished=${count%%/*}
        total=${count#*/}
        total=${total%%[] ]*}
        if [ -t 3 ]; then
            printf '\r   %s of %s (after %s s) ' "$finished" "$total" "$(elapsed)" >&3
            [ "$finished" -lt "$total" ] || echo >&3
        elif [ $((10 * finished / total)) -gt "$told" ]; then
            told=$((10 * finished / total))
            echo "   $finished of $total (after $(elapsed) s)" >&3
        fi
    done 3>&1 >"$1"
}

# build PRESET LOG [TARGET...]: configures, with $configure_options, and builds; says the end of the log when
# that fails.
build() {
    preset=$1
    log=$2
    shift 2
    mkdir -p build
    rm -f build/failed
    [ $# -eq 0 ] || set -- --target "$@"
    {
        # Options, to be split.
        # shellcheck disable=SC2086
        { cmake --preset "$preset" ${configure_options:-} && NINJA_STATUS='[%f/%t] ' cmake --build --preset "$preset" "$@"; } 2>&1 ||
            touch build/failed
    } | progress "$log"
    [ -e build/failed ] || return 0
    rm build/failed
    echo "The end of $log:" >&2
    tail -n 60 "$log" >&2
    exit 1
}
