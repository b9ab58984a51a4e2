// Values of all types, in every spelling that clients use.
#include "host/server/RequestValue.h"

#include <gtest/gtest.h>

#include "host/mof/MofParser.h"
#include "host/mof/Schema.h"
#include "host/server/CimError.h"

namespace cmpihost::server {
namespace {

using namespace std::string_literals;

/// The value of a text as text; "none" for a text that is no value of the type.
std::string readBack(const std::string& text, const std::string& typeName) {
    const auto value = valueFromText(text, *typeNamed(typeName));
    if (!value) return "none";
    EXPECT_EQ(cimTypeName(value->type()), typeName) << text;
    return value->toText();
}

TEST(RequestValue, IsReadByItsType) {
    const struct {
        const char* type;
        const char* text;
        const char* value;
    } rows[] = {
        {"uint8", "0", "0"},
        {"uint8", "255", "255"},
        {"uint8", "256", "none"},
        {"uint8", "-1", "none"},
        {"uint8", "-0", "0"},
        {"uint8", "+7", "7"},
        {"uint8", "007", "7"},
        {"uint8", "0xff", "255"},
        {"uint8", "0XFF", "255"},
        {"uint8", "0x100", "none"},
        {"uint8", "0x", "none"},
        {"uint8", "ff", "none"},
        {"uint8", "1.0", "none"},
        {"uint8", "", "none"},
        {"uint8", "+", "none"},
        {"uint8", "+-1", "none"},
        {"uint8", " 1", "none"},
        {"uint8", "1 ", "none"},
        {"uint8", "one", "none"},
        {"sint8", "127", "127"},
        {"sint8", "128", "none"},
        {"sint8", "-128", "-128"},
        {"sint8", "-129", "none"},
        {"sint8", "-0x80", "-128"},
        {"uint16", "65535", "65535"},
        {"uint16", "65536", "none"},
        {"sint16", "32768", "none"},
        {"sint16", "-32768", "-32768"},
        {"uint32", "4294967295", "4294967295"},
        {"uint32", "4294967296", "none"},
        {"sint32", "-2147483648", "-2147483648"},
        {"sint32", "-2147483649", "none"},
        {"uint64", "18446744073709551615", "18446744073709551615"},
        {"uint64", "18446744073709551616", "none"},
        {"uint64", "0xFFFFFFFFFFFFFFFF", "18446744073709551615"},
        {"sint64", "9223372036854775807", "9223372036854775807"},
        {"sint64", "9223372036854775808", "none"},
        {"sint64", "-9223372036854775808", "-9223372036854775808"},
        {"sint64", "-9223372036854775809", "none"},
        {"boolean", "TRUE", "true"},
        {"boolean", "true", "true"},
        {"boolean", "False", "false"},
        {"boolean", "", "none"},
        {"boolean", "1", "none"},
        {"boolean", " TRUE", "none"},
        {"boolean", "yes", "none"},
        {"real64", "1.5", "1.5"},
        {"real64", "-1.50000000000000000e+02", "-150"},
        {"real64", "+2.5E-1", "0.25"},
        {"real64", "3", "3"},
        {"real64", ".5", "0.5"},
        {"real64", "INF", "inf"},
        {"real64", "-INF", "-inf"},
        {"real64", "NaN", "nan"},
        {"real64", "", "none"},
        {"real64", "infinity", "none"},
        {"real64", "nan", "none"},
        {"real64", "0x1p3", "none"},
        {"real64", "+-1.0", "none"},
        {"real64", "1.0e", "none"},
        {"real64", "1.0 ", "none"},
        {"real64", "1.0e999", "none"},
        {"real32", "1.5", "1.5"},
        {"real32", "1.0e39", "none"},
        {"real32", "INF", "inf"},
        {"string", "", ""},
        {"string", " any text ", " any text "},
        {"char16", "A", "65"},
        {"char16", "\xE2\x82\xAC", "8364"},
        {"char16", " ", "32"},
        {"char16", "", "none"},
        {"char16", "AB", "none"},
        {"char16", "\xF0\x9F\x98\x80", "none"},
        {"datetime", "20250301101500.000000+060", "20250301101500.000000+060"},
        {"datetime", "00000012233445.123456:000", "00000012233445.123456:000"},
        {"datetime", "20250301******.******+***", "20250301******.******+***"},
        {"datetime", "2025****101500.000000+060", "none"},
        {"datetime", "20250230101500.000000+060", "none"},
        {"datetime", "00000301101500.000000+060", "none"},
        {"datetime", "20250301101560.000000+060", "none"},
        {"datetime", "20250301101500.000000+06", "none"},
        {"datetime", "2025-03-01T10:15:00Z", "none"},
        {"datetime", "", "none"},
    };
    for (const auto& row : rows) {
        EXPECT_EQ(readBack(row.text, row.type), row.value) << row.type << " '" << row.text << "'";
    }
}

TEST(RequestValue, TypesAreKnownByNameWithoutCase) {
    EXPECT_EQ(typeNamed("UInt16"), CMPI_uint16);
    EXPECT_EQ(typeNamed("reference"), CMPI_ref);
    EXPECT_EQ(typeNamed("uint17"), std::nullopt);
    EXPECT_EQ(typeNamed(""), std::nullopt);
}

class RequestValues : public testing::Test {
  protected:
    RequestValues() : catalogue_(schema()) {}

    /// The value as text, or the error.
    std::string read(const std::string& xml, CMPIType type) const {
        return outcome(
            [&] { return readValue(parseXml(xml), type, catalogue_, "root/x").toText(); });
    }
    /// The instance, its path first, or the error.
    std::string instance(const std::string& content, const char* className = "T_Thing") const {
        const std::string xml =
            "<INSTANCE CLASSNAME='"s + className + "'>" + content + "</INSTANCE>";
        return outcome([&] {
            const InstanceValue read = readInstance(parseXml(xml), catalogue_, "root/x");
            std::string text = toString(read.path);
            for (const PropertyValue& property : read.properties) {
                text += " " + property.name + ":" + cimTypeName(property.value.type()) + "=" +
                        property.value.toText();
            }
            return text;
        });
    }

  private:
    static Schema schema() {
        Schema schema;
        schema.add(
            mof::parse("class T_Thing { [Key] string Id; uint16 Size; uint8 Codes[];"
                       "  T_Thing REF Next; datetime When; };",
                       "x.mof"));
        return schema;
    }
    template <class Reading>
    static std::string outcome(Reading reading) {
        try {
            return reading();
        } catch (const CimError& error) {
            return std::to_string(error.code()) + ": " + error.what();
        }
    }

    const SchemaCatalogue catalogue_;
};

TEST_F(RequestValues, AreReadFromTheirElements) {
    constexpr auto numbers = static_cast<CMPIType>(CMPI_uint8 | CMPI_ARRAY);
    constexpr auto references = static_cast<CMPIType>(CMPI_ref | CMPI_ARRAY);
    const std::string reference =
        "<VALUE.REFERENCE><INSTANCENAME CLASSNAME='t_thing'><KEYBINDING NAME='ID'><KEYVALUE>a"
        "</KEYVALUE></KEYBINDING></INSTANCENAME></VALUE.REFERENCE>";
    const struct {
        std::string xml;
        CMPIType type;
        const char* value;
    } rows[] = {
        {"<VALUE>7</VALUE>", CMPI_uint8, "7"},
        {"<VALUE></VALUE>", CMPI_string, ""},
        {"<VALUE></VALUE>", CMPI_uint8, "4: '' is no uint8"},
        {"<VALUE>x</VALUE>", CMPI_uint8, "4: 'x' is no uint8"},
        {"<VALUE.NULL/>", CMPI_uint8, "NULL"},
        {"<VALUE.ARRAY/>", numbers, "{}"},
        {"<VALUE.ARRAY><VALUE>1</VALUE><VALUE.NULL/><VALUE>0x2</VALUE></VALUE.ARRAY>", numbers,
         "{1, NULL, 2}"},
        {"<VALUE.ARRAY><VALUE>1</VALUE><VALUE>z</VALUE></VALUE.ARRAY>", numbers,
         "4: 'z' is no uint8"},
        {"<VALUE.ARRAY/>", CMPI_uint8, "13: an array is given for a single value"},
        {"<VALUE>1</VALUE>", numbers, "13: a single value is given for an array"},
        {reference, CMPI_ref, "root/x:T_Thing.Id=\"a\""},
        {"<VALUE.REFARRAY>" + reference + "<VALUE.NULL/></VALUE.REFARRAY>", references,
         "{root/x:T_Thing.Id=\"a\", NULL}"},
        {reference, CMPI_string, "4: VALUE.REFERENCE is no string"},
        {"<VALUE>T_Thing.Id=\"a\"</VALUE>", CMPI_ref, "4: 'T_Thing.Id=\"a\"' is no reference"},
        {"<CLASSNAME NAME='T_Thing'/>", CMPI_string, "4: CLASSNAME is no string"},
    };
    for (const auto& row : rows) EXPECT_EQ(read(row.xml, row.type), row.value) << row.xml;
}

TEST_F(RequestValues, OfAnInstanceHaveTheTypesThatTheSchemaDeclares) {
    EXPECT_EQ(instance("<PROPERTY NAME='ID' TYPE='string'><VALUE>a</VALUE></PROPERTY>"
                       "<PROPERTY NAME='size' TYPE='string'><VALUE>5</VALUE></PROPERTY>"
                       "<PROPERTY.ARRAY NAME='Codes' TYPE='uint32'><VALUE.ARRAY><VALUE>1</VALUE>"
                       "</VALUE.ARRAY></PROPERTY.ARRAY>",
                       "T_THING"),
              "root/x:T_Thing.Id=\"a\" Id:string=a Size:uint16=5 Codes:uint8[]={1}");
    EXPECT_EQ(instance("<QUALIFIER NAME='Q' TYPE='string'/><PROPERTY NAME='Size' TYPE='uint16'>"
                       "<QUALIFIER NAME='Q' TYPE='string'/></PROPERTY>"
                       "<PROPERTY NAME='When' TYPE='datetime'/><PROPERTY.REFERENCE NAME='Next'/>"),
              "root/x:T_Thing Size:uint16=NULL When:datetime=NULL Next:ref=NULL");
}

TEST_F(RequestValues, OfUndeclaredPropertiesHaveTheTypesThatTheClientTells) {
    const std::string content =
        "<PROPERTY NAME='A' TYPE='sint8'><VALUE>-5</VALUE></PROPERTY>"
        "<PROPERTY.ARRAY NAME='B' TYPE='boolean'><VALUE.ARRAY><VALUE>true</VALUE></VALUE.ARRAY>"
        "</PROPERTY.ARRAY><PROPERTY.REFERENCE NAME='C'><VALUE.REFERENCE><CLASSNAME NAME='X'/>"
        "</VALUE.REFERENCE></PROPERTY.REFERENCE>"
        "<PROPERTY NAME='D' TYPE='string' EmbeddedObject='instance'><VALUE>&lt;INSTANCE/></VALUE>"
        "</PROPERTY>";
    EXPECT_EQ(instance(content, "Other"),
              "root/x:Other A:sint8=-5 B:boolean[]={true} C:ref=root/x:X D:string=<INSTANCE/>");
    EXPECT_EQ(instance("<PROPERTY NAME='A' TYPE='sint8'><VALUE>-5</VALUE></PROPERTY>"),
              "root/x:T_Thing A:sint8=-5");
}

TEST_F(RequestValues, OfAnInstanceAreRefusedByTheNameOfTheProperty) {
    EXPECT_EQ(instance("<PROPERTY NAME='size' TYPE='uint16'><VALUE>70000</VALUE></PROPERTY>"),
              "4: Size: '70000' is no uint16");
    EXPECT_EQ(instance("<PROPERTY NAME='Codes' TYPE='uint8'><VALUE>7</VALUE></PROPERTY>"),
              "13: Codes: a single value is given for an array");
    EXPECT_EQ(instance("<PROPERTY NAME='Id' TYPE='string'/><PROPERTY NAME='id' TYPE='string'/>"),
              "4: Id: this property is given twice");
    EXPECT_EQ(instance("<PROPERTY NAME='New' TYPE='uint17'/>"), "4: uint17: there is no such type");
}

}  // namespace
}  // namespace cmpihost::server
