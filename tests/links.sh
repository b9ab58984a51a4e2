#!/bin/sh
# Follows the relative links of documents: links.sh DOCUMENT... Names each one that leads to no file, or
# to no heading of its file, and fails if there is one.
set -eu

# Targets of the links in a document, without what is shown in blocks and as code.
targets() {
    awk '/^ *```/ {inside = !inside; next} !inside' "$1" | sed "s/\`[^\`]*\`//g" |
        grep -o '](<\{0,1\}[^)>]*' | sed 's/^](<\{0,1\}//; s/ .*//'
}

# Names of a document's headings, as links write them.
anchors() {
    awk '/^ *```/ {inside = !inside; next} !inside' "$1" | sed -n 's/^##* *//p' | tr '[:upper:]' '[:lower:]' |
        sed 's/[^[:alnum:] _-]//g; s/ /-/g'
}

dead=0
for document in "$@"; do
    for target in $(targets "$document"); do
        case $target in
            *://* | mailto:*) continue ;;
            '#'*) file=$document ;;
            *) file=$(dirname "$document")/${target%%#*} ;;
        esac
        if [ ! -e "$file" ]; then
            echo "$document: $target leads to no file" >&2
            dead=1
            continue
        fi
        case $target in *'#'*) ;; *) continue ;; esac
        anchors "$file" | grep -qxF -e "${target#*#}" || {
            echo "$document: $target leads to no heading" >&2
            dead=1
        }
    done
done
exit "$dead"
