// What of a class is shown on a terminal, and what is told of it to printers of other forms.
#include "host/cli/Describe.h"

#include <gmock/gmock.h>

#include <sstream>

#include "host/cli/PathParser.h"
#include "host/mof/MofParser.h"

namespace {

using namespace cmpihost;
using testing::ElementsAre;

const Schema& devices() {
    static const Schema schema = Schema::load(KORVA_TEST_DATA "/cli/othermof");
    return schema;
}

template <class Kind>
Kind described(const std::string& subject) {
    return std::get<Kind>(describe(devices(), subject));
}

std::string shown(const std::string& subject, const Terminal& terminal) {
    std::ostringstream stream;
    print(describe(devices(), subject), terminal, stream);
    return stream.str();
}

TEST(Describe, TellsAClassWithWhatItInherits) {
    const auto disk = described<ClassDescription>("DISK");
    EXPECT_EQ(disk.summary.name, "Disk");
    EXPECT_FALSE(disk.summary.isAbstract);
    // A version is that of one class, a description one for all subclasses without their own.
    EXPECT_EQ(disk.version, "");
    EXPECT_THAT(disk.description, testing::StartsWith("A device."));
    EXPECT_THAT(disk.superclasses, ElementsAre("Device"));
    std::vector<std::string> names;
    for (const PropertyDescription& property : disk.properties) names.push_back(property.name);
    EXPECT_THAT(names,
                ElementsAre("Id", "State", "Capacity", "Partitions", "Size", "Kind", "Weight"));
    EXPECT_EQ(disk.methods.size(), 2U);
    EXPECT_THAT(described<ClassDescription>("Device").subclasses, ElementsAre("Disk"));
}

TEST(Describe, TellsAPropertyWithItsOriginAndWhereItsValueComesFrom) {
    const auto state = described<PropertyDescription>("disk.state");
    EXPECT_EQ(state.className, "Disk");
    EXPECT_EQ(state.origin, "Device");
    EXPECT_EQ(state.inheritedFrom, "");
    EXPECT_EQ(state.description, "Whether the disk turns.");
    EXPECT_EQ(state.defaultValue, "0");
    ASSERT_EQ(state.values.size(), 3U);
    EXPECT_EQ(state.values[1].value, "1..9");
    EXPECT_EQ(state.values[1].meaning, "Working");
    EXPECT_THAT(state.sources, ElementsAre("/proc/devices: state", "/proc/other"));
    EXPECT_THAT(described<PropertyDescription>("Disk.Id").sources,
                ElementsAre("MIF.DMTF: Device: 001.2"));
    EXPECT_TRUE(described<PropertyDescription>("Disk.Id").key);
}

TEST(Describe, TellsWhereAPropertyComesFromThatASchemaHasNotFrom) {
    Schema schema;
    schema.add(mof::parse("class A : CIM_A { [Override(\"P\")] uint8 P; uint8 Q; };", "x.mof"));
    const auto origin = [&](const std::string& subject) {
        const auto property = std::get<PropertyDescription>(describe(schema, subject));
        return property.origin + " " + property.inheritedFrom;
    };
    EXPECT_EQ(origin("A.P"), "A CIM_A");
    EXPECT_EQ(origin("A.Q"), "A ");
}

TEST(Describe, TellsWhatTakesThePlaceOfWhatIsDeprecated) {
    using Names = std::optional<std::vector<std::string>>;
    EXPECT_EQ(described<PropertyDescription>("Disk.Size").deprecated, Names({"Capacity"}));
    EXPECT_EQ(described<PropertyDescription>("Disk.Weight").deprecated,
              Names(std::vector<std::string>()));
    EXPECT_EQ(described<PropertyDescription>("Disk.Kind").deprecated, std::nullopt);
}

TEST(Describe, RefusesNamesInTextsThatAreSafeToPrint) {
    for (const char* subject : {"No\x1b", "Disk.No\x1b"}) {
        try {
            describe(devices(), subject);
            ADD_FAILURE() << "no error";
        } catch (const UsageError& error) {
            EXPECT_THAT(error.what(), testing::EndsWith(" 'No\\x1b'"));
        }
    }
}

TEST(Describe, WritesDefaultsAsMofDoes) {
    const std::pair<const char*, std::optional<std::string>> rows[] = {
        {"uint8 P = 0x10", "16"},         {"sint8 P = -5", "-5"},
        {"boolean P = true", "TRUE"},     {"string P = \"a\\\"b\"", "\"a\\\"b\""},
        {"char16 P = 'x'", "'x'"},        {"real64 P = 1.5", "1.5"},
        {"real32 P = 2.0", "2.0"},        {"uint8 P[] = {1, NULL}", "{1, NULL}"},
        {"uint8 P[] = {}", "{}"},         {"uint8 P[] = NULL", std::nullopt},
        {"uint8 P = NULL", std::nullopt}, {"uint8 P", std::nullopt},
    };
    for (const auto& [declaration, text] : rows) {
        Schema schema;
        schema.add(mof::parse(std::string("class A { ") + declaration + "; };", "x.mof"));
        EXPECT_EQ(std::get<PropertyDescription>(describe(schema, "A.P")).defaultValue, text)
            << declaration;
    }
}

TEST(Describe, WrapsTextsAtTheWidthOfTheTerminal) {
    EXPECT_EQ(shown("Device", {40, true}),
              "Device\n"
              "\n"
              "  A device.\n"
              "  It has a second line with \\x1b in it.\n"
              "  And a second sentence.\n"
              "\n"
              "  Kind          abstract class\n"
              "  Version       2.0\n"
              "  Subclasses    Disk\n"
              "\n"
              "Properties (* key)\n"
              "* Id     string  Which device it is.\n"
              "  State  uint16  The state.\n"
              "\n"
              "Methods\n"
              "  RequestState()  Asks for a state.\n");
}

TEST(Describe, ListsClassesInColumnsOfWhichTheFirstHasNoBlanks) {
    std::ostringstream stream;
    print(classSummaries(devices()), {}, stream);
    EXPECT_EQ(stream.str(),
              "Alarm                  -       indication\n"
              "Attached               -       association\n"
              "Device                 -       abstract class\n"
              "Disk                   Device  class\n"
              "KORVA_OperatingSystem  -       class\n");
}

}  // namespace
