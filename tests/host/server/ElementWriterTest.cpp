#include "host/server/ElementWriter.h"

#include <gmock/gmock.h>

#include <limits>

#include "host/server/ResponseValidator.h"
#include "host/server/ResponseWriter.h"

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
    EXPECT_EQ(elementValue(Value::fromArray(CMPI_instance, {Value::null(CMPI_instance)})),
              "<VALUE.ARRAY></VALUE.ARRAY>");
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

const std::string vmRootCimv2 =
    "<NAMESPACEPATH><HOST>vm</HOST><LOCALNAMESPACEPATH><NAMESPACE NAME=\"root\"/><NAMESPACE "
    "NAME=\"cimv2\"/></LOCALNAMESPACEPATH></NAMESPACEPATH>";

/// What a function writes, which is a response of the operation that the validator takes.
template <class Write>
std::string writtenFor(const std::string& operation, Write write) {
    Message message;
    message.id = "7";
    message.method = operation;
    std::string xml;
    beginResponse(xml, message);
    const std::size_t start = xml.size();
    write(xml);
    const std::string written = xml.substr(start);
    endResponse(xml, message);
    EXPECT_THAT(complaintsAbout(xml, operation), testing::ElementsAre());
    return written;
}

TEST(ElementWriter, KeysAreTaggedByTheirTypes) {
    ObjectPathValue part;
    part.nameSpace = "/root//other/";
    part.className = "X_Part";
    part.keys = {{"Id", "a\"<b>\""}};
    part.hostName = "elsewhere";
    ObjectPathValue path;
    path.nameSpace = "root/cimv2";
    path.className = "X_Link";
    path.keys = {{"Text", "two words"},
                 {"Chars", Value::fromText("", CMPI_chars)},
                 {"Small", Value::fromUnsigned(36, CMPI_uint16)},
                 {"Minus", Value::fromSigned(-5)},
                 {"Yes", Value::fromBoolean(true)},
                 {"When", Value::fromText("20250301101500.000000+000", CMPI_dateTime)},
                 {"Letter", Value::fromUnsigned('x', CMPI_char16)},
                 {"None", Value::null(CMPI_string)},
                 {"Part", Value::fromReference(part)}};
    const auto written = writtenFor("EnumerateInstanceNames", [&](std::string& xml) {
        xml += "<IRETURNVALUE>";
        writeInstanceNames(xml, {path}, elementSite);
        xml += "</IRETURNVALUE>";
    });
    EXPECT_EQ(
        written,
        "<IRETURNVALUE><INSTANCENAME CLASSNAME=\"X_Link\">"
        "<KEYBINDING NAME=\"Text\"><KEYVALUE VALUETYPE=\"string\">two words</KEYVALUE></KEYBINDING>"
        "<KEYBINDING NAME=\"Chars\"><KEYVALUE VALUETYPE=\"string\"></KEYVALUE></KEYBINDING>"
        "<KEYBINDING NAME=\"Small\"><KEYVALUE VALUETYPE=\"numeric\">36</KEYVALUE></KEYBINDING>"
        "<KEYBINDING NAME=\"Minus\"><KEYVALUE VALUETYPE=\"numeric\">-5</KEYVALUE></KEYBINDING>"
        "<KEYBINDING NAME=\"Yes\"><KEYVALUE VALUETYPE=\"boolean\">TRUE</KEYVALUE></KEYBINDING>"
        "<KEYBINDING NAME=\"When\"><KEYVALUE VALUETYPE=\"string\">20250301101500.000000+000"
        "</KEYVALUE></KEYBINDING>"
        "<KEYBINDING NAME=\"Letter\"><KEYVALUE VALUETYPE=\"string\">x</KEYVALUE></KEYBINDING>"
        "<KEYBINDING NAME=\"None\"><KEYVALUE VALUETYPE=\"string\"></KEYVALUE></KEYBINDING>"
        "<KEYBINDING NAME=\"Part\"><VALUE.REFERENCE><INSTANCEPATH><NAMESPACEPATH><HOST>elsewhere"
        "</HOST><LOCALNAMESPACEPATH><NAMESPACE NAME=\"root\"/><NAMESPACE NAME=\"other\"/>"
        "</LOCALNAMESPACEPATH></NAMESPACEPATH><INSTANCENAME CLASSNAME=\"X_Part\"><KEYBINDING "
        "NAME=\"Id\"><KEYVALUE VALUETYPE=\"string\">a\"&lt;b&gt;\"</KEYVALUE></KEYBINDING>"
        "</INSTANCENAME></INSTANCEPATH></VALUE.REFERENCE></KEYBINDING></INSTANCENAME>"
        "</IRETURNVALUE>");
}

TEST(ElementWriter, AnInstanceHasThePropertiesThatHaveAValue) {
    InstanceValue inner;
    inner.path.className = "X_Inner";
    inner.properties = {{"Text", "a&b"}};
    InstanceValue instance;
    instance.path = {"", "X_Thing", {}, ""};
    instance.properties = {
        {"Name", "x", "X_Base"},
        {"Description", ""},
        {"Nothing", Value::null(CMPI_uint32)},
        {"Codes", Value::fromArray(CMPI_uint16, {Value::fromUnsigned(2, CMPI_uint16)})},
        {"NoTexts", Value::fromArray(CMPI_string, std::vector<Value>())},
        {"Inner", Value::fromInstance(inner)},
        {"Inners", Value::fromArray(CMPI_instance, {Value::fromInstance(inner)})},
        {"Link", Value::fromReference({"", "X_Far", {{"Id", Value::fromBoolean(false)}}, ""})},
        {"Links", Value::fromArray(CMPI_ref, std::vector<Value>())},
        {"Bytes", Value::fromPointer({nullptr, 0})}};
    const std::string embedded =
        "&lt;INSTANCE CLASSNAME=\"X_Inner\"&gt;&lt;PROPERTY NAME=\"Text\" TYPE=\"string\"&gt;"
        "&lt;VALUE&gt;a&amp;amp;b&lt;/VALUE&gt;&lt;/PROPERTY&gt;&lt;/INSTANCE&gt;";
    const std::string first =
        "<INSTANCE CLASSNAME=\"X_Thing\"><PROPERTY NAME=\"Name\" TYPE=\"string\"";
    const std::string rest =
        "><VALUE>x</VALUE></PROPERTY>"
        "<PROPERTY NAME=\"Description\" TYPE=\"string\"><VALUE></VALUE></PROPERTY>"
        "<PROPERTY.ARRAY NAME=\"Codes\" TYPE=\"uint16\"><VALUE.ARRAY><VALUE>2</VALUE></VALUE.ARRAY>"
        "</PROPERTY.ARRAY>"
        "<PROPERTY.ARRAY NAME=\"NoTexts\" TYPE=\"string\"><VALUE.ARRAY></VALUE.ARRAY>"
        "</PROPERTY.ARRAY>"
        "<PROPERTY NAME=\"Inner\" TYPE=\"string\" EmbeddedObject=\"instance\"><VALUE>" +
        embedded +
        "</VALUE></PROPERTY>"
        "<PROPERTY.ARRAY NAME=\"Inners\" TYPE=\"string\" EmbeddedObject=\"instance\"><VALUE.ARRAY>"
        "<VALUE>" +
        embedded +
        "</VALUE></VALUE.ARRAY></PROPERTY.ARRAY>"
        "<PROPERTY.REFERENCE NAME=\"Link\" "
        "REFERENCECLASS=\"X_Far\"><VALUE.REFERENCE><INSTANCEPATH>" +
        vmRootCimv2 +
        "<INSTANCENAME CLASSNAME=\"X_Far\"><KEYBINDING NAME=\"Id\"><KEYVALUE VALUETYPE=\"boolean\">"
        "FALSE</KEYVALUE></KEYBINDING></INSTANCENAME></INSTANCEPATH></VALUE.REFERENCE>"
        "</PROPERTY.REFERENCE></INSTANCE>";
    const auto written = [&](bool classOrigin) {
        return writtenFor("GetInstance", [&](std::string& xml) {
            xml += "<IRETURNVALUE>";
            writeInstance(xml, instance, elementSite, classOrigin);
            xml += "</IRETURNVALUE>";
        });
    };
    EXPECT_EQ(written(false), "<IRETURNVALUE>" + first + rest + "</IRETURNVALUE>");
    EXPECT_EQ(written(true),
              "<IRETURNVALUE>" + first + " CLASSORIGIN=\"X_Base\"" + rest + "</IRETURNVALUE>");
}

TEST(ElementWriter, ListsHaveTheFormsThatOperationsAnswer) {
    const ObjectPathValue path{"root/cimv2", "X", {{"K", "k"}}, ""};
    const InstanceValue instance{path, {{"K", "k"}}};
    const std::string name =
        "<INSTANCENAME CLASSNAME=\"X\"><KEYBINDING NAME=\"K\"><KEYVALUE VALUETYPE=\"string\">k"
        "</KEYVALUE></KEYBINDING></INSTANCENAME>";
    const std::string wholePath = "<INSTANCEPATH>" + vmRootCimv2 + name + "</INSTANCEPATH>";
    const std::string properties =
        "<INSTANCE CLASSNAME=\"X\"><PROPERTY NAME=\"K\" TYPE=\"string\"><VALUE>k</VALUE></PROPERTY>"
        "</INSTANCE>";
    const auto twice = [](const std::string& text) {
        return "<IRETURNVALUE>" + text + text + "</IRETURNVALUE>";
    };
    using Write = void (*)(std::string&, const std::vector<InstanceValue>&, const Site&, bool);
    const auto instances = [&](const char* operation, Write write) {
        return writtenFor(operation, [&](std::string& xml) {
            xml += "<IRETURNVALUE>";
            write(xml, {instance, instance}, elementSite, false);
            xml += "</IRETURNVALUE>";
        });
    };
    EXPECT_EQ(instances("EnumerateInstances", writeNamedInstances),
              twice("<VALUE.NAMEDINSTANCE>" + name + properties + "</VALUE.NAMEDINSTANCE>"));
    EXPECT_EQ(instances("Associators", writeObjectsWithPath),
              twice("<VALUE.OBJECTWITHPATH>" + wholePath + properties + "</VALUE.OBJECTWITHPATH>"));
    using WritePaths = void (*)(std::string&, const std::vector<ObjectPathValue>&, const Site&);
    const auto paths = [&](const char* operation, WritePaths write) {
        return writtenFor(operation, [&](std::string& xml) {
            xml += "<IRETURNVALUE>";
            write(xml, {path, path}, elementSite);
            xml += "</IRETURNVALUE>";
        });
    };
    EXPECT_EQ(paths("EnumerateInstanceNames", writeInstanceNames), twice(name));
    EXPECT_EQ(paths("ReferenceNames", writeObjectPaths),
              twice("<OBJECTPATH>" + wholePath + "</OBJECTPATH>"));
}

TEST(ElementWriter, WhatComesOutOfOperationsAndMethodsTellsItsType) {
    const auto written = writtenFor("PullInstancePaths", [](std::string& xml) {
        xml += "<IRETURNVALUE></IRETURNVALUE>";
        writeParameter(xml, "EnumerationContext", Value::null(CMPI_string), elementSite);
        writeParameter(xml, "EndOfSequence", Value::fromBoolean(true), elementSite);
    });
    EXPECT_EQ(written,
              "<IRETURNVALUE></IRETURNVALUE><PARAMVALUE NAME=\"EnumerationContext\" "
              "PARAMTYPE=\"string\"></PARAMVALUE><PARAMVALUE NAME=\"EndOfSequence\" "
              "PARAMTYPE=\"boolean\"><VALUE>TRUE</VALUE></PARAMVALUE>");
    std::string xml;
    writeReturnValue(xml, Value::fromUnsigned(0, CMPI_uint32), elementSite);
    writeReturnValue(xml, Value::null(CMPI_uint32), elementSite);
    writeParameter(xml, "List", Value::fromArray(CMPI_sint8, std::vector<Value>()), elementSite);
    writeParameter(xml, "Job", Value::fromReference({"", "X", {}, ""}), elementSite);
    writeParameter(xml, "Setting", Value::fromInstance(InstanceValue()), elementSite);
    writeParameter(xml, "a<b", Value(), elementSite);
    EXPECT_EQ(
        xml,
        "<RETURNVALUE PARAMTYPE=\"uint32\"><VALUE>0</VALUE></RETURNVALUE>"
        "<PARAMVALUE NAME=\"List\" PARAMTYPE=\"sint8\"><VALUE.ARRAY></VALUE.ARRAY></PARAMVALUE>"
        "<PARAMVALUE NAME=\"Job\" PARAMTYPE=\"reference\"><VALUE.REFERENCE><CLASSPATH>" +
            vmRootCimv2 +
            "<CLASSNAME NAME=\"X\"/></CLASSPATH></VALUE.REFERENCE></PARAMVALUE>"
            "<PARAMVALUE NAME=\"Setting\" PARAMTYPE=\"string\" EmbeddedObject=\"instance\">"
            "<VALUE>&lt;INSTANCE CLASSNAME=\"\"&gt;&lt;/INSTANCE&gt;</VALUE></PARAMVALUE>"
            "<PARAMVALUE NAME=\"a&lt;b\"></PARAMVALUE>");
}

}  // namespace
}  // namespace cmpihost::server
