#include "host/server/ResponseValidator.h"

#include <gmock/gmock.h>

namespace cmpihost::server {
namespace {

using testing::ElementsAre;
using testing::HasSubstr;

std::string answering(const std::string& operation, const std::string& content) {
    return "<?xml version=\"1.0\" encoding=\"utf-8\"?>\n"
           "<CIM CIMVERSION=\"2.0\" DTDVERSION=\"2.0\"><MESSAGE ID=\"7\" PROTOCOLVERSION=\"1.0\">"
           "<SIMPLERSP><IMETHODRESPONSE NAME=\"" +
           operation + "\">" + content + "</IMETHODRESPONSE></SIMPLERSP></MESSAGE></CIM>\n";
}

std::string answeringResults(const std::string& operation, const std::string& results) {
    return answering(operation, "<IRETURNVALUE>" + results + "</IRETURNVALUE>");
}

/// The text with the first place of `part` replaced, which it has to hold.
std::string changed(std::string text, const std::string& part, const std::string& instead) {
    const std::size_t place = text.find(part);
    EXPECT_NE(place, std::string::npos) << part;
    return place == std::string::npos ? text : text.replace(place, part.size(), instead);
}

/// A text many times.
std::string nested(const std::string& text, int times) {
    std::string result;
    for (int count = 0; count < times; ++count) result += text;
    return result;
}

const std::string goodNamespace =
    "<NAMESPACEPATH><HOST>vm</HOST><LOCALNAMESPACEPATH><NAMESPACE NAME=\"root\"/>"
    "<NAMESPACE NAME=\"cimv2\"/></LOCALNAMESPACEPATH></NAMESPACEPATH>";
const std::string goodName =
    "<INSTANCENAME CLASSNAME=\"X_A\">"
    "<KEYBINDING NAME=\"S\"><KEYVALUE VALUETYPE=\"string\">a &amp; b</KEYVALUE></KEYBINDING>"
    "<KEYBINDING NAME=\"B\"><KEYVALUE VALUETYPE=\"boolean\">TRUE</KEYVALUE></KEYBINDING>"
    "<KEYBINDING NAME=\"N\"><KEYVALUE VALUETYPE=\"numeric\">-5</KEYVALUE></KEYBINDING>"
    "</INSTANCENAME>";
const std::string goodPath = "<INSTANCEPATH>" + goodNamespace + goodName + "</INSTANCEPATH>";
const std::string goodClassPath =
    "<CLASSPATH>" + goodNamespace + "<CLASSNAME NAME=\"X_A\"/></CLASSPATH>";
const std::string goodReference = "<VALUE.REFERENCE>" + goodPath + "</VALUE.REFERENCE>";
const std::string goodInstance =
    "<INSTANCE CLASSNAME=\"X_A\">"
    "<PROPERTY NAME=\"U\" TYPE=\"uint8\" CLASSORIGIN=\"X_B\"><VALUE>255</VALUE></PROPERTY>"
    "<PROPERTY NAME=\"E\" TYPE=\"string\" EmbeddedObject=\"instance\"><VALUE>"
    "&lt;INSTANCE CLASSNAME=\"X_C\"&gt;&lt;/INSTANCE&gt;</VALUE></PROPERTY>"
    "<PROPERTY NAME=\"Null\" TYPE=\"datetime\"></PROPERTY>"
    "<PROPERTY.ARRAY NAME=\"L\" TYPE=\"string\"><VALUE.ARRAY><VALUE> one\n&#13;</VALUE>"
    "<VALUE></VALUE></VALUE.ARRAY></PROPERTY.ARRAY>"
    "<PROPERTY.REFERENCE NAME=\"R\" REFERENCECLASS=\"X_A\">" +
    goodReference + "</PROPERTY.REFERENCE></INSTANCE>";
const std::string goodClass =
    "<CLASS NAME=\"X_A\" SUPERCLASS=\"X_B\">"
    "<QUALIFIER NAME=\"Version\" TYPE=\"string\" TOSUBCLASS=\"false\"><VALUE>1</VALUE></QUALIFIER>"
    "<PROPERTY NAME=\"P\" TYPE=\"uint16\">"
    "<QUALIFIER NAME=\"Key\" TYPE=\"boolean\" OVERRIDABLE=\"false\"><VALUE>TRUE</VALUE></QUALIFIER>"
    "<QUALIFIER NAME=\"ValueMap\" TYPE=\"string\"><VALUE.ARRAY><VALUE>1</VALUE><VALUE>2</VALUE>"
    "</VALUE.ARRAY></QUALIFIER>"
    "<QUALIFIER NAME=\"Values\" TYPE=\"string\"><VALUE.ARRAY><VALUE>One</VALUE><VALUE>Two</VALUE>"
    "</VALUE.ARRAY></QUALIFIER><VALUE>1</VALUE></PROPERTY>"
    "<METHOD NAME=\"M\" TYPE=\"uint32\" PROPAGATED=\"true\">"
    "<PARAMETER NAME=\"A\" TYPE=\"string\"></PARAMETER>"
    "<PARAMETER.ARRAY NAME=\"B\" TYPE=\"string\" ARRAYSIZE=\"3\"></PARAMETER.ARRAY>"
    "<PARAMETER.REFERENCE NAME=\"C\" REFERENCECLASS=\"X_A\"></PARAMETER.REFERENCE>"
    "<PARAMETER.REFARRAY NAME=\"D\" REFERENCECLASS=\"X_A\"></PARAMETER.REFARRAY>"
    "</METHOD></CLASS>";
const std::string goodQualifier =
    "<QUALIFIER.DECLARATION NAME=\"Key\" TYPE=\"boolean\" ISARRAY=\"false\" OVERRIDABLE=\"false\">"
    "<SCOPE PROPERTY=\"true\" REFERENCE=\"true\"></SCOPE><VALUE>FALSE</VALUE>"
    "</QUALIFIER.DECLARATION>";
const std::string goodOutputs =
    "<PARAMVALUE NAME=\"EnumerationContext\" PARAMTYPE=\"string\"><VALUE>c</VALUE></PARAMVALUE>"
    "<PARAMVALUE NAME=\"EndOfSequence\" PARAMTYPE=\"boolean\"><VALUE>FALSE</VALUE></PARAMVALUE>";

struct AnswerRow {
    const char* operation;
    std::string results;
};

TEST(ResponseValidator, TheAnswersOfAllOperationsAreGood) {
    const AnswerRow rows[] = {
        {"GetInstance", goodInstance},
        {"EnumerateInstances", ""},
        {"EnumerateInstances",
         "<VALUE.NAMEDINSTANCE>" + goodName + goodInstance + "</VALUE.NAMEDINSTANCE>"},
        {"EnumerateInstanceNames", goodName + goodName},
        {"CreateInstance", goodName},
        {"Associators",
         "<VALUE.OBJECTWITHPATH>" + goodPath + goodInstance + "</VALUE.OBJECTWITHPATH>"},
        {"References",
         "<VALUE.OBJECTWITHPATH>" + goodClassPath + goodClass + "</VALUE.OBJECTWITHPATH>"},
        {"AssociatorNames", "<OBJECTPATH>" + goodPath + "</OBJECTPATH>"},
        {"ReferenceNames", "<OBJECTPATH>" + goodClassPath + "</OBJECTPATH>"},
        {"GetClass", goodClass},
        {"EnumerateClasses", goodClass + goodClass},
        {"enumerateclassnames", "<CLASSNAME NAME=\"X_A\"/><CLASSNAME NAME=\"X_B\"/>"},
        {"GetProperty", ""},
        {"GetProperty", "<VALUE>any text</VALUE>"},
        {"GetProperty", goodReference},
        {"GetQualifier", goodQualifier},
        {"EnumerateQualifiers", ""},
        {"ExecQuery", "<VALUE.OBJECT>" + goodInstance + "</VALUE.OBJECT>"},
        {"EnumerationCount", "<VALUE>3</VALUE>"},
    };
    for (const AnswerRow& row : rows)
        EXPECT_THAT(complaintsAbout(answeringResults(row.operation, row.results)), ElementsAre())
            << row.operation;
    for (const char* const operation :
         {"SetProperty", "ModifyInstance", "DeleteInstance", "CreateClass", "ModifyClass",
          "DeleteClass", "SetQualifier", "DeleteQualifier", "CloseEnumeration"})
        EXPECT_THAT(complaintsAbout(answering(operation, "")), ElementsAre()) << operation;
    const std::string withPath =
        "<VALUE.INSTANCEWITHPATH>" + goodPath + goodInstance + "</VALUE.INSTANCEWITHPATH>";
    const AnswerRow pulledRows[] = {
        {"OpenEnumerateInstances", withPath},      {"OpenReferenceInstances", withPath},
        {"OpenAssociatorInstances", withPath},     {"PullInstancesWithPath", ""},
        {"OpenEnumerateInstancePaths", goodPath},  {"OpenReferenceInstancePaths", goodPath},
        {"OpenAssociatorInstancePaths", goodPath}, {"PullInstancePaths", goodPath + goodPath},
        {"OpenQueryInstances", goodInstance},      {"PullInstances", goodInstance},
    };
    for (const AnswerRow& row : pulledRows)
        EXPECT_THAT(complaintsAbout(answering(row.operation, "<IRETURNVALUE>" + row.results +
                                                                 "</IRETURNVALUE>" + goodOutputs)),
                    ElementsAre())
            << row.operation;
}

TEST(ResponseValidator, ErrorsAndAnswersOfMethodsAreGood) {
    EXPECT_THAT(
        complaintsAbout(answering("Any name", "<ERROR CODE=\"7\" DESCRIPTION=\"no such\"/>")),
        ElementsAre());
    const std::string method =
        changed(changed(answering("Start",
                                  "<RETURNVALUE PARAMTYPE=\"uint32\"><VALUE>0</VALUE></RETURNVALUE>"
                                  "<PARAMVALUE NAME=\"Job\" PARAMTYPE=\"reference\">" +
                                      goodReference +
                                      "</PARAMVALUE><PARAMVALUE NAME=\"None\"></PARAMVALUE>"),
                        "<IMETHODRESPONSE", "<METHODRESPONSE"),
                "</IMETHODRESPONSE", "</METHODRESPONSE");
    EXPECT_THAT(complaintsAbout(method, "Start"), ElementsAre());
    EXPECT_THAT(complaintsAbout(method, "start"), ElementsAre("it answers Start, not start"));
    EXPECT_THAT(complaintsAbout(changed(method, "<VALUE>0<", "<VALUE>-1<")),
                ElementsAre(HasSubstr("'-1' is not uint32")));
    EXPECT_THAT(complaintsAbout(changed(method, "=\"reference\"", "=\"string\"")),
                ElementsAre(HasSubstr("a reference is not string")));
}

/// A fault in a good answer, and what is said of it.
struct FaultRow {
    const char* part;
    std::string instead;
    const char* complaint;
};

void expectComplaints(const std::string& good, const std::vector<FaultRow>& rows) {
    ASSERT_THAT(complaintsAbout(good), ElementsAre());
    for (const FaultRow& row : rows)
        EXPECT_THAT(complaintsAbout(changed(good, row.part, row.instead)),
                    testing::Contains(HasSubstr(row.complaint)))
            << row.part << " -> " << row.instead;
}

TEST(ResponseValidator, WhatSomeClientsDoNotReadIsAFault) {
    expectComplaints(
        answeringResults("GetInstance", goodInstance),
        {{"<?xml", " <?xml", "it does not begin with"},
         {"<?xml", "\xEF\xBB\xBF<?xml", "it does not begin with"},
         {"<?xml version=\"1.0\" encoding=\"utf-8\"?>", "", "it does not begin with"},
         {"utf-8\"?>", "utf-8\" standalone=\"yes\"?>", "it does not begin with"},
         {"\"?>\n", "\"?><!DOCTYPE CIM>", "document type"},
         {"<SIMPLERSP>", "<!-- --><SIMPLERSP>", "a comment"},
         {"<SIMPLERSP>", "<?x y?><SIMPLERSP>", "a processing instruction"},
         {" one", "<![CDATA[one]]>", "a CDATA section"},
         {"\"datetime\"></PROPERTY>", "\"datetime\"/>", "PROPERTY has no end tag"},
         {"<VALUE></VALUE>", "<VALUE/>", "VALUE has no end tag"},
         {"<VALUE></VALUE>", "<VALUE />", "VALUE has no end tag"},
         {"<VALUE></VALUE>", "<VALUE.NULL></VALUE.NULL>", "VALUE.NULL: unknown element"},
         {" one", "&#111;ne", "a reference that clients do not resolve"},
         {" one", "&#xD;ne", "a reference that clients do not resolve"},
         {" one", "a\rb", "a carriage return"},
         {"ID=\"7\"", "ID=\"\r\"", "a carriage return"},
         {"ID=\"7\"", "ID='7'", "an attribute in single quotes"},
         {"ID=\"7\"", "ID=\"a\tb\"", "white space in an attribute"},
         {"ID=\"7\"", "ID=\"a\nb\"", "white space in an attribute"},
         {" NAME=\"U\"", " xml:lang=\"en\" NAME=\"U\"", "unknown attribute xml:lang"},
         {" NAME=\"U\"", " EMBEDDEDOBJECT=\"instance\" NAME=\"U\"",
          "unknown attribute EMBEDDEDOBJECT"},
         {"<SIMPLERSP>", "text<SIMPLERSP>", "text between elements"},
         {"</CIM>\n", "</CIM>\n<CIM></CIM>", "junk after document element"},
         {" one", "\x01", "not well-formed"},
         {" one", "\xC3(", "not well-formed"},
         {" one", "\xEF\xBF\xBE", "not well-formed"},
         {"</CIM>", "", "no element found"},
         {"<SIMPLERSP>", nested("<SIMPLERSP>", 70), "deeper than any response"}});
}

TEST(ResponseValidator, ElementsOutOfPlaceAreFaults) {
    expectComplaints(
        answeringResults("GetInstance", goodInstance),
        {{"<CIM ", "<Cim ", "mismatched tag"},
         {"<VALUE.REFERENCE>", "<VALUE.REFERENCE><CLASSNAME NAME=\"A\"/>",
          "VALUE.REFERENCE: wrong children: CLASSNAME INSTANCEPATH"},
         {"<SIMPLERSP>", "<SIMPLERSP></SIMPLERSP><SIMPLERSP>", "MESSAGE: wrong children"},
         {"<IRETURNVALUE>", "<PARAMVALUE NAME=\"a\"></PARAMVALUE><IRETURNVALUE>",
          "IMETHODRESPONSE: wrong children: PARAMVALUE IRETURNVALUE"},
         {"<IRETURNVALUE>", "<ERROR CODE=\"1\" DESCRIPTION=\"a\"/><IRETURNVALUE>",
          "IMETHODRESPONSE: wrong children: ERROR IRETURNVALUE"},
         {"<IRETURNVALUE>", "<IRETURNVALUE><CLASSNAME NAME=\"A\"/>",
          "IRETURNVALUE: wrong children: CLASSNAME INSTANCE"},
         {"<PROPERTY ", "<VALUE></VALUE><PROPERTY ", "INSTANCE: wrong children: VALUE PROPERTY"},
         {"<VALUE>255</VALUE>", "<VALUE>255</VALUE><VALUE>255</VALUE>",
          "PROPERTY: wrong children: VALUE VALUE"},
         {"<VALUE>255</VALUE>", "<VALUE.ARRAY></VALUE.ARRAY>",
          "PROPERTY: wrong children: VALUE.ARRAY"},
         {"<VALUE>255</VALUE>", "255", "PROPERTY: text between elements"},
         {"<HOST>vm</HOST>", "", "NAMESPACEPATH: wrong children: LOCALNAMESPACEPATH"},
         {"<HOST>vm</HOST>", "<HOST></HOST>", "HOST: empty"},
         {"<NAMESPACE NAME=\"root\"/><NAMESPACE NAME=\"cimv2\"/>", "",
          "LOCALNAMESPACEPATH: wrong children:"},
         {"<INSTANCEPATH>", "<LOCALINSTANCEPATH></LOCALINSTANCEPATH><INSTANCEPATH>",
          "LOCALINSTANCEPATH: unknown element"},
         {"<KEYBINDING NAME=\"S\"><KEYVALUE VALUETYPE=\"string\">a &amp; b</KEYVALUE></KEYBINDING>",
          "<KEYVALUE VALUETYPE=\"string\">a</KEYVALUE>", "INSTANCENAME: wrong children: KEYVALUE"},
         {"<KEYVALUE VALUETYPE=\"string\">a &amp; b</KEYVALUE>", "",
          "KEYBINDING: wrong children:"}});
    expectComplaints(
        answeringResults("GetClass", goodClass),
        {{"<PROPERTY ", "<METHOD NAME=\"N\" TYPE=\"uint8\"></METHOD><PROPERTY ",
          "CLASS: wrong children: QUALIFIER METHOD PROPERTY METHOD"},
         {"</METHOD>",
          "<QUALIFIER NAME=\"A\" TYPE=\"boolean\"><VALUE>TRUE</VALUE></QUALIFIER></METHOD>",
          "METHOD: wrong children"},
         {"<VALUE>Two</VALUE>", "", "ValueMap and Values are of different lengths"}});
    expectComplaints(answeringResults("GetQualifier", goodQualifier),
                     {{"</SCOPE>", "</SCOPE><SCOPE></SCOPE>",
                       "QUALIFIER.DECLARATION: wrong children: SCOPE SCOPE VALUE"}});
}

TEST(ResponseValidator, OtherDocumentsAreFaults) {
    EXPECT_THAT(complaintsAbout(""), testing::Contains("line 1, column 0: no element found"));
    EXPECT_THAT(complaintsAbout("<?xml version=\"1.0\" encoding=\"utf-8\"?>\n<VALUE></VALUE>"),
                ElementsAre("the root is VALUE"));
}

TEST(ResponseValidator, AttributesThatAreMissingUnknownOrWrongAreFaults) {
    expectComplaints(
        answeringResults("GetInstance", goodInstance),
        {{" CIMVERSION=\"2.0\"", "", "CIM: no CIMVERSION"},
         {"CIMVERSION=\"2.0\"", "CIMVERSION=\"2.4\"", "CIM: wrong CIMVERSION '2.4'"},
         {"DTDVERSION=\"2.0\"", "DTDVERSION=\"2.4\"", "CIM: wrong DTDVERSION '2.4'"},
         {"PROTOCOLVERSION=\"1.0\"", "PROTOCOLVERSION=\"1.4\"",
          "MESSAGE: wrong PROTOCOLVERSION '1.4'"},
         {" ID=\"7\"", "", "MESSAGE: no ID"},
         {" NAME=\"GetInstance\"", "", "IMETHODRESPONSE: no NAME"},
         {" TYPE=\"uint8\"", "", "PROPERTY: no TYPE"},
         {" TYPE=\"uint8\"", " TYPE=\"UInt8\"", "PROPERTY: wrong TYPE 'UInt8'"},
         {" TYPE=\"uint8\"", " TYPE=\"reference\"", "PROPERTY: wrong TYPE 'reference'"},
         {" NAME=\"U\"", " NAME=\"\"", "PROPERTY: wrong NAME ''"},
         {" NAME=\"U\"", " NAME=\"two words\"", "PROPERTY: wrong NAME 'two words'"},
         {" NAME=\"U\"", " NAME=\"U\" PROPAGATED=\"TRUE\"", "PROPERTY: wrong PROPAGATED 'TRUE'"},
         {" NAME=\"U\"", " NAME=\"U\" TOSUBCLASS=\"true\"", "PROPERTY: unknown attribute TOSUBC"},
         {"CLASSORIGIN=\"X_B\"", "CLASSORIGIN=\"\"", "PROPERTY: wrong CLASSORIGIN ''"},
         {"REFERENCECLASS=\"X_A\"", "REFERENCECLASS=\"\"", "wrong REFERENCECLASS ''"},
         {"EmbeddedObject=\"instance\"", "EmbeddedObject=\"any\"", "wrong EmbeddedObject 'any'"},
         {"=\"root\"", "=\"root/cimv2\"", "NAMESPACE: wrong NAME 'root/cimv2'"},
         {" VALUETYPE=\"string\"", "", "KEYVALUE: no VALUETYPE"},
         {" VALUETYPE=\"string\"", " VALUETYPE=\"String\"", "KEYVALUE: wrong VALUETYPE 'String'"},
         {"CLASSNAME=\"X_A\"", "", "INSTANCE: no CLASSNAME"},
         {"<PROPERTY NAME=\"E\"", "<PROPERTY NAME=\"u\"", "INSTANCE: two of the name u"},
         {"<KEYBINDING NAME=\"B\"", "<KEYBINDING NAME=\"s\"", "INSTANCENAME: two of the name s"}});
    expectComplaints(
        answering("X", "<ERROR CODE=\"7\" DESCRIPTION=\"no\"/>"),
        {{" DESCRIPTION=\"no\"", "", "ERROR: no DESCRIPTION"},
         {"\"no\"", "\"\"", "ERROR: wrong DESCRIPTION ''"},
         {"\"no\"", "\"" + std::string(501, 'x') + "\"", "ERROR: wrong DESCRIPTION 'xx"},
         {"CODE=\"7\"", "CODE=\"seven\"", "ERROR: wrong CODE 'seven'"},
         {"CODE=\"7\"", "CODE=\"0\"", "ERROR: wrong CODE '0'"},
         {"\"no\"/>", "\"no\"><INSTANCE CLASSNAME=\"A\"></INSTANCE></ERROR>",
          "ERROR: wrong children: INSTANCE"}});
    expectComplaints(answeringResults("GetClass", goodClass),
                     {{" TYPE=\"uint32\"", "", "METHOD: no TYPE"},
                      {"ARRAYSIZE=\"3\"", "ARRAYSIZE=\"x\"", "wrong ARRAYSIZE 'x'"},
                      {"SUPERCLASS=\"X_B\"", "SUPERCLASS=\"\"", "wrong SUPERCLASS ''"},
                      {"\"ValueMap\"", "\"values\"", "PROPERTY: two of the name Values"},
                      {"NAME=\"B\"", "NAME=\"A\"", "METHOD: two of the name A"}});
}

TEST(ResponseValidator, TextsThatAreNoValueOfTheirTypeAreFaults) {
    const std::string good = answeringResults(
        "GetInstance",
        "<INSTANCE CLASSNAME=\"A\"><PROPERTY NAME=\"P\" TYPE=\"uint8\"><VALUE>0</VALUE></PROPERTY>"
        "</INSTANCE>");
    struct Row {
        const char* type;
        std::vector<const char*> good;
        std::vector<const char*> bad;
    };
    const Row rows[] = {
        {"uint8", {"0", "255"}, {"", " 1", "1 ", "+1", "01", "256", "-1", "0x1", "1.0", "1000"}},
        {"sint8", {"-128", "127", "0"}, {"-129", "128", "-0", "-", "--1"}},
        {"uint16", {"65535"}, {"65536"}},
        {"sint16", {"-32768", "32767"}, {"-32769", "32768"}},
        {"uint32", {"4294967295"}, {"4294967296"}},
        {"sint32", {"-2147483648", "2147483647"}, {"-2147483649", "2147483648"}},
        {"uint64", {"18446744073709551615"}, {"18446744073709551616", "-1"}},
        {"sint64",
         {"-9223372036854775808", "9223372036854775807"},
         {"-9223372036854775809", "9223372036854775808"}},
        {"boolean", {"TRUE", "FALSE"}, {"", "yes", "1", "TRUE "}},
        {"real32",
         {"1.00000000e+00", "-1.00000000e-38", "INF", "-INF", "NaN"},
         {"", "1", "1.0", "1.0000000000000000e+00", "inf", "nan", "1,00000000e+00"}},
        {"real64", {"1.0000000000000000e+308", "NaN"}, {"", "1.00000000e+00", "+INF"}},
        {"string", {"", " any ", "NULL"}, {}},
        {"char16", {"x", "\xC3\xA9", "\xE2\x82\xAC"}, {"", "xy", "\xF0\x9F\x90\xA7"}},
        {"datetime",
         {"20250301101500.000000+000", "20250301101500.000000-720", "00000003040506.000000:000",
          "20250301******.******+000", "99991231235959.999999+999"},
         {"", "20250301101500.000000+00", "00000301101500.000000+000", "20251301101500.000000+000",
          "20250300101500.000000+000", "20250301241500.000000+000", "20250301106000.000000+000",
          "20250301101560.000000+000", "20250301101500,000000+000", "20250301101500.000000 000",
          "00000003040506.000000:001", "2025030110150*.000000+000", "2025-03-01T10:15:00+00:00"}},
    };
    for (const Row& row : rows) {
        const auto with = [&](const char* text) {
            return complaintsAbout(
                changed(changed(good, "uint8", row.type), ">0<", ">" + std::string(text) + "<"));
        };
        for (const char* const text : row.good) EXPECT_THAT(with(text), ElementsAre()) << text;
        for (const char* const text : row.bad)
            EXPECT_THAT(with(text), ElementsAre(HasSubstr("' is not " + std::string(row.type))))
                << text;
    }
}

TEST(ResponseValidator, KeysArraysAndEmbeddedObjectsAreLookedInto) {
    expectComplaints(
        answeringResults("GetInstance", goodInstance),
        {{">-5<", ">five<", "'five' is not numeric"},
         {">-5<", "><", "'' is not numeric"},
         {">TRUE<", ">1<", "'1' is not boolean"},
         {"NAME=\"L\" TYPE=\"string\"", "NAME=\"L\" TYPE=\"uint8\"", "'' is not uint8"},
         {"&lt;/INSTANCE&gt;", "", "an embedded object that is no XML"},
         {"&lt;INSTANCE CLASSNAME=\"X_C\"&gt;&lt;/INSTANCE&gt;", "&lt;VALUE&gt;&lt;/VALUE&gt;",
          "VALUE is no embedded instance"},
         {"CLASSNAME=\"X_C\"", "NAME=\"X_C\"", "VALUE/INSTANCE: no CLASSNAME"},
         {"TYPE=\"string\" Emb", "TYPE=\"uint8\" Emb",
          "an embedded object is a string, not uint8"}});
    expectComplaints(
        answeringResults("EnumerateInstances", "<VALUE.NAMEDINSTANCE>" + goodName + goodInstance +
                                                   "</VALUE.NAMEDINSTANCE>"),
        {{"CLASSNAME=\"X_A\"", "CLASSNAME=\"X_B\"", "an instance of X_A has a path of X_B"}});
}

TEST(ResponseValidator, AnswersOfAnotherOperationAreFaults) {
    const AnswerRow rows[] = {
        {"GetInstance", ""},
        {"GetInstance", goodInstance + goodInstance},
        {"EnumerateInstances", goodInstance},
        {"EnumerateInstances",
         "<VALUE.OBJECTWITHPATH>" + goodPath + goodInstance + "</VALUE.OBJECTWITHPATH>"},
        {"EnumerateInstanceNames", goodPath},
        {"Associators",
         "<VALUE.INSTANCEWITHPATH>" + goodPath + goodInstance + "</VALUE.INSTANCEWITHPATH>"},
        {"AssociatorNames", goodPath},
        {"GetClass", ""},
        {"EnumerateClassNames", goodClass},
        {"GetProperty", "<VALUE>1</VALUE><VALUE>2</VALUE>"},
        {"ExecQuery", goodInstance},
    };
    for (const AnswerRow& row : rows)
        EXPECT_THAT(
            complaintsAbout(answeringResults(row.operation, row.results)),
            ElementsAre(std::string(row.operation) + " does not answer such an IRETURNVALUE"));
    EXPECT_THAT(complaintsAbout(answeringResults("DeleteInstance", "")),
                ElementsAre("DeleteInstance has no IRETURNVALUE"));
    EXPECT_THAT(complaintsAbout(answering("EnumerateInstances", "")),
                ElementsAre("EnumerateInstances lacks its IRETURNVALUE"));
    EXPECT_THAT(complaintsAbout(answeringResults("Reboot", "")),
                ElementsAre("success of an unknown operation Reboot"));
    EXPECT_THAT(complaintsAbout(answering(
                    "GetClass", "<IRETURNVALUE>" + goodClass + "</IRETURNVALUE>" + goodOutputs)),
                ElementsAre("GetClass has no PARAMVALUE"));
    EXPECT_THAT(complaintsAbout(answering("A", "<ERROR CODE=\"7\" DESCRIPTION=\"b\"/>"), "a"),
                ElementsAre("it answers A, not a"));
}

TEST(ResponseValidator, PullAnswersHaveToTellHowTheyGoOn) {
    expectComplaints(
        answering("PullInstancePaths", "<IRETURNVALUE></IRETURNVALUE>" + goodOutputs),
        {{"NAME=\"EndOfSequence\"", "NAME=\"endofsequence\"", "no EndOfSequence"},
         {"NAME=\"EnumerationContext\"", "NAME=\"Context\"", "no EnumerationContext"},
         {">FALSE<", ">no<", "no EndOfSequence"},
         {">c<", "><", "an empty EnumerationContext before the end"},
         {"<PARAMVALUE ", "<PARAMVALUE NAME=\"x\"></PARAMVALUE><PARAMVALUE ",
          "an unknown PARAMVALUE"},
         {"<IRETURNVALUE></IRETURNVALUE>", "", "PullInstancePaths lacks its IRETURNVALUE"}});
    const std::string ended =
        changed(changed(goodOutputs, "<VALUE>c</VALUE>", ""), "FALSE", "TRUE");
    EXPECT_THAT(
        complaintsAbout(answering("PullInstancePaths", "<IRETURNVALUE></IRETURNVALUE>" + ended)),
        ElementsAre());
}

}  // namespace
}  // namespace cmpihost::server
