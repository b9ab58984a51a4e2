# The source archive, and the RPM packages that are made by what packaging/rpm says.
# shellcheck shell=sh
: "${work:?}" "${KORVA_SOURCE_DIR:?}" "${KORVA_BINARY_DIR:?}" "${KORVA_WORD_SIZE:?}"
description=$KORVA_SOURCE_DIR/packaging/rpm/korva-osstatus.spec
architecture=x86_64
isa=x86-64
[ "$KORVA_WORD_SIZE" = 64 ] || { architecture=i686 && isa=x86-32; }

# archive FOLDER [VARIABLE=VALUE...]: makes the source archive in there.
archive() {
    folder=$1
    shift
    expect_success env "$@" "$KORVA_SOURCE_DIR/packaging/source-archive" "$folder"
    expect_equal "the archive's name" "$folder/korva-osstatus-1.0.0.tar.xz" "$output"
}

SourceArchiveHoldsWhatGitKnows() {
    archive "$work/out"
    tar -tf "$output" | LC_ALL=C sort >"$work/found"
    git -C "$KORVA_SOURCE_DIR" ls-files | sed 's|^|korva-osstatus-1.0.0/|' | LC_ALL=C sort >"$work/expected-files"
    expect_equal "the archive" "$(cat "$work/expected-files")" "$(cat "$work/found")"
}

SourceArchiveIsTheSameEverywhereAndOfItself() {
    archive "$work/one"
    mkdir "$work/a clone"
    tar -C "$work/a clone" -xf "$output"
    (umask 077 && archive "$work/two" TZ=Asia/Tokyo LC_ALL=C.UTF-8)
    expect_success cmp "$work/one/korva-osstatus-1.0.0.tar.xz" "$work/two/korva-osstatus-1.0.0.tar.xz"
    mkdir "$work/a clone/korva-osstatus-1.0.0/build"
    touch "$work/a clone/korva-osstatus-1.0.0/build/left"
    KORVA_SOURCE_DIR="$work/a clone/korva-osstatus-1.0.0" archive "$work/three"
    expect_success cmp "$work/one/korva-osstatus-1.0.0.tar.xz" "$work/three/korva-osstatus-1.0.0.tar.xz"
}

ReleaseHasTheSameVersionAndDayEverywhere() {
    version=$(sed -n 's/^project(korva-osstatus VERSION \([^ ]*\) .*/\1/p' "$KORVA_SOURCE_DIR/CMakeLists.txt")
    expect_equal "the version of the .rpm packages" "$version" \
        "$(rpmspec -q --srpm --qf '%{version}' "$description")"
    changelog=$KORVA_SOURCE_DIR/packaging/debian/changelog
    expect_equal "the version of the .deb packages" "korva-osstatus ($version-1)" "$(sed '1s/) .*/)/; q' "$changelog")"
    expect_equal "the day" "$(date -ud "$(sed -n '/^ -- /{s/.*>  //p;q}' "$changelog")" +%F)" \
        "$(rpmspec -q --srpm --qf '[%{changelogtime:date}\n]' "$description" | sed 1q | date -u -f - +%F)"
}

# The tree that is built here is packed: what would unpack and build the source does nothing.
pack() {
    mkdir -p "$work/top/BUILD/korva-osstatus-1.0.0"
    expect_success rpmbuild -bb --nodeps --target "$architecture" "$description" --define "_topdir $work/top" \
        --define "_vpath_builddir $KORVA_BINARY_DIR" --define "_libdir /usr/lib" --define "debug_package %{nil}" \
        --define "_build_id_links none" --define "__spec_prep_cmd true" --define "__spec_build_cmd true"
    packages=$work/top/RPMS/$architecture
}

# query NAME OPTION...
query() {
    name=$1
    shift
    rpm -qp "$@" "$packages/korva-osstatus-$name-1.0.0-1.$architecture.rpm"
}

PackagesHoldTheComponentsAndSayWhatTheyNeed() {
    pack
    own="provider:provider companion:companion development:devel tools:tools"
    [ "$KORVA_WORD_SIZE" = 32 ] || own="$own server:server"
    for pair in $own; do
        DESTDIR=$work/tree expect_success cmake --install "$KORVA_BINARY_DIR" --prefix /usr --component "${pair%:*}"
        (cd "$work/tree" && find . ! -type d -printf '/%P\n' | LC_ALL=C sort) >"$work/expected-files"
        query "${pair#*:}" --qf '[%{FILEMODES:perms} %{FILENAMES}\n]' |
            sed -n '/^d/d; s/^[^ ]* //p' | LC_ALL=C sort >"$work/found"
        expect_equal "the files of ${pair#*:}" "$(cat "$work/expected-files")" "$(cat "$work/found")"
        rm -r "$work/tree"
    done

    own=" = 1.0.0-1"
    for name in companion devel tools $([ "$KORVA_WORD_SIZE" = 32 ] || echo server); do
        query "$name" --requires | sed -n "s/^korva/$name: &/p" | uniq
    done >"$work/needs"
    expect_equal "what they need of each other" "companion: korva-osstatus-provider($isa)$own
devel: korva-osstatus-provider($isa)$own
tools: korva-osstatus-companion($isa)$own
tools: korva-osstatus-provider($isa)$own" "$(grep -v ^server "$work/needs")"
    [ "$KORVA_WORD_SIZE" = 32 ] || expect_equal "what the endpoint needs" "server: korva-osstatus-companion($isa)$own
server: korva-osstatus-provider($isa)$own" "$(grep ^server "$work/needs")"
    expect_equal "what is recommended" "systemd-libs($isa)" "$(query provider --recommends)"
    expect_equal "what is suggested" logrotate "$(query provider --suggests)"
    expect_equal "what configures" /etc/logrotate.d/korva-osstatus "$(query provider -c)"
    libraries=$(query provider --provides)$(query companion --provides)
    expect_text libvaprovider.so.1 "$libraries"
    expect_no_text libkor "$libraries$(query provider --requires)"
}

# script NAME KIND ARGUMENT: runs that script of a package where the command that registers fails. What the
# command is told goes to calls.
script() {
    printf '#!/bin/sh\necho "$*" >>"%s/calls"\necho "disk full" >&2\nexit 1\n' "$work" >"$work/korva-osstatus-register"
    chmod +x "$work/korva-osstatus-register"
    rpmspec -q --qf "%{name} script\n[%{$2}\n]" --define "_sbindir $work" "$description" |
        sed "1,/^korva-osstatus-$1 script/d; /ldconfig/d" | sed '/ script$/,$d' >"$work/script"
    expect_success sh "$work/script" "$3"
}

ScriptsTellAFailureAndGoOn() {
    for name in provider companion; do
        script $name postin 1
        expect_equal "what installing tells" "disk full
korva-osstatus-$name: registering failed; mend what is told above, then run: korva-osstatus-register register" "$output"
        script $name preun 0
        expect_equal "what removing tells" "disk full
korva-osstatus-$name: perhaps still registered; what is told above takes it out" "$output"
        script $name preun 1
        expect_equal "what an upgrade tells" "" "$output"
    done
    expect_equal "the calls" "register --without-companion --package
unregister --without-companion --package
register --only-companion --package
unregister --only-companion --package" "$(cat "$work/calls")"
}
