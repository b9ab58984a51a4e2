# The man pages, against what they describe.
# shellcheck shell=sh
: "${work:?}" "${KORVA_BINARY_DIR:?}" "${KORVA_SOURCE_DIR:?}"
pages=$KORVA_SOURCE_DIR/docs/man

# The text of a page, without marks.
text() { mandoc -Tascii "$pages/$1" | sed "s/.$(printf '\b')//g"; }

# Long options in a text, each once.
options_in() { grep -oE '(^|[^-[:alnum:]])--[a-z][a-z-]*' | grep -oE -e '--.*' | sort -u; }

PagesAreWithoutFault() {
    need_tool mandoc mandoc
    for page in "$pages"/*; do
        # Whether the pages that it refers to are installed is another matter.
        faults=$(mandoc -Tlint -Wstyle "$page" 2>/dev/null | grep -v 'referenced manual not found' || true)
        expect_equal "$(basename "$page")" "" "$faults"
    done
}

# The pages in a folder that refer to one of ours that is not there.
dead_references() {
    for page in "$1"/*; do
        sed -n 's/^\.\(.* \)\{0,1\}Xr \([^ ]*\) \([1-8]\).*/\2.\3/p' "$page" |
            grep -E '^(korva|cmpi|zblog)' | while read -r name; do
            [ -e "$1/$name" ] || echo "$(basename "$page"): $name"
        done
    done
}

PagesReferToPagesThatThereAre() {
    expect_equal "what is missing" "" "$(dead_references "$pages")"
    cp -R "$pages" "$work/pages"
    mv "$work/pages/zblog.conf.5" "$work/pages/zblog.conf.8"
    expect_text "korva-osstatus.7: zblog.conf.5" "$(dead_references "$work/pages")"
}

host=$KORVA_BINARY_DIR/bin/cmpihost

# The commands in the help of the host, and those with a help of their own: serve is another program.
commands() { "$host" --help | sed -n '/^Operations:/,/^Paths:/s/^  \([a-z][a-z]*\) .*/\1/p'; }
own_commands() { commands | grep -vx serve; }

PageOfTheHostHasItsOptions() {
    need_tool mandoc mandoc
    {
        "$host" --help
        for command in $(own_commands); do "$host" "$command" --help; done
    } | options_in >"$work/told"
    expect_equal options "$(cat "$work/told")" "$(text cmpihost.1 | options_in)"
}

PageOfTheHostHasItsCommands() {
    expect_equal commands "$(commands | sort)" \
        "$(sed -n '/^\.Ss Commands/,/^\.El/s/^\.It Cm \([a-z]*\).*/\1/p' "$pages/cmpihost.1" | sort)"
    [ "$(commands | wc -l)" -eq 17 ] || fail "not seventeen commands: $(commands)"
}

PageOfTheHostHasItsExitStatuses() {
    expect_equal statuses "$("$host" --help | sed -n '/^Exit status:/,$s/^  \([0-9]\)  .*/\1/p')" \
        "$(sed -n '/^\.Sh EXIT STATUS/,/^\.El/s/^\.It \([0-9]\)$/\1/p' "$pages/cmpihost.1")"
}

PageOfTheHostHasItsExamples() {
    need_tool mandoc mandoc
    for command in $(own_commands); do
        example=$("$host" "$command" --help | sed -n 's/^  \(cmpihost .*\)/\1/p')
        [ -n "$example" ] || fail "no example of $command"
        expect_text "$example" "$(text cmpihost.1)"
    done
}

PageOfTheServerHasItsOptionsAndExitStatuses() {
    need_tool mandoc mandoc
    server=$KORVA_BINARY_DIR/bin/cmpihost-serve
    [ "$KORVA_WORD_SIZE" = 64 ] || return 0
    "$server" --help >"$work/help"
    expect_equal options "$(options_in <"$work/help")" "$(text cmpihost-serve.1 | options_in)"
    expect_equal statuses "$(sed -n '/^Exit status:/,$s/^  \([0-9]\)  .*/\1/p' "$work/help")" \
        "$(sed -n '/^\.Sh EXIT STATUS/,/^\.El/s/^\.It \([0-9]\)$/\1/p' "$pages/cmpihost-serve.1")"
    expect_text "$(sed -n 's/^  \(cmpihost-serve .*\)/\1/p' "$work/help")" "$(text cmpihost-serve.1)"
}

PageOfTheRegisterCommandHasItsOptions() {
    need_tool mandoc mandoc
    "$KORVA_BINARY_DIR/sbin/korva-osstatus-register" --help | options_in >"$work/told"
    expect_equal options "$(cat "$work/told")" "$(text korva-osstatus-register.8 | options_in)"
}

PageOfTheConfigurationHasItsKeys() {
    grep -o '{"[a-z]*\.[a-z]*", Channel' "$KORVA_SOURCE_DIR/framework/logging/Configuration.cpp" |
        cut -d '"' -f 2 | sort >"$work/keys"
    expect_equal keys "$(cat "$work/keys")" \
        "$(sed -n 's/^\.It Cm \(log\.[a-z]*\) , \(trace\.[a-z]*\)$/\1 \2/p' "$pages/zblog.conf.5" | tr ' ' '\n' | sort)"
    [ "$(wc -l <"$work/keys")" -eq 8 ] || fail "not eight keys: $(cat "$work/keys")"
}
