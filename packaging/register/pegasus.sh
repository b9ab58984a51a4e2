# Sourced by korva-osstatus-register: the object manager OpenPegasus. Registrations are instances in
# its interop namespace; with cimserver stopped, its repository can be written to, but not cleared.
# shellcheck shell=sh

# Set by the commands that source this.
registration=
: "${default_namespace:?}" "${interop:?}" "${schema_dir:?}" "${parts:?}" "${work:?}" "${dry_run:?}"
: "${repository?}" "${answer?}" "${repository_folder?}" "${namespaces_known?}"
: "${server_bits?}" "${library?}" "${agent?}" "${loader_bits?}"
classes_namespace=${namespace:-$default_namespace}

pegasus_present() { installed cimprovider && { installed cimmof || installed cimmofl; }; }

# What a compiler said although it did its work, such as that a class with the same Version stays.
pegasus_tell_warnings() { sed "s/^/    $1: /" "$work/output"; }

# Compiles files into a namespace: pegasus_compile NAMESPACE FILE...
pegasus_compile() {
    into=$1
    shift
    set -- -uc -n "$into" "$@"
    compiler=cimmof
    if [ "$answers" = no ]; then
        compiler=cimmofl
        [ -z "$repository" ] || set -- -R "$(dirname "$repository_folder")" "$@"
    fi
    if attempt "$compiler" "$@"; then
        [ "$dry_run" = yes ] || pegasus_tell_warnings "$compiler"
        return 0
    fi
    # Without the server nobody can take out the older registration; it serves as well.
    if [ "$answers" = no ] && grep -Eiq 'already.?exists' "$work/output"; then
        say "OpenPegasus: $into holds this already, and it stays as it is"
        return 0
    fi
    failed "$compiler" "$(pegasus_way_out)" || true
    [ "$namespaces_known" = yes ] || complain "if there was no namespace $into before and there is one now," \
        "delete it; whether there was one could not be asked without cimcli"
    return 1
}

# What to do about the output of a compiler that failed.
pegasus_way_out() {
    if grep -q 'Bitness' "$work/output"; then
        if [ "$server_bits" = 64 ]; then
            echo "this 64-bit server runs no 32-bit providers: install the amd64 packages"
        else
            echo "this server knows no 32-bit agents: if it is a 32-bit one, register with --agent-bits server"
        fi
    elif grep -Eiq 'invalid.?namespace' "$work/output"; then
        echo "the namespace $into does not exist: make it, or name another one, and register again"
    else
        echo "mend what it names and register again"
    fi
}

pegasus_withdraw() {
    module=$(module_of "$1")
    # The first command fails for a module that is disabled already; the second one decides.
    attempt cimprovider -d -m "$module" || true
    attempt cimprovider -r -m "$module" ||
        failed "cimprovider -r" "mend what it names and run this again"
}

# The commands that do without this one what unregistering does.
pegasus_by_hand() {
    for part in $parts; do
        say "    cimprovider -d -m $(module_of "$part")"
        say "    cimprovider -r -m $(module_of "$part")"
    done
}

# A part of a registration breaks requests to other providers.
pegasus_take_out_what_is_left() {
    if [ "$answers" = no ]; then
        complain "once cimserver runs, see whether $(module_of "$1") is left: cimprovider -l"
        complain "and take it out: cimprovider -r -m $(module_of "$1")"
    elif pegasus_answers && pegasus_knows "$1"; then
        complain "what it left of the $1 is taken out; the $1 is not registered"
        pegasus_withdraw "$1"
    fi
}

# All that can be known before anything is changed; sets what pegasus_add needs.
pegasus_check() {
    has_files "$1" -pegasus.mof || return 1
    former=
    if [ "$answers" = yes ]; then former=$(pegasus_form_of "$1"); fi
    part_form=$(form_after "$former")
    pegasus_find_library "$1" "$part_form" || return 1
    pegasus_choose_agent || return 1
    reason=$(why_not_loadable "$library" "$loader_bits")
    [ -n "$reason" ] || return 0
    complain "OpenPegasus cannot load the $1: $reason"
    complain "a provider that cannot be loaded breaks requests to others, so it is not registered;" \
        "install the packages of the server's word size, with all that they need"
    return 1
}

pegasus_add() {
    pegasus_check "$1" || return 1
    part=$1
    find_registration "$part" -pegasus.mof "$classes_namespace" "$part_form" "$agent" || return 1
    set --
    for class in $(classes_of "$part"); do set -- "$@" "$schema_dir/$class.mof"; done
    pegasus_compile "$classes_namespace" "$@" || return 1
    # Instances that are there already are not replaced, so the former ones go first.
    if [ "$answers" = yes ] && pegasus_knows "$part"; then pegasus_withdraw "$part" || return 1; fi
    pegasus_compile "$interop" "$registration" && return 0
    pegasus_take_out_what_is_left "$part"
    return 1
}

pegasus_register() {
    answers=no
    if pegasus_answers; then
        answers=yes
    elif installed cimmofl; then
        say "OpenPegasus: cimserver does not answer; its repository is written to directly"
        pegasus_find_repository || return 1
    else
        complain "cimserver does not answer, and cimmofl, which works without it, is not installed"
        complain "start cimserver and register again"
        return 1
    fi
    for name in "$classes_namespace" "$interop"; do pegasus_need_namespace "$name" || return 1; done
    for part in $parts; do pegasus_check "$part" || return 1; done
    for part in $parts; do pegasus_add "$part" || return 1; done
    remember pegasus cimprovider
}

pegasus_unregister() {
    if ! pegasus_answers; then
        complain "cimserver does not answer; OpenPegasus forgets a provider only while it runs"
        complain "start cimserver and unregister again"
        return 1
    fi
    for part in $parts; do
        if pegasus_knows "$part"; then
            pegasus_withdraw "$part" || return 1
            say "OpenPegasus: the classes of the $part stay in $classes_namespace"
        else
            say "OpenPegasus: the $part is not registered"
        fi
    done
    ! pegasus_answers || pegasus_knows provider || pegasus_knows companion || forget pegasus
}

# Tells of one part; fails unless it is registered, enabled and loadable, and answers as far as it can be asked.
pegasus_status_of() {
    if ! pegasus_knows "$1"; then
        say "OpenPegasus: the $1 is not registered"
        return 1
    fi
    part_form=$(pegasus_form_of "$1")
    known="the $1 ($(provider_of "$1" "$part_form")) is registered"
    state=$(pegasus_state_of "$1")
    if [ "$state" != OK ]; then
        say "OpenPegasus: $known, but disabled ($state): cimprovider -e -m $(module_of "$1") enables it"
        return 1
    fi
    pegasus_find_library "$1" "$part_form" || return 1
    pegasus_find_server
    # A 64-bit server that took a 32-bit module has agents for it.
    loader_bits=$server_bits
    [ "$(word_size_of "$library")-$server_bits" != 32-64 ] || loader_bits=
    reason=$(why_not_loadable "$library" "$loader_bits")
    if [ -n "$reason" ]; then
        say "OpenPegasus: $known, but cannot be loaded: $reason"
        return 1
    fi
    unanswered=0
    ask pegasus "$classes_namespace" "$(class_of "$1")" cimcli wbemcli || unanswered=1
    say "OpenPegasus: $known$answer"
    return "$unanswered"
}

pegasus_status() {
    answers=yes
    if ! pegasus_answers; then
        say "OpenPegasus: cimserver does not answer"
        return 1
    fi
    unknown=0
    for part in $parts; do pegasus_status_of "$part" || unknown=1; done
    return "$unknown"
}
