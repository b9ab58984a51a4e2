# Sourced by korva-osstatus-register: the object manager sfcb. Files are staged, then the repository
# is built from all that is staged; the broker reads it when it starts.
# shellcheck shell=sh

# Set by the command that sources this.
registration=
: "${default_namespace:?}" "${schema_dir:?}" "${parts:?}" "${restart:?}"

sfcb_present() { installed sfcbstage && installed sfcbunstage && installed sfcbrepos; }

# Where the installed sfcbstage keeps what it was given.
sfcb_stage() {
    tree=$(dirname "$(dirname "$(command -v sfcbstage)")")
    case $tree in
        / | /usr) echo /var/lib/sfcb/stage ;;
        *) echo "$tree/var/lib/sfcb/stage" ;;
    esac
}

sfcb_staged_registration() { echo "$(sfcb_stage)/regs/$(stem_of "$1").reg"; }

sfcb_knows() { [ -e "$(sfcb_staged_registration "$1")" ]; }

# The namespace that a part is registered in; nothing for one that is not.
sfcb_namespace_of() {
    sfcb_knows "$1" || return 0
    staged_namespace=$(sed -n '/^ *namespace: */{s///;s/[[:space:]].*//;p;q;}' "$(sfcb_staged_registration "$1")")
    echo "${staged_namespace:-$default_namespace}"
}

# sfcb_add PART NAMESPACE
sfcb_add() {
    find_registration "$(stem_of "$1").reg" "$2" || return 1
    set -- "$1" -n "$2" -r "$registration"
    for class in $(classes_of "$1"); do set -- "$@" "$schema_dir/$class.mof"; done
    shift
    attempt sfcbstage "$@" || failed sfcbstage "mend what it names and register again"
}

# sfcb_withdraw PART NAMESPACE
sfcb_withdraw() {
    set -- "$1" -n "$2" -r "$(stem_of "$1").reg"
    for class in $(classes_of "$1"); do set -- "$@" "$class.mof"; done
    shift
    attempt sfcbunstage "$@" || failed sfcbunstage "mend what it names and run this again"
}

# True if all files of a part can be read; tells the first one that cannot.
sfcb_has_files() {
    find_registration "$(stem_of "$1").reg" "$default_namespace" || return 1
    for class in $(classes_of "$1"); do need_file "$schema_dir/$class.mof" || return 1; done
}

# Registers a part where the caller says, or else where it is: sfcb_place PART FORMER-NAMESPACE
sfcb_place() {
    into=${namespace:-${2:-$default_namespace}}
    sfcb_has_files "$1" || return 1
    if [ -n "$2" ] && [ "$2" != "$into" ]; then
        say "sfcb: the $1 moves from $2 to $into"
        sfcb_withdraw "$1" "$2" || return 1
    fi
    sfcb_add "$1" "$into"
}

# Nothing that was staged just now may spoil the next rebuild: sfcb_put_back PART=FORMER-NAMESPACE...
sfcb_put_back() {
    for place in "$@"; do
        part=${place%%=*}
        former=${place#*=}
        now=$(sfcb_namespace_of "$part")
        [ "$now" != "$former" ] || continue
        [ -z "$now" ] || sfcb_withdraw "$part" "$now" || continue
        [ -z "$former" ] || sfcb_add "$part" "$former" || continue
    done
}

sfcb_rebuild() {
    attempt sfcbrepos -f || failed sfcbrepos \
        "the broker keeps its former repository; mend what sfcbrepos names and run: sfcbrepos -f"
}

sfcb_stage_parts() {
    for part in $parts; do sfcb_place "$part" "$(sfcb_namespace_of "$part")" || return 1; done
}

sfcb_register() {
    set --
    for part in $parts; do set -- "$@" "$part=$(sfcb_namespace_of "$part")"; done
    if ! sfcb_stage_parts || ! sfcb_rebuild; then
        sfcb_put_back "$@"
        return 1
    fi
    sfcb_restart
}

sfcb_unregister() {
    withdrawn=no
    for part in $parts; do
        if sfcb_knows "$part"; then
            sfcb_withdraw "$part" "$(sfcb_namespace_of "$part")" || return 1
            withdrawn=yes
        else
            say "sfcb: the $part is not registered"
        fi
    done
    [ "$withdrawn" = yes ] || return 0
    sfcb_rebuild || return 1
    sfcb_restart
}

sfcb_status() {
    unknown=0
    for part in $parts; do
        if sfcb_knows "$part"; then
            say "sfcb: the $part is registered"
        else
            say "sfcb: the $part is not registered"
            unknown=1
        fi
    done
    return "$unknown"
}

# Prints the command that restarts the running broker; nothing when no running service is found.
sfcb_restart_command() {
    for unit in sfcb.service sblim-sfcb.service; do
        if installed systemctl && systemctl is-active --quiet "$unit" 2>/dev/null; then
            echo systemctl restart "$unit"
            return
        fi
    done
    if installed service && service sfcb status >/dev/null 2>&1; then
        echo service sfcb restart
    fi
}

sfcb_restart() {
    if [ "$restart" = no ]; then
        say "sfcb: the broker must be restarted before this takes effect (--restart does it)"
        return
    fi
    how=$(sfcb_restart_command)
    if [ -z "$how" ]; then
        say "sfcb: no running service was found; the broker reads this when it is started"
        return
    fi
    # Words of our own, without blanks in them.
    # shellcheck disable=SC2086
    attempt $how || failed "$how" "restart the broker by hand"
}
