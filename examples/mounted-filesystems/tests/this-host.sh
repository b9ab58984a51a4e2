#!/bin/sh
# Asks the provider about this host and compares the answers with those of stat: this-host.sh CMPIHOST LIBRARY
set -eu
cmpihost=$1
library=$2
share=$(dirname "$(dirname "$cmpihost")")/share/korva-osstatus
schema=$(dirname "$0")/../mounted-filesystems.mof
answer=$("$cmpihost" --provider "$library" --schema "$schema" --schema "$share/schema" --format mof \
    ei EXAMPLE_MountedFileSystem Name FileSystemSize)

compared=0
while read -r property _ value; do
    value=${value%;}
    case $property in
        Name)
            folder=${value#\"}
            folder=${folder%\"}
            ;;
        FileSystemSize)
            size=$(($(stat -f -c '%b * %S' "$folder")))
            [ "$value" -eq "$size" ] || {
                echo "$folder: $value bytes, but stat says $size" >&2
                exit 1
            }
            compared=$((compared + 1))
            ;;
    esac
done <<END
$answer
END
echo "$compared sizes are as stat has them"
[ "$compared" -gt 0 ]
