# The RPM packages.
# shellcheck shell=sh
: "${work:?}" "${KORVA_BINARY_DIR:?}" "${KORVA_WORD_SIZE:?}"
packages=$work/packages
architecture=x86_64
[ "$KORVA_WORD_SIZE" = 64 ] || architecture=i686

# Files and links of a package, without the folders that it owns.
contents() {
    rpm -qp --qf '[%{FILEMODES:perms} %{FILENAMES}\n]' "$packages/korva-osstatus-$1-1.0.0-1.$architecture.rpm" |
        sed -n '/^d/d; s|^[^ ]* /||p' | LC_ALL=C sort
}

PackagesHoldTheSameFilesAsThoseOfDebian() {
    expect_success cpack -G RPM --config "$KORVA_BINARY_DIR/CPackConfig.cmake" -B "$packages"
    for name in provider companion devel tools; do contents $name; done |
        grep -v 'share/doc/korva-osstatus/' | LC_ALL=C sort >"$work/found"
    sed 's/^[^ ]* //; /share\/doc\/korva-osstatus/d' package-files.txt | LC_ALL=C sort >"$work/expected-files"
    expect_equal "the packages" "$(cat "$work/expected-files")" "$(cat "$work/found")"

    isa=x86-64
    [ "$KORVA_WORD_SIZE" = 64 ] || isa=x86-32
    expect_equal "what is recommended" "systemd-libs($isa)" \
        "$(rpm -qp --recommends "$packages/korva-osstatus-provider-1.0.0-1.$architecture.rpm")"
    expect_equal "what is suggested" "korva-osstatus-companion
logrotate" "$(rpm -qp --suggests "$packages/korva-osstatus-provider-1.0.0-1.$architecture.rpm")"
    expect_equal "what configures" /etc/logrotate.d/korva-osstatus \
        "$(rpm -qpc "$packages/korva-osstatus-provider-1.0.0-1.$architecture.rpm")"
    scripts=$(rpm -qp --scripts "$packages/korva-osstatus-provider-1.0.0-1.$architecture.rpm")
    expect_text "korva-osstatus-register register --without-companion --package" "$scripts"
    expect_text "|| korva-osstatus-register unregister --without-companion --package" "$scripts"
}
