#!/bin/sh
# Looks through the product's code with clang-tidy, as a preset that is configured compiles it:
#   tests/tidy.sh PRESET [FILE...]
# With files, through those among them that the preset compiles by themselves. Ends with status 1 on a
# finding. What it looks for is in .clang-tidy.
set -eu
cd "$(dirname "$0")/.."
preset=$1
shift
folder=build/$preset/tidy
mkdir -p "$folder"

# Each file of the product once, without the options that only g++ knows.
awk -v product="\"file\": \"$PWD/((base|companion|examples|facade|framework|host|provider)/|build/$preset/host/)" '
    /^{/ { entry = "" }
    { entry = entry $0 "\n" }
    /^}/ {
        sub(/,\n$/, "\n", entry)
        gsub(/ -(fno-gnu-unique|mmemset-strategy=[^ ]*)/, "", entry)
        if (entry ~ product && entry !~ / -o (tests|bench)\//) {
            entries = entries separator entry
            separator = ","
        }
    }
    END { print "[" entries "]" }' "build/$preset/compile_commands.json" >"$folder/compile_commands.json"
sed -n 's/^ *"file": "\([^"]*\)".*/\1/p' "$folder/compile_commands.json" | sort >"$folder/files"
if [ $# -gt 0 ]; then
    printf "$PWD/%s\n" "$@" | sort | comm -12 - "$folder/files" >"$folder/chosen"
    mv "$folder/chosen" "$folder/files"
fi

if xargs -r -P "$(nproc)" -n 1 clang-tidy --quiet -p "$folder" <"$folder/files" >"$folder/findings" 2>"$folder/errors"; then
    echo "$(wc -l <"$folder/files") files, no finding"
else
    # Findings in headers of others are counted, but not shown.
    { cat "$folder/findings" && grep -v ' warnings* generated\.$' "$folder/errors"; } >&2
    exit 1
fi
