# The installed examples, built with the installed development package, and the guide that goes through them.
# shellcheck shell=sh
: "${work:?}" "${KORVA_BINARY_DIR:?}" "${KORVA_SOURCE_DIR:?}" "${KORVA_WORD_SIZE:?}"
tree=$work/destination/usr
install_tree() { DESTDIR=$work/destination expect_success cmake --install "$KORVA_BINARY_DIR" --prefix /usr; }
export CXXFLAGS="-m$KORVA_WORD_SIZE -Wall -Wextra -Wpedantic -Wshadow -Wconversion -Werror"
guide=$KORVA_SOURCE_DIR/docs/writing-a-provider.md
# The lines of the guide's blocks that are marked so.
blocks() { awk -v mark="\`\`\`$1" '/^```/ { inside = $0 == mark; next } inside' "$guide"; }

build_example() {
    install_tree
    expect_success cmake -S "$tree/share/korva-osstatus/examples/mounted-filesystems" -B "$work/build" \
        -DCMAKE_PREFIX_PATH="$tree"
    expect_success cmake --build "$work/build"
}

ExampleIsBuiltAndItsTestsPass() {
    build_example
    expect_success ctest --test-dir "$work/build" --output-on-failure
    expect_text "100% tests passed, 0 tests failed out of 2" "$output"
}

ExampleExportsNothingButItsFactories() {
    build_example
    expect_equal "the exported symbols" "MountedFileSystemProvider_Create_AssociationMI
MountedFileSystemProvider_Create_InstanceMI" \
        "$(nm -D --defined-only --format=posix "$work/build/libexamplemountedfilesystems.so" | cut -d ' ' -f 1 | LC_ALL=C sort)"
}

ExampleAnswersFromWhereItIsInstalled() {
    build_example
    expect_success cmake --install "$work/build" --prefix "$tree"
    own=$tree/share/mounted-filesystems
    shipped=$tree/share/korva-osstatus
    expect_success "$tree/bin/cmpihost" --schema "$own" --registration "$own" \
        --schema "$shipped/schema" --registration "$shipped/registration" ein EXAMPLE_MountedFileSystem
    expect_text 'Name="/' "$output"
}

GuideLeadsFromAnEmptyFolderToAnswers() {
    install_tree
    blocks shell >"$work/commands"
    blocks text >"$work/promised"
    mkdir "$work/empty"
    cd "$work/empty" || fail "no folder"
    PATH=$tree/bin:$PATH PREFIX=$tree expect_success sh -eu "$work/commands"
    printf '%s\n' "$output" | sed "s/\"$(uname -n)\"/\"vm\"/g" >"$work/printed"
    expect_equal "what the guide promises, and is not printed" "" \
        "$(grep -vxF -f "$work/printed" "$work/promised")"
}

ExcerptsOfTheGuideAreInTheExample() {
    { blocks mof && blocks cpp && blocks reg; } >"$work/excerpts"
    [ "$(wc -l <"$work/excerpts")" -gt 15 ] || fail "the excerpts of the guide are not found"
    cat "$KORVA_SOURCE_DIR"/examples/mounted-filesystems/*.* >"$work/example"
    expect_equal "what the example does not have" "" "$(grep -vxF -f "$work/example" "$work/excerpts")"
}

FaultsOfTheGuideAreThoseThatTheHostCatches() {
    # Backquotes, not commands.
    # shellcheck disable=SC2016
    # The first column of the table: patterns between backquotes, whose fixed parts stand between "…".
    sed -n '/^| `caught:` |/,/^$/s/^| \(.*`\) | .*/\1/p' "$guide" |
        sed 1d | tr '`' '\n' | sed 's/…/\n/g' | sed 's/^[ ,:]*//; s/[ ,:]*$//' | grep . | sort -u >"$work/parts"
    [ "$(wc -l <"$work/parts")" -gt 20 ] || fail "the table of the guide is not found"
    while read -r part; do
        grep -rqF -- "$part" "$KORVA_SOURCE_DIR/host/broker" || fail "the host says nothing like '$part'"
    done <"$work/parts"
}
