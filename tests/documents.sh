#!/bin/sh
# Checks the documents: documents.sh [NEED]...
# Counts the words of those for users, follows the links of all, and runs every command that they show in a
# block marked "sh", from the root folder: each works once ./run has built its part. A block marked "sh NEED"
# also needs the whole build of that preset, or that command, and is run if the need is named here. The first
# thing that is wrong ends the run and is named.
set -eu
cd "$(dirname "$0")/.."

# The endpoint took 1 500 more: it is a server, with clients, users and an administrator of its own.
limit=10500
words=$(cat README.md docs/*.md | wc -w)
[ "$words" -le "$limit" ] || {
    echo "README.md and docs/*.md have $words words, which is more than $limit" >&2
    exit 1
}
echo "$words words for users, of $limit"

sh tests/links.sh ./*.md docs/*.md docs/dev/*.md

# Ports of one's own in the place of those that are shown, which somebody else may use.
port=$((12000 + $$ % 6000 * 3))
used() { grep -qE ":($(printf '%04X|%04X|%04X' "$1" $(($1 + 1)) $(($1 + 2)))) " /proc/net/tcp /proc/net/tcp6 2>/dev/null; }
while used "$port"; do port=$((port + 3)); done

script=$(mktemp)
trap 'rm -f "$script" "$script.errors"' EXIT
for document in ./*.md docs/*.md docs/dev/*.md; do
    # A document's blocks are one script: a later one may use what an earlier one made.
    awk -v needs=" $* " -v document="$document" '
        /^ *```/ && inside { inside = run = 0; next }
        /^ *```/ {
            inside = 1
            if ($1 != "```sh") next
            run = NF == 1 || index(needs, " " $2 " ")
            if (!run) print "left out, needs " $2 ": " document ":" NR >"/dev/stderr"
            next
        }
        run' "$document" |
        sed "s/15988/$port/g; s/15989/$((port + 1))/g; s/15990/$((port + 2))/g" >"$script"
    [ -s "$script" ] || continue
    echo "commands of $document"
    sh -eu "$script" >/dev/null 2>"$script.errors" || {
        tail -n 20 "$script.errors" | cat "$script" - >&2
        echo "a command of $document failed" >&2
        exit 1
    }
done
