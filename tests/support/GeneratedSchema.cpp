// The texts repeat, which costs a reader as much as others of their length.
#include "support/GeneratedSchema.h"

namespace {

constexpr const char* folders[] = {"Application", "Core",    "Database", "Device", "Event",
                                   "IPsecPolicy", "Network", "Physical", "System", "User"};

const std::string sentence =
    "The element tells what a manager has to know of the thing that it stands for, and how it is "
    "tied to the things around it. ";

/// As MOF writes long texts: strings side by side, one a line.
std::string description(unsigned sentences) {
    std::string text = "Description (";
    for (unsigned index = 0; index < sentences; ++index)
        text += "\n         \"" + sentence.substr(0, 64) + "\"\n         \"" + sentence.substr(64) +
                "\"";
    return text + " )";
}

std::string valueMap() {
    return "      ValueMap { \"0\", \"1\", \"2\", \"3\", \"4\", \"5\", \"6\", \"7..32767\",\n"
           "         \"0x8000..\" },\n"
           "      Values { \"Unknown\", \"Other\", \"Enabled\", \"Disabled\", \"Shutting Down\",\n"
           "         \"Not Applicable\", \"Starting\", \"DMTF Reserved\",\n"
           "         \"Vendor Reserved\" }";
}

std::string property(const std::string& qualifiers, const std::string& declaration) {
    return "      [" + qualifiers + "]\n   " + declaration + ";\n\n";
}

std::string method(const std::string& number) {
    return "      [" + description(3) + ",\n" + valueMap() + "]\n   uint32 RequestChange" + number +
           "(\n" + "         [IN, " + description(1) + ",\n" + valueMap() + "]\n" +
           "      uint16 RequestedState,\n" + "         [IN ( false ), OUT, " + description(1) +
           "]\n" + "      " + GeneratedSchema::className(0) + " REF Job,\n" + "         [IN, " +
           description(1) + "]\n      datetime TimeoutPeriod);\n";
}

std::string classText(unsigned number) {
    const std::string digits = std::to_string(number);
    const std::string superclass =
        number == 0 ? "" : " : " + GeneratedSchema::className((number - 1) / 3);
    std::string text =
        "   [Version ( \"2.41.0\" ),\n    UMLPackagePath ( \"GEN::Core\" ),\n      " +
        description(4) + "]\nclass " + GeneratedSchema::className(number) + superclass + " {\n\n";
    if (number == 0) text += property("Key, MaxLen ( 256 ), " + description(1), "string Id");
    text += property(description(2) + ", MaxLen ( 64 )", "string Label" + digits);
    text += property(description(3) + ",\n" + valueMap() +
                         ",\n      ModelCorrespondence { \"GEN_Class0.Label0\" }",
                     "uint16 State" + digits + " = 5");
    if (number > 0) text += property("Override ( \"Id\" ), " + description(1), "string Id");
    text += property(description(2) + ", Units ( \"Bytes\" ), PUnit ( \"byte\" ), Gauge",
                     "uint64 Size" + digits);
    text +=
        property(description(1) + ", ArrayType ( \"Indexed\" )", "string Notes" + digits + "[]");
    return text + method(digits) + "};\n";
}

const char* const qualifiers =
    "Qualifier ArrayType : string = \"Bag\", Scope(property, parameter), Flavor(DisableOverride);\n"
    "Qualifier Description : string = null, Scope(any), Flavor(Translatable);\n"
    "Qualifier Key : boolean = false, Scope(property, reference), Flavor(DisableOverride);\n"
    "Qualifier ModelCorrespondence : string[], Scope(any);\n"
    "Qualifier Override : string = null, Scope(property, reference, method), Flavor(Restricted);\n"
    "Qualifier Version : string = null, Scope(class, association, indication),\n"
    "    Flavor(Restricted, Translatable);\n";

}  // namespace

GeneratedSchema::GeneratedSchema() {
    directory_.write("qualifiers.mof", qualifiers);
    std::string all = "#pragma locale (\"en_US\")\n#pragma include (\"qualifiers.mof\")\n";
    for (unsigned number = 0; number < classCount; ++number) {
        const std::string file =
            std::string(folders[number % 10]) + "/" + className(number) + ".mof";
        directory_.write(file, classText(number));
        all += "#pragma include (\"" + file + "\")\n";
    }
    directory_.write("all.mof", all);
}

std::string GeneratedSchema::className(unsigned number) {
    return "GEN_Class" + std::to_string(number);
}
