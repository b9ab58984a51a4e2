#!/bin/sh
# unsuppressed.sh <program> <list>: runs one test of the program under the thread sanitizer without the
# list of what is shared by design. Reports must come, each about a variable of the list, and about each
# of them, within a few runs: races are seen by chance. Only one test: variables of a library that was loaded again have no names in reports.
set -eu
program=$1
list=$2
reports=$(mktemp -d)
trap 'rm -rf "$reports"' EXIT

sed -n "s/^race:^\(.*\)\\$\$/\1/p" "$list" | sort >"$reports/listed"

for _ in 1 2 3 4 5; do
    TSAN_OPTIONS="log_path=$reports/report exitcode=0" "$program" \
        --gtest_filter='*GetTheAnswersOfEachRequestAsWhenItIsAlone/SimulatedHostThroughTheFacade' >"$reports/output" || {
        cat "$reports/output" >&2
        exit 1
    }
    cat "$reports"/report.* >"$reports/all" 2>/dev/null || true
    sed -n "s/^  Location is global '\(.*\)' of size .*/\1/p" "$reports/all" | sort -u >"$reports/found"
    ! cmp -s "$reports/listed" "$reports/found" || break
done

warnings=$(grep -c '^WARNING: ThreadSanitizer' "$reports/all") || true
located=$(grep -c "^  Location is global '" "$reports/all") || true
echo "$warnings reports, about:"
cat "$reports/found"
if [ "$warnings" -ne "$located" ] || ! cmp "$reports/listed" "$reports/found"; then
    cat "$reports/all" >&2
    exit 1
fi
