#include <limits>

#include "utilities/UtilitiesFixture.h"

namespace {

using cmpihost::KeyBinding;
using cmpihost::Value;
using testing::ElementsAre;
using testing::Pair;

class ObjectPaths : public UtilitiesFixture {
  protected:
    // The text of a key of the path's own type, "(none)" when it is none.
    std::string keyText(Value value) {
        std::string text = "(none)";
        Utilities::getKeyProperty(path("C", {{"Key", std::move(value)}}), "Key", text);
        return text;
    }
};

INSTANTIATE_TEST_SUITE_P(On, ObjectPaths, testing::Bool(), brokerName);

TEST_P(ObjectPaths, ClassIdsFollowTheClassNameWithoutLetterCase) {
    const std::pair<const char*, unsigned short> rows[] = {
        {"KORVA_ComputerSystem", 1},
        {"KORVA_OperatingSystem", 55},
        {"KORVA_OperatingSystemCapabilities", 56},
        {"KORVA_InstalledOS", 57},
        {"KORVA_RunningOS", 64},
        {"KORVA_OSElementCapabilities", 65},
        {"korva_runningos", 64},
        {"KORVA_RUNNINGOS", 64},
        {"KORVA_RunningOS ", 0},
        {"CIM_OperatingSystem", 0},
        {"", 0},
        {"KORVA_Runnin", 0},
    };
    for (const auto& [className, id] : rows) {
        EXPECT_EQ(Utilities::getClassId(className), id) << className;
        EXPECT_EQ(Utilities::getClassId(path(className)), id) << className;
    }
}

TEST_P(ObjectPaths, NullIsOfNoClass) {
    EXPECT_EQ(Utilities::getClassId(static_cast<const char*>(nullptr)), 0);
    EXPECT_EQ(Utilities::getClassId(static_cast<const CMPIObjectPath*>(nullptr)), 0);
}

TEST_P(ObjectPaths, KeysAreCountedAndAClassPathHasNone) {
    EXPECT_EQ(Utilities::getKeyCount(path("C")), 0U);
    EXPECT_EQ(Utilities::getKeyCount(path("C", {{"a", "1"}, {"b", "2"}})), 2U);
    EXPECT_EQ(Utilities::getKeyCount(nullptr), 0U);
}

TEST_P(ObjectPaths, NamespaceIsThatOfThePath) {
    EXPECT_EQ(Utilities::getNamespace(path("C")), "root/cimv2");
    EXPECT_EQ(Utilities::getNamespace(nullptr), "");
}

TEST_P(ObjectPaths, NewPathHasNoKeys) {
    CMPIObjectPath* created =
        Utilities::createObjectPath(broker.cmpi(), "KORVA_OperatingSystem", "root/x");
    ASSERT_NE(created, nullptr);
    const cmpihost::ObjectPathValue value = cmpihost::valueOf(created);
    EXPECT_EQ(value.nameSpace, "root/x");
    EXPECT_EQ(value.className, "KORVA_OperatingSystem");
    EXPECT_TRUE(value.keys.empty());
}

TEST_P(ObjectPaths, PathThatTheBrokerRefusesIsNull) {
    for (const CMPIrc rc : {CMPI_RC_OK, CMPI_RC_ERR_FAILED}) {
        cmpihost::FaultPlan plan(cmpihost::Fault{"newObjectPath", 1, 1, rc});
        broker.setFaultPlan(&plan);
        EXPECT_EQ(Utilities::createObjectPath(broker.cmpi(), "C", "root"), nullptr);
        broker.setFaultPlan(nullptr);
    }
    EXPECT_EQ(Utilities::createObjectPath(nullptr, "C", "root"), nullptr);
}

TEST_P(ObjectPaths, TextKeysAreAddedAndReplaced) {
    CMPIObjectPath* target = path("C");
    Utilities::setKeyProperty(target, "a", "1");
    Utilities::setKeyProperty(target, "b", std::string("2"));
    Utilities::setKeyProperty(target, "a", std::string("3"));
    const cmpihost::ObjectPathValue value = cmpihost::valueOf(target);
    ASSERT_EQ(value.keys.size(), 2U);
    EXPECT_EQ(*value.key("a"), Value("3"));
    EXPECT_EQ(*value.key("b"), Value("2"));
}

TEST_P(ObjectPaths, ReferenceKeysAreSetAndReadAsPaths) {
    CMPIObjectPath* target = path("KORVA_RunningOS");
    CMPIObjectPath* end = path("KORVA_ComputerSystem", {{"Name", "host1"}});
    Utilities::setKeyProperty(target, "Dependent", end);
    const CMPIObjectPath* read = nullptr;
    EXPECT_TRUE(Utilities::getKeyProperty(target, "Dependent", &read));
    EXPECT_EQ(cmpihost::valueOf(read), cmpihost::valueOf(end));
    std::string text = "untouched";
    EXPECT_FALSE(Utilities::getKeyProperty(target, "Dependent", text));
    EXPECT_EQ(text, "untouched");
}

TEST_P(ObjectPaths, KeyThatIsNoReferenceIsNotReadAsOne) {
    const CMPIObjectPath* untouched = path("C");
    const CMPIObjectPath* read = untouched;
    EXPECT_FALSE(Utilities::getKeyProperty(path("C", {{"a", "1"}}), "a", &read));
    EXPECT_FALSE(Utilities::getKeyProperty(path("C"), "a", &read));
    EXPECT_EQ(read, untouched);
}

TEST_P(ObjectPaths, KeysOfEveryTypeGiveTheirText) {
    EXPECT_EQ(keyText("text"), "text");
    EXPECT_EQ(keyText(Value::fromText("characters", CMPI_chars)), "characters");
    EXPECT_EQ(keyText(""), "");
    EXPECT_EQ(keyText(Value::fromBoolean(true)), "true");
    EXPECT_EQ(keyText(Value::fromBoolean(false)), "false");
    EXPECT_EQ(keyText(Value::fromUnsigned(std::numeric_limits<std::uint64_t>::max())),
              "18446744073709551615");
    EXPECT_EQ(keyText(Value::fromUnsigned(255, CMPI_uint8)), "255");
    EXPECT_EQ(keyText(Value::fromUnsigned(65535, CMPI_uint16)), "65535");
    EXPECT_EQ(keyText(Value::fromUnsigned(4294967295U, CMPI_uint32)), "4294967295");
    EXPECT_EQ(keyText(Value::fromSigned(std::numeric_limits<std::int64_t>::min())),
              "-9223372036854775808");
    EXPECT_EQ(keyText(Value::fromSigned(-128, CMPI_sint8)), "-128");
    EXPECT_EQ(keyText(Value::fromSigned(-32768, CMPI_sint16)), "-32768");
    EXPECT_EQ(keyText(Value::fromSigned(-2147483647, CMPI_sint32)), "-2147483647");
    EXPECT_EQ(keyText(Value::fromUnsigned(65, CMPI_char16)), "65");
    EXPECT_EQ(keyText(Value::fromReal(0.1F, CMPI_real32)), "0.100000001");
    EXPECT_EQ(keyText(Value::fromReal(0.1)), "0.10000000000000001");
    EXPECT_EQ(keyText(Value::fromText("20090317081542.000000+300", CMPI_dateTime)),
              "20090317081542.000000+300");
}

TEST_P(ObjectPaths, NullAndMissingKeysGiveNoText) {
    EXPECT_EQ(keyText(Value::null(CMPI_string)), "(none)");
    std::string text = "untouched";
    EXPECT_FALSE(Utilities::getKeyProperty(path("C", {{"a", "1"}}), "b", text));
    EXPECT_FALSE(Utilities::getKeyProperty(nullptr, "b", text));
    EXPECT_EQ(text, "untouched");
}

TEST_P(ObjectPaths, KeyNamesAreMatchedWithoutLetterCase) {
    std::string text;
    EXPECT_TRUE(Utilities::getKeyProperty(path("C", {{"csname", "h"}}), "CSName", text));
    EXPECT_EQ(text, "h");
}

TEST_P(ObjectPaths, MonikerTakesTheKeysInThePathsOrderAsTextWithoutReferences) {
    VA::Moniker moniker;
    Utilities::transformObjectPathToMoniker(
        path("C", {{"z", "1"},
                   {"a", Value::fromUnsigned(2)},
                   {"r", Value::fromReference(cmpihost::ObjectPathValue{"root", "D", {}, ""})},
                   {"n", Value::null(CMPI_string)},
                   {"b", Value::fromBoolean(true)}}),
        moniker);
    std::vector<std::pair<std::string, std::string>> keys(moniker.getKeyCount());
    for (unsigned int index = 0; index < keys.size(); ++index) {
        moniker.selectKey(index);
        moniker.getName(keys[index].first);
        moniker.getValue(keys[index].second);
    }
    EXPECT_THAT(keys, ElementsAre(Pair("z", "1"), Pair("a", "2"), Pair("b", "true")));
}

TEST_P(ObjectPaths, MonikersKeysBecomeKeysOfThePath) {
    VA::Moniker moniker;
    moniker.addKey("Name", "host1");
    moniker.addKey("Other", "");
    CMPIObjectPath* target = path("KORVA_ComputerSystem");
    CMPIObjectPath* const before = target;
    Utilities::transformMonikerToObjectPath(moniker, &target);
    EXPECT_EQ(target, before);
    EXPECT_EQ(cmpihost::toString(cmpihost::valueOf(target)),
              "root/cimv2:KORVA_ComputerSystem.Name=\"host1\",Other=\"\"");
}

TEST_P(ObjectPaths, NullArgumentsDoNothing) {
    VA::Moniker moniker;
    moniker.addKey("a", "1");
    CMPIObjectPath* none = nullptr;
    Utilities::transformObjectPathToMoniker(nullptr, moniker);
    Utilities::transformMonikerToObjectPath(moniker, &none);
    Utilities::transformMonikerToObjectPath(moniker, nullptr);
    Utilities::setKeyProperty(nullptr, "a", "1");
    Utilities::setKeyProperty(nullptr, "a", std::string("1"));
    CMPIObjectPath* target = path("C");
    Utilities::setKeyProperty(target, "a", static_cast<const char*>(nullptr));
    Utilities::setKeyProperty(target, "a", static_cast<CMPIObjectPath*>(nullptr));
    EXPECT_EQ(moniker.getKeyCount(), 1U);
    EXPECT_EQ(none, nullptr);
    EXPECT_EQ(Utilities::getKeyCount(target), 0U);
}

}  // namespace
