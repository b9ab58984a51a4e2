# Sourced by korva-osstatus-register: the object manager sfcb. Files are staged, then the repository
# is built from all that is staged; the broker reads it when it starts.
# shellcheck shell=sh

# Set by the commands that source this.
registration=
: "${default_namespace:?}" "${schema_dir:?}" "${parts:?}" "${restart:?}"

sfcb_present() { installed sfcbstage && installed sfcbunstage && installed sfcbrepos; }

# Where the installed sfcb keeps what it was given, and what it made of that.
sfcb_tree() {
    tree=$(dirname "$(readlink -f "$(dirname "$(command -v sfcbstage)")")")
    case $tree in
        / | /usr) echo /var/lib/sfcb ;;
        *) echo "$tree/var/lib/sfcb" ;;
    esac
}

sfcb_staged_registration() { echo "$(sfcb_tree)/stage/regs/$(stem_of "$1").reg"; }

sfcb_knows() { [ -e "$(sfcb_staged_registration "$1")" ]; }

# The first value of a key in the staged registration of a part; nothing for one that is not staged.
sfcb_staged() {
    sfcb_knows "$1" || return 0
    sed -n "/^ *$2: */{s///;s/[[:space:]].*//;p;q;}" "$(sfcb_staged_registration "$1")"
}

# The namespace that a part is registered in; nothing for one that is not.
sfcb_namespace_of() {
    staged_namespace=$(sfcb_staged "$1" namespace)
    if sfcb_knows "$1"; then echo "${staged_namespace:-$default_namespace}"; fi
}

# bare, facade, or nothing for a part that is not registered.
sfcb_form_of() {
    case $(sfcb_staged "$1" provider) in
        '') ;;
        "$(provider_of "$1" facade)") echo facade ;;
        *) echo bare ;;
    esac
}

# sfcb_add PART NAMESPACE FORM
sfcb_add() {
    find_registration "$1" .reg "$2" "$3" || return 1
    set -- "$1" -n "$2" -r "$registration"
    for class in $(classes_of "$1"); do set -- "$@" "$schema_dir/$class.mof"; done
    shift
    attempt sfcbstage "$@" || failed sfcbstage "mend what it names and register again"
}

# The arguments of sfcbunstage, without blanks in them: sfcb_unstaging PART NAMESPACE
sfcb_unstaging() {
    set -- "$1" "-n $2 -r $(stem_of "$1").reg"
    for class in $(classes_of "$1"); do set -- "$1" "$2 $class.mof"; done
    echo "$2"
}

# sfcb_withdraw PART NAMESPACE
sfcb_withdraw() {
    # shellcheck disable=SC2046
    attempt sfcbunstage $(sfcb_unstaging "$1" "$2") || failed sfcbunstage "mend what it names and run this again"
}

# The commands that do without this one what unregistering does.
sfcb_by_hand() {
    for part in $parts; do
        former=
        ! sfcb_present || former=$(sfcb_namespace_of "$part")
        say "    sfcbunstage $(sfcb_unstaging "$part" "${former:-$default_namespace}")"
    done
    say "    sfcbrepos -f"
}

# Registers a part where the caller says, or else where it is: sfcb_place PART FORMER-NAMESPACE FORMER-FORM
sfcb_place() {
    into=${namespace:-${2:-$default_namespace}}
    has_files "$1" .reg || return 1
    if [ -n "$2" ] && [ "$2" != "$into" ]; then
        say "sfcb: the $1 moves from $2 to $into"
        sfcb_withdraw "$1" "$2" || return 1
    fi
    sfcb_add "$1" "$into" "$(form_after "$3")"
}

# How a part is registered: PART=NAMESPACE=FORM
sfcb_place_of() { echo "$1=$(sfcb_namespace_of "$1")=$(sfcb_form_of "$1")"; }

# Nothing that was staged just now may spoil the next rebuild: sfcb_put_back FORMER-PLACE...
sfcb_put_back() {
    for place in "$@"; do
        part=${place%%=*}
        former=${place#*=}
        now=$(sfcb_place_of "$part")
        [ "$now" != "$place" ] || continue
        now=${now#*=}
        [ "$now" = = ] || [ "${now%=*}" = "${former%=*}" ] || sfcb_withdraw "$part" "${now%=*}" || continue
        [ "$former" = = ] || sfcb_add "$part" "${former%=*}" "${former#*=}" || continue
    done
}

sfcb_rebuild() {
    attempt sfcbrepos -f || failed sfcbrepos \
        "the broker keeps its former repository; mend what sfcbrepos names and run: sfcbrepos -f"
}

sfcb_stage_parts() {
    for part in $parts; do
        sfcb_place "$part" "$(sfcb_namespace_of "$part")" "$(sfcb_form_of "$part")" || return 1
    done
}

sfcb_register() {
    set --
    for part in $parts; do set -- "$@" "$(sfcb_place_of "$part")"; done
    if ! sfcb_stage_parts || ! sfcb_rebuild; then
        sfcb_put_back "$@"
        return 1
    fi
    remember sfcb sfcbstage
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
    sfcb_knows provider || sfcb_knows companion || forget sfcb
    sfcb_restart
}
