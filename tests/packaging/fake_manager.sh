#!/bin/sh
# The commands of two object managers, as far as their manuals tell, on files below the folder $FAKE;
# which command it is, its name tells. The small-footprint one keeps staged files in small/stage and
# builds small/registration from them. The full one keeps the classes of a namespace in
# full/classes/NAMESPACE, each a file with its superclass and a sum of the text that it came from, and
# its modules in full/modules.
#
# Calls are noted in $FAKE/calls. The one whose number is in $FAKE/fail fails halfway.
set -u
command=${0##*/}
echo "$command $*" >>"$FAKE/calls"
breaks=''
if read -r number <"$FAKE/fail" && [ "$number" = "$(wc -l <"$FAKE/calls")" ]; then
    breaks=1
fi
fail() {
    echo "$command: $*" >&2
    exit 3
}
has_to_run() { [ -f "$FAKE/full/running" ] || fail "cannot connect"; }

stage='' space='' reg='' update=''
read_options() {
    count=$#
    while [ $# -gt 0 ]; do
        case $1 in
        -s) stage=$2 && shift ;;
        -n) space=$2 && shift ;;
        -r) reg=$2 && shift ;;
        -uC | -aEV) update=1 ;;
        *) break ;;
        esac
        shift
    done
    taken=$((count - $#))
}

compile() {
    cd "$FAKE/full/classes/$space" || exit 1
    sum=$(cat "$@" | cksum)
    sed -n 's/^class \([A-Za-z0-9_]*\) *:* *\([A-Za-z0-9_]*\).*/\1 \2/p' "$@" >"$FAKE/declared"
    [ -z "$breaks" ] || sed -i '20,$d' "$FAKE/declared"
    while read -r class super; do
        [ -z "$super" ] || [ -f "$super" ] || fail "class $class: there is no class $super"
        [ ! -f "$class" ] || [ -n "$update" ] || fail "there is a class $class"
        echo "$super $sum" >"$class"
    done <"$FAKE/declared"
    module=$(sed -n '/PG_ProviderModule$/,/};/s/^ *Name = "\(.*\)";/\1/p' "$1")
    if [ -n "$module" ]; then
        ! grep -qx "$module" "$FAKE/full/modules" || fail "there is a module $module"
        echo "$module" >>"$FAKE/full/modules"
        [ -n "$breaks" ] || cksum <"$1" >"$FAKE/full/capabilities"
    fi
}

case $command in
sfcbstage)
    read_options "$@"
    shift "$taken"
    mkdir -p "$stage/mofs/$space" "$stage/regs"
    cp "$@" "$stage/mofs/$space/"
    [ -n "$breaks" ] || [ -z "$reg" ] || cp "$reg" "$stage/regs/"
    ;;
sfcbunstage)
    read_options "$@"
    shift "$taken"
    for file; do
        rm "$stage/mofs/$space/$(basename "$file")" || exit 1
    done
    [ -n "$breaks" ] || [ -z "$reg" ] || rm "$stage/regs/$(basename "$reg")" || exit 1
    ;;
sfcbrepos)
    [ "$1 $2 $4" = "-f -s -r" ] || fail "usage"
    rm -rf "${5:?}"/*
    [ -z "$breaks" ] || fail "no room is left"
    echo "what others registered" | cat - "$3"/regs/*.reg >"$5/providerRegister" 2>/dev/null
    (cd "$3" && find mofs -name '*.mof' -exec cksum {} + | sort) >"$5/repository"
    ;;
pidof) test -f "$FAKE/small/running" && breaks='' ;;
systemctl)
    case $* in
    "is-active --quiet sfcb") breaks='' ;;
    "restart sfcb") ;;
    *) exit 1 ;;
    esac
    ;;
cimserver)
    [ -z "$breaks" ] || fail "out of luck"
    case $* in
    -s) rm "$FAKE/full/running" ;;
    '') [ ! -f "$FAKE/full/running" ] && touch "$FAKE/full/running" || fail "it runs already" ;;
    esac
    ;;
cimprovider)
    has_to_run
    case $1 in
    -l) cat "$FAKE/full/modules" ;;
    -r) [ -n "$breaks" ] || { sed -i "/^$3\$/d" "$FAKE/full/modules" && rm -f "$FAKE/full/capabilities"; } ;;
    esac
    ;;
cimmof)
    has_to_run
    read_options "$@"
    shift "$taken"
    mkdir -p "$FAKE/full/classes/$space"
    compile "$@"
    ;;
cimcli)
    has_to_run
    case $1 in
    nc) ls "$FAKE/full/classes/$4" && breaks='' ;;
    *)
        cd "$FAKE/full/classes/$4" && [ -f "$2" ] || fail "no class $2 in $4"
        if [ "$1" = dc ]; then
            ! grep -q "^$2 " -- * || fail "class $2 has subclasses"
            [ -n "$breaks" ] || rm "$2"
        fi
        ;;
    esac
    ;;
esac || exit 1
[ -z "$breaks" ] || fail "out of luck"
