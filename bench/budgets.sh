#!/usr/bin/env bash
# Holds what the library costs against bench/budgets.tsv.
#   bench/budgets.sh check BUILD-FOLDER [REASON]     1 when a figure grew by more than 5 %, or has no budget;
#                                                    77 where the figures mean nothing, for the reason
#   bench/budgets.sh write BUILD-FOLDER              writes the figures of this word size anew
#   bench/budgets.sh profile BUILD-FOLDER [ROW]      where the instructions of a row go; without one, the rows
# Of instructions those of the module itself count alone: what the C library does differs between machines.
set -euo pipefail
tolerance=5 # per cent
here="$(cd "$(dirname "$0")" && pwd)"
budgets="$here/budgets.tsv"
command="$1"
build="$2"
program="$build/bin/bench_budgets"
[ -z "${3:-}" ] || [ "$command" = profile ] || { echo "budgets: skipped: $3"; exit 77; }
command -v valgrind >/dev/null || { echo "budgets: skipped: valgrind is not installed"; exit 77; }
bits=$(sed -n 's/^VLN_WORD_SIZE:STRING=//p' "$build/CMakeCache.txt")
work="$(mktemp -d)"
trap 'rm -rf "$work"' EXIT

# The rows of a host, each counted alone: the profile of ROW becomes $work/ROW.
profile_rows() {
    valgrind --tool=callgrind --callgrind-out-file="$work/part" --compress-strings=no \
        --dump-before=vln_measured --dump-after=vln_measured "$program" rows "$1" \
        >"$work/rows" 2>"$work/log" || { cat "$work/log" >&2; exit 1; }
    local part=1 row
    while read -r row; do # each row has a part before it, and its own
        part=$((part + 1))
        mv "$work/part.$part" "$work/$row"
        part=$((part + 1))
    done <"$work/rows"
}

own_instructions() {
    awk '/^ob=/ { ours = /libvln_bench_module/ }
         /^calls=/ { getline; next }
         ours && /^[-+*0-9]/ { own += $2 }
         END { if (!own) exit 1; printf "%.0f\n", own }' "$1" ||
        { echo "budgets: no instruction of the module was seen" >&2; exit 1; }
}

# All figures, as "name figure".
measure() {
    local host row own
    for host in $("$program" hosts); do
        profile_rows "$host"
        while read -r row; do
            own=$(own_instructions "$work/$row")
            printf '%s\t%s\n' "$row" "$own"
        done <"$work/rows"
        printf 'memory-%s-kib\t%s\n' "$host" "$("$program" memory "$host")"
    done
    strip -o "$work/stripped" "$build/lib/libvorlan_mpca_provider.so"
    printf 'module-stripped-bytes\t%s\n' "$(stat -c %s "$work/stripped")"
}

check() {
    measure >"$work/figures"
    awk -F '\t' -v bits="$bits" -v tolerance=$tolerance '
        function say(text) { printf "budgets: %s (%d bits) %s\n", $1, bits, text }
        FNR == NR { if (!/^#/ && $2 == bits) budget[$1] = $3; next }
        !($1 in budget) { say("has no budget; it is " $2); bad = 1; next }
        {
            change = budget[$1] ? ($2 / budget[$1] - 1) * 100 : 0
            if (change > tolerance) {
                say(sprintf("grew from %d to %d, by %.1f %%", budget[$1], $2, change))
                bad = 1
            } else if (change < -tolerance)
                say(sprintf("fell from %d to %d: its budget can be lowered", budget[$1], $2))
            delete budget[$1]
        }
        END {
            for (name in budget) {
                printf "budgets: %s (%d bits) is not measured any more\n", name, bits
                bad = 1
            }
            exit bad
        }' "$budgets" "$work/figures" && return
    echo "budgets: where the growth is worth it, ./run budgets writes the file anew"
    return 1
}

write() {
    measure | awk -v bits="$bits" 'BEGIN { FS = OFS = "\t" } { print $1, bits, $2 }' >"$work/figures"
    { grep '^#' "$budgets"
      { awk -F '\t' -v bits="$bits" '!/^#/ && $2 != bits' "$budgets"; cat "$work/figures"; } |
          LC_ALL=C sort -t "$(printf '\t')" -k 2,2n -k 1,1; } >"$work/new"
    cp "$work/new" "$budgets"
}

# Names without the folders of the build, and no longer than a line takes.
shorten() {
    sed -E 's,\[[^]]*/,[,; s,build/\.\./\.\./,,; s,cimple::,,g; s,\(anonymous namespace\)::,,g' | cut -c1-140
}

# What each function takes without those that it calls, of all libraries.
by_function() {
    awk '/^ob=/ { object = substr($0, 4) }
         /^fn=/ { name = substr($0, 4) }
         /^calls=/ { getline; next }
         /^[-+*0-9]/ { cost[name " [" object "]"] += $2; all += $2 }
         END { for (name in cost) printf "%d (%.1f%%)  %s\n", cost[name], 100 * cost[name] / all, name }' "$1" |
        sort -nr | head -n 30
}

show_profile() {
    printf '%s: %d instructions of the module itself\n' "$1" "$(own_instructions "$work/$1")"
    printf '\nA function alone, of all libraries\n\n'
    by_function "$work/$1" | shorten
    printf '\nA function with all that it calls\n\n'
    callgrind_annotate --auto=no --inclusive=yes "$work/$1" | sed -n '/file:function/,$p' | sed 1,2d |
        head -n 60 | shorten
}

profile() {
    local host row wanted="${1:-}"
    for host in $("$program" hosts); do
        profile_rows "$host"
        while read -r row; do
            if [ -z "$wanted" ]; then
                echo "$row"
            elif [[ $row == "$wanted"* ]]; then
                show_profile "$row"
                return
            fi
        done <"$work/rows"
    done
    [ -z "$wanted" ] || { echo "no row begins with '$wanted'" >&2; exit 2; }
}

case "$command" in
check) check ;;
write) write ;;
profile) profile "${3:-}" ;;
*) echo "usage: bench/budgets.sh check|write|profile BUILD-FOLDER" >&2; exit 2 ;;
esac
