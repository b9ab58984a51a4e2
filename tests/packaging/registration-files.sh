# The registrations for the object managers, as they are built for this word size.
# shellcheck shell=sh
: "${work:?}" "${KORVA_BINARY_DIR:?}" "${KORVA_SOURCE_DIR:?}" "${KORVA_WORD_SIZE:?}"
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
    bitness=
    [ "$KORVA_WORD_SIZE" = 64 ] || bitness="
   Bitness = 2;"
    expect_equal "the module" "instance of PG_ProviderModule {
   Name = \"KorvaOSStatusModule\";
   Vendor = \"Korva\";
   Version = \"1.0.0\";
   InterfaceType = \"CMPI\";
   InterfaceVersion = \"2.0.0\";
   Location = \"korzbosstatusprofileprovider\";$bitness
};" "$(sed -n '/^instance of PG_ProviderModule/,/^}/p' "$folder/korva-osstatus-pegasus.mof")"
    expect_equal "the provider" "instance of PG_Provider {
   ProviderModuleName = \"KorvaOSStatusModule\";
   Name = \"OperatingSystemProvider\";
};" "$(sed -n '/^instance of PG_Provider {/,/^}/p' "$folder/korva-osstatus-pegasus.mof")"
}

OpenPegasusIsToldOfACapability() {
    expect_equal "the last capability" "instance of PG_ProviderCapabilities {
   ProviderModuleName = \"KorvaOSStatusModule\";
   ProviderName = \"OperatingSystemProvider\";
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

# expect_factories REGISTRATION LIBRARY TYPE...: the names that an object manager looks up.
expect_factories() {
    provider=$(sed -n 's/^   provider: //p' "$folder/$1" | sort -u)
    location=$(sed -n 's/^   location: //p' "$folder/$1" | sort -u)
    library=$KORVA_BINARY_DIR/lib/lib$location.so
    shift
    for type in "$@"; do
        nm -D --defined-only "$library" | grep -q " T ${provider}_Create_${type}MI\$" ||
            fail "$library has no factory for $type of $provider"
    done
}

EachProviderNameHasItsFactoriesInItsLibrary() {
    expect_factories korva-osstatus.reg Instance Association
    expect_factories korva-osstatus-companion.reg Instance
}
