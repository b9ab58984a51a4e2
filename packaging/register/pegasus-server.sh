# Sourced by korva-osstatus-register: what there is to know of the server of OpenPegasus, running or
# stopped: its modules, namespaces, repository, word size, and where it looks for libraries.
# shellcheck shell=sh

# Set by the commands that source this.
: "${agent_bits?}" "${repository?}" "${work:?}" "${cmpi_folder:?}"
# Whether cimserver runs, and what is found here for the caller.
answers=
repository_folder=
namespaces_known=no
server=
server_bits=
library=
agent=
# shellcheck disable=SC2034
loader_bits=

# ---- modules

# True if cimserver answers; its modules and their states are then listed in $work/modules.
pegasus_answers() { cimprovider -l -s >"$work/modules" 2>/dev/null </dev/null; }

pegasus_knows() {
    grep -Eq "^[[:space:]]*$(module_of "$1")([[:space:]]|\$)" "$work/modules"
}

pegasus_state_of() { sed -n "s/^[[:space:]]*$(module_of "$1")[[:space:]][[:space:]]*//p" "$work/modules"; }

# facade, bare, or nothing for a part that is not registered.
pegasus_form_of() {
    pegasus_knows "$1" || return 0
    cimprovider -l -m "$(module_of "$1")" >"$work/providers" 2>/dev/null </dev/null || return 0
    if grep -Fq "$(provider_of "$1" facade)" "$work/providers"; then echo facade; else echo bare; fi
}

# ---- namespaces and the repository

# A folder holds the repository if the root namespace, in one form of storage or another, is in it.
pegasus_is_repository() {
    for entry in "$1"/root*; do [ ! -e "$entry" ] || return 0; done
    return 1
}

# Sets repository_folder to the repository of a stopped server: the one that the caller names, by itself or
# by its parent, or else the server's own, as far as it tells that.
pegasus_find_repository() {
    repository_folder=$(pegasus_setting repositoryDir) || repository_folder=
    : "${repository_folder:=/nowhere}"
    [ -n "$repository" ] || return 0
    repository_folder=$(readlink -f "$repository") || repository_folder=$repository
    # cimmofl takes the parent, and appends this name.
    if [ "$(basename "$repository_folder")" != repository ] || ! pegasus_is_repository "$repository_folder"; then
        repository_folder=$repository_folder/repository
    fi
    ! pegasus_is_repository "$repository_folder" || return 0
    complain "neither $repository nor $repository/repository is a repository of OpenPegasus"
    complain "name the folder \"repository\" of the server, or the folder that it is in, with --repository"
    return 1
}

# Fails for a namespace that is known to be missing: a compiler would make it, and then fail all the same.
# Sets namespaces_known.
# shellcheck disable=SC2034
pegasus_need_namespace() {
    namespaces_known=no
    if [ "$answers" = yes ]; then
        installed cimcli && cimcli ns >"$work/namespaces" 2>/dev/null </dev/null || return 0
    else
        pegasus_is_repository "$repository_folder" || return 0
        for entry in "$repository_folder"/*; do basename "$entry" .db; done | tr '#' '/' >"$work/namespaces"
    fi
    sed 's/^[[:space:]]*//; s/[[:space:]]*$//' "$work/namespaces" >"$work/names"
    # Without the root namespace this is no list of them.
    grep -qix root "$work/names" || return 0
    namespaces_known=yes
    grep -qix "$1" "$work/names" || {
        complain "OpenPegasus has no namespace $1"
        complain "make it, or name another one (--namespace for the classes, --interop for registrations)"
        return 1
    }
}

# ---- libraries

# Prints a setting of the server, as it is while it runs, else as it will be.
pegasus_setting() {
    when=-p
    [ "$answers" = no ] || when=-c
    installed cimconfig && cimconfig -g "$1" "$when" 2>/dev/null </dev/null |
        sed -n "s/^$1 *= *//p; s/^[A-Za-z ]*value *[:=] *//p" | sed -n 1p
}

# Sets library to the file that the server loads for a part: pegasus_find_library PART FORM
pegasus_find_library() {
    location=$(location_of "$1" "$2")
    folders=$(pegasus_setting providerDir) || folders=
    if [ -z "$folders" ]; then
        say "OpenPegasus: whether it finds lib$location.so is not known: cimconfig does not tell providerDir"
        folders=$cmpi_folder
    fi
    library=$(library_in "$folders" "${PEGASUS_HOME:-/nowhere}" "$location")
    [ -z "$library" ] || return 0
    complain "OpenPegasus does not find the library of the $1, lib$location.so, in providerDir ($folders)"
    if [ ! -e "$cmpi_folder/lib$location.so" ]; then
        complain "it is not in $cmpi_folder either: install the package again, or name the tree with --prefix"
        return 1
    fi
    complain "let it look there, now and after a restart, then register again:"
    [ "$answers" = no ] || say "    cimconfig -s providerDir=$folders:$cmpi_folder -c" >&2
    say "    cimconfig -s providerDir=$folders:$cmpi_folder -p" >&2
    return 1
}

# Where a program of the server is, in PATH or near cimprovider; nothing if nowhere.
pegasus_program() {
    near=$(dirname "$(readlink -f "$(command -v cimprovider)")")
    for file in "$(command -v "$1")" "$near/$1" "$near/../sbin/$1"; do
        if [ -n "$file" ] && [ -e "$file" ]; then
            echo "$file"
            break
        fi
    done
}

# Sets server, its program, and server_bits, its word size; both are empty when it is not found.
pegasus_find_server() {
    server=$(pegasus_program cimserver)
    server_bits=$(word_size_of "$server")
}

# A stopped server cannot be asked for its agents; it takes a module for agents that it has not, too.
pegasus_has_agents_when_stopped() {
    if [ -z "$server_bits" ]; then
        complain "the library is a 32-bit one, and cimserver, which would tell its word size, is not found"
        complain "start it and register again, or tell what loads providers: --agent-bits 32, or server"
        return 1
    fi
    [ -z "$(pegasus_program cimprovagt32)" ] || return 0
    complain "the library is a 32-bit one, and $server a 64-bit one without 32-bit agents (cimprovagt32)"
    complain "install the amd64 packages; if it has such agents all the same, register with --agent-bits 32"
    return 1
}

# Sets agent, 32 for a module in the 32-bit agents of a 64-bit server, else server; and loader_bits, the
# word size of what loads the library, as far as it is known.
# shellcheck disable=SC2034
pegasus_choose_agent() {
    pegasus_find_server
    agent=$agent_bits
    if [ -z "$agent" ]; then
        agent=server
        if [ "$(word_size_of "$library")" = 32 ] && [ "$server_bits" != 32 ]; then
            agent=32
            [ "$answers" = yes ] || pegasus_has_agents_when_stopped || return 1
        fi
    fi
    loader_bits=$server_bits
    [ "$agent" = server ] || loader_bits=32
}
