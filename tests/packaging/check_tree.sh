#!/bin/sh
# check_tree.sh PREFIX SOURCE BUILD LIBDIR: what is installed below PREFIX is all there, nothing else is,
# and works from where it is. Says what does not hold, and fails.
set -u
prefix=$1 source=$2 build=$3 libdir=$4
export LC_ALL=C
wrong=0
holds() { # WHAT COMMAND...
    what=$1
    shift
    "$@" >"$scratch/said" 2>&1 && return
    echo "$prefix: $what" >&2
    cat "$scratch/said" >&2
    wrong=$((wrong + 1))
}
scratch=$(mktemp -d) || exit 1
trap 'rm -rf "$scratch"' EXIT
cd "$scratch" || exit 1

# ---- Every path ----
paths() {
    sed "s|LIBDIR|$libdir|" "$source/tests/packaging/paths.txt"
    (cd "$source/schema/mof" && find . -type f | sed 's|^[.]|share/vorlan-mpca/catalogue|')
    (cd "$source/simulator" && find scenarios -type f | sed 's|^|share/vorlan-mpca/|')
}
paths | sort >expected
(cd "$prefix" && find . ! -type d | sed 's|^[.]/||' | sort) >seen
holds "other files than expected" diff expected seen
for program in bin/mpcactl share/vorlan-mpca/provider-register.sh; do
    holds "$program cannot be executed" test -x "$prefix/$program"
done
holds "a path of the build shows" sh -c "! grep -raoF '$source' '$prefix'"
holds "other exports than the map has" cmake -DNM="$(command -v nm)" -DEXPECTED=1591 \
    "-DMODULES=$prefix/$libdir/cmpi/libvorlan_mpca_provider.so;$prefix/$libdir/vorlan-mpca/simulator/libvorlan_mpca_provider.so" \
    -DMAP="$build/generated/export.map" -P "$source/tests/road/exported_symbols.cmake"
holds "the manual page has no name" sh -c "zcat '$prefix/share/man/man1/mpcactl.1.gz' | grep -A1 '^.SH NAME' | grep -q '^mpcactl '"

# ---- mpcactl finds what it needs; the simulated host is that of the tests ----
mpcactl=$prefix/bin/mpcactl
grep -v '^#' "$source/tests/road/census/two-port-cna.tsv" | sort >expected
"$mpcactl" --simulate two-port-cna census | grep -v '[^0-9]0$' | sort >seen
holds "the simulated host differs" diff expected seen
holds "the machine itself cannot be asked" "$mpcactl" enum VLNMPCA_Card
holds "the catalogue is not found" "$mpcactl" class VLNMPCA_EthernetPort
holds "the registration is not found" sh -c \
    "'$mpcactl' names VLNMPCA_Card --namespace root/elsewhere 2>&1 | grep -q 'nothing is registered in'"

# ---- The simulated module, loaded by a program that knows nothing of the simulator ----
simulated=$prefix/$libdir/vorlan-mpca/simulator/libvorlan_mpca_provider.so
# What is asked of the environment's host differs in nothing from mpcactl's own.
in_environment() { # ARGUMENT...
    env -i TZ=UTC VLNSIM_SCENARIO="$prefix/share/vorlan-mpca/scenarios/two-port-cna.json" \
        VLNSIM_HOST_ROOT="$scratch/root" "$mpcactl" --module "$simulated" "$@"
}
in_environment enum VLNMPCA_EthernetPort >seen
"$mpcactl" --simulate two-port-cna enum VLNMPCA_EthernetPort >expected
holds "the environment's host differs" diff expected seen
holds "the environment's host has no adapters" test "$(grep -c . seen)" -gt 4
setting='VLNMPCA_ProviderConfigSetting.InstanceID="Vorlan MPCA Provider:cachetimeout"'
holds "a setting cannot be changed" in_environment modify "$setting" current=20
holds "its file is not in the host's root" grep -rq 20 "$scratch/root/etc"
holds "it is not read there" sh -c "'$mpcactl' --simulate two-port-cna --host-root '$scratch/root' \
    get '$setting' -p current | grep -qx 20"
holds "without an environment it cannot be asked" env -i "$mpcactl" --module "$simulated" names VLNMPCA_Card
holds "without an environment there are adapters" test ! -s said

[ "$wrong" -eq 0 ] && echo "$prefix: all holds"
exit "$((wrong > 0))"
