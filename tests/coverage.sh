#!/usr/bin/env bash
# Runs the suite of a build with counters and prints which lines and branches of the library's own sources
# it reached, a line a folder. A list of the files, with the lines that were not reached, stands in
# BUILD-FOLDER/coverage.txt.
#   tests/coverage.sh BUILD-FOLDER [NAME]    only the tests that match; what earlier ones reached stays
set -euo pipefail
cd "$(dirname "$0")/.."
build="$1"
tests="${2:-}"
rooms="cimple schema foundation device operations agent derivedObjects services"
[ -n "$tests" ] || find "$build" -name '*.gcda' -delete
# Names of source files stand in what is built so, which the test of the installed tree minds.
ctest --test-dir "$build" -E '^installed_tree$' -j "$(nproc)" ${tests:+-R "$tests"} >"$build/coverage.log" 2>&1 || {
    echo "Some tests failed, and what they would have reached may be missing:"
    sed -n '/The following tests FAILED/,$p' "$build/coverage.log"
}

# A branch that only an exception takes is in every other call: the allocations refused one by one show those.
filters=()
for room in $rooms; do filters+=(--filter "$room/"); done
gcovr --root . --object-directory "$build" "${filters[@]}" --exclude 'schema/(generator|mof_parser)/' \
    --exclude-throw-branches --exclude-unreachable-branches -j "$(nproc)" \
    --csv "$build/coverage.csv" --txt "$build/coverage.txt" "$build" >"$build/gcovr.log" 2>&1 ||
    { tail "$build/gcovr.log" >&2; exit 1; }

awk -F , '
    function row(name, lines, reached, branches, taken) {
        return sprintf("%-28s %7d %7d %7.1f %9d %7d %7.1f", name, lines, reached, lines ? 100 * reached / lines : 100,
            branches, taken, branches ? 100 * taken / branches : 100)
    }
    NR == 1 { next }
    {
        folder = $1
        sub("/[^/]*$", "", folder)
        lines[folder] += $2; reached[folder] += $3; branches[folder] += $5; taken[folder] += $6
        all += $2; all_reached += $3; all_branches += $5; all_taken += $6
    }
    END {
        if (!all) exit 1
        printf "%-28s %7s %7s %7s %9s %7s %7s\n", "folder", "lines", "reached", "%", "branches", "taken", "%"
        sort = "LC_ALL=C sort"
        for (folder in lines)
            print row(folder, lines[folder], reached[folder], branches[folder], taken[folder]) | sort
        close(sort)
        print row("all", all, all_reached, all_branches, all_taken)
    }' "$build/coverage.csv" || { echo "coverage: no file was seen" >&2; exit 1; }
echo "The files, and the lines not reached: $build/coverage.txt"
