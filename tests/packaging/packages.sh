# The Debian packages: what they hold.
# shellcheck shell=sh
# shellcheck source=packed.sh
. ./packed.sh

EachComponentIsPacked() {
    need_tool dpkg-deb dpkg
    rm -rf "$packages"
    expect_success cpack -G DEB --config "$KORVA_BINARY_DIR/CPackConfig.cmake"
    for name in provider companion dev tools; do
        [ -f "$(package $name)" ] || fail "$(package $name) is missing: $output"
    done
}

# Names of files in a package, without the folders.
contents() { dpkg-deb --fsys-tarfile "$(package "$1")" | tar -t | sed -n 's|^\./||; /[^/]$/p' | LC_ALL=C sort; }

PackagesHoldTheirFiles() {
    for name in provider companion dev tools; do
        contents $name | sed "s|^|$name: |" | grep -v 'share/doc/korva-osstatus/' >>"$work/contents"
    done
    expect_equal "the packages" "$(cat package-files.txt)" "$(cat "$work/contents")"
}

PackagesDescribeThemselves() {
    own="korva-osstatus-provider (= 1.0.0-1)"
    libraries="libc6 (>= 2.34), libgcc-s1 (>= 7), libstdc++6 (>= 11)"
    for name in provider companion dev tools; do
        dpkg-deb -f "$(package $name)" Package Version Architecture Depends Recommends Suggests
    done >"$work/fields"
    expect_equal "the fields" "Package: korva-osstatus-provider
Version: 1.0.0-1
Architecture: $architecture
Depends: $libraries
Recommends: libsystemd0
Suggests: korva-osstatus-companion, logrotate
Package: korva-osstatus-companion
Version: 1.0.0-1
Architecture: $architecture
Depends: $own, $libraries
Package: korva-osstatus-dev
Version: 1.0.0-1
Architecture: $architecture
Depends: $own
Package: korva-osstatus-tools
Version: 1.0.0-1
Architecture: $architecture
Depends: $own, $libraries" "$(cat "$work/fields")"
}

# Symbol versions of a kind that the files of a package need, highest last.
needed_versions() {
    find "$work/unpacked" -type f \( -name '*.so*' -o -path '*/bin/*' \) -exec readelf -V {} + |
        sed -n "s/.*Name: $1_\([0-9.]*\) .*/\1/p" | sort -Vu
}

DependenciesCoverWhatTheFilesNeed() {
    for name in provider companion tools; do dpkg-deb -x "$(package $name)" "$work/unpacked"; done
    # libstdc++6 of version 11 has symbols up to 3.4.29.
    for kind in GLIBC:2.34 GLIBCXX:3.4.29 GCC:7.0.0; do
        needed=$(needed_versions "${kind%:*}" | tail -n 1)
        [ -n "$needed" ] || fail "no symbol of ${kind%:*} is needed"
        highest=$(printf '%s\n%s\n' "$needed" "${kind#*:}" | sort -V | tail -n 1)
        expect_equal "the version of ${kind%:*}" "${kind#*:}" "$highest"
    done
}

LintianFindsNoError() {
    need_tool lintian lintian
    capture lintian --allow-root --fail-on error "$packages"/*.deb
    [ "$code" -eq 0 ] || fail "$output"
}

ScriptsOfPackagesSpareATreeForAnotherMachine() {
    dpkg-deb -e "$(package provider)" "$work/control"
    expect_success env DPKG_ROOT=/nowhere PATH=/nowhere "$work/control/postinst" configure
    expect_success env DPKG_ROOT=/nowhere PATH=/nowhere "$work/control/prerm" remove
}

ScriptsOfPackagesSurviveAFailingCommand() {
    mkdir "$work/bin"
    ln -s "$(command -v false)" "$work/bin/korva-osstatus-register"
    for name in provider companion; do
        dpkg-deb -e "$(package $name)" "$work/$name"
        expect_success env PATH="$work/bin:$PATH" "$work/$name/postinst" configure
        expect_success env PATH="$work/bin:$PATH" "$work/$name/prerm" remove
    done
}

PackageOfTheHostHasTheNoticesOfWhatIsInIt() {
    dpkg-deb -x "$(package tools)" "$work/tools"
    documents=$work/tools/usr/share/doc
    for notices in "$documents/korva-osstatus-tools/copyright" "$documents/korva-osstatus/copyright.cmpihost"; do
        for line in "the OperatingSystemProvider authors" "University of Cincinnati" "Niels Lohmann" \
            "Florian Loitsch" "Bjoern Hoehrmann" "License: BSD-3-clause" "License: Expat" \
            "Redistributions in binary form" "The above copyright notice and this permission notice"; do
            expect_text "$line" "$(cat "$notices")"
        done
    done
}
