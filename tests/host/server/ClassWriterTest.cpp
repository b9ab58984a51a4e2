#include "host/server/ClassWriter.h"

#include <gmock/gmock.h>

#include "host/mof/MofParser.h"
#include "host/server/ResponseValidator.h"
#include "host/server/ResponseWriter.h"

namespace cmpihost::server {
namespace {

/// The result in a response of the operation, which the validator takes.
std::string validated(const std::string& operation, const std::string& result) {
    Message message;
    message.method = operation;
    std::string document;
    beginResponse(document, message);
    document += "<IRETURNVALUE>" + result + "</IRETURNVALUE>";
    endResponse(document, message);
    EXPECT_THAT(complaintsAbout(document, operation), testing::ElementsAre());
    return result;
}

/// The last class of a MOF text as it is written.
std::string writtenClass(const std::string& text, const ClassView& view = {}) {
    mof::Document document = mof::parse(text, "x.mof");
    const std::string name = document.classes.back().name;
    Schema schema;
    schema.add(std::move(document));
    std::string xml;
    writeClass(xml, *resolvedClass(schema, name), schema.qualifierTypes(), view);
    return validated("GetClass", xml);
}

/// A class with one property that has one qualifier, from the start of its QUALIFIER on.
std::string writtenQualifier(const std::string& qualifier, const std::string& declaration = {}) {
    const std::string xml =
        writtenClass(declaration + "class A { [" + qualifier + "] string P; };");
    const std::size_t start = xml.find("<QUALIFIER");
    return xml.substr(start, xml.find("</PROPERTY>") - start);
}

const std::string familyMof =
    "[Description(\"a <base>\"), Version(\"1.0\")]"
    "class A { [Key] string Id; uint8 Q = 7;"
    "  [Description(\"starts\")] uint32 Start([In] string How, [In(false), Out] A REF Job,"
    "    uint16 Codes[], A REF Others[]); };"
    "[Association, Version(\"2.0\")]"
    "class B : A { [Override(\"Q\")] uint8 q; [Key] A REF End; real32 R[] = {1, -2.5};"
    "  uint32 Stop(); };";

TEST(ClassWriter, AClassHasWhatItDeclaresAndInheritsInTheOrderThatClientsCheck) {
    ClassView view;
    view.classOrigin = true;
    EXPECT_EQ(
        writtenClass(familyMof, view),
        "<CLASS NAME=\"B\" SUPERCLASS=\"A\">"
        "<QUALIFIER NAME=\"Description\" TYPE=\"string\" PROPAGATED=\"true\" "
        "TRANSLATABLE=\"true\"><VALUE>a &lt;base&gt;"
        "</VALUE></QUALIFIER>"
        "<QUALIFIER NAME=\"Association\" TYPE=\"boolean\" OVERRIDABLE=\"false\"><VALUE>TRUE</VALUE>"
        "</QUALIFIER>"
        "<QUALIFIER NAME=\"Version\" TYPE=\"string\" TOSUBCLASS=\"false\" "
        "TRANSLATABLE=\"true\"><VALUE>2.0</VALUE>"
        "</QUALIFIER>"
        "<PROPERTY NAME=\"q\" TYPE=\"uint8\" CLASSORIGIN=\"A\">"
        "<QUALIFIER NAME=\"Override\" TYPE=\"string\" TOSUBCLASS=\"false\"><VALUE>Q</VALUE>"
        "</QUALIFIER><VALUE>7</VALUE></PROPERTY>"
        "<PROPERTY.REFERENCE NAME=\"End\" REFERENCECLASS=\"A\" CLASSORIGIN=\"B\">"
        "<QUALIFIER NAME=\"Key\" TYPE=\"boolean\" OVERRIDABLE=\"false\"><VALUE>TRUE</VALUE>"
        "</QUALIFIER></PROPERTY.REFERENCE>"
        "<PROPERTY.ARRAY NAME=\"R\" TYPE=\"real32\" CLASSORIGIN=\"B\"><VALUE.ARRAY>"
        "<VALUE>1.00000000e+00</VALUE><VALUE>-2.50000000e+00</VALUE></VALUE.ARRAY>"
        "</PROPERTY.ARRAY>"
        "<PROPERTY NAME=\"Id\" TYPE=\"string\" CLASSORIGIN=\"A\" PROPAGATED=\"true\">"
        "<QUALIFIER NAME=\"Key\" TYPE=\"boolean\" PROPAGATED=\"true\" OVERRIDABLE=\"false\">"
        "<VALUE>TRUE</VALUE></QUALIFIER></PROPERTY>"
        "<METHOD NAME=\"Stop\" TYPE=\"uint32\" CLASSORIGIN=\"B\"></METHOD>"
        "<METHOD NAME=\"Start\" TYPE=\"uint32\" CLASSORIGIN=\"A\" PROPAGATED=\"true\">"
        "<QUALIFIER NAME=\"Description\" TYPE=\"string\" PROPAGATED=\"true\" "
        "TRANSLATABLE=\"true\"><VALUE>starts</VALUE>"
        "</QUALIFIER>"
        "<PARAMETER NAME=\"How\" TYPE=\"string\"><QUALIFIER NAME=\"In\" TYPE=\"boolean\" "
        "PROPAGATED=\"true\" OVERRIDABLE=\"false\"><VALUE>TRUE</VALUE></QUALIFIER></PARAMETER>"
        "<PARAMETER.REFERENCE NAME=\"Job\" REFERENCECLASS=\"A\"><QUALIFIER NAME=\"In\" "
        "TYPE=\"boolean\" PROPAGATED=\"true\" OVERRIDABLE=\"false\"><VALUE>FALSE</VALUE>"
        "</QUALIFIER><QUALIFIER NAME=\"Out\" TYPE=\"boolean\" PROPAGATED=\"true\" "
        "OVERRIDABLE=\"false\"><VALUE>TRUE</VALUE></QUALIFIER></PARAMETER.REFERENCE>"
        "<PARAMETER.ARRAY NAME=\"Codes\" TYPE=\"uint16\"></PARAMETER.ARRAY>"
        "<PARAMETER.REFARRAY NAME=\"Others\" REFERENCECLASS=\"A\"></PARAMETER.REFARRAY>"
        "</METHOD></CLASS>");
}

TEST(ClassWriter, AViewLeavesOutWhatNobodyAskedFor) {
    ClassView bare;
    bare.qualifiers = false;
    bare.localOnly = true;
    EXPECT_EQ(writtenClass(familyMof, bare),
              "<CLASS NAME=\"B\" SUPERCLASS=\"A\">"
              "<PROPERTY NAME=\"q\" TYPE=\"uint8\"><VALUE>7</VALUE></PROPERTY>"
              "<PROPERTY.REFERENCE NAME=\"End\" REFERENCECLASS=\"A\"></PROPERTY.REFERENCE>"
              "<PROPERTY.ARRAY NAME=\"R\" TYPE=\"real32\"><VALUE.ARRAY><VALUE>1.00000000e+00"
              "</VALUE><VALUE>-2.50000000e+00</VALUE></VALUE.ARRAY></PROPERTY.ARRAY>"
              "<METHOD NAME=\"Stop\" TYPE=\"uint32\"></METHOD></CLASS>");
    ClassView listed;
    listed.localOnly = true;
    listed.properties = {{"end", "END", "nothing"}};
    EXPECT_EQ(writtenClass(familyMof, listed),
              "<CLASS NAME=\"B\" SUPERCLASS=\"A\">"
              "<QUALIFIER NAME=\"Association\" TYPE=\"boolean\" OVERRIDABLE=\"false\"><VALUE>TRUE"
              "</VALUE></QUALIFIER>"
              "<QUALIFIER NAME=\"Version\" TYPE=\"string\" TOSUBCLASS=\"false\" "
              "TRANSLATABLE=\"true\"><VALUE>2.0</VALUE>"
              "</QUALIFIER>"
              "<PROPERTY.REFERENCE NAME=\"End\" REFERENCECLASS=\"A\"><QUALIFIER NAME=\"Key\" "
              "TYPE=\"boolean\" OVERRIDABLE=\"false\"><VALUE>TRUE</VALUE></QUALIFIER>"
              "</PROPERTY.REFERENCE><METHOD NAME=\"Stop\" TYPE=\"uint32\"></METHOD></CLASS>");
    ClassView none;
    none.qualifiers = false;
    none.properties.emplace();
    EXPECT_EQ(writtenClass("class A { string P; };", none), "<CLASS NAME=\"A\"></CLASS>");
}

TEST(ClassWriter, DefaultValuesAreWrittenAsValuesOfInstancesAre) {
    EXPECT_EQ(
        writtenClass("class A { boolean B = true; string S = \"a&b\"; char16 C = 'x';"
                     "  sint64 N = -9223372036854775808; real64 D = 3; string E = NULL;"
                     "  datetime T = \"00000001000000.000000:000\"; string L[] = {\"a\", \"\"};"
                     "  uint8 M[] = {}; A REF F = \"A.B=TRUE\"; };"),
        "<CLASS NAME=\"A\">"
        "<PROPERTY NAME=\"B\" TYPE=\"boolean\"><VALUE>TRUE</VALUE></PROPERTY>"
        "<PROPERTY NAME=\"S\" TYPE=\"string\"><VALUE>a&amp;b</VALUE></PROPERTY>"
        "<PROPERTY NAME=\"C\" TYPE=\"char16\"><VALUE>x</VALUE></PROPERTY>"
        "<PROPERTY NAME=\"N\" TYPE=\"sint64\"><VALUE>-9223372036854775808</VALUE></PROPERTY>"
        "<PROPERTY NAME=\"D\" TYPE=\"real64\"><VALUE>3.0000000000000000e+00</VALUE></PROPERTY>"
        "<PROPERTY NAME=\"E\" TYPE=\"string\"></PROPERTY>"
        "<PROPERTY NAME=\"T\" TYPE=\"datetime\"><VALUE>00000001000000.000000:000</VALUE>"
        "</PROPERTY>"
        "<PROPERTY.ARRAY NAME=\"L\" TYPE=\"string\"><VALUE.ARRAY><VALUE>a</VALUE>"
        "<VALUE></VALUE></VALUE.ARRAY></PROPERTY.ARRAY>"
        "<PROPERTY.ARRAY NAME=\"M\" TYPE=\"uint8\"><VALUE.ARRAY></VALUE.ARRAY>"
        "</PROPERTY.ARRAY>"
        "<PROPERTY.REFERENCE NAME=\"F\" REFERENCECLASS=\"A\"></PROPERTY.REFERENCE></CLASS>");
}

struct QualifierRow {
    const char* qualifier;
    const char* declaration;
    const char* expected;
};

TEST(ClassWriter, AQualifierHasTheDeclaredTypeElseThatOfItsConstant) {
    const QualifierRow rows[] = {
        {"X", "", "NAME=\"X\" TYPE=\"boolean\"><VALUE>TRUE</VALUE>"},
        {"X(5)", "", "NAME=\"X\" TYPE=\"uint32\"><VALUE>5</VALUE>"},
        {"X(4294967296)", "", "NAME=\"X\" TYPE=\"uint64\"><VALUE>4294967296</VALUE>"},
        {"X(-5)", "", "NAME=\"X\" TYPE=\"sint32\"><VALUE>-5</VALUE>"},
        {"X(1.5)", "", "NAME=\"X\" TYPE=\"real64\"><VALUE>1.5000000000000000e+00</VALUE>"},
        {"X('c')", "", "NAME=\"X\" TYPE=\"char16\"><VALUE>c</VALUE>"},
        {"X(NULL)", "", "NAME=\"X\" TYPE=\"string\">"},
        {"X{}", "", "NAME=\"X\" TYPE=\"string\"><VALUE.ARRAY></VALUE.ARRAY>"},
        {"X{\"a\", \"b\"}", "",
         "NAME=\"X\" TYPE=\"string\"><VALUE.ARRAY><VALUE>a</VALUE><VALUE>b</VALUE></VALUE.ARRAY>"},
        {"X{1, NULL}", "",
         "NAME=\"X\" TYPE=\"uint32\"><VALUE.ARRAY><VALUE>1</VALUE></VALUE.ARRAY>"},
        {"X(5)", "Qualifier X : sint64, Scope(any);",
         "NAME=\"X\" TYPE=\"sint64\"><VALUE>5</VALUE>"},
        {"X(\"5\")", "Qualifier X : sint64, Scope(any);",
         "NAME=\"X\" TYPE=\"string\"><VALUE>5</VALUE>"},
        {"X", "Qualifier X : string, Scope(any);", "NAME=\"X\" TYPE=\"string\">"},
        {"X : DisableOverride Restricted Translatable", "",
         "NAME=\"X\" TYPE=\"boolean\" OVERRIDABLE=\"false\" TOSUBCLASS=\"false\" "
         "TRANSLATABLE=\"true\"><VALUE>TRUE</VALUE>"},
        {"X", "Qualifier X : boolean, Scope(any), Flavor(DisableOverride, Translatable);",
         "NAME=\"X\" TYPE=\"boolean\" OVERRIDABLE=\"false\" TRANSLATABLE=\"true\"><VALUE>TRUE"
         "</VALUE>"},
    };
    for (const QualifierRow& row : rows)
        EXPECT_EQ(writtenQualifier(row.qualifier, row.declaration),
                  "<QUALIFIER " + std::string(row.expected) + "</QUALIFIER>");
}

TEST(ClassWriter, NamesOfValuesStandOnlyBesideAsManyNumbers) {
    // The schema itself refuses properties of this kind that are integers.
    EXPECT_EQ(writtenQualifier("ValueMap{\"1\", \"2\"}, Values{\"one\"}"),
              "<QUALIFIER NAME=\"ValueMap\" TYPE=\"string\"><VALUE.ARRAY><VALUE>1</VALUE>"
              "<VALUE>2</VALUE></VALUE.ARRAY></QUALIFIER>");
    EXPECT_EQ(writtenQualifier("Values{\"none\", \"one\"}"),
              "<QUALIFIER NAME=\"Values\" TYPE=\"string\" "
              "TRANSLATABLE=\"true\"><VALUE.ARRAY><VALUE>none</VALUE>"
              "<VALUE>one</VALUE></VALUE.ARRAY></QUALIFIER>");
}

TEST(ClassWriter, AQualifierDeclarationTellsItsScopesAndFlavors) {
    const auto written = [](const std::string& mof) {
        const mof::Document document = mof::parse(mof, "x.mof");
        std::string xml;
        writeQualifierDeclaration(xml, document.qualifierTypes.front());
        return validated("GetQualifier", xml);
    };
    EXPECT_EQ(written("Qualifier Key : boolean = false, Scope(property, reference),"
                      " Flavor(DisableOverride);"),
              "<QUALIFIER.DECLARATION NAME=\"Key\" TYPE=\"boolean\" ISARRAY=\"false\" "
              "OVERRIDABLE=\"false\"><SCOPE REFERENCE=\"true\" PROPERTY=\"true\"></SCOPE>"
              "<VALUE>FALSE</VALUE></QUALIFIER.DECLARATION>");
    EXPECT_EQ(written("Qualifier Words : string[] = {\"a\"}, Scope(any),"
                      " Flavor(Restricted, Translatable);"),
              "<QUALIFIER.DECLARATION NAME=\"Words\" TYPE=\"string\" ISARRAY=\"true\" "
              "TOSUBCLASS=\"false\" TRANSLATABLE=\"true\"><SCOPE CLASS=\"true\" "
              "ASSOCIATION=\"true\" REFERENCE=\"true\" PROPERTY=\"true\" METHOD=\"true\" "
              "PARAMETER=\"true\" INDICATION=\"true\"></SCOPE><VALUE.ARRAY><VALUE>a</VALUE>"
              "</VALUE.ARRAY></QUALIFIER.DECLARATION>");
    EXPECT_EQ(written("Qualifier Text : string = NULL, Scope(class);"),
              "<QUALIFIER.DECLARATION NAME=\"Text\" TYPE=\"string\" ISARRAY=\"false\"><SCOPE "
              "CLASS=\"true\"></SCOPE></QUALIFIER.DECLARATION>");
}

}  // namespace
}  // namespace cmpihost::server
