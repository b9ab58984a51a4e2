#!/bin/sh
# Whether packages come out the same, byte by byte, wherever and whenever they are made: unpacks the source
# archive in two folders, one with a blank in its name, runs a command in both, in other circumstances, and
# compares what is in build/packages then.
#   packaging/try/reproducible.sh [COMMAND...]    packaging/build-packages without a command
# Exit status: 0 all the same; 1 something differs, or the command fails.
set -eu
cd "$(dirname "$0")/../.."
[ $# -gt 0 ] || set -- packaging/build-packages

work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT
trap 'exit 1' HUP INT TERM

# make FOLDER VARIABLE=VALUE... COMMAND...
make() {
    mkdir -p "$1"
    tar -C "$1" --strip-components=1 -xf "$archive"
    cd "$1"
    shift
    echo "== In $PWD"
    env "$@"
}

archive=$(packaging/source-archive "$work")
(make "$work/one" TZ=UTC LC_ALL=C "$@")
(umask 077 && make "$work/the other one" TZ=Asia/Tokyo LC_ALL=C.UTF-8 HOME="$work" "$@")

differing=0
cd "$work"
for folder in one "the other one"; do
    (cd "$folder/build/packages" && find . -name '*.deb' -o -name '*.dsc' -o -name '*.rpm' -o -name '*.tar.*' |
        LC_ALL=C sort) >"$folder.list"
done
diff "one.list" "the other one.list"
[ -s one.list ] || {
    echo "reproducible: nothing was made" >&2
    exit 1
}
while read -r file; do
    if cmp "one/build/packages/$file" "the other one/build/packages/$file"; then
        echo "same    $file"
    else
        differing=1
    fi
done <one.list
exit $differing
