#!/bin/sh
# Follows the links of the documents, then runs every command that they show in a block marked "sh", from
# the root folder. A dead link or a command that fails ends the run and is named.
set -eu
cd "$(dirname "$0")/.."
sh tests/links.sh ./*.md docs/*.md docs/dev/*.md
script=$(mktemp)
trap 'rm -f "$script"' EXIT
for document in ./*.md docs/*.md docs/dev/*.md; do
    awk '/^```sh$/ {inside = 1; next} /^```/ {inside = 0} inside' "$document" >"$script"
    [ -s "$script" ] || continue
    echo "commands of $document"
    sh -eu "$script" >/dev/null 2>"$script.errors" || {
        cat "$script.errors" "$script" >&2
        rm -f "$script.errors"
        echo "a command of $document failed" >&2
        exit 1
    }
    rm -f "$script.errors"
done
