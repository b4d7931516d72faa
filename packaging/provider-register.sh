#!/bin/sh
# Makes the object managers of this host take the provider's classes and load its module, or takes
# them back. Called by the package when it is configured and removed, and by administrators.
#
# What was registered is kept in the state folder, so that it can be taken back, compared and put back
# although the files beside this script are another version's by then.
#
# Functions that begin with the name of a kind are called by it:
# shellcheck disable=SC2317
set -u

usage() {
    cat <<'END'
usage: provider-register.sh COMMAND [OPTIONS]

Commands
  register     make the classes known to each object manager that is installed, and their provider;
               does nothing where that is so already
  reregister   the same, anew, so that a new version of the module is loaded
  deregister   take both back
  status       tell what is registered

Options
  --kind KIND       small or full: only that kind of object manager. small is the small-footprint
                    kind, known by its command sfcbrepos; full the other, known by cimprovider
  --interop NS      the interop namespace; root/interop for small, root/PG_InterOp for full
  --base BASE       schema: there is a CIM Schema in namespace root/vorlan, as small has it; own: there
                    is none, and the base classes that come with the provider are taken, as for full
  --stage DIR       small: its staging folder, /var/lib/sfcb/stage
  --repository DIR  small: the folder of its class repository, /var/lib/sfcb/registration
  --state DIR       where this script remembers, /var/lib/vorlan-mpca
  -h, --help        this text

What --interop, --base, --stage and --repository say holds until the provider is deregistered.

An object manager that is stopped stays stopped: the small kind reads everything when it starts, the
full kind is started for as long as this takes. One that runs serves the classes afterwards.
Where a step fails, what was done before it is undone.

Exit status: 0 done, or nothing to do; 1 failed; 2 wrong usage.
END
}

say() { printf '%s\n' "$*"; }
complain() { printf 'provider-register.sh: %s\n' "$*" >&2; }
fail() {
    complain "$*"
    exit 1
}
misused() {
    complain "$*"
    complain "try --help"
    exit 2
}

module=vorlan_mpca_provider
share=$(cd "$(dirname "$0")" && pwd) || exit 1
root=${DPKG_ROOT:-} # of a system that is not this one's, as dpkg names it

# ---- What both kinds share ----------------------------------------------------------------------

# Runs a command whose failure ends what is going on. Its complaints are always shown, the rest of
# its output if it fails.
run() {
    "$@" >"$work/output" && return
    code=$?
    cat "$work/output" >&2
    fail "status $code of $*"
}

# Settings of a kind: those of its registration, else those given now, else its own.
choose_settings() {
    given="interop=$interop base=$base stage=$stage repository=$repository"
    case $kind in
    small) : "${interop:=root/interop}" "${base:=schema}" ;;
    full) : "${interop:=root/PG_InterOp}" "${base:=own}" ;;
    esac
    : "${stage:=$root/var/lib/sfcb/stage}" "${repository:=$root/var/lib/sfcb/registration}"
    [ -f "$kept/settings" ] || return 0
    while IFS='=' read -r name value; do
        case " $given " in
        *" $name= "* | *" $name=$value "*) ;;
        *) fail "the $kind kind of object manager has the classes with $name $value: deregister first" ;;
        esac
        case $name in
        interop) interop=$value ;;
        base) base=$value ;;
        stage) stage=$value ;;
        repository) repository=$value ;;
        esac
    done <"$kept/settings"
}

# The files of this version as a kind is handed them: those of the two namespaces in folders, the
# registration, and the settings that they were made with.
gather() {
    mkdir -p "$files/vorlan" "$files/interop" &&
        case $base in
        schema) cp "$share"/mof/final/*.mof "$share"/mof/30_*.mof "$files/vorlan/" ;;
        own) cp "$share"/mof/*.mof "$files/vorlan/" ;;
        esac &&
        cp "$share"/mof/interop/*.mof "$files/interop/" &&
        case $kind in
        small)
            sed "/^ *namespace:/s|root/pg_interop|$interop|" "$share/$module.reg" >"$files/$module.reg"
            ;;
        full)
            sed "s|\"root/PG_InterOp\"|\"$interop\"|" "$share/registration/provider_module.mof" \
                >"$files/provider_module.mof"
            ;;
        esac &&
        printf '%s\n' "interop=$interop" "base=$base" "stage=$stage" "repository=$repository" \
            >"$files/settings" || exit 1
}

keep() {
    if ! { cp -R "$files" "$kept.new" && rm -rf "$kept" && mv "$kept.new" "$kept"; }; then
        fail "what was registered cannot be remembered in $kept"
    fi
}

# ---- The small-footprint kind: files are staged, and the repository is built from them ----------

small_is_installed() { command -v sfcbstage >/dev/null && command -v sfcbrepos >/dev/null; }
small_is_registered() { [ -f "$stage/regs/$module.reg" ]; }

small_save_folder() { # NAME FOLDER
    [ ! -d "$2" ] || cp -a "$2" "$work/$1" || fail "the folder $2 cannot be saved"
}

small_restore_folder() { # NAME FOLDER
    if [ -d "$work/$1" ]; then
        cp -a "$work/$1" "$2.before" && rm -rf "$2" && mv "$2.before" "$2"
    else
        rm -rf "$2"
    fi
}

small_begin() {
    small_save_folder stage "$stage"
    small_save_folder repository "$repository"
    undo=small_restore
}

small_restore() {
    small_restore_folder stage "$stage" && small_restore_folder repository "$repository" &&
        { [ -z "$restarted" ] || small_restart; }
}

small_stage() { # sfcbstage or sfcbunstage, FOLDER
    run "$1" -s "$stage" -n root/vorlan -r "$2/$module.reg" "$2"/vorlan/*.mof
    run "$1" -s "$stage" -n "$interop" "$2"/interop/*.mof
}

# A broker that runs reads the repository when it starts.
small_restart() {
    pidof sfcbd >/dev/null || return 0
    for service in sfcb sblim-sfcb; do
        if command -v systemctl >/dev/null && systemctl is-active --quiet "$service"; then
            restarted=1
            systemctl restart "$service"
            return
        fi
        if command -v service >/dev/null && service "$service" status >/dev/null 2>&1; then
            restarted=1
            service "$service" restart
            return
        fi
    done
    complain "the object manager runs, but as no service: restart it; until then it serves what it did"
}

small_end() {
    run sfcbrepos -f -s "$stage" -r "$repository"
    small_restart || fail "the object manager cannot be restarted"
}

small_register() {
    [ -z "$was_registered" ] || small_stage sfcbunstage "$kept"
    small_stage sfcbstage "$files"
}

small_deregister() {
    if small_is_registered; then
        small_stage sfcbunstage "$kept"
    fi
}

# ---- The full kind: it has to run, and is told --------------------------------------------------

full_is_installed() { command -v cimmof >/dev/null && command -v cimprovider >/dev/null; }
full_lists() { cimprovider -l >"$work/modules" 2>"$work/unreached"; }
full_is_registered() { full_lists && grep -q "^ *$module *\$" "$work/modules"; }

# Started for as long as this takes, if it is stopped.
full_begin() {
    full_lists && return
    say "The object manager does not answer: it is started for as long as this takes."
    run cimserver
    started=1
    undo=full_end
    tries=20
    until full_lists; do
        tries=$((tries - 1))
        if [ "$tries" -eq 0 ]; then
            cat "$work/unreached" >&2
            fail "the object manager was started and does not answer"
        fi
        sleep 1
    done
}

full_end() {
    [ -n "$started" ] || return 0
    run cimserver -s
    started=''
}

full_compile() { # FOLDER
    run cimmof -uC -aEV -n root/vorlan "$1"/vorlan/*.mof
    run cimmof -uC -aEV -n "$interop" "$1"/interop/*.mof
}

full_name_space() { # vorlan or interop
    case $1 in
    vorlan) say root/vorlan ;;
    interop) say "$interop" ;;
    esac
}

full_drop_module() {
    full_is_registered || return 0
    cimprovider -d -m "$module" || complain "the module cannot be disabled"
    run cimprovider -r -m "$module"
}

# Notes which classes a namespace has from us, in the order of their making: those of before in
# brought.*, and those that come now in fresh.*.
full_note_classes() { # vorlan or interop, NAMESPACE
    sed -n 's/^class \([A-Za-z0-9_]*\).*/\1/p' "$files/$1"/*.mof >"$work/declared"
    if command -v cimcli >/dev/null; then
        cimcli nc -di -n "$2" >"$work/present" 2>/dev/null || : >"$work/present" # no such namespace
        grep -vxF -f "$work/present" "$work/declared" >"$work/fresh.$1"
    else
        grep '^VLNMPCA_' "$work/declared" >"$work/fresh.$1"
    fi
    if [ -f "$kept/brought.$1" ]; then
        cp "$kept/brought.$1" "$files/" || exit 1
    fi
    cat "$work/fresh.$1" >>"$files/brought.$1" || exit 1
}

# Deletes classes of a list, each before what it is derived from.
full_drop_classes() { # LIST NAMESPACE
    if ! command -v cimcli >/dev/null; then
        complain "cimcli is not installed: the classes stay in $2, and nobody serves them"
        return
    fi
    tac "$1" >"$work/classes"
    while read -r class; do
        cimcli dc "$class" -n "$2" >"$work/output" 2>&1 && continue
        # One that is gone already is no failure.
        cimcli gc "$class" -n "$2" >/dev/null 2>&1 || continue
        cat "$work/output" >&2
        case $class in
        VLNMPCA_*) fail "the class $class of namespace $2 cannot be deleted" ;;
        *) complain "the class $class of namespace $2 stays: others have come to need it" ;;
        esac
    done <"$work/classes"
}

# Back to what was registered before, or to nothing.
full_restore() {
    full_drop_module
    for each in interop vorlan; do
        [ ! -f "$work/fresh.$each" ] || full_drop_classes "$work/fresh.$each" "$(full_name_space "$each")"
    done
    if [ -n "$was_registered" ]; then
        full_compile "$kept"
        run cimmof -n "$interop" "$kept/provider_module.mof"
    fi
    full_end
}

full_register() {
    for each in vorlan interop; do
        full_note_classes "$each" "$(full_name_space "$each")"
    done
    undo=full_restore
    full_compile "$files"
    full_drop_module
    run cimmof -n "$interop" "$files/provider_module.mof"
}

full_deregister() {
    undo=full_restore
    full_drop_module
    for each in interop vorlan; do
        full_drop_classes "$kept/brought.$each" "$(full_name_space "$each")"
    done
}

# ---- One kind, from beginning to end ------------------------------------------------------------

finish() {
    code=$?
    trap '' INT TERM HUP
    if [ -n "$undo" ]; then
        if ! ("$undo"); then
            fail "failed, and could not be undone; what there was before is in $work and $kept"
        fi
        complain "failed; the $kind kind of object manager has what it had before"
    fi
    rm -rf "$work"
    exit "$code"
}

register_kind() {
    gather
    "${kind}_begin"
    if [ -d "$kept" ] && "${kind}_is_registered"; then
        was_registered=1
    fi
    if [ "$command" = register ] && [ -n "$was_registered" ] && diff -r -x "brought.*" "$kept" "$files" >/dev/null; then
        [ -z "$started" ] || full_end
        say "The $kind kind of object manager has the classes already."
        return
    fi
    "${kind}_register"
    "${kind}_end"
    keep
    say "The $kind kind of object manager has the classes, in root/vorlan and $interop."
}

deregister_kind() {
    if [ ! -d "$kept" ]; then
        say "The $kind kind of object manager does not have the classes."
        return
    fi
    if "${kind}_is_installed"; then
        was_registered=1
        "${kind}_begin"
        "${kind}_deregister"
        "${kind}_end"
    fi
    rm -rf "$kept" || exit 1
    say "The $kind kind of object manager has the classes no more."
}

# In a shell of its own, so that each kind ends for itself.
act() { # KIND
    kind=$1 kept=$state/$1
    undo='' was_registered='' restarted='' started=''
    work=$(mktemp -d "$state/work.XXXXXX") || exit 1
    files=$work/files
    trap finish EXIT
    trap 'exit 130' INT
    trap 'exit 143' TERM HUP
    choose_settings
    case $command in
    deregister) deregister_kind ;;
    *) register_kind ;;
    esac
    undo=''
}

show() { # KIND
    kind=$1 kept=$state/$1
    if [ ! -d "$kept" ]; then
        say "The $kind kind of object manager does not have the classes."
        return
    fi
    choose_settings
    say "The $kind kind of object manager has the classes, in root/vorlan and $interop."
}

# ---- Command line -------------------------------------------------------------------------------

command='' only='' interop='' base='' stage='' repository='' state=$root/var/lib/vorlan-mpca
while [ $# -gt 0 ]; do
    case $1 in
    -h | --help)
        usage
        exit 0
        ;;
    --kind | --interop | --base | --stage | --repository | --state)
        [ $# -gt 1 ] || misused "$1: a value is missing"
        case $1=$2 in
        *[[:space:]]*) misused "$1: no blanks, please: '$2'" ;;
        --kind=small | --kind=full) only=$2 ;;
        --base=schema | --base=own) base=$2 ;;
        --interop=[!A-Za-z]* | --interop=*[!A-Za-z0-9_/]*) misused "$1: $2 is no namespace" ;;
        --interop=?*) interop=$2 ;;
        --stage=/*) stage=$2 ;;
        --repository=/*) repository=$2 ;;
        --state=/*) state=$2 ;;
        *) misused "$1: '$2' will not do" ;;
        esac
        shift
        ;;
    register | reregister | deregister | status)
        [ -z "$command" ] || misused "one command is enough: $command, $1"
        command=$1
        ;;
    *) misused "unknown: $1" ;;
    esac
    shift
done
[ -n "$command" ] || misused "a command is missing"

kinds=''
for kind in small full; do
    if [ -n "$only" ] && [ "$only" != "$kind" ]; then
        continue
    fi
    if "${kind}_is_installed"; then
        kinds="$kinds $kind"
    elif [ -d "$state/$kind" ]; then
        # It has gone, and may still be remembered.
        case $command in
        deregister | status) kinds="$kinds $kind" ;;
        esac
    fi
done
if [ -z "$kinds" ]; then
    say "There is no ${only:+$only }object manager on this host: neither sfcbrepos nor cimprovider is found."
    exit 0
fi

if [ "$command" != status ]; then
    mkdir -p "$state" && exec 9<"$state" || exit 1
    flock -n 9 || fail "another call is under way"
fi
failed=0
for kind in $kinds; do
    case $command in
    status) (show "$kind") ;;
    *) (act "$kind") 9<&- ;; # what is started must not keep the lock
    esac || failed=1
done
exit "$failed"
