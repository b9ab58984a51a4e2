// The value model: what values, paths and instances are equal to, how they read, and datetimes as
// numbers.
#include "host/broker/Value.h"

#include "host/broker/ClassCatalogue.h"
#include "host/broker/DateTimeText.h"

#include "BrokerFixture.h"

namespace cmpihost {
namespace {

TEST(TypeNames, AreThoseOfSchemas) {
    const std::vector<std::pair<CMPIType, const char*>> rows = {{CMPI_uint16, "uint16"},
                                                                {CMPI_stringA, "string[]"},
                                                                {CMPI_chars, "string"},
                                                                {CMPI_dateTime, "datetime"},
                                                                {0x55, "type 85"}};
    for (const auto& [type, name] : rows) EXPECT_EQ(cimTypeName(type), name);
}

TEST(ValueModel, ANullKeepsItsType) {
    const Value value = Value::null(CMPI_uint64);
    EXPECT_TRUE(value.isNull());
    EXPECT_EQ(value.type(), CMPI_uint64);
    EXPECT_EQ(Value().type(), CMPI_null);
}

TEST(ValueModel, AnAccessorOfAnotherKindThrows) {
    EXPECT_THROW(Value("text").boolean(), std::bad_variant_access);
    EXPECT_THROW(Value::fromBoolean(true).text(), std::bad_variant_access);
    EXPECT_THROW(Value::null(CMPI_ref).reference(), std::bad_variant_access);
}

TEST(ValueModel, ValuesAreEqualByTypeAndContent) {
    const auto reference = [](const char* name) {
        return Value::fromReference({"root", "TEST_Thing", {{"Name", name}}});
    };
    char bytes[] = "ab";
    const struct {
        Value left, right;
        bool equal;
    } rows[] = {
        {"a", Value::fromText("a", CMPI_chars), true},
        {"a", "A", false},
        {"a", Value::fromText("a", CMPI_dateTime), false},
        {Value::fromUnsigned(1, CMPI_uint16), Value::fromUnsigned(1, CMPI_uint32), false},
        {Value::null(CMPI_uint16), Value::fromUnsigned(0, CMPI_uint16), false},
        {Value::fromArray(CMPI_string, {"a", "b"}), Value::fromArray(CMPI_chars, {"a", "b"}), true},
        {Value::fromArray(CMPI_string, {"a", "b"}), Value::fromArray(CMPI_string, {"b", "a"}),
         false},
        {Value::fromPointer({bytes, 2}), Value::fromPointer({bytes, 2}), true},
        {Value::fromPointer({bytes, 2}), Value::fromPointer({bytes, 1}), false},
        {Value::fromPointer({bytes, 1}), Value::fromPointer({bytes + 1, 1}), false},
        {reference("x"), reference("x"), true},
        {reference("x"), reference("y"), false},
    };
    for (const auto& row : rows) {
        EXPECT_EQ(row.left == row.right, row.equal) << row.left.toText() << row.right.toText();
        EXPECT_EQ(row.left != row.right, !row.equal) << row.left.toText() << row.right.toText();
    }
}

TEST(ValueModel, TextFormsAreThoseThatPeopleReadAndIntegersAreCutToTheirWidth) {
    const std::vector<std::pair<Value, const char*>> rows = {
        {Value::null(CMPI_uint64), "NULL"},
        {Value::fromBoolean(false), "false"},
        {Value::fromUnsigned(0x1FF, CMPI_uint8), "255"},
        {Value::fromUnsigned(0x12345, CMPI_char16), "9029"},
        {Value::fromUnsigned(0x3FFFF, CMPI_uint16), "65535"},
        {Value::fromUnsigned(0x3FFFFFFFF, CMPI_uint32), "4294967295"},
        {Value::fromUnsigned(~std::uint64_t{0}), "18446744073709551615"},
        {Value::fromSigned(0xFF, CMPI_sint8), "-1"},
        {Value::fromSigned(0x18000, CMPI_sint16), "-32768"},
        {Value::fromSigned(0xFFFFFFFF, CMPI_sint32), "-1"},
        {Value::fromSigned(INT64_MIN), "-9223372036854775808"},
        {Value::fromReal(0.1), "0.1"},
        {Value::fromReal(0.1, CMPI_real32), "0.1"},
        {Value::fromReal(1.0 / 3), "0.3333333333333333"},
        {Value::fromReal(1.0 / 3, CMPI_real32), "0.33333334"},
        {Value::fromArray(CMPI_uint16,
                          {Value::fromUnsigned(5, CMPI_uint16), Value::null(CMPI_uint16)}),
         "{5, NULL}"},
        {Value::fromReference({"root/cimv2", "TEST_Thing", {{"Name", "x"}}}),
         "root/cimv2:TEST_Thing.Name=\"x\""},
        {Value::fromInstance({{"", "TEST_Thing"}, {}}), "instance of TEST_Thing"},
        {Value::fromPointer({nullptr, 7}), "7 bytes"}};
    for (const auto& [value, text] : rows) EXPECT_EQ(value.toText(), text);
}

TEST(ObjectPaths, AreWrittenAsClientsWriteThem) {
    const ObjectPathValue thing = {"a/b", "Thing", {{"Name", "x\"y"}}};
    const ObjectPathValue link = {"a/b", "Link", {{"From", Value::fromReference(thing)}}};
    const std::vector<std::pair<ObjectPathValue, const char*>> rows = {
        {{"root/cimv2", "Thing"}, "root/cimv2:Thing"},
        {{"", "Thing"}, "Thing"},
        {{"root", "Thing", {}, "host"}, "//host/root:Thing"},
        {{"n",
          "X",
          {{"S", "a\"b\\c"},
           {"C", Value::fromText("d", CMPI_chars)},
           {"U", Value::fromUnsigned(18446744073709551615U)},
           {"I", Value::fromSigned(-5, CMPI_sint16)},
           {"R", Value::fromReal(0.5)},
           {"T", Value::fromBoolean(true)},
           {"F", Value::fromBoolean(false)},
           {"W", Value::fromText("20240102030405.000000+000", CMPI_dateTime)},
           {"K", Value::fromUnsigned(0x20AC, CMPI_char16)},
           {"N", Value::null(CMPI_string)}}},
         R"(n:X.S="a\"b\\c",C="d",U=18446744073709551615,I=-5,R=0.5,T=TRUE,F=FALSE,)"
         "W=\"20240102030405.000000+000\",K=\"\xE2\x82\xAC\",N=\"\""},
        {link, R"(a/b:Link.From="a/b:Thing.Name=\"x\\\"y\"")"},
        {{"a/b", "Link", {{"Next", Value::fromReference(link)}}},
         R"(a/b:Link.Next="a/b:Link.From=\"a/b:Thing.Name=\\\"x\\\\\\\"y\\\"\"")"}};
    for (const auto& [path, text] : rows) EXPECT_EQ(toString(path), text);
}

TEST(ObjectPaths, AreEqualWhateverTheOrderAndCaseOfTheirKeys) {
    const ObjectPathValue path = {"root/cimv2", "TEST_Thing", {{"A", "1"}, {"B", "2"}}};
    EXPECT_EQ(path, (ObjectPathValue{"ROOT/cimv2", "test_thing", {{"b", "2"}, {"a", "1"}}}));
    const ObjectPathValue others[] = {{"root/cimv2", "TEST_Thing", {{"A", "1"}, {"B", "3"}}},
                                      {"root/cimv2", "TEST_Thing", {{"A", "1"}}},
                                      {"root/cimv2", "TEST_Thin", {{"A", "1"}, {"B", "2"}}},
                                      {"root/interop", "TEST_Thing", {{"A", "1"}, {"B", "2"}}}};
    for (const ObjectPathValue& other : others) {
        EXPECT_NE(path, other) << toString(other);
        EXPECT_NE(other, path) << toString(other);
    }
    ASSERT_NE(path.key("a"), nullptr);
    EXPECT_EQ(path.key("a")->text(), "1");
    EXPECT_EQ(path.key("AB"), nullptr);
}

TEST(Instances, AreEqualWithTheSamePathAndTheSameSetOfProperties) {
    const InstanceValue instance = {{"", "TEST_Thing"}, {{"A", "1"}, {"B", "2"}}};
    EXPECT_EQ(instance,
              (InstanceValue{{"", "TEST_Thing"}, {{"b", "2"}, {"a", "1", "TEST_Origin"}}}));
    EXPECT_NE(instance, (InstanceValue{{"", "TEST_Thing"}, {{"A", "1"}}}));
    EXPECT_NE(instance, (InstanceValue{{"", "TEST_Other"}, {{"A", "1"}, {"B", "2"}}}));
    ASSERT_NE(instance.property("a"), nullptr);
    EXPECT_EQ(instance.property("C"), nullptr);
}

TEST(Catalogue, TellsHowClassesAreRelated) {
    const TestCatalogue catalogue = testClasses();
    const struct {
        const ClassCatalogue* catalogue;
        const char* className;
        const char* ancestor;
        ClassRelation relation;
    } rows[] = {{&catalogue, "test_thing", "TEST_Thing", ClassRelation::Same},
                {&catalogue, "TEST_SmallThing", "test_thing", ClassRelation::Subclass},
                {&catalogue, "TEST_SmallThing", "CIM_Thing", ClassRelation::Subclass},
                {&catalogue, "TEST_SmallThing", "CIM_Base", ClassRelation::Unknown},
                {&catalogue, "TEST_Other", "TEST_Thing", ClassRelation::Unrelated},
                {&catalogue, "TEST_Unknown", "TEST_Thing", ClassRelation::Unknown},
                {nullptr, "TEST_Thing", "test_thing", ClassRelation::Same},
                {nullptr, "TEST_SmallThing", "TEST_Thing", ClassRelation::Unknown}};
    for (const auto& row : rows) {
        EXPECT_EQ(classRelation(row.catalogue, row.className, row.ancestor), row.relation)
            << row.className << " to " << row.ancestor;
    }
}

constexpr std::uint64_t noMicroseconds = ~std::uint64_t{0};

std::uint64_t microsecondsOf(const std::string& text) {
    const auto binary = parseDateTime(text);
    return binary && binary->microseconds ? *binary->microseconds : noMicroseconds;
}

TEST(DateTimeText, IsReadAsMicrosecondsSince1970InUtcOrOfTheInterval) {
    const std::pair<const char*, std::uint64_t> rows[] = {
        {"19700101000000.000000+000", 0},
        {"20000229123456.000007+000", 951827696000007},
        {"99991231235959.999999+000", 253402300799999999},
        {"19700101020000.000000+060", 3600000000},
        {"19700101020000.000000-060", 10800000000},
        {"200001011200**.******+000", 946728000000000},
        {"****0101000000.000000+000", noMicroseconds},
        {"1970****000000.000000+***", 0},
        {"00000001020304.000005:000", 93784000005},
        {"99999999235959.999999:000", 8639999999999999999},
        {"********000001.000000:000", 1000000},
        {"00000000000000.000000:000", 0},
        {"19691231235959.999999+000", noMicroseconds},
        {"00010101000000.000000+000", noMicroseconds}};
    for (const auto& [text, microseconds] : rows) {
        const auto binary = parseDateTime(text);
        ASSERT_TRUE(binary) << text;
        EXPECT_EQ(microsecondsOf(text), microseconds) << text;
        EXPECT_EQ(binary->interval, text[21] == ':') << text;
    }
}

TEST(DateTimeText, WhatIsNoDateTimeIsRefused) {
    for (const char* const text :
         {"", "20000101120000.000000+00", "20000101120000.000000+0000", "20000101120000,000000+000",
          "20000101120000.000000 000", "20001301120000.000000+000", "20000100120000.000000+000",
          "20000230120000.000000+000", "19000229120000.000000+000", "20000101240000.000000+000",
          "20000101126000.000000+000", "20000101120060.000000+000", "2000010112000x.000000+000",
          "00000101120000.000000+000", "00000001020304.000005:001", "00000001240304.000005:000",
          "2000010112000:.000000+000", "200001011/0000.000000+000", "2000010112003*.000000+000"}) {
        EXPECT_FALSE(parseDateTime(text)) << text;
    }
}

TEST(DateTimeText, IsWrittenInUtcWhereThereIsAText) {
    const struct {
        std::uint64_t microseconds;
        bool interval;
        std::optional<std::string> text;
    } rows[] = {{0, false, "19700101000000.000000+000"},
                {951827696000007, false, "20000229123456.000007+000"},
                {4107542399999999, false, "21000228235959.999999+000"},
                {253402300799999999, false, "99991231235959.999999+000"},
                {253402300800000000, false, std::nullopt},
                {93784000005, true, "00000001020304.000005:000"},
                {8639999999999999999u, true, "99999999235959.999999:000"},
                {8640000000000000000u, true, std::nullopt},
                {~std::uint64_t{0}, false, std::nullopt}};
    for (const auto& row : rows) {
        EXPECT_EQ(formatDateTime(row.microseconds, row.interval), row.text) << row.microseconds;
    }
}

TEST(DateTimeText, EveryDayOfFourCenturiesComesBackFromItsText) {
    constexpr std::uint64_t day = 86400000000u;
    for (std::uint64_t instant = 0; instant < 146097 * day; instant += day) {
        const auto text = formatDateTime(instant, false);
        ASSERT_TRUE(text);
        ASSERT_EQ(microsecondsOf(*text), instant) << *text;
    }
}

}  // namespace
}  // namespace cmpihost
