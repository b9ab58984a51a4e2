#include "host/server/ElementWriter.h"

#include <gtest/gtest.h>

#include <limits>

namespace cmpihost::server {
namespace {

const Site elementSite{"vm", "root/cimv2"};

std::string elementValue(const Value& value) {
    std::string xml;
    writeValue(xml, value, elementSite);
    return xml;
}

struct ValueRow {
    Value value;
    const char* expected;
};

TEST(ElementWriter, EachTypeOfValueHasItsForm) {
    constexpr double infinite = std::numeric_limits<double>::infinity();
    const ValueRow rows[] = {
        {Value::fromUnsigned(0, CMPI_uint8), "<VALUE>0</VALUE>"},
        {Value::fromUnsigned(255, CMPI_uint8), "<VALUE>255</VALUE>"},
        {Value::fromUnsigned(65535, CMPI_uint16), "<VALUE>65535</VALUE>"},
        {Value::fromUnsigned(4294967295, CMPI_uint32), "<VALUE>4294967295</VALUE>"},
        {Value::fromUnsigned(18446744073709551615U), "<VALUE>18446744073709551615</VALUE>"},
        {Value::fromSigned(-128, CMPI_sint8), "<VALUE>-128</VALUE>"},
        {Value::fromSigned(-32768, CMPI_sint16), "<VALUE>-32768</VALUE>"},
        {Value::fromSigned(-2147483648, CMPI_sint32), "<VALUE>-2147483648</VALUE>"},
        {Value::fromSigned(std::numeric_limits<std::int64_t>::min()),
         "<VALUE>-9223372036854775808</VALUE>"},
        {Value::fromSigned(7), "<VALUE>7</VALUE>"},
        {Value::fromBoolean(true), "<VALUE>TRUE</VALUE>"},
        {Value::fromBoolean(false), "<VALUE>FALSE</VALUE>"},
        {Value::fromReal(1.5, CMPI_real32), "<VALUE>1.50000000e+00</VALUE>"},
        {Value::fromReal(-0.1, CMPI_real32), "<VALUE>-1.00000001e-01</VALUE>"},
        {Value::fromReal(0.1), "<VALUE>1.0000000000000001e-01</VALUE>"},
        {Value::fromReal(std::numeric_limits<double>::max()),
         "<VALUE>1.7976931348623157e+308</VALUE>"},
        {Value::fromReal(std::numeric_limits<double>::denorm_min()),
         "<VALUE>4.9406564584124654e-324</VALUE>"},
        {Value::fromReal(infinite), "<VALUE>INF</VALUE>"},
        {Value::fromReal(-infinite, CMPI_real32), "<VALUE>-INF</VALUE>"},
        {Value::fromReal(std::numeric_limits<double>::quiet_NaN()), "<VALUE>NaN</VALUE>"},
        {Value(""), "<VALUE></VALUE>"},
        {Value("  kept blanks\t\n "), "<VALUE>  kept blanks\t\n </VALUE>"},
        {Value::fromText("chars", CMPI_chars), "<VALUE>chars</VALUE>"},
        {Value::fromUnsigned(0xE9, CMPI_char16), "<VALUE>\xC3\xA9</VALUE>"},
        {Value::fromUnsigned('<', CMPI_char16), "<VALUE>&lt;</VALUE>"},
        {Value::fromUnsigned(0, CMPI_char16), "<VALUE>\xEF\xBF\xBD</VALUE>"},
        {Value::fromUnsigned(0xD800, CMPI_char16), "<VALUE>\xEF\xBF\xBD</VALUE>"},
        {Value::fromText("20250301101500.000000-060", CMPI_dateTime),
         "<VALUE>20250301101500.000000-060</VALUE>"},
        {Value::fromText("00000003040506.000000:000", CMPI_dateTime),
         "<VALUE>00000003040506.000000:000</VALUE>"},
        {Value(), ""},
        {Value::null(CMPI_string), ""},
        {Value::null(CMPI_uint16A), ""},
        {Value::fromPointer({nullptr, 0}), ""},
        {Value::fromArray(CMPI_uint16, std::vector<Value>()), "<VALUE.ARRAY></VALUE.ARRAY>"},
        {Value::fromArray(CMPI_uint16, {Value::fromUnsigned(2, CMPI_uint16),
                                        Value::fromUnsigned(11, CMPI_uint16)}),
         "<VALUE.ARRAY><VALUE>2</VALUE><VALUE>11</VALUE></VALUE.ARRAY>"},
        {Value::fromReference({"root/cimv2", "A", {}, ""}),
         "<VALUE.REFERENCE><CLASSPATH><NAMESPACEPATH><HOST>vm</HOST><LOCALNAMESPACEPATH><NAMESPACE "
         "NAME=\"root\"/><NAMESPACE "
         "NAME=\"cimv2\"/></LOCALNAMESPACEPATH></NAMESPACEPATH><CLASSNAME "
         "NAME=\"A\"/></CLASSPATH></VALUE.REFERENCE>"},
        {Value::fromArray(CMPI_ref, std::vector<Value>()), "<VALUE.REFARRAY></VALUE.REFARRAY>"},
    };
    for (const ValueRow& row : rows) EXPECT_EQ(elementValue(row.value), row.expected);
}

TEST(ElementWriter, ANullInAnArrayIsAnEmptyTextOrNothing) {
    EXPECT_EQ(elementValue(Value::fromArray(CMPI_string, {"a", Value::null(CMPI_string), "c"})),
              "<VALUE.ARRAY><VALUE>a</VALUE><VALUE></VALUE><VALUE>c</VALUE></VALUE.ARRAY>");
    EXPECT_EQ(elementValue(Value::fromArray(CMPI_boolean,
                                            {Value::null(CMPI_boolean), Value::fromBoolean(true)})),
              "<VALUE.ARRAY><VALUE>TRUE</VALUE></VALUE.ARRAY>");
    EXPECT_EQ(elementValue(Value::fromArray(CMPI_ref, {Value::null(CMPI_ref)})),
              "<VALUE.REFARRAY></VALUE.REFARRAY>");
}

struct TextRow {
    std::string text;
    const char* content;
    const char* attribute;
};

TEST(ElementWriter, TextsAreEscapedAndWhatIsNoXmlIsReplaced) {
    const TextRow rows[] = {
        {"", "", ""},
        {"plain", "plain", "plain"},
        {"a&b<c>d\"e'f", "a&amp;b&lt;c&gt;d\"e'f", "a&amp;b&lt;c&gt;d&quot;e'f"},
        {"&&", "&amp;&amp;", "&amp;&amp;"},
        {"<![CDATA[<&]]>", "&lt;![CDATA[&lt;&amp;]]&gt;", "&lt;![CDATA[&lt;&amp;]]&gt;"},
        {"a\tb\nc", "a\tb\nc", "a b c"},
        {"a\rb\r\n", "a&#13;b&#13;\n", "a b  "},
        {"caf\xC3\xA9 \xE2\x82\xAC \xF0\x9F\x90\xA7", "caf\xC3\xA9 \xE2\x82\xAC \xF0\x9F\x90\xA7",
         "caf\xC3\xA9 \xE2\x82\xAC \xF0\x9F\x90\xA7"},
        {"\x7F\xC2\x80", "\x7F\xC2\x80", "\x7F\xC2\x80"},
        {std::string("a\0b", 3),
         "a\xEF\xBF\xBD"
         "b",
         "a\xEF\xBF\xBD"
         "b"},
        {"\x01\x1F", "\xEF\xBF\xBD\xEF\xBF\xBD", "\xEF\xBF\xBD\xEF\xBF\xBD"},
        // A byte of Latin-1, an overlong slash, a surrogate, above U+10FFFF, a cut character.
        {"\xE9!", "\xEF\xBF\xBD!", "\xEF\xBF\xBD!"},
        {"\xC0\xAF", "\xEF\xBF\xBD\xEF\xBF\xBD", "\xEF\xBF\xBD\xEF\xBF\xBD"},
        {"\xED\xA0\x80", "\xEF\xBF\xBD\xEF\xBF\xBD\xEF\xBF\xBD",
         "\xEF\xBF\xBD\xEF\xBF\xBD\xEF\xBF\xBD"},
        {"\xF4\x90\x80\x80", "\xEF\xBF\xBD\xEF\xBF\xBD\xEF\xBF\xBD\xEF\xBF\xBD",
         "\xEF\xBF\xBD\xEF\xBF\xBD\xEF\xBF\xBD\xEF\xBF\xBD"},
        {"a\xE2\x82", "a\xEF\xBF\xBD\xEF\xBF\xBD", "a\xEF\xBF\xBD\xEF\xBF\xBD"},
        // Characters that XML does not have, and their neighbours.
        {"\xEF\xBF\xBE|\xEF\xBF\xBF", "\xEF\xBF\xBD|\xEF\xBF\xBD", "\xEF\xBF\xBD|\xEF\xBF\xBD"},
        {"\xED\x9F\xBF\xEE\x80\x80\xEF\xBF\xBD", "\xED\x9F\xBF\xEE\x80\x80\xEF\xBF\xBD",
         "\xED\x9F\xBF\xEE\x80\x80\xEF\xBF\xBD"},
    };
    for (const TextRow& row : rows) {
        std::string content = "x";
        writeText(content, row.text);
        EXPECT_EQ(content, "x" + std::string(row.content));
        std::string attribute = "x";
        writeAttributeText(attribute, row.text);
        EXPECT_EQ(attribute, "x" + std::string(row.attribute));
    }
}

}  // namespace
}  // namespace cmpihost::server
