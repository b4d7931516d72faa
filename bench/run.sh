#!/usr/bin/env bash
# Prints what an enumeration costs, from instruction counts (which repeat), then times and sizes.
#   bench/run.sh BUILD-FOLDER
set -euo pipefail
build="$1"
work="$(mktemp -d)"
trap 'rm -rf "$work"' EXIT

# Instructions inside the measured function.
instructions() {
    valgrind --tool=callgrind --callgrind-out-file="$work/out" --toggle-collect=vln_measured \
        "$build/bin/bench_enumeration" "$1" "$2" >"$work/log" 2>&1 ||
        { cat "$work/log" >&2; exit 1; }
    sed -n 's/.*Collected : \([0-9]*\).*/\1/p' "$work/log"
}

echo "Enumerating VLNMPCA_EthernetPort through the in-process object manager, instructions per instance"
echo "(floor: a provider written by hand; clones: the two copies that the locking rules demand)"
printf '%9s %10s %10s %10s %24s\n' instances floor clones library '(library-clones)/floor'
for count in 100 1000 20000; do
    floor=$(($(instructions floor $count) / count))
    clones=$(($(instructions clones $count) / count))
    library=$(($(instructions provider $count) / count))
    printf '%9d %10d %10d %10d %24s\n' $count $floor $clones $library \
        "$(awk "BEGIN { printf \"%.3f\", ($library - $clones) / $floor }")"
done

module="$build/lib/libvorlan_mpca_provider.so"
strip -o "$work/stripped.so" "$module"
echo
printf 'module: %d KiB stripped\n' $(($(stat -c %s "$work/stripped.so") / 1024))
read -r before after <<<"$("$build/bin/bench_enumeration" memory 0)"
printf 'resident memory: %d KiB after the first enumeration, %d KiB of it since the module was loaded\n' \
    "$after" $((after - before))
echo
if [ -x "$build/bin/bench_times" ]; then
    "$build/bin/bench_times" --benchmark_min_time=0.2 2>/dev/null
fi
