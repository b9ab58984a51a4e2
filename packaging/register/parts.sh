# Sourced by korva-osstatus-register: what belongs to a part, the provider or the companion. The provider
# has two forms: object managers load the facade in front of it, or, bare, the provider itself.
# shellcheck shell=sh

# Set by the command that sources this.
: "${default_namespace:?}" "${prefix:?}" "${schema_dir:?}" "${work:?}" "${form:?}" "${package:?}"

classes_of() {
    case $1 in
        provider) echo KORVA_OperatingSystem KORVA_OperatingSystemCapabilities KORVA_InstalledOS \
            KORVA_RunningOS KORVA_OSElementCapabilities ;;
        companion) echo KORVA_ComputerSystem ;;
    esac
}

# The class that tells whether a part answers.
class_of() { classes_of "$1" | sed 's/ .*//'; }

stem_of() {
    case $1 in
        provider) echo korva-osstatus ;;
        companion) echo korva-osstatus-companion ;;
    esac
}

module_of() {
    case $1 in
        provider) echo KorvaOSStatusModule ;;
        companion) echo KorvaComputerSystemModule ;;
    esac
}

# The name that a provider is registered by: provider_of PART FORM
provider_of() {
    case $1-$2 in
        provider-bare) echo OperatingSystemProvider ;;
        provider-*) echo OSStatusFacade ;;
        companion-*) echo ComputerSystemProvider ;;
    esac
}

# Its library, without lib and .so: location_of PART FORM
location_of() {
    case $1-$2 in
        provider-bare) echo korzbosstatusprofileprovider ;;
        provider-*) echo korvaosstatusfacade ;;
        companion-*) echo korvacomputersystemprovider ;;
    esac
}

# The form that is to be registered: what the caller says; a package keeps what is there.
# form_after FORMER-FORM
form_after() {
    if [ "$package" = yes ] && [ "$form" = facade ]; then echo "${1:-facade}"; else echo "$form"; fi
}

need_file() {
    [ ! -r "$1" ] || return 0
    complain "cannot read $1"
    complain "install the package again, or name the tree that holds it with --prefix"
    return 1
}

# True if all files of a part can be read; tells the first one that cannot: has_files PART SUFFIX
has_files() {
    need_file "$prefix/share/korva-osstatus/registration/$(stem_of "$1")$2" || return 1
    for class in $(classes_of "$1"); do need_file "$schema_dir/$class.mof" || return 1; done
}

# Sets registration to the file of a part, or to a copy with what is other than usual:
# find_registration PART SUFFIX NAMESPACE FORM [AGENT-BITS]
find_registration() {
    registration=$(stem_of "$1")$2
    edits=
    [ "$3" = "$default_namespace" ] || edits="$edits;s|$default_namespace|$3|"
    [ "$1-$4" != provider-bare ] ||
        edits="$edits;s/$(provider_of "$1" facade)/$(provider_of "$1" bare)/
s/$(location_of "$1" facade)/$(location_of "$1" bare)/"
    [ "${5:-}" != 32 ] || edits="$edits;s|// Bitness = 2;.*|Bitness = 2;|"
    if [ -z "$edits" ]; then
        registration=$prefix/share/korva-osstatus/registration/$registration
    else
        sed "${edits#;}" "$prefix/share/korva-osstatus/registration/$registration" >"$work/$registration" ||
            return 1
        registration=$work/$registration
    fi
}
