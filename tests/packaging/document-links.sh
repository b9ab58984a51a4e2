# What follows the links of the documents.
# shellcheck shell=sh
: "${work:?}" "${KORVA_SOURCE_DIR:?}"

# Writes a document, and another one that it may link to: follow LINE...
follow() {
    mkdir -p "$work/docs"
    printf '%s\n' "# There it is" "" "\`\`\`sh" "# a comment" "\`\`\`" >"$work/docs/there.md"
    printf '%s\n' "$@" >"$work/page.md"
    capture sh "$KORVA_SOURCE_DIR/tests/links.sh" "$work/page.md"
}

LinksThatLeadSomewhereAreFollowed() {
    follow "## Of its own, \`code\` too" "[file](docs/there.md), [folder](docs)" \
        "[heading](docs/there.md#there-it-is) [own](#of-its-own-code-too)" "[far](https://localhost/x)"
    expect_equal "output" "" "$output"
    expect_equal "the status" 0 "$code"
}

LinkToNoFileIsNamed() {
    follow "[there](docs/there.md) and [nowhere](docs/nowhere.md)"
    expect_equal "output" "$work/page.md: docs/nowhere.md leads to no file" "$output"
    expect_equal "the status" 1 "$code"
}

LinkToNoHeadingIsNamed() {
    follow "[comment](docs/there.md#a-comment) [own](#nothing)"
    expect_equal "output" "$work/page.md: docs/there.md#a-comment leads to no heading
$work/page.md: #nothing leads to no heading" "$output"
    expect_equal "the status" 1 "$code"
}

WhatIsShownIsNotFollowed() {
    follow "\`\`\`" "[shown](nowhere.md)" "\`\`\`" "and \`[code](nowhere.md)\`"
    expect_equal "the status" 0 "$code"
}

DocumentsHaveNoDeadLinks() {
    cd "$KORVA_SOURCE_DIR" || fail "no folder $KORVA_SOURCE_DIR"
    expect_success sh tests/links.sh ./*.md docs/*.md docs/dev/*.md
}
