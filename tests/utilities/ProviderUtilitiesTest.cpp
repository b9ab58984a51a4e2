// The utilities on the embedded broker: complete, and as poor as a provider may meet it.
#include "ProviderUtilities.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cstdint>
#include <limits>
#include <string>
#include <type_traits>
#include <utility>
#include <vector>

#include "host/broker/Broker.h"
#include "host/broker/RequestScope.h"

namespace {

using cmpihost::InstanceValue;
using cmpihost::KeyBinding;
using cmpihost::Value;
using testing::ElementsAre;
using testing::Pair;

template <class Value, class = void>
struct CanBeSet : std::false_type {};
template <class Value>
struct CanBeSet<Value, std::void_t<decltype(VA::ProviderUtilities::setProperty(
                           std::declval<CMPIInstance*>(), "", std::declval<Value>()))>>
    : std::true_type {};
template <class... Values>
constexpr bool canAllBeSet = (CanBeSet<Values>::value && ...);
template <class... Values>
constexpr bool canAnyBeSet = (CanBeSet<Values>::value || ...);

enum Enumerator : std::uint32_t {};

static_assert(canAllBeSet<bool, unsigned short, short, unsigned int, unsigned long,
                          unsigned long long, std::string&, CMPIObjectPath*>);
static_assert(canAllBeSet<std::uint16_t, std::int16_t, std::uint32_t, std::uint64_t, std::size_t>);
static_assert(canAllBeSet<const char*, char*, const char (&)[5], char (&)[26]>);
static_assert(!canAnyBeSet<char, signed char, unsigned char, wchar_t, int, long, long long, float,
                           double, Enumerator, std::nullptr_t, std::string, const std::string&>);
static_assert(!canAnyBeSet<void*, const void*, std::string*, const char**, const unsigned char*,
                           const CMPIObjectPath*, CMPIInstance*, CMPIString*, void (*)()>);

// An open request of a broker; the parameter says whether it is one with everything that may be
// missing missing.
class UtilitiesTest : public testing::TestWithParam<bool> {
  protected:
    using Utilities = VA::ProviderUtilities;

    UtilitiesTest()
        : broker(nullptr,
                 GetParam() ? cmpihost::BrokerOptions::sparse() : cmpihost::BrokerOptions{}) {}

    void TearDown() override { EXPECT_THAT(broker.takeViolations(), testing::IsEmpty()); }

    CMPIObjectPath* path(const std::string& className,
                         std::vector<cmpihost::KeyBinding> keys = {}) {
        cmpihost::ObjectPathValue value;
        value.nameSpace = "root/cimv2";
        value.className = className;
        value.keys = std::move(keys);
        return request.makePath(value);
    }

    // Does something on a broker with such faults, and counts the calls that reach it.
    template <class Action>
    unsigned int callsWhile(cmpihost::FaultPlan plan, Action action) {
        broker.setFaultPlan(&plan);
        action();
        broker.setFaultPlan(nullptr);
        return plan.calls();
    }
    template <class Action>
    unsigned int callsWhile(const cmpihost::Fault& fault, Action action) {
        return callsWhile(cmpihost::FaultPlan(fault), action);
    }

    cmpihost::Broker broker;
    cmpihost::RequestScope request{broker};
};

std::string brokerName(const testing::TestParamInfo<bool>& info) {
    return info.param ? "SparseBroker" : "CompleteBroker";
}

class ObjectPaths : public UtilitiesTest {
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
    EXPECT_EQ(Utilities::getClassId(static_cast<const char*>(nullptr)), 0);
    EXPECT_EQ(Utilities::getClassId(static_cast<const CMPIObjectPath*>(nullptr)), 0);
}

TEST_P(ObjectPaths, NewPathHasItsNamespaceAndClassAndNoKeys) {
    CMPIObjectPath* created =
        Utilities::createObjectPath(broker.cmpi(), "KORVA_OperatingSystem", "root/x");
    ASSERT_NE(created, nullptr);
    EXPECT_EQ(cmpihost::valueOf(created),
              (cmpihost::ObjectPathValue{"root/x", "KORVA_OperatingSystem", {}, ""}));
    EXPECT_EQ(Utilities::getNamespace(created), "root/x");
    EXPECT_EQ(Utilities::getNamespace(nullptr), "");
}

TEST_P(ObjectPaths, PathThatTheBrokerRefusesIsNull) {
    for (const CMPIrc rc : {CMPI_RC_OK, CMPI_RC_ERR_FAILED}) {
        callsWhile(cmpihost::Fault{"newObjectPath", 1, 1, rc}, [&] {
            EXPECT_EQ(Utilities::createObjectPath(broker.cmpi(), "C", "root"), nullptr);
        });
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
    EXPECT_EQ(Utilities::getKeyCount(target), 2U);
    EXPECT_EQ(Utilities::getKeyCount(nullptr), 0U);
    EXPECT_EQ(*value.key("a"), Value("3"));
    EXPECT_EQ(*value.key("b"), Value("2"));
}

TEST_P(ObjectPaths, ReferenceKeysAreSetAndReadAsPathsAndNoOthersAre) {
    CMPIObjectPath* target = path("KORVA_RunningOS", {{"text", "1"}});
    CMPIObjectPath* end = path("KORVA_ComputerSystem", {{"Name", "host1"}});
    Utilities::setKeyProperty(target, "Dependent", end);
    const CMPIObjectPath* read = nullptr;
    EXPECT_TRUE(Utilities::getKeyProperty(target, "Dependent", &read));
    EXPECT_EQ(cmpihost::valueOf(read), cmpihost::valueOf(end));
    const CMPIObjectPath* const before = read;
    for (const char* name : {"text", "missing"})
        EXPECT_FALSE(Utilities::getKeyProperty(target, name, &read)) << name;
    EXPECT_EQ(read, before);
}

TEST_P(ObjectPaths, KeysOfEveryTypeGiveTheirText) {
    const std::pair<Value, const char*> rows[] = {
        {"text", "text"},
        {"", ""},
        {Value::fromText("characters", CMPI_chars), "characters"},
        {Value::fromBoolean(true), "true"},
        {Value::fromBoolean(false), "false"},
        {Value::fromUnsigned(std::numeric_limits<std::uint64_t>::max()), "18446744073709551615"},
        {Value::fromUnsigned(255, CMPI_uint8), "255"},
        {Value::fromUnsigned(65535, CMPI_uint16), "65535"},
        {Value::fromUnsigned(4294967295U, CMPI_uint32), "4294967295"},
        {Value::fromSigned(std::numeric_limits<std::int64_t>::min()), "-9223372036854775808"},
        {Value::fromSigned(-128, CMPI_sint8), "-128"},
        {Value::fromSigned(-32768, CMPI_sint16), "-32768"},
        {Value::fromSigned(-2147483647, CMPI_sint32), "-2147483647"},
        {Value::fromUnsigned(65, CMPI_char16), "65"},
        {Value::fromReal(0.1F, CMPI_real32), "0.100000001"},
        {Value::fromReal(0.1), "0.10000000000000001"},
        {Value::fromText("20090317081542.000000+300", CMPI_dateTime), "20090317081542.000000+300"},
    };
    for (const auto& [value, text] : rows) EXPECT_EQ(keyText(value), text);
}

TEST_P(ObjectPaths, NullMissingAndReferenceKeysGiveNoText) {
    EXPECT_EQ(keyText(Value::null(CMPI_string)), "(none)");
    EXPECT_EQ(keyText(Value::fromReference(cmpihost::ObjectPathValue{"root", "D", {}, ""})),
              "(none)");
    std::string text = "untouched";
    EXPECT_FALSE(Utilities::getKeyProperty(path("C", {{"a", "1"}}), "b", text));
    EXPECT_FALSE(Utilities::getKeyProperty(nullptr, "b", text));
    EXPECT_EQ(text, "untouched");
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

class Instances : public UtilitiesTest {
  protected:
    CMPIInstance* instance = Utilities::createInstance(broker.cmpi(), path("C", {{"k", "v"}}));

    Value property(const char* name) {
        const InstanceValue value = cmpihost::valueOf(instance);
        const Value* found = value.property(name);
        return found == nullptr ? Value::null(CMPI_null) : *found;
    }
    bool has(const char* name) { return cmpihost::valueOf(instance).property(name) != nullptr; }
};

INSTANTIATE_TEST_SUITE_P(On, Instances, testing::Bool(), brokerName);

TEST_P(Instances, NewInstanceCarriesTheKeysOfItsPathInTheirOwnTypes) {
    instance = Utilities::createInstance(
        broker.cmpi(), path("C", {{"text", "v"},
                                  {"characters", Value::fromText("w", CMPI_chars)},
                                  {"number", Value::fromUnsigned(7, CMPI_uint16)},
                                  {"flag", Value::fromBoolean(true)},
                                  {"end", Value::fromReference(cmpihost::ObjectPathValue{
                                              "root", "D", {{"x", "y"}}, ""})}}));
    ASSERT_NE(instance, nullptr);
    EXPECT_EQ(property("text"), Value("v"));
    EXPECT_EQ(property("characters"), Value("w"));
    EXPECT_EQ(property("number"), Value::fromUnsigned(7, CMPI_uint16));
    EXPECT_EQ(property("flag"), Value::fromBoolean(true));
    EXPECT_EQ(property("end").reference().className, "D");
}

TEST_P(Instances, InstanceThatTheBrokerRefusesIsNull) {
    for (const CMPIrc rc : {CMPI_RC_OK, CMPI_RC_ERR_FAILED}) {
        callsWhile(cmpihost::Fault{"newInstance", 1, 1, rc}, [&] {
            EXPECT_EQ(Utilities::createInstance(broker.cmpi(), path("C")), nullptr);
        });
    }
    EXPECT_EQ(Utilities::createInstance(broker.cmpi(), nullptr), nullptr);
    EXPECT_EQ(Utilities::createInstance(nullptr, path("C")), nullptr);
}

TEST_P(Instances, TypeOfTheArgumentIsTheTypeOfTheProperty) {
    std::string text = "text";
    char written[] = "written";
    const char* const pointer = "pointer";
    Utilities::setProperty(instance, "bool", true);
    Utilities::setProperty(instance, "uint16", static_cast<unsigned short>(65535));
    Utilities::setProperty(instance, "sint16", static_cast<short>(-32768));
    Utilities::setProperty(instance, "uint32", 4294967295U);
    Utilities::setProperty(instance, "uint64", 18446744073709551615ULL);
    Utilities::setProperty(instance, "unsigned long", 4294967295UL);
    Utilities::setProperty(instance, "string", text);
    Utilities::setProperty(instance, "literal", "literal");
    Utilities::setProperty(instance, "written", written);
    Utilities::setProperty(instance, "pointer", pointer);
    Utilities::setProperty(instance, "ref", path("D", {{"x", "y"}}));
    const std::pair<const char*, Value> rows[] = {
        {"bool", Value::fromBoolean(true)},
        {"uint16", Value::fromUnsigned(65535, CMPI_uint16)},
        {"sint16", Value::fromSigned(-32768, CMPI_sint16)},
        {"uint32", Value::fromUnsigned(4294967295U, CMPI_uint32)},
        {"uint64", Value::fromUnsigned(18446744073709551615ULL, CMPI_uint64)},
        {"unsigned long", Value::fromUnsigned(4294967295U, CMPI_uint64)},
        {"string", "text"},
        {"literal", "literal"},
        {"written", "written"},
        {"pointer", "pointer"},
    };
    for (const auto& [name, value] : rows) EXPECT_EQ(property(name), value) << name;
    EXPECT_EQ(property("ref").reference().className, "D");
}

TEST_P(Instances, ArraysCarryTheirElementsInOrder) {
    std::vector<unsigned short> numbers = {3, 5};
    std::vector<std::string> words = {"a", "", "c"};
    std::vector<unsigned short> none;
    Utilities::setProperty(broker.cmpi(), instance, "numbers", numbers);
    Utilities::setProperty(broker.cmpi(), instance, "words", words);
    Utilities::setProperty(broker.cmpi(), instance, "none", none);
    EXPECT_EQ(property("numbers").type(), CMPI_uint16A);
    EXPECT_EQ(property("numbers").toText(), "{3, 5}");
    EXPECT_EQ(property("words").type(), CMPI_stringA);
    EXPECT_THAT(property("words").elements(), ElementsAre(Value("a"), Value(""), Value("c")));
    EXPECT_TRUE(property("none").elements().empty());
}

TEST_P(Instances, ArrayThatTheBrokerDoesNotCompleteIsLeftOut) {
    std::vector<unsigned short> numbers = {3, 5};
    std::vector<std::string> words = {"a", "b"};
    const auto set = [&] {
        Utilities::setProperty(broker.cmpi(), instance, "numbers", numbers);
        Utilities::setProperty(broker.cmpi(), instance, "words", words);
    };
    for (const cmpihost::Fault& fault :
         {cmpihost::Fault{"newArray", 1, 2, CMPI_RC_OK},
          cmpihost::Fault{"newArray", 1, 2, CMPI_RC_ERR_FAILED},
          cmpihost::Fault{"setElementAt", 2, 0, CMPI_RC_ERR_TYPE_MISMATCH}}) {
        callsWhile(fault, set);
        EXPECT_FALSE(has("numbers")) << fault.entry;
        EXPECT_FALSE(has("words")) << fault.entry;
    }
    callsWhile(cmpihost::Fault{"newString", 2, 1, CMPI_RC_OK}, set);
    EXPECT_TRUE(has("numbers"));
    EXPECT_FALSE(has("words"));
}

TEST_P(Instances, TextBecomesADateTimeWhereItIsFlaggedAsOne) {
    std::string text = "20090317081542.000000+300";
    Utilities::setProperty(broker.cmpi(), instance, "moment", text, true);
    EXPECT_EQ(property("moment").type(), CMPI_dateTime);
    EXPECT_EQ(property("moment").text(), text);
    Utilities::setProperty(broker.cmpi(), instance, "text", text, false);
    EXPECT_EQ(property("text"), Value(text));
}

TEST_P(Instances, EveryCimDateTimeIsHandedToABrokerAndLeftOutWhereThatMakesNone) {
    const std::pair<std::string, unsigned int> rows[] = {
        {"20090317081542.000000-060", 1}, {"****0317081542.000000+***", 1},
        {"99999999235959.999999:000", 1}, {"00000011132312.125000:***", 0},
        {"20090300000000.000000+000", 0}, {"", 0},
    };
    for (auto [text, calls] : rows) {
        for (const CMPIrc rc : {CMPI_RC_OK, CMPI_RC_ERR_FAILED}) {
            const auto set = [&, &moment = text] {
                Utilities::setProperty(broker.cmpi(), instance, "moment", moment, true);
            };
            EXPECT_EQ(callsWhile(cmpihost::Fault{"newDateTimeFromChars", 1, 1, rc}, set), calls)
                << text;
            EXPECT_FALSE(has("moment")) << text;
        }
    }
}

TEST_P(Instances, NullArgumentsDoNothing) {
    std::string text = "20090317081542.000000+300";
    std::vector<unsigned short> numbers = {1};
    std::vector<std::string> words = {"a"};
    const std::size_t before = cmpihost::valueOf(instance).properties.size();
    CMPIObjectPath* const end = path("C");
    const unsigned int calls = callsWhile(cmpihost::FaultPlan(), [&] {
        Utilities::setProperty(nullptr, "x", true);
        Utilities::setProperty(nullptr, "x", 1U);
        Utilities::setProperty(nullptr, "x", text);
        Utilities::setProperty(nullptr, "x", end);
        Utilities::setProperty(nullptr, "x", "text");
        Utilities::setProperty(instance, "x", static_cast<const char*>(nullptr));
        Utilities::setProperty(instance, "x", static_cast<CMPIObjectPath*>(nullptr));
        Utilities::setProperty(broker.cmpi(), nullptr, "x", numbers);
        Utilities::setProperty(broker.cmpi(), nullptr, "x", words);
        Utilities::setProperty(broker.cmpi(), nullptr, "x", text, true);
        Utilities::setProperty(nullptr, instance, "x", numbers);
        Utilities::setProperty(nullptr, instance, "x", text, true);
    });
    EXPECT_EQ(calls, 0U);
    EXPECT_EQ(cmpihost::valueOf(instance).properties.size(), before);
}

}  // namespace
