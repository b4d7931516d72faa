#!/bin/sh
# packages.sh SOURCE BUILD LIBDIR: the packages of a build are sound, name what they need, work from a
# scratch root, and register themselves with an object manager there. Says what does not hold, and fails.
# shellcheck disable=SC2317 # what holds or not is called by its name
set -u
source=$1 build=$2 libdir=$3
here=$source/tests/packaging
top=$build/tests/run/packages
root=$top/root
wrong=0
complain() {
    printf '%s\n' "$*" >&2
    wrong=$((wrong + 1))
}
holds() { # WHAT COMMAND...
    what=$1
    shift
    "$@" >"$top/said" 2>&1 || complain "$what
$(cat "$top/said")"
}
not() { ! "$@"; }

rm -rf "$top"
mkdir -p "$top" "$root/var/lib/dpkg/info" "$root/var/lib/dpkg/updates"
touch "$root/var/lib/dpkg/status"
set -- "$build"/packages/*.deb
holds "not three packages: $*" test $# -eq 3
holds "lintian complains" lintian --allow-root --fail-on error,warning "$@"

# ---- What they say that they need, against what their files take ----
taken() { # PREFIX FOLDER: the newest version of the symbols that its files take of a library
    find "$2" -type f -exec objdump -T {} + 2>/dev/null | grep -oE "$1_[0-9.]+" | sort -uV | tail -1
}
for deb; do
    name=$(basename "${deb%%_*}")
    depends=$(dpkg-deb -f "$deb" Depends)
    dpkg-deb -x "$deb" "$top/$name"
    glibc=$(taken GLIBC "$top/$name")
    holds "$name: needs $glibc, and says $depends" dpkg --compare-versions "${glibc#GLIBC_}" le \
        "$(echo "$depends" | sed 's/.*libc6 (>= \([0-9.]*\)).*/\1/')"
    # Of GCC 12, which the dependencies name.
    glibcxx=$(taken GLIBCXX "$top/$name")
    holds "$name: needs $glibcxx" dpkg --compare-versions "${glibcxx#GLIBCXX_}" le 3.4.30
    find "$top/$name" -type f -exec objdump -p {} + 2>/dev/null |
        sed -n 's/^ *NEEDED *//p' | sort -u |
        grep -vE '^(lib(stdc[+][+]|gcc_s|c)[.]so[.][0-9]+|ld-linux.*|libvlnsim[.]so)$' >"$top/others"
    ! echo "$depends" | grep -q libedit2 || sed -i '/^libedit[.]so[.]2$/d' "$top/others"
    holds "$name: needs other libraries too: $(cat "$top/others")" test ! -s "$top/others"
done

# ---- The package manager, and an object manager, in the scratch root ----
export FAKE="$top/fake"
mkdir -p "$FAKE" "$top/bin" "$root/var/lib/sfcb/registration"
: >"$FAKE/fail"
for command in sfcbstage sfcbunstage sfcbrepos pidof; do
    ln -s "$here/fake_manager.sh" "$top/bin/$command"
done
dpkg_there() {
    : >"$FAKE/calls"
    PATH=$top/bin:$PATH dpkg --root="$root" --force-script-chrootless --force-architecture \
        --force-depends --force-not-root "$@"
}
staged=$root/var/lib/sfcb/stage/regs/vorlan_mpca_provider.reg
holds "they cannot be installed" dpkg_there -i "$@"
holds "installing does not register" test -f "$staged"
holds "they cannot be upgraded" dpkg_there -i "$@"
holds "an upgrade does not keep the classes" test -f "$staged"
holds "an upgrade takes the classes away for a time" test "$(grep -c ^sfcbrepos "$FAKE/calls")" -eq 1
sh "$here/check_tree.sh" "$root/usr" "$source" "$build" "$libdir" || complain "installed files"
echo 1 >"$FAKE/fail"
holds "removal succeeds although the object manager keeps the classes" not dpkg_there -r vorlan-mpca-provider
holds "a failed removal takes the classes away" test -f "$staged"
: >"$FAKE/fail"
holds "they cannot be removed" dpkg_there -r vorlan-mpca-tools vorlan-mpca-provider vorlan-mpca-simulator
holds "removing does not deregister" test ! -e "$staged"
holds "it cannot be purged" dpkg_there -P vorlan-mpca-provider
find "$root" -path "$root/var/lib/dpkg" -prune -o -path "$root/var/lib/sfcb" -prune -o ! -type d -print >"$top/left"
holds "something is left: $(cat "$top/left")" test ! -s "$top/left"

[ "$wrong" -eq 0 ] && echo "$build/packages: all holds"
exit "$((wrong > 0))"
