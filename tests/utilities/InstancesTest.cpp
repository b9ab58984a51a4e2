#include <cstdint>
#include <type_traits>

#include "utilities/UtilitiesFixture.h"

namespace {

using cmpihost::InstanceValue;
using cmpihost::Value;
using testing::ElementsAre;

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

class Instances : public UtilitiesFixture {
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
        cmpihost::FaultPlan plan(cmpihost::Fault{"newInstance", 1, 1, rc});
        broker.setFaultPlan(&plan);
        EXPECT_EQ(Utilities::createInstance(broker.cmpi(), path("C")), nullptr);
        broker.setFaultPlan(nullptr);
    }
    EXPECT_EQ(Utilities::createInstance(broker.cmpi(), nullptr), nullptr);
    EXPECT_EQ(Utilities::createInstance(nullptr, path("C")), nullptr);
}

TEST_P(Instances, TypeOfTheArgumentIsTheTypeOfTheProperty) {
    std::string text = "text";
    Utilities::setProperty(instance, "bool", true);
    Utilities::setProperty(instance, "uint16", static_cast<unsigned short>(65535));
    Utilities::setProperty(instance, "sint16", static_cast<short>(-32768));
    Utilities::setProperty(instance, "uint32", 4294967295U);
    Utilities::setProperty(instance, "uint64", 18446744073709551615ULL);
    Utilities::setProperty(instance, "unsigned long", 4294967295UL);
    Utilities::setProperty(instance, "string", text);
    Utilities::setProperty(instance, "ref", path("D", {{"x", "y"}}));
    EXPECT_EQ(property("bool"), Value::fromBoolean(true));
    EXPECT_EQ(property("uint16"), Value::fromUnsigned(65535, CMPI_uint16));
    EXPECT_EQ(property("sint16"), Value::fromSigned(-32768, CMPI_sint16));
    EXPECT_EQ(property("uint32"), Value::fromUnsigned(4294967295U, CMPI_uint32));
    EXPECT_EQ(property("uint64"), Value::fromUnsigned(18446744073709551615ULL, CMPI_uint64));
    EXPECT_EQ(property("unsigned long"), Value::fromUnsigned(4294967295U, CMPI_uint64));
    EXPECT_EQ(property("string"), Value("text"));
    EXPECT_EQ(property("ref").reference().className, "D");
}

TEST_P(Instances, CharactersAreATextInWhateverFormTheyAreGiven) {
    char written[] = "written";
    const char* const pointer = "pointer";
    Utilities::setProperty(instance, "literal", "literal");
    Utilities::setProperty(instance, "written", written);
    Utilities::setProperty(instance, "pointer", pointer);
    for (const char* name : {"literal", "written", "pointer"})
        EXPECT_EQ(property(name), Value(name));
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
    for (const cmpihost::Fault& fault :
         {cmpihost::Fault{"newArray", 1, 2, CMPI_RC_OK},
          cmpihost::Fault{"newArray", 1, 2, CMPI_RC_ERR_FAILED},
          cmpihost::Fault{"setElementAt", 2, 0, CMPI_RC_ERR_TYPE_MISMATCH}}) {
        cmpihost::FaultPlan plan(fault);
        broker.setFaultPlan(&plan);
        Utilities::setProperty(broker.cmpi(), instance, "numbers", numbers);
        Utilities::setProperty(broker.cmpi(), instance, "words", words);
        broker.setFaultPlan(nullptr);
        EXPECT_FALSE(has("numbers")) << fault.entry;
        EXPECT_FALSE(has("words")) << fault.entry;
    }
    cmpihost::FaultPlan plan(cmpihost::Fault{"newString", 2, 1, CMPI_RC_OK});
    broker.setFaultPlan(&plan);
    Utilities::setProperty(broker.cmpi(), instance, "words", words);
    broker.setFaultPlan(nullptr);
    EXPECT_FALSE(has("words"));
}

TEST_P(Instances, DateTimeTextBecomesADateTime) {
    std::string text = "20090317081542.000000+300";
    Utilities::setProperty(broker.cmpi(), instance, "moment", text, true);
    EXPECT_EQ(property("moment").type(), CMPI_dateTime);
    EXPECT_EQ(property("moment").text(), "20090317081542.000000+300");
}

TEST_P(Instances, TextThatIsNoDateTimeLeavesThePropertyOut) {
    for (std::string text : {"   00000000000.000000+000", "", "20090300000000.000000+000"}) {
        Utilities::setProperty(broker.cmpi(), instance, "moment", text, true);
        EXPECT_FALSE(has("moment")) << text;
    }
}

TEST_P(Instances, DateTimeThatTheBrokerDoesNotMakeLeavesThePropertyOut) {
    std::string text = "20090317081542.000000+300";
    for (const CMPIrc rc : {CMPI_RC_OK, CMPI_RC_ERR_FAILED}) {
        cmpihost::FaultPlan plan(cmpihost::Fault{"newDateTimeFromChars", 1, 1, rc});
        broker.setFaultPlan(&plan);
        Utilities::setProperty(broker.cmpi(), instance, "moment", text, true);
        broker.setFaultPlan(nullptr);
        EXPECT_FALSE(has("moment"));
    }
}

TEST_P(Instances, WithoutTheFlagATextStaysAText) {
    std::string text = "20090317081542.000000+300";
    Utilities::setProperty(broker.cmpi(), instance, "text", text, false);
    EXPECT_EQ(property("text"), Value("20090317081542.000000+300"));
}

TEST_P(Instances, NullArgumentsDoNothing) {
    std::string text = "20090317081542.000000+300";
    std::vector<unsigned short> numbers = {1};
    std::vector<std::string> words = {"a"};
    const std::size_t before = cmpihost::valueOf(instance).properties.size();
    CMPIObjectPath* const end = path("C");
    cmpihost::FaultPlan plan;  // of no faults: it counts
    broker.setFaultPlan(&plan);
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
    broker.setFaultPlan(nullptr);
    EXPECT_EQ(plan.calls(), 0U);
    EXPECT_EQ(cmpihost::valueOf(instance).properties.size(), before);
}

}  // namespace
