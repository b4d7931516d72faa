#!/usr/bin/env bash
# Prints what an enumeration, a walk and a refresh cost, from instruction counts (which repeat), then
# times and sizes.
#   bench/run.sh BUILD-FOLDER [BUILD-FOLDER]
# The requests of both; all else of the first.
set -euo pipefail
# What the compiler did not optimise takes four times as many instructions.
for build in "$@"; do
    grep -qx 'CMAKE_BUILD_TYPE:STRING=Release' "$build/CMakeCache.txt" ||
        { echo "bench: $build is not configured from a preset" >&2; exit 1; }
done
build="$1"
work="$(mktemp -d)"
trap 'rm -rf "$work"' EXIT

# Instructions of a program while the functions that the options toggle are running. What the program
# itself prints stays in $work/result.
count() {
    local options="$1"
    shift
    # shellcheck disable=SC2086 # several options
    valgrind --tool=callgrind --callgrind-out-file="$work/out" $options "$@" \
        >"$work/result" 2>"$work/log" || { cat "$work/log" >&2; exit 1; }
    sed -n 's/.*Collected : \([0-9]*\).*/\1/p' "$work/log"
}

instructions() {
    count --toggle-collect=vln_measured "$build/bin/bench_enumeration" "$1" "$2"
}

# What one answer of a kind of request costs: "floor library".
request() {
    local folder="$1" what="$2" each="$3" floor library
    floor=$(count --toggle-collect=vln_measured "$folder/bin/bench_requests" floor "$what" 4000)
    library=$(count --toggle-collect=vln_measured "$folder/bin/bench_requests" library "$what" 4000)
    echo $((floor / each)) $((library / each))
}

echo "Requests through the in-process object manager, instructions an answer, of 1,000 Ethernet ports and"
echo "4,000 storage volumes (floor: providers written by hand; the association has nothing to say)"
printf '%6s %-22s %9s %9s %9s %8s  %s\n' bits request floor library own ratio goal
row() { # BITS NAME FLOOR LIBRARY GOAL
    printf '%6s %-22s %9d %9d %9d %8s  %s\n' "$1" "$2" "$3" "$4" $(($4 - $3)) \
        "$(awk "BEGIN { printf \"%.2f\", $4 / $3 }")" "$5"
}
for folder in "$@"; do
    bits=$(sed -n 's/^VLN_WORD_SIZE:STRING=//p' "$folder/CMakeCache.txt")
    build="$folder"
    row "$bits" "port" $(($(instructions floor 1000) / 1000)) $(($(instructions provider 1000) / 1000)) \
        "own at most 3000"
    read -r floor library <<<"$(request "$folder" instances 4000)"
    row "$bits" "volume" "$floor" "$library" ""
    read -r floor library <<<"$(request "$folder" names 4000)"
    row "$bits" "name of a volume" "$floor" "$library" "ratio at most 1.5"
    read -r floor library <<<"$(request "$folder" get 100)"
    row "$bits" "get of a volume" "$floor" "$library" "ratio at most 1.2"
    read -r floor library <<<"$(request "$folder" association 100)"
    row "$bits" "empty association" "$floor" "$library" "own at most 4000"
done
build="$1"
all=$(count --toggle-collect=vln_measured "$build/bin/bench_requests" library associations 4000)
read -r asked <"$work/result"
echo "All $asked associations that have nothing to say about a volume: $((all / asked)) instructions each, the"
echo "object manager's included"
few=$(($(instructions provider 100) / 100))
many=$(($(instructions provider 20000) / 20000))
echo "A port among 100: $few; among 20,000: $many"

calls=100000 # as bench/bench_hooks.h has it
bound=$(instructions bound 100)
direct=$(instructions direct 100)
echo
echo "What a bound function adds to a call of the library: $(((bound - direct + calls / 2) / calls)) instructions"

host="$build/bin/bench_host"
echo
echo "Walking every association of every instance of blade-16-functions, and of twice its cards"
printf '%9s %10s %10s %14s %14s %18s\n' 'asked for' sources twice instructions twice 'ratio, at most 2.6'
for what in names instances; do
    once=$(count --toggle-collect=vln_measured "$host" walk $what 1)
    read -r sources _ <"$work/result"
    twice=$(count --toggle-collect=vln_measured "$host" walk $what 2)
    read -r more _ <"$work/result"
    printf '%9s %10d %10d %14d %14d %18s\n' $what "$sources" "$more" "$once" "$twice" \
        "$(awk "BEGIN { printf \"%.2f\", $twice / $once }")"
done

# Of a refresh only the instructions of the module itself count, whoever called: what the C library does
# for it differs between machines (its string functions, the state of the heap). How often a pass ran
# is read from the same file. "own passes", and what all libraries took in $work/all.
refreshes() { # BENCH_HOST'S ARGUMENTS
    count "--toggle-collect=cimple::ProviderAgent::rebuildAdapterData()
           --toggle-collect=cimple::ProviderAgent::rebuildAdapterMaps(*) --compress-strings=no" \
        "$host" "$@" >"$work/all"
    awk '
        /^ob=/ { ours = /vln_bench_module/ }
        /^cfn=/ { of_a_pass = /rebuildAdapterMaps\([^()]*\)$/ }
        /^calls=/ { if (of_a_pass) { sub("calls=", ""); passes += $1 } getline; next }
        ours && /^[-+*0-9]/ { own += $2 }
        END { printf "%.0f %d\n", own, passes }' "$work/out"
}
read -r own passes <<<"$(refreshes refresh 1)"
read -r made _ <"$work/result"
[ "$passes" -gt 0 ] || { echo "bench: no adapter pass was seen; have its functions other names?" >&2; exit 1; }
read -r _ time <<<"$("$host" refresh 1)"
echo
awk -v own="$own" -v all="$(cat "$work/all")" -v time="$time" -v made="$made" -v passes="$passes" 'BEGIN {
    printf "A full adapter refresh of blade-16-functions makes %d instances, each at %.0f instructions of the", made,
        own / passes / made
    printf " module itself\n(%.0f with the libraries it calls, which differ between machines; %.0f us a refresh)\n",
        all / passes / made, time }'
read -r median most longest <<<"$("$host" latency 1)"
printf 'An enumeration of VLNMPCA_EthernetPort while refreshes run: median %d us, 99 %% %d us, longest %d us\n' \
    "$median" "$most" "$longest"
printf 'memory: %d bytes per instance, the model of the devices included\n' "$("$host" memory 1)"

# An adapter refresh of hosts with more and more of something.
growth() { # BENCH_HOST'S MODE, WHAT GROWS, TEXTS AROUND A NUMBER OF IT, NUMBERS
    local mode="$1" name="$2" before="$3" after="$4" former='' number own passes made
    shift 4
    printf '%9s %10s %14s %30s\n' "$name" instances instructions "to half the $name, at most 2.3"
    for number in "$@"; do
        read -r own passes <<<"$(refreshes "$mode" "$number")"
        read -r made _ <"$work/result"
        own=$((own / passes))
        printf '%9s %10d %14d %30s\n' "$before$number$after" "$made" $own \
            "$([ -z "$former" ] || awk "BEGIN { printf \"%.2f\", $own / $former }")"
        former=$own
    done
}
echo
echo "An adapter refresh of 16 ports with virtual functions, of the module itself"
growth virtual functions "16 x " "" 16 32 64
echo
echo "An adapter refresh of an FC port with virtual ports, each of which sees 64 units, of the module itself"
growth vports ports "" " x 64" 64 128 256

san="$build/bin/bench_san"
pass="--toggle-collect=cimple::ProviderAgent::runSANPass()
      --toggle-collect=vlnsim::library::HBA_*"
passes=2
echo
echo "A SAN pass over san-4096-luns and over parts of it, the library not counted"
printf '%9s %14s %10s %30s\n' units instructions 'per unit' 'to half the units, at most 2.3'
former=
for units in 512 1024 2048 4096; do
    own=$(($(count "$pass" "$san" pass $units) / passes))
    printf '%9d %14d %10d %30s\n' $units $own $((own / units)) \
        "$([ -z "$former" ] || awk "BEGIN { printf \"%.2f\", $own / $former }")"
    former=$own
done
few=$(($(count --toggle-collect=vln_measured "$san" volumes 40) / 40))
many=$(($(count --toggle-collect=vln_measured "$san" volumes 4000) / 4000))
printf 'Enumerating VLNMPCA_StorageVolume: %d instructions per instance of 40, %d of 4000, ratio %s (at most 1.15)\n' \
    $few $many "$(awk "BEGIN { printf \"%.3f\", $many / $few }")"
printf 'objects of the object manager alive at the peak of it, 4000 volumes: %s\n' "$(cat "$work/result")"
read -r before after made <<<"$("$san" resident 4096)"
printf 'resident memory with 4,096 units, every class enumerated once: %d KiB for %d instances, at most 49152; %d KiB of it since the module was loaded\n' \
    "$after" "$made" $((after - before))

# The library aside again; a change asks for a refresh, and the look at the end brings the only one.
changes="--toggle-collect=vln_measured_changes --toggle-collect=vln_measured
         --toggle-collect=cimple::ProviderAgent::runSANPass() --toggle-collect=vlnsim::library::AX_*"
echo
echo "iSCSI targets added and logged in to one after the other, then shown, the library not counted"
printf '%9s %14s %12s %30s\n' targets instructions 'per target' 'to half the targets, at most 2.3'
former=
for targets in 500 1000 2000; do
    own=$(count "$changes" "$san" iscsi $targets)
    printf '%9d %14d %12d %30s\n' $targets "$own" $((own / targets)) \
        "$([ -z "$former" ] || awk "BEGIN { printf \"%.2f\", $own / $former }")"
    former=$own
done

# Again the module alone: the object manager hands out the bytes one by one.
bytes=$((8 << 20))
count "--toggle-collect=vln_measured --compress-strings=no" "$build/bin/bench_stream" $bytes >"$work/all"
own=$(awk '
    /^ob=/ { ours = /vorlan_mpca_provider/ }
    /^calls=/ { getline; next }
    ours && /^[-+*0-9]/ { own += $2 }
    END { printf "%.0f", own }' "$work/out")
[ "$own" -gt 0 ] || { echo "bench: no instruction of the module was seen" >&2; exit 1; }
echo
awk -v own="$own" -v bytes=$bytes 'BEGIN {
    printf "An image of 8 MiB as bytes: %.1f instructions of the module itself per byte, at most 60\n", own / bytes }'

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
