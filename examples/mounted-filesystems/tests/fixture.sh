#!/bin/sh
# Asks the provider about the mounts of the folder root and compares the answers with expected.txt:
#   fixture.sh CMPIHOST LIBRARY
# With UPDATE_GOLDEN=1 it writes that file instead. Read what differs before you keep it.
set -eu
here=$(cd "$(dirname "$0")" && pwd)
cmpihost=$1
library=$2
share=$(dirname "$(dirname "$cmpihost")")/share/korva-osstatus
export EXAMPLE_ROOT="$here/root"
found=$(mktemp)
trap 'rm -f "$found" "$found.errors"' EXIT

# The results of a command of the host, what it says of failures and faults, and how it ends.
run() {
    echo "== $*"
    status=0
    "$cmpihost" --provider "$library" --schema "$here/../mounted-filesystems.mof" --schema "$share/schema" \
        "$@" 2>"$found.errors" || status=$?
    grep -E '^caught: |CIM_ERR_' "$found.errors" || true
    echo "exit status $status"
}

computer="KORVA_ComputerSystem.CreationClassName=\"KORVA_ComputerSystem\",Name=\"$(uname -n)\""
one='EXAMPLE_MountedFileSystem.Name="/srv/old"'
{
    run ei EXAMPLE_MountedFileSystem --format mof
    run ein EXAMPLE_HostedFileSystem
    run gi "$one" device ReadOnly --format mof
    run gi "$one" --properties '' --format mof
    run gi 'EXAMPLE_MountedFileSystem.CSCreationClassName="KORVA_ComputerSystem",CSName="another",CreationClassName="EXAMPLE_MountedFileSystem",Name="/srv/old"'

    run ai "$one" --format mof
    run ain "$computer"
    run ri "$one" --format mof
    run rin "$one"
    run ain "$computer" --assoc-class CIM_HostedFileSystem --result-class CIM_FileSystem \
        --role GroupComponent --result-role PartComponent
    run ain "$computer" --result-class KORVA_ComputerSystem
    run ain "$computer" --role PartComponent
    run ain "$one" --result-role PartComponent
    run rin "$one" --result-class KORVA_RunningOS

    run ci EXAMPLE_MountedFileSystem 'Name="/new"'
    run mi "$one" 'Device="other"'
    run di "$one"
    run xq 'SELECT * FROM EXAMPLE_MountedFileSystem'
    run ei KORVA_OperatingSystem
    EXAMPLE_ROOT=/nowhere
    run ein EXAMPLE_MountedFileSystem
} | sed "s/\"$(uname -n)\(\\\\*\"\)/\"HOST\1/g" >"$found"

if [ -n "${UPDATE_GOLDEN:-}" ]; then
    cp "$found" "$here/expected.txt"
else
    diff -u "$here/expected.txt" "$found"
fi
