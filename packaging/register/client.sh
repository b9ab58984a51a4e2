# Sourced by korva-osstatus-register: whether a running broker answers, asked through a client.
# shellcheck shell=sh

# Set by the command that sources this.
: "${work:?}"
# Read by the parts about object managers.
# shellcheck disable=SC2034
answer=

# A broker that hangs must not hang this.
bounded() { if installed timeout; then timeout 20 "$@"; else "$@"; fi; }

# Asks for names of instances: ask_through CLIENT MANAGER NAMESPACE CLASS
ask_through() {
    case $1-$2 in
        wbemcli-*) bounded wbemcli ein "http://localhost:5988/$3:$4" ;;
        cimcli-sfcb) bounded cimcli ni -l localhost:5988 -n "$3" "$4" ;;
        cimcli-pegasus) bounded cimcli ni -n "$3" "$4" ;;
    esac
}

# The first line of what the client said that is no frame.
first_words() { sed -n 's/^[* ]*//; /./{p;q;}' "$work/answer"; }

# Sets answer to the end of a sentence about a part. Fails if the broker answers with an error or with
# nothing; that nobody can be asked is no failure: ask MANAGER NAMESPACE CLASS CLIENT...
# shellcheck disable=SC2034
ask() {
    asked="$1 $2 $3"
    shift 3
    for client in "$@" none; do ! installed "$client" || break; done
    answer="; whether it answers is not known: no client (wbemcli, cimcli) is installed"
    [ "$client" != none ] || return 0

    client_end=0
    # Three words.
    # shellcheck disable=SC2086
    ask_through "$client" $asked >"$work/answer" 2>&1 </dev/null || client_end=$?
    if grep -Eq 'CIM_ERR_|Cim:' "$work/answer"; then
        answer=", but does not answer: $(first_words)"
    elif grep -Fiq "${asked##* }." "$work/answer"; then
        answer=", and answers"
        return 0
    elif [ "$client_end" -eq 124 ]; then
        answer=", but does not answer within 20 seconds"
    elif [ "$client_end" -eq 0 ]; then
        answer=", but answers with no instance"
    else
        answer="; whether it answers is not known: $(first_words)"
        return 0
    fi
    return 1
}
