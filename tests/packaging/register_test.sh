#!/bin/sh
# register_test.sh SHARE FOLDER: the script that registers, of the installed folder SHARE, against fake
# object managers in FOLDER. Says what does not hold, and fails.
# shellcheck disable=SC2317 # what holds or not is called by its name
set -u
share=$1
top=$2
here=$(cd "$(dirname "$0")" && pwd)
wrong=0
complain() {
    printf '%s\n' "$*" >&2
    wrong=$((wrong + 1))
}

# A folder as the installed one, with few classes, for tests that make many calls.
few_classes() { # FOLDER VERSION
    mkdir -p "$1/mof/final" "$1/mof/interop" "$1/registration"
    cp "$share/provider-register.sh" "$1/"
    echo "class CIM_Element" >"$1/mof/20_base.mof"
    echo "class CIM_Card : CIM_Element" >>"$1/mof/20_base.mof"
    echo "class CIM_Extra : CIM_Element" >"$1/mof/final/20_additions.mof"
    printf 'class %s\n// %s\n' "VLNMPCA_Card : CIM_Card" "$2" "VLNMPCA_GoldCard : VLNMPCA_Card" "$2" \
        >"$1/mof/30_provider.mof"
    printf 'class %s\n' "VLNMPCA_RegisteredProfile : CIM_Element" >"$1/mof/interop/30_interop.mof"
    printf '%s\n' "[VLNMPCA_Card]" "   namespace: root/vorlan root/pg_interop" "# $2" \
        >"$1/vorlan_mpca_provider.reg"
    printf '%s\n' "instance of PG_ProviderModule" "{" '    Name = "vorlan_mpca_provider";' "};" \
        "// $2" >"$1/registration/provider_module.mof"
}

# A host with object managers that run: host NAME KIND... Each call of the script goes to it.
host() {
    export FAKE="$top/$1"
    shift
    mkdir -p "$FAKE/bin" "$FAKE/state" "$FAKE/small/stage/mofs" "$FAKE/small/registration" \
        "$FAKE/full/classes"
    : >"$FAKE/calls"
    : >"$FAKE/fail"
    : >"$FAKE/full/modules"
    echo "what others registered" >"$FAKE/small/registration/providerRegister"
    for command in sh dirname basename sed grep cp rm mv mkdir mktemp flock diff cat tac ls \
        wc cksum find sort touch; do
        ln -s "$(command -v "$command")" "$FAKE/bin/$command"
    done
    ln -s "$(command -v true)" "$FAKE/bin/sleep"
    for kind; do
        case $kind in
        small) commands="sfcbstage sfcbunstage sfcbrepos pidof systemctl" ;;
        full) commands="cimserver cimprovider cimmof cimcli" ;;
        esac
        for command in $commands; do
            ln -s "$here/fake_manager.sh" "$FAKE/bin/$command"
        done
        touch "$FAKE/$kind/running"
    done
    if [ -x "$FAKE/bin/sfcbrepos" ]; then
        PATH=$FAKE/bin sfcbrepos -f -s "$FAKE/small/stage" -r "$FAKE/small/registration"
    fi
    # The interop namespace of the full one has the base classes that profiles need.
    if [ -x "$FAKE/bin/cimmof" ]; then
        PATH=$FAKE/bin cimmof -n root/PG_InterOp "$version"/mof/20*.mof
    fi
}

# The script of a version, with whatever is not its caller's to say. What it says is in $FAKE/said.
call() { # VERSION ARGUMENT...
    script=$top/$1/provider-register.sh
    shift
    : >"$FAKE/calls"
    PATH=$FAKE/bin sh "$script" "$@" --state "$FAKE/state" --stage "$FAKE/small/stage" \
        --repository "$FAKE/small/registration" >"$FAKE/said" 2>&1
}

# All that there is: files with their sums.
picture() { (cd "$FAKE" && find small full state -type f -exec cksum {} + | sort); }
same() { [ "$(picture)" = "$1" ]; }
told() { grep -q -e "$1" "$FAKE/said"; }
called() { [ "$(grep -c -e "^$1" "$FAKE/calls")" = "$2" ]; } # BEGINNING TIMES
holds() { # WHAT COMMAND...
    what=$1
    shift
    "$@" >/dev/null 2>&1 || complain "$FAKE: $what
$(cat "$FAKE/said")"
}
fails() { # STATUS COMMAND...
    expected=$1
    shift
    "$@"
    [ $? -eq "$expected" ]
}

small_has() { # VERSION
    diff -r "$top/$1/mof/interop" "$FAKE/small/stage/mofs/root/interop" &&
        cat "$top/$1/mof/final"/* "$top/$1/mof"/30* >"$FAKE/expected" &&
        cat "$FAKE/small/stage/mofs/root/vorlan"/* | diff "$FAKE/expected" - &&
        sed 's|pg_interop|interop|' "$top/$1/vorlan_mpca_provider.reg" >"$FAKE/expected" &&
        diff "$FAKE/expected" "$FAKE/small/stage/regs/vorlan_mpca_provider.reg" &&
        echo "what others registered" | cat - "$FAKE/expected" |
        diff - "$FAKE/small/registration/providerRegister"
}
full_has() { # VERSION
    cksum <"$top/$1/registration/provider_module.mof" | diff - "$FAKE/full/capabilities" &&
        [ "$(grep -c . "$FAKE/full/modules")" = 1 ] &&
        [ "$(cat "$FAKE/full/classes/root/vorlan/VLNMPCA_Card")" = \
            "CIM_Card $(cat "$top/$1/mof"/*.mof | cksum)" ] &&
        [ -f "$FAKE/full/classes/root/PG_InterOp/VLNMPCA_RegisteredProfile" ]
}

# From nothing to registered, to the next version, and back to nothing.
life() { # KIND OLD NEW
    before=$(picture)
    holds "registering fails" call "$2" register
    holds "not registered" "$1_has" "$2"
    after=$(picture)
    holds "registering again fails" call "$2" register
    holds "registering again changes something" same "$after"
    holds "nobody is told that nothing was to be done" told already
    holds "the next version fails" call "$3" reregister
    holds "the next version is not registered" "$1_has" "$3"
    holds "other settings are taken" fails 1 call "$3" register --interop root/other
    holds "status does not tell" call "$3" status
    holds "status does not tell" told 'has the classes, in root/vorlan and root/'
    holds "deregistering fails" call "$3" deregister
    holds "something is left behind" same "$before"
    holds "deregistering again fails" call "$3" deregister
    holds "deregistering again changes something" same "$before"
}

# Lets each command of a call fail in turn. Then the call fails and says so, and all is as it was; or
# it could do without. Ends with the call that no failure met.
failures() { # KIND VERSION COMMAND
    rm -rf "$FAKE/saved"
    mkdir "$FAKE/saved"
    cp -a "$FAKE/small" "$FAKE/full" "$FAKE/state" "$FAKE/saved"
    before=$(picture)
    echo "$before" >"$FAKE/before"
    number=0 failed=0 done=''
    until [ "$done" ]; do
        number=$((number + 1))
        echo "$number" >"$FAKE/fail"
        if call "$2" "$3"; then
            [ "$(wc -l <"$FAKE/calls")" -ge "$number" ] || done=1
        else
            failed=$((failed + 1))
            holds "$3, call $number of the object manager fails: not told" \
                told 'has what it had before\|does not answer\|status 3 of'
            holds "$3, call $number of the object manager fails: $(picture | diff - "$FAKE/before")" \
                same "$before"
        fi
        if [ ! "$done" ]; then
            rm -rf "$FAKE/small" "$FAKE/full" "$FAKE/state"
            cp -a "$FAKE/saved"/* "$FAKE/"
        fi
    done
    : >"$FAKE/fail"
    holds "$3: only $failed of $number calls fail it" test "$failed" -ge 3
}

rm -rf "$top"
mkdir -p "$top"
few_classes "$top/old" 1
few_classes "$top/new" 2
cp -R "$share" "$top/real"
version=$top/old

for kind in small full; do
    host "$kind" "$kind"
    life "$kind" old new
    failures "$kind" old register
    failures "$kind" new reregister
    holds "the next version is not registered after failures" "${kind}_has" new
    failures "$kind" new deregister
    # Stopped it stays stopped.
    rm "$FAKE/$kind/running"
    life "$kind" old new
    failures "$kind" old register
    holds "it runs" test ! -e "$FAKE/$kind/running"
done

# One that runs is started anew, once; one that is stopped is not.
host restarted small
call old register
holds "not restarted" called 'systemctl restart sfcb' 1
rm "$FAKE/small/running"
call new reregister
holds "started" called 'systemctl restart' 0

# Both kinds on one host: each for itself.
host both small full
echo 1 >"$FAKE/fail"
holds "a failure is hidden" fails 1 call old register
holds "the other is not registered" full_has old
: >"$FAKE/fail"
holds "now both" call old register
holds "the small-footprint one is not registered" small_has old
holds "one alone" call old deregister --kind full
holds "the small-footprint one is not registered any more" small_has old
rm "$FAKE/bin/sfcbrepos"
holds "an object manager that has gone" call old deregister
holds "it is still remembered" test ! -e "$FAKE/state/small"

host none
holds "no object manager" call old register
holds "nobody is told" told 'no object manager'

host chosen small
holds "the administrator's namespace" call old register --interop interop --base own
holds "the interop namespace is another" test -d "$FAKE/small/stage/mofs/interop"
holds "registered for another" grep -q 'root/vorlan interop$' "$FAKE/small/stage/regs/vorlan_mpca_provider.reg"
holds "the base is not staged" test -f "$FAKE/small/stage/mofs/root/vorlan/20_base.mof"
holds "not taken back" call old deregister
holds "something stays staged" test -z "$(find "$FAKE/small/stage" -type f)"
for bad in "" "register deregister" "register --interop" "register --interop a;b" "register --kind big" "rm"; do
    # shellcheck disable=SC2086
    holds "'$bad' is taken" fails 2 call old $bad
done

# The real classes.
version=$top/real
host real small full
life small real real
[ "$wrong" -eq 0 ] && echo "provider-register.sh: all holds"
exit "$((wrong > 0))"
