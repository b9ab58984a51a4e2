# Builds the source packages on a system that has nothing but what it says that it needs, and no network:
# twice, by users of different habits in different folders. Both must come to the same bytes.
# shellcheck shell=sh
# Functions are run by check.
# shellcheck disable=SC2317
# shellcheck source=system.sh
. "$(dirname "$0")/system.sh"
: "${packages:?}" "${work:?}" "${root:?}" "${status:?}"

# A system of 32 bit in a folder of one of 64 bit has the latter's name for rpmbuild.
target=x86_64
[ "$architecture" = amd64 ] || target=i686

bring_source() {
    mkdir "$root/source"
    cp "$packages"/korva-osstatus_*.dsc "$packages"/korva-osstatus_*.tar.xz "$packages"/*.src.rpm "$root/source/"
    inside sh -c 'apt-get -y --no-install-recommends install build-essential rpm debugedit elfutils cpio file \
        pkg-config && apt-get -y --no-install-recommends build-dep /source/*.dsc'
}

# build FOLDER UMASK VARIABLE=VALUE...
build() {
    folder=$1
    mask=$2
    shift 2
    # What stands there is for the shell in the system. The build ids that debugedit gives follow from the length
    # of the folder's name, whatever it is: rpmbuild works in one like that of build-packages.
    # shellcheck disable=SC2016
    unshare --net env -i PATH=/usr/sbin:/usr/bin:/sbin:/bin "$@" chroot "$root" sh -c '
        set -e
        mkdir -p "$0"
        cd "$0"
        umask "$1"
        dpkg-source -x /source/*.dsc tree
        (cd tree && dpkg-buildpackage -us -uc -b)
        top=$(mktemp -d)
        rpmbuild --rebuild --nodeps --target "$2" --define "_topdir $top" --define "_buildhost localhost" \
            /source/*.src.rpm
        mv "$top"/RPMS/*/*.rpm .' "$folder" "$mask" "$target"
}

gave_the_same() {
    for folder in build/one srv/elsewhere/two; do (cd "$root/$folder" && sha256sum -- *.deb *.rpm); done >"$work/sums"
    sort "$work/sums" | uniq -u >"$work/differing"
    cat "$work/sums"
    [ -s "$work/sums" ] && [ ! -s "$work/differing" ]
}

check "what the build needs" bring_source
[ "$status" -eq 0 ] || exit 1
check "a build without a network" build /build/one 022 LC_ALL=C
check "another, in another folder, time zone and language" \
    build /srv/elsewhere/two 077 LC_ALL=C.UTF-8 TZ=Asia/Tokyo HOME=/root USER=other
check "both gave the same packages, byte for byte" gave_the_same
sort -u "$work/sums" | sed 's/^/        /'
exit "$status"
