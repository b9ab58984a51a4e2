# The registrations for the object managers, as they are built for this word size.
# shellcheck shell=sh
: "${work:?}" "${KORVA_BINARY_DIR:?}" "${KORVA_SOURCE_DIR:?}"
folder=$KORVA_BINARY_DIR/share/korva-osstatus/registration
schema=$KORVA_SOURCE_DIR/schema

# Class and types of each section of a registration for sfcb.
sfcb_types() { sed -n 's/^\[\(.*\)\]$/\1/p; s/^   type: //p' "$1" | paste -sd ' \n'; }

# Class and types of each capability in a registration for OpenPegasus.
pegasus_types() {
    sed -n 's/^   ClassName = "\(.*\)";$/\1/p; s/^   ProviderType = {2, 3};$/instance association/p
        s/^   ProviderType = {2};$/instance/p' "$1" | paste -sd ' \n'
}

# What the classes themselves say: class and types.
schema_types() {
    for class in "$@"; do
        if grep -q '^ *\[Association' "$schema/$class.mof"; then
            echo "$class instance association"
        else
            echo "$class instance"
        fi
    done
}

provider_classes() {
    find "$schema" -maxdepth 1 -name '*.mof' ! -name KORVA_ComputerSystem.mof -exec basename {} .mof \; | sort
}

EachClassIsRegisteredWithSfcbAsWhatItIs() {
    # Names of classes, without blanks.
    # shellcheck disable=SC2046
    expect_equal "the provider" "$(schema_types $(provider_classes))" \
        "$(sfcb_types "$folder/korva-osstatus.reg" | sort)"
    expect_equal "the companion" "KORVA_ComputerSystem instance" \
        "$(sfcb_types "$folder/korva-osstatus-companion.reg")"
}

EachClassIsRegisteredWithOpenPegasusAsWhatItIs() {
    # shellcheck disable=SC2046
    expect_equal "the provider" "$(schema_types $(provider_classes))" \
        "$(pegasus_types "$folder/korva-osstatus-pegasus.mof" | sort)"
    expect_equal "the companion" "KORVA_ComputerSystem instance" \
        "$(pegasus_types "$folder/korva-osstatus-companion-pegasus.mof")"
}

OpenPegasusIsToldOfTheModule() {
    expect_equal "the module" "instance of PG_ProviderModule {
   Name = \"KorvaOSStatusModule\";
   Vendor = \"Korva\";
   Version = \"1.0.0\";
   InterfaceType = \"CMPI\";
   InterfaceVersion = \"2.0.0\";
   Location = \"korvaosstatusfacade\";
   // Bitness = 2;   for the 32-bit agents of a 64-bit server, which take 32-bit libraries only
};" "$(sed -n '/^instance of PG_ProviderModule/,/^}/p' "$folder/korva-osstatus-pegasus.mof")"
    expect_equal "the provider" "instance of PG_Provider {
   ProviderModuleName = \"KorvaOSStatusModule\";
   Name = \"OSStatusFacade\";
};" "$(sed -n '/^instance of PG_Provider {/,/^}/p' "$folder/korva-osstatus-pegasus.mof")"
}

OpenPegasusIsToldOfACapability() {
    expect_equal "the last capability" "instance of PG_ProviderCapabilities {
   ProviderModuleName = \"KorvaOSStatusModule\";
   ProviderName = \"OSStatusFacade\";
   CapabilityID = \"5\";
   ClassName = \"KORVA_OSElementCapabilities\";
   Namespaces = {\"root/cimv2\"};
   ProviderType = {2, 3};
   SupportedProperties = NULL;
   SupportedMethods = NULL;
};" "$(tail -n 10 "$folder/korva-osstatus-pegasus.mof")"
}

CapabilitiesAreNumberedApart() {
    expect_equal "the numbers" "1 2 3 4 5" \
        "$(sed -n 's/^   CapabilityID = "\(.*\)";$/\1/p' "$folder/korva-osstatus-pegasus.mof" | paste -sd ' ')"
}

# The one value of a key: value_of KEY REGISTRATION
value_of() { sed -n "s/^   $1: //p" "$folder/$2" | sort -u; }

# expect_factories PROVIDER LOCATION TYPE...: the names that an object manager looks up.
expect_factories() {
    provider=$1
    library=$KORVA_BINARY_DIR/lib/lib$2.so
    shift 2
    for type in "$@"; do
        nm -D --defined-only "$library" | grep -q " T ${provider}_Create_${type}MI\$" ||
            fail "$library has no factory for $type of $provider"
    done
}

EachProviderNameHasItsFactoriesInItsLibrary() {
    for stem in korva-osstatus korva-osstatus-companion; do
        types=Instance
        [ "$stem" != korva-osstatus ] || types="Instance Association"
        # Two words.
        # shellcheck disable=SC2086
        expect_factories "$(value_of provider $stem.reg)" "$(value_of location $stem.reg)" $types
    done
    expect_factories OperatingSystemProvider korzbosstatusprofileprovider Instance Association
}

# ---- versions of the classes

# Name, Version and content of each class in a folder; comments on lines of their own are no content.
class_versions() {
    for file in "$1"/*.mof; do
        printf '%s %s %s\n' "$(basename "$file" .mof)" "$(sed -n 's/.*Version ( "\(.*\)" ).*/\1/p' "$file")" \
            "$(sed '/^ *\/\//d' "$file" | sha256sum | cut -d ' ' -f 1)"
    done
}

# Object managers keep a class that has the same Version as before. A class that changes gets a Version of
# its own, and a line in class-versions.txt beside the former ones, which UPDATE_GOLDEN=1 adds.
AClassThatChangesGetsAnotherVersion() {
    class_versions "$schema" >"$work/versions"
    while read -r version; do
        grep -qxF "$version" class-versions.txt && continue
        [ "${UPDATE_GOLDEN:-}" != 1 ] || { echo "$version" >>class-versions.txt; continue; }
        fail "$version: changed without another Version, or not in class-versions.txt"
    done <"$work/versions"
    expect_equal "the Versions with two contents" "" "$(cut -d ' ' -f 1,2 class-versions.txt | sort | uniq -d)"
}

AChangeOfAClassIsNoticed() {
    cp -R "$schema" "$work/schema"
    class_versions "$work/schema" >"$work/before"
    echo "// A comment." >>"$work/schema/KORVA_RunningOS.mof"
    expect_equal "the versions" "$(cat "$work/before")" "$(class_versions "$work/schema")"
    sed -i 's/Max ( 1 )/Max ( 2 )/' "$work/schema/KORVA_RunningOS.mof"
    expect_equal "the classes that changed" KORVA_RunningOS \
        "$(class_versions "$work/schema" | grep -vxF -f "$work/before" | cut -d ' ' -f 1)"
}
