# What try-packages refuses to try. Trying itself takes a mirror and the rights of root.
# shellcheck shell=sh
: "${work:?}" "${KORVA_SOURCE_DIR:?}"
cp -R "$KORVA_SOURCE_DIR/packaging" "$work/packaging"
mkdir -p "$work/build/packages"

# make_packages VERSION PRESET: empty files under the names of packages.
make_packages() {
    for name in provider companion dev tools server; do
        touch "$work/build/packages/korva-osstatus-${name}_$1_$2.deb"
    done
}

# refused TEXT ARGUMENT...: ends with status 2, says this text, and leaves nothing behind.
refused() {
    expected=$1
    shift
    mkdir -p "$work/tmp"
    capture env TMPDIR="$work/tmp" "$work/packaging/try-packages" "$@"
    [ "$code" -eq 2 ] || fail "status $code: $output"
    expect_text "try-packages: $expected" "$output"
    expect_equal "what is left" "" "$(ls "$work/tmp")"
}

RefusesWhatIsNoPreset() {
    make_packages 1.0.0-1 i386
    refused "the presets are i386 and amd64, not 'asan'" i386 asan
}

RefusesPresetsWithoutPackages() {
    make_packages 1.0.0-1 i386
    refused "$work/build/packages/korva-osstatus-provider_*_amd64.deb is missing;\
 packaging/build-packages makes it" amd64
    rm "$work/build/packages"/*-tools_*
    refused "$work/build/packages/korva-osstatus-tools_*_i386.deb is missing" i386
}

RefusesASourceThatIsNotThere() {
    make_packages 1.0.0-1 amd64
    refused "$work/build/packages/korva-osstatus_*.dsc is missing; packaging/build-packages makes it" --source amd64
}

RefusesToChooseAmongVersions() {
    make_packages 1.0.0-1 amd64
    make_packages 1.0.1-1 amd64
    refused "several versions of one package: $work/build/packages/korva-osstatus-provider_1.0.0-1_amd64.deb" amd64
}

RefusesUsersOtherThanRoot() {
    make_packages 1.0.0-1 amd64
    mkdir "$work/bin"
    printf '#!/bin/sh\necho 1000\n' >"$work/bin/id"
    chmod +x "$work/bin/id"
    PATH=$work/bin:$PATH
    refused "run this as root" amd64
}
