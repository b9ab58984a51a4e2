# Sourced by korva-osstatus-register: what has become of a registration in sfcb, and its broker.
# shellcheck shell=sh

# Set by the commands that source this.
: "${parts:?}" "${restart:?}" "${answer?}"

# ---- the repository

# sfcb_section FILE CLASS
sfcb_section() { sed -n "/^\[$2\]/,/^#/p" "$1"; }

# True if the repository was built with what is staged now, or, for a part that is not staged, with any
# registration of it.
sfcb_has_built() {
    built=$(sfcb_tree)/registration/providerRegister
    [ -r "$built" ] || return 1
    for class in $(classes_of "$1"); do
        section=$(sfcb_section "$built" "$class")
        [ -n "$section" ] || return 1
        ! sfcb_knows "$1" || [ "$section" = "$(sfcb_section "$(sfcb_staged_registration "$1")" "$class")" ] ||
            return 1
    done
}

# Tells of one part; fails unless it is staged and in the repository, and answers as far as it can be asked.
sfcb_status_of() {
    if ! sfcb_knows "$1"; then
        if sfcb_has_built "$1"; then
            say "sfcb: the $1 is in the repository, but no longer staged: run sfcbrepos -f, restart the broker"
        else
            say "sfcb: the $1 is not registered"
        fi
        return 1
    fi
    known="the $1 ($(sfcb_staged "$1" provider) in $(sfcb_namespace_of "$1")) is staged"
    if ! sfcb_has_built "$1"; then
        say "sfcb: $known, but not in the repository: run sfcbrepos -f, restart the broker"
        return 1
    fi
    unanswered=0
    ask sfcb "$(sfcb_namespace_of "$1")" "$(class_of "$1")" wbemcli cimcli || unanswered=1
    say "sfcb: $known and in the repository$answer"
    return "$unanswered"
}

sfcb_status() {
    unknown=0
    for part in $parts; do sfcb_status_of "$part" || unknown=1; done
    return "$unknown"
}

# ---- the broker

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

sfcb_runs() {
    { installed pgrep && pgrep -x sfcbd; } || { installed pidof && pidof sfcbd; }
} >/dev/null 2>&1

# Status 3: done, but for the broker, which nobody but the one who started it can start again.
sfcb_restart() {
    if [ "$restart" = no ]; then
        say "sfcb: the broker must be restarted before this takes effect (--restart does it)"
        return
    fi
    how=$(sfcb_restart_command)
    if [ -n "$how" ]; then
        # Words of our own, without blanks in them.
        # shellcheck disable=SC2086
        attempt $how || failed "$how" "restart the broker by hand"
    elif sfcb_runs; then
        complain "sfcbd runs, but not as a service: it was started by hand and still has the former repository"
        complain "stop it and start it again; everything else is done"
        return 3
    else
        say "sfcb: no running broker was found; it reads this when it is started"
    fi
}
