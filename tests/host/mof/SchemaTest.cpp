// Classes with what they inherit, and the names of their numbers.
#include "host/mof/Schema.h"

#include <gmock/gmock.h>

#include "host/broker/Value.h"
#include "host/mof/MofParser.h"

namespace {

using namespace cmpihost;
using testing::ElementsAre;
using testing::HasSubstr;

Schema schemaOf(const std::string& text) {
    Schema schema;
    schema.add(mof::parse(text, "x.mof"));
    return schema;
}

/// What() of what the call throws.
template <class Call>
std::string complaint(Call call) {
    try {
        call();
    } catch (const std::runtime_error& error) {
        return error.what();
    }
    return "no error";
}

std::string complaintAbout(const std::string& text) {
    return complaint([&] { schemaOf(text); });
}

const char* family =
    "class Base { [Key] string Id; uint16 Size; };"
    "class Derived : Base { string Name; [Override(\"Id\")] string ID; };"
    "[Association] class Link { [Key] Base REF From; [Key] Base REF To; };"
    "class SubLink : Link { };"
    "class Foreign : CIM_Elsewhere { datetime When; uint8 Codes[]; };";

TEST(Schema, FindsClassesAndTheNearestDeclarationOfAPropertyWithoutCase) {
    const Schema schema = schemaOf(family);
    ASSERT_NE(schema.find("dERIVED"), nullptr);
    EXPECT_EQ(schema.find("dERIVED")->name, "Derived");
    EXPECT_EQ(schema.find("Nobody"), nullptr);
    EXPECT_EQ(schema.findProperty("Derived", "id")->name, "ID");
    EXPECT_EQ(schema.findProperty("Derived", "SIZE")->name, "Size");
    EXPECT_EQ(schema.findProperty("Derived", "Weight"), nullptr);
    EXPECT_EQ(schema.findProperty("Nobody", "Id"), nullptr);
}

TEST(Schema, FindsTheNearestDeclarationOfAMethodWithoutCase) {
    const Schema schema = schemaOf(
        "class A { uint32 Start(); uint32 Stop(); };"
        "class B : A { uint32 START(uint8 Speed); };");
    EXPECT_EQ(schema.findMethod("b", "start")->parameters.size(), 1U);
    EXPECT_EQ(schema.findMethod("B", "stop")->result.name, "Stop");
    EXPECT_EQ(schema.findMethod("B", "Reset"), nullptr);
    EXPECT_EQ(schema.findMethod("C", "Start"), nullptr);
}

TEST(Schema, InheritsKeysAndAssociationsFromSuperclassesDeclaredOrNot) {
    const Schema schema = schemaOf(family);
    EXPECT_TRUE(schema.isKey("Derived", "ID"));
    EXPECT_FALSE(schema.isKey("Derived", "Name"));
    EXPECT_TRUE(schema.isAssociation("SubLink"));
    EXPECT_FALSE(schema.isAssociation("Derived"));
    EXPECT_TRUE(schema.isA("Derived", "Base"));
    EXPECT_FALSE(schema.isA("Base", "Derived"));
    EXPECT_TRUE(schema.isA("Foreign", "cim_elsewhere"));
}

TEST(Schema, ListsSubclassesOfClassesDeclaredOrNot) {
    Schema schema = schemaOf(family);
    schema.add(mof::parse("class Deep : dERIVED {}; class alone : BASE {};", "y.mof"));
    EXPECT_THAT(schema.subclasses("BASE"), ElementsAre("alone", "Derived"));
    EXPECT_THAT(schema.subclasses("Base", true), ElementsAre("alone", "Deep", "Derived"));
    EXPECT_THAT(schema.subclasses("CIM_Elsewhere"), ElementsAre("Foreign"));
    EXPECT_THAT(schema.subclasses(""), ElementsAre("Base", "Link"));
    EXPECT_THAT(schema.subclasses("Deep", true), ElementsAre());
}

TEST(Schema, InheritsTheNamesOfNumbersUnlessAnOverrideBringsItsOwn) {
    const Schema schema = schemaOf(
        "class C : B { [Override(\"State\"), ValueMap{\"1\"}, Values{\"own\"}] uint16 State; };"
        "class B : A { [Override(\"State\")] uint16 STATE; };"
        "class A { [ValueMap{\"1\"}, Values{\"one\"}] uint16 State; };");
    EXPECT_EQ(*schema.valueMap("B", "State").find(1), "one");
    EXPECT_EQ(*schema.valueMap("C", "State").find(1), "own");
    EXPECT_TRUE(schema.valueMap("B", "Weight").empty());
}

TEST(Schema, PairsNamesAndNumbersOfDifferentDeclarations) {
    const Schema schema = schemaOf(
        "class B : A { [Override(\"P\"), Values{\"cinq\", \"six\"}] uint16 P;"
        " [Override(\"Q\"), ValueMap{\"7\", \"8\"}] uint16 Q;"
        " [Override(\"R\"), Values{\"zero\"}] uint16 R; };"
        "class A { [ValueMap{\"5\", \"6\"}, Values{\"five\", \"six\"}] uint16 P;"
        " [ValueMap{\"5\", \"6\"}, Values{\"five\", \"six\"}] uint16 Q;"
        " [ValueMap{\"5\", \"6\"}, Values{\"five\", \"six\"}] uint16 R; };");
    EXPECT_EQ(*schema.valueMap("B", "P").find(5), "cinq");
    EXPECT_EQ(schema.valueMap("B", "P").find(0), nullptr);
    EXPECT_EQ(*schema.valueMap("B", "Q").find(7), "five");
    EXPECT_EQ(schema.valueMap("B", "Q").find(5), nullptr);
    EXPECT_EQ(*schema.valueMap("B", "R").find(0), "zero");
    EXPECT_EQ(*schema.valueMap("A", "P").find(5), "five");
}

TEST(Schema, RefusesClassesThatAreDeclaredTwiceOrDescendFromThemselves) {
    EXPECT_EQ(complaintAbout("class A {};\nclass a {};"),
              "x.mof:2:7: class 'a' is declared twice, first at x.mof:1");
    EXPECT_EQ(complaintAbout("class A : A {};"), "x.mof:1:7: class 'A' descends from itself");
    EXPECT_EQ(complaintAbout("class A : B {};\nclass B : C {};\nclass C : A {};"),
              "x.mof:3:7: class 'C' descends from itself");
}

TEST(Schema, RefusesAQualifierThatIsDeclaredInTwoWays) {
    const std::string once = "Qualifier Q : string, Scope(any), Flavor(Restricted);\n";
    EXPECT_EQ(complaintAbout(once + once + "class A {};"), "no error");
    EXPECT_EQ(complaintAbout(once + "Qualifier q : string, Scope(any);"),
              "x.mof:2:11: qualifier 'q' is declared otherwise than at x.mof:1");
}

TEST(SchemaCatalogue, ShowsTheBrokerClassesWithTheirOwnPropertiesBeforeInheritedOnes) {
    const SchemaCatalogue catalogue(schemaOf(family));
    const auto shown = [&](const char* className) {
        const ClassDeclaration* declared = catalogue.find(className);
        if (declared == nullptr) return std::string("none");
        std::string text = declared->name + ":" + declared->superclass;
        text += declared->association ? " association" : "";
        for (const PropertyDeclaration& property : declared->properties) {
            text += std::string(property.key ? " *" : " ") + property.name + "=" +
                    cimTypeName(property.type);
            text += property.referenceClass.empty() ? "" : ">" + property.referenceClass;
        }
        return text;
    };
    EXPECT_EQ(shown("DERIVED"), "Derived:Base Name=string *ID=string Size=uint16");
    EXPECT_EQ(shown("SubLink"), "SubLink:Link association *From=ref>Base *To=ref>Base");
    EXPECT_EQ(shown("Foreign"), "Foreign:CIM_Elsewhere When=datetime Codes=uint8[]");
    EXPECT_EQ(shown("Nobody"), "none");
}

TEST(SchemaCatalogue, GivesEveryTypeOfMofItsCmpiType) {
    const std::pair<const char*, CMPIType> rows[] = {
        {"boolean", CMPI_boolean},   {"string", CMPI_string}, {"char16", CMPI_char16},
        {"datetime", CMPI_dateTime}, {"uint8", CMPI_uint8},   {"sint8", CMPI_sint8},
        {"uint16", CMPI_uint16},     {"sint16", CMPI_sint16}, {"uint32", CMPI_uint32},
        {"sint32", CMPI_sint32},     {"uint64", CMPI_uint64}, {"sint64", CMPI_sint64},
        {"real32", CMPI_real32},     {"real64", CMPI_real64}, {"A REF", CMPI_ref}};
    for (const auto& [name, type] : rows) {
        const Schema schema = schemaOf(std::string("class A { ") + name + " P; };");
        const mof::Feature& property = *schema.findProperty("A", "P");
        EXPECT_EQ(cmpiType(property), type) << name;
        if (type != CMPI_ref) {
            EXPECT_STREQ(mof::nameOf(property.type), name);
        }
    }
}

ValueMap mapOf(const std::string& qualifiers, const std::string& type = "uint16") {
    const mof::Document document =
        mof::parse("class A { [" + qualifiers + "] " + type + " P; };", "x.mof");
    const mof::Feature& property = document.classes.at(0).properties.at(0);
    return ValueMap::of(property.type, mof::findQualifier(property.qualifiers, "Values"),
                        mof::findQualifier(property.qualifiers, "ValueMap"));
}

TEST(ValueMap, NamesNumbersByTheNarrowestAndFirstEntryThatHoldsThem) {
    const char* const ranges =
        R"(ValueMap{"..","0x8000..","2","10..20"}, Values{"rest","vendor","two","tens"})";
    const char* const low = R"(ValueMap{"..-5","-1"}, Values{"low","minus one"})";
    const struct {
        const char* qualifiers;
        const char* type;
        std::int64_t number;
        const char* name;
    } rows[] = {
        {R"(ValueMap{"0","5","0x10"}, Values{"zero","five","sixteen"})", "uint8", 0, "zero"},
        {R"(ValueMap{"0","5","0x10"}, Values{"zero","five","sixteen"})", "uint8", 5, "five"},
        {R"(ValueMap{"0","5","0x10"}, Values{"zero","five","sixteen"})", "uint8", 16, "sixteen"},
        {R"(ValueMap{"0","5","0x10"}, Values{"zero","five","sixteen"})", "uint8", 1, nullptr},
        {R"(Values{"a","b"})", "uint16", 1, "b"},
        {R"(Values{"a","b"})", "uint16", 2, nullptr},
        {ranges, "uint16", 2, "two"},
        {ranges, "uint16", 10, "tens"},
        {ranges, "uint16", 20, "tens"},
        {ranges, "uint16", 21, "rest"},
        {ranges, "uint16", 0x7FFF, "rest"},
        {ranges, "uint16", 0x8000, "vendor"},
        {R"(ValueMap{"1","1"}, Values{"first","second"})", "uint16", 1, "first"},
        {R"(ValueMap{"1..2","2..3"}, Values{"first","second"})", "uint16", 2, "first"},
        {low, "sint16", -6, "low"},
        {low, "sint16", -1, "minus one"},
        {low, "sint16", 0, nullptr},
        {R"(ValueMap{"9223372036854775807"}, Values{"most"})", "uint64", INT64_MAX, "most"},
    };
    for (const auto& row : rows) {
        const ValueMap map = mapOf(row.qualifiers, row.type);
        const std::string* const name = map.find(row.number);
        EXPECT_EQ(name == nullptr ? "none" : *name, row.name == nullptr ? "none" : row.name)
            << row.qualifiers << " " << row.number;
    }
}

TEST(ValueMap, IsForIntegersWithValues) {
    for (const char* type :
         {"uint8", "sint8", "uint16", "sint16", "uint32", "sint32", "uint64", "sint64"}) {
        EXPECT_FALSE(mapOf(R"(Values{"zero"})", type).empty()) << type;
    }
    for (const char* type : {"boolean", "char16", "datetime", "real32", "real64", "string"})
        EXPECT_TRUE(mapOf(R"(Values{"zero"})", type).empty()) << type;
    for (const char* qualifiers : {R"(ValueMap{"1"})", "Key"})
        EXPECT_TRUE(mapOf(qualifiers).empty()) << qualifiers;
    EXPECT_TRUE(mapOf(R"(ValueMap{"OK"}, Values{"fine"})", "string").empty());
}

TEST(ValueMap, ThatMakesNoSenseIsRefusedAtItsProperty) {
    EXPECT_EQ(complaint([] { mapOf(R"(ValueMap{"1","2"}, Values{"a"})"); }),
              "ValueMap lists 2 entries and Values 1");
    for (const std::string entry :
         {"x", "1.5", "1..y", "9223372036854775808", "99999999999999999999"}) {
        EXPECT_THAT(complaint([&] { mapOf("ValueMap{\"" + entry + "\"}, Values{\"a\"}"); }),
                    HasSubstr("in the ValueMap is no integer"))
            << entry;
    }
    EXPECT_EQ(complaint([] { mapOf(R"(ValueMap{""}, Values{"a"})"); }),
              "the ValueMap has an empty entry");
    EXPECT_EQ(complaintAbout("class A {\n [ValueMap{\"1\"}, Values{}] uint8 P;\n"
                             " [ValueMap{\"z\"}, Values{\"n\"}] uint8 Q; };"),
              "x.mof:3:37: property 'Q': 'z' in the ValueMap is no integer");
}

}  // namespace
