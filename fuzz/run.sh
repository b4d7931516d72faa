#!/usr/bin/env bash
# Builds the fuzzers with clang under build/fuzz and runs each for so many seconds, on all processors.
# Prints a line per fuzzer; exit status 1 if one found something. What it found lies under
# build/fuzz/findings, and what it learned is kept under build/fuzz/corpus for the next run.
#   fuzz/run.sh [SECONDS] [FUZZER...]
set -euo pipefail
cd "$(dirname "$0")/.."

seconds="${1:-60}"
[ $# -gt 0 ] && shift
case "$seconds" in
'' | *[!0-9]*) echo "fuzz: a number of seconds comes first, then names of fuzzers" >&2; exit 2 ;;
esac
build="$(realpath -m "${VLN_FUZZ_BUILD:-build/fuzz}")"
seeds="$PWD/fuzz/corpus" # absolute: a fuzzer may change its working folder

# Each time, since the rooms of an older tree stay in the cache otherwise.
mkdir -p "$build"
compilers=(-DCMAKE_C_COMPILER=clang -DCMAKE_CXX_COMPILER=clang++)
[ ! -f "$build/build.ninja" ] || compilers=()
cmake -S . -B "$build" -G Ninja -Wno-dev "${compilers[@]}" \
    -DCMAKE_BUILD_TYPE=Release -DCMAKE_C_FLAGS_RELEASE="-O1 -g1" \
    -DCMAKE_CXX_FLAGS_RELEASE="-O1 -g1" -DVLN_FUZZ=ON \
    -DVLN_SANITIZE=fuzzer-no-link,address,undefined \
    -DVLN_ROOMS="cimple;schema;foundation;device;operations;agent;services;derivedObjects;module;simulator;host;fuzz" \
    >"$build/configure.log" 2>&1 || { cat "$build/configure.log" >&2; exit 2; }
for name in "$@"; do
    [ -d "$seeds/$name" ] || { echo "fuzz: no fuzzer $name; there are:" $(ls "$seeds") >&2; exit 2; }
done
targets=("${@/#/fuzz_}")
[ $# -gt 0 ] || targets=(vln_fuzzers)
NINJA_STATUS="[fuzz %f/%t] " cmake --build "$build" --target "${targets[@]}" -j "$(nproc)" >&2

# One fuzzer: its learned corpus comes first, so that new inputs go there and the seeds stay as they are.
run_one() {
    local name="$1" log="$build/findings/$1.log" options=""
    # Short inputs are whole rows of operations, and the module's threads do not bear a search for leaks.
    # Weighing a hundred thousand features anew at each turn costs a fifth of the time.
    case "$name" in surface | answers) options="-max_len=200 -detect_leaks=0 -entropic=0" ;; esac
    mkdir -p "$build/corpus/$name" "$build/findings"
    if "$build/bin/fuzz_$name" -max_total_time="$seconds" -timeout=10 -rss_limit_mb=3072 \
        -artifact_prefix="$build/findings/$name-" -print_final_stats=1 -verbosity=1 $options \
        "$build/corpus/$name" "$seeds/$name" >"$log" 2>&1; then
        printf '%-14s ok      %s runs, %s\n' "$name" \
            "$(sed -n 's/^stat::number_of_executed_units: *//p' "$log")" \
            "$(sed -n 's/^#[0-9]*[ \t]*DONE *\(cov: [0-9]* ft: [0-9]*\).*/\1/p' "$log")"
    else
        printf '%-14s FAILED  %s (see %s)\n' "$name" \
            "$(grep -m1 -E 'ERROR:|runtime error:|broken:|deadly signal' "$log" || echo 'no message')" \
            "$log"
        return 1
    fi
}
export -f run_one
export seconds build seeds

[ $# -gt 0 ] || set -- $(ls "$seeds")
printf '%s\n' "$@" | xargs -P "$(nproc)" -I{} bash -c 'run_one {}'
