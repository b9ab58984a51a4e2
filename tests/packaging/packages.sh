# The Debian packages: what they hold.
# shellcheck shell=sh
# shellcheck source=packed.sh
. ./packed.sh

# By what makes them from the source, with the tree that is built already.
EachComponentIsPacked() {
    need_tool dh debhelper
    rm -rf "$packages"
    mkdir -p "$packages/source"
    cp -R "$KORVA_SOURCE_DIR/packaging/debian" "$KORVA_SOURCE_DIR/CHANGELOG.md" "$packages/source/"
    DESTDIR=$work/tree expect_success cmake --install "$KORVA_BINARY_DIR" --prefix /usr
    # The libraries of Debian's packages are in the folder of their architecture.
    mv "$work/tree/usr/lib" "$work/libraries"
    mkdir "$work/tree/usr/lib"
    mv "$work/libraries" "$work/tree/usr/lib/$triplet"
    cd "$packages/source" || fail "no folder to pack in"
    expect_success env KORVA_INSTALLED_TREE="$work/tree" DEB_BUILD_OPTIONS=noautodbgsym \
        dpkg-architecture "-a$architecture" -c debian/rules binary
    for name in $components; do
        [ -f "$(package "$name")" ] || fail "$(package "$name") is missing: $output"
    done
}

# Names of files in a package, without the folders.
contents() { dpkg-deb --fsys-tarfile "$(package "$1")" | tar -t | sed -n 's|^\./||; /[^/]$/p' | LC_ALL=C sort; }

PackagesHoldTheirFiles() {
    for name in $components; do
        contents "$name" | sed "s|^|$name: |; s|/$triplet/|/TRIPLET/|" | grep -v 'share/doc/korva-osstatus/' >>"$work/contents"
    done
    expected=$(cat package-files.txt)
    [ "$KORVA_WORD_SIZE" = 64 ] || expected=$(grep -v '^server: ' package-files.txt)
    expect_equal "the packages" "$expected" "$(cat "$work/contents")"
}

# Versions of libraries are those of the machine that builds.
PackagesDescribeThemselves() {
    own="korva-osstatus-provider (= 1.0.0-1)"
    for name in provider companion dev tools; do
        dpkg-deb -f "$(package $name)" Package Version Architecture Multi-Arch
        dpkg-deb -f "$(package $name)" Depends | sed 's/ (>= [^)]*)//g; s/, /\n/g' | sort | paste -sd ' '
        dpkg-deb -f "$(package $name)" Recommends Suggests
    done >"$work/fields"
    expect_equal "the fields" "Package: korva-osstatus-provider
Version: 1.0.0-1
Architecture: $architecture
Multi-Arch: same
libc6 libgcc-s1 libstdc++6
Recommends: libsystemd0
Suggests: korva-osstatus-companion, logrotate
Package: korva-osstatus-companion
Version: 1.0.0-1
Architecture: $architecture
Multi-Arch: same
$own libc6 libgcc-s1 libstdc++6
Package: korva-osstatus-dev
Version: 1.0.0-1
Architecture: $architecture
Multi-Arch: same
$own
Package: korva-osstatus-tools
Version: 1.0.0-1
Architecture: $architecture
korva-osstatus-companion (= 1.0.0-1) $own libc6 libgcc-s1 libstdc++6" "$(cat "$work/fields")"
}

PackageOfTheEndpointOpensNoPortByItself() {
    [ "$KORVA_WORD_SIZE" = 64 ] || return 0
    dpkg-deb -f "$(package server)" Package Version Architecture Multi-Arch >"$work/fields"
    dpkg-deb -f "$(package server)" Depends | sed 's/ (>= [^)]*)//g; s/, /\n/g' | sort | paste -sd ' ' >>"$work/fields"
    expect_equal "the fields" "Package: korva-osstatus-server
Version: 1.0.0-1
Architecture: amd64
korva-osstatus-companion (= 1.0.0-1) korva-osstatus-provider (= 1.0.0-1) libc6 libcrypt1 libexpat1 libgcc-s1\
 libmicrohttpd12 libstdc++6" "$(cat "$work/fields")"
    dpkg-deb -e "$(package server)" "$work/control"
    expect_equal "what is done with the service" "postinst: try-restart 'korva-osstatus-server.service' 'korva-osstatus-server.socket'
prerm: stop korva-osstatus-server.socket korva-osstatus-server.service" \
        "$(cd "$work/control" && grep -o 'invoke .*' p* | sed 's/invoke //; s| >/dev/null.*||; s/:/: /')"
    # Enabled is what was so before an upgrade.
    expect_equal "what is enabled" "was-enabled enable was-enabled enable" \
        "$(grep -oE '(was-)?enabled? .korva' "$work/control/postinst" | sed 's/ .*//' | paste -sd ' ')"
}

UnitsAreWhatSystemdKnows() {
    need_tool systemd-analyze systemd
    mkdir "$work/units"
    for unit in service socket; do
        sed "s|=/usr/bin/cmpihost-serve|=$KORVA_BINARY_DIR/bin/cmpihost|" \
            "$KORVA_SOURCE_DIR/packaging/debian/korva-osstatus-server.$unit" >"$work/units/korva-osstatus-server.$unit"
    done
    capture systemd-analyze verify --man=no "$work/units/korva-osstatus-server.service" "$work/units/korva-osstatus-server.socket"
    expect_equal "what is wrong with the units" "0 " "$code $(echo "$output" | grep korva || true)"
    # Of 100; 17 is what is left: the network of the host, its processes, and D-Bus.
    expect_success systemd-analyze security --offline=yes --threshold=20 "$work/units/korva-osstatus-server.service"
}

LibrariesExportTheirSymbolsAndNoOther() {
    dpkg-deb -x "$(package provider)" "$work/provider"
    expect_success dpkg-gensymbols -c4 -q -pkorva-osstatus-provider -v1.0.0-1 "-a$architecture" -O/dev/null \
        "-I$KORVA_SOURCE_DIR/packaging/debian/korva-osstatus-provider.symbols" \
        "-P$work/provider" "-e$work/provider/usr/lib/$triplet/*.so.1"
    dpkg-deb --ctrl-tarfile "$(package provider)" | tar -xO ./symbols >"$work/symbols"
    expect_equal "the libraries" "libvainstrumentation.so.1 korva-osstatus-provider #MINVER#
libvaprovider.so.1 korva-osstatus-provider #MINVER#
libzblog.so.1 korva-osstatus-provider #MINVER#" "$(grep '^lib' "$work/symbols")"
}

# Bugs are closed by uploads to Debian only, and the libraries are packed with what needs them.
LintianFindsNothing() {
    need_tool lintian lintian
    capture lintian --allow-root --fail-on error,warning \
        --suppress-tags initial-upload-closes-no-bugs,package-name-doesnt-match-sonames "$packages"/*.deb
    [ "$code" -eq 0 ] || fail "$output"
}

ScriptsOfPackagesPrepareATreeForAnotherMachine() {
    dpkg-deb -x "$(package provider)" "$work/tree"
    dpkg-deb -e "$(package provider)" "$work/control"
    mkdir -p "$work/tree/etc/alternatives" "$work/tree/var/lib/dpkg/alternatives" "$work/tree/var/log"
    expect_success env DPKG_ROOT="$work/tree" "$work/control/postinst" configure
    expect_no_text "korva-osstatus-register" "$output"
    expect_equal "the link" "/usr/lib/$triplet/cmpi/libkorvaosstatusfacade.so" \
        "$(readlink "$work/tree/etc/alternatives/korva-osstatus")"
    expect_success env DPKG_ROOT="$work/tree" "$work/control/prerm" remove
    expect_equal "what is left" "" "$(ls "$work/tree/usr/lib/cmpi")"
}

PackageOfTheHostHasTheNoticesOfWhatIsInIt() {
    dpkg-deb -x "$(package tools)" "$work/tools"
    for line in "the OperatingSystemProvider authors" "University of Cincinnati" "Niels Lohmann" \
        "Florian Loitsch" "Bjoern Hoehrmann" "License: BSD-3-clause" "License: Expat" \
        "Redistributions in binary form" "The above copyright notice and this permission notice"; do
        expect_text "$line" "$(cat "$work/tools/usr/share/doc/korva-osstatus-tools/copyright")"
    done
}
