#include "host/broker/Value.h"

#include "host/broker/ClassCatalogue.h"

#include <gtest/gtest.h>

namespace cmpihost {
namespace {

TEST(Names, CompareWithoutCaseAndOnlyInFullLength) {
    EXPECT_TRUE(equalNames("CSName", "csNAME"));
    EXPECT_TRUE(equalNames("", ""));
    EXPECT_TRUE(equalNames("AZ", "az"));
    EXPECT_FALSE(equalNames("CSName", "CSNam"));
    EXPECT_FALSE(equalNames("[", "{"));
    EXPECT_FALSE(equalNames("\xC3\x84", "\xC3\xA4"));
}

TEST(TypeNames, AreThoseOfSchemas) {
    EXPECT_EQ(cimTypeName(CMPI_uint16), "uint16");
    EXPECT_EQ(cimTypeName(CMPI_stringA), "string[]");
    EXPECT_EQ(cimTypeName(CMPI_chars), "string");
    EXPECT_EQ(cimTypeName(CMPI_dateTime), "datetime");
    EXPECT_EQ(cimTypeName(0x55), "type 85");
}

TEST(ValueModel, ANullKeepsItsType) {
    const Value value = Value::null(CMPI_uint64);
    EXPECT_TRUE(value.isNull());
    EXPECT_EQ(value.type(), CMPI_uint64);
    EXPECT_EQ(value.toText(), "NULL");
    EXPECT_EQ(Value().type(), CMPI_null);
}

TEST(ValueModel, IntegersAreCutToTheWidthOfTheirType) {
    EXPECT_EQ(Value::fromUnsigned(0x1FF, CMPI_uint8).unsignedInteger(), 0xFFu);
    EXPECT_EQ(Value::fromUnsigned(0x12345, CMPI_char16).unsignedInteger(), 0x2345u);
    EXPECT_EQ(Value::fromUnsigned(0x3FFFF, CMPI_uint16).unsignedInteger(), 0xFFFFu);
    EXPECT_EQ(Value::fromUnsigned(0x3FFFFFFFF, CMPI_uint32).unsignedInteger(), 0xFFFFFFFFu);
    EXPECT_EQ(Value::fromUnsigned(~std::uint64_t{0}).unsignedInteger(), 18446744073709551615u);
    EXPECT_EQ(Value::fromSigned(0xFF, CMPI_sint8).signedInteger(), -1);
    EXPECT_EQ(Value::fromSigned(-9223372036854775807 - 1).toText(), "-9223372036854775808");
}

TEST(ValueModel, AnAccessorOfAnotherKindThrows) {
    EXPECT_THROW(Value("text").boolean(), std::bad_variant_access);
    EXPECT_THROW(Value::fromBoolean(true).text(), std::bad_variant_access);
    EXPECT_THROW(Value::null(CMPI_ref).reference(), std::bad_variant_access);
}

TEST(ValueModel, ValuesAreEqualByTypeAndContent) {
    EXPECT_EQ(Value("a"), Value::fromText("a", CMPI_chars));
    EXPECT_NE(Value("a"), Value("A"));
    EXPECT_NE(Value("a"), Value::fromText("a", CMPI_dateTime));
    EXPECT_NE(Value::fromUnsigned(1, CMPI_uint16), Value::fromUnsigned(1, CMPI_uint32));
    EXPECT_NE(Value::null(CMPI_uint16), Value::fromUnsigned(0, CMPI_uint16));
    EXPECT_EQ(Value::fromArray(CMPI_string, {"a", "b"}), Value::fromArray(CMPI_chars, {"a", "b"}));
    EXPECT_NE(Value::fromArray(CMPI_string, {"a", "b"}), Value::fromArray(CMPI_string, {"b", "a"}));
    char bytes[] = "ab";
    EXPECT_EQ(Value::fromPointer({bytes, 2}), Value::fromPointer({bytes, 2}));
    EXPECT_NE(Value::fromPointer({bytes, 2}), Value::fromPointer({bytes, 1}));
    EXPECT_NE(Value::fromPointer({bytes, 1}), Value::fromPointer({bytes + 1, 1}));
}

TEST(ValueModel, TextFormsAreThoseThatPeopleRead) {
    EXPECT_EQ(Value::fromBoolean(false).toText(), "false");
    EXPECT_EQ(Value::fromReal(0.1).toText(), "0.1");
    EXPECT_EQ(Value::fromReal(0.1, CMPI_real32).toText(), "0.1");
    EXPECT_EQ(Value::fromArray(CMPI_uint16,
                               {Value::fromUnsigned(5, CMPI_uint16), Value::null(CMPI_uint16)})
                  .toText(),
              "{5, NULL}");
    EXPECT_EQ(Value::fromReference({"root/cimv2", "TEST_Thing", {{"Name", "x"}}}).toText(),
              "root/cimv2:TEST_Thing.Name=\"x\"");
    EXPECT_EQ(Value::fromInstance({{"", "TEST_Thing"}, {}}).toText(), "instance of TEST_Thing");
}

TEST(ObjectPaths, AreWrittenWithQuotedTextAndPlainNumbers) {
    const ObjectPathValue path = {
        "root/cimv2",
        "TEST_Thing",
        {{"Name", "a \"b\" \\c"},
         {"Size", Value::fromUnsigned(7)},
         {"On", Value::fromBoolean(true)},
         {"Link", Value::fromReference({"", "TEST_Other", {{"Id", "1"}}})}}};
    EXPECT_EQ(toString(path),
              "root/cimv2:TEST_Thing.Name=\"a \\\"b\\\" \\\\c\",Size=7,On=TRUE,"
              "Link=\"TEST_Other.Id=\\\"1\\\"\"");
}

TEST(ObjectPaths, AreEqualWhateverTheOrderAndCaseOfTheirKeys) {
    const ObjectPathValue path = {"root/cimv2", "TEST_Thing", {{"A", "1"}, {"B", "2"}}};
    EXPECT_EQ(path, (ObjectPathValue{"ROOT/cimv2", "test_thing", {{"b", "2"}, {"a", "1"}}}));
    EXPECT_NE(path, (ObjectPathValue{"root/cimv2", "TEST_Thing", {{"A", "1"}, {"B", "3"}}}));
    EXPECT_NE(path, (ObjectPathValue{"root/cimv2", "TEST_Thing", {{"A", "1"}}}));
    EXPECT_NE((ObjectPathValue{"root/cimv2", "TEST_Thing", {{"A", "1"}}}), path);
    EXPECT_NE(path, (ObjectPathValue{"root/interop", "TEST_Thing", {{"A", "1"}, {"B", "2"}}}));
}

TEST(ObjectPaths, FindKeysWithoutCase) {
    const ObjectPathValue path = {"", "TEST_Thing", {{"Name", "x"}}};
    ASSERT_NE(path.key("NAME"), nullptr);
    EXPECT_EQ(path.key("NAME")->text(), "x");
    EXPECT_EQ(path.key("Nam"), nullptr);
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

TEST(References, CompareByThePathThatTheyPointTo) {
    const auto reference = [](const char* name) {
        return Value::fromReference({"root", "TEST_Thing", {{"Name", name}}});
    };
    EXPECT_EQ(reference("x"), reference("x"));
    EXPECT_NE(reference("x"), reference("y"));
}

}  // namespace
}  // namespace cmpihost
