# Sourced by korva-osstatus-register: the object manager OpenPegasus. Registrations are instances in
# its interop namespace; with cimserver stopped, its repository can be written to, but not cleared.
# shellcheck shell=sh

# Set by the command that sources this.
registration=
: "${default_namespace:?}" "${interop:?}" "${schema_dir:?}" "${parts:?}" "${work:?}"
classes_namespace=${namespace:-$default_namespace}

pegasus_present() { installed cimprovider && { installed cimmof || installed cimmofl; }; }

# True if cimserver answers; its modules are then listed in $work/modules.
pegasus_answers() { cimprovider -l >"$work/modules" 2>/dev/null </dev/null; }

pegasus_knows() {
    grep -Eq "(^|[[:space:]])$(module_of "$1")([[:space:]]|\$)" "$work/modules"
}

# Compiles files into a namespace: pegasus_compile NAMESPACE FILE...
pegasus_compile() {
    into=$1
    shift
    set -- -uc -n "$into" "$@"
    if [ "$answers" = yes ]; then
        attempt cimmof "$@" || pegasus_compile_failed cimmof
        return
    fi
    [ -z "${repository:-}" ] || set -- -R "$repository" "$@"
    attempt cimmofl "$@" && return 0
    # Without the server nobody can take out the older registration; it serves as well.
    grep -Eiq 'already.?exists' "$work/output" || pegasus_compile_failed cimmofl || return 1
    say "OpenPegasus: $into holds this already"
}

pegasus_compile_failed() {
    failed "$1" "mend what it names and register again; does the namespace $into exist?"
}

pegasus_withdraw() {
    module=$(module_of "$1")
    # The first command fails for a module that is disabled already; the second one decides.
    attempt cimprovider -d -m "$module" || true
    attempt cimprovider -r -m "$module" ||
        failed "cimprovider -r" "mend what it names and run this again"
}

pegasus_add() {
    find_registration "$(stem_of "$1")-pegasus.mof" "$classes_namespace" || return 1
    part=$1
    set --
    for class in $(classes_of "$part"); do
        need_file "$schema_dir/$class.mof" || return 1
        set -- "$@" "$schema_dir/$class.mof"
    done
    pegasus_compile "$classes_namespace" "$@" || return 1
    # Instances that are there already are not replaced, so the former ones go first.
    if [ "$answers" = yes ] && pegasus_knows "$part"; then pegasus_withdraw "$part" || return 1; fi
    pegasus_compile "$interop" "$registration"
}

pegasus_register() {
    answers=no
    if pegasus_answers; then
        answers=yes
    elif installed cimmofl; then
        say "OpenPegasus: cimserver does not answer; its repository is written to directly"
    else
        complain "cimserver does not answer, and cimmofl, which works without it, is not installed"
        complain "start cimserver and register again"
        return 1
    fi
    for part in $parts; do pegasus_add "$part" || return 1; done
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
}

pegasus_status() {
    if ! pegasus_answers; then
        say "OpenPegasus: cimserver does not answer"
        return 1
    fi
    unknown=0
    for part in $parts; do
        if pegasus_knows "$part"; then
            say "OpenPegasus: the $part is registered"
        else
            say "OpenPegasus: the $part is not registered"
            unknown=1
        fi
    done
    return "$unknown"
}
