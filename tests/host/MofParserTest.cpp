#include "host/mof/MofParser.h"

#include <gmock/gmock.h>

#include "host/mof/MofAst.h"

namespace {

using namespace cmpihost::mof;

Class onlyClass(const std::string& text) {
    Document document = parse(text, "x.mof");
    EXPECT_EQ(document.classes.size(), 1U);
    return document.classes.empty() ? Class() : document.classes.front();
}

TEST(MofParser, ReadsAnEmptyText) {
    EXPECT_TRUE(parse("", "x.mof").classes.empty());
    EXPECT_TRUE(parse("// nothing\n", "x.mof").classes.empty());
}

TEST(MofParser, ReadsTheHeadOfAClass) {
    const Class read = onlyClass("[Association, Version(\"1.0\")]\nclass A : B { };");
    EXPECT_EQ(read.name, "A");
    EXPECT_EQ(read.superclass, "B");
    EXPECT_EQ(read.file, "x.mof");
    EXPECT_EQ(read.position.line, 2U);
    EXPECT_TRUE(isSet(read.qualifiers, "ASSOCIATION"));
    EXPECT_EQ(text(read.qualifiers, "version"), "1.0");
}

TEST(MofParser, TakesKeywordsInAnyCase) {
    const Class read = onlyClass("CLASS A { UInt8 X = Null; B Ref Y; Boolean Z = TRUE; };");
    ASSERT_EQ(read.properties.size(), 3U);
    EXPECT_EQ(read.properties[0].type, Type::UInt8);
    EXPECT_EQ(read.properties[1].type, Type::Reference);
    EXPECT_EQ(read.properties[1].referenceClass, "B");
    EXPECT_EQ(read.properties[2].defaultValue->items[0], Scalar(true));
}

TEST(MofParser, ReadsEveryType) {
    const struct {
        const char* name;
        Type type;
    } rows[] = {{"boolean", Type::Boolean},   {"string", Type::String}, {"char16", Type::Char16},
                {"datetime", Type::DateTime}, {"uint8", Type::UInt8},   {"sint8", Type::SInt8},
                {"uint16", Type::UInt16},     {"sint16", Type::SInt16}, {"uint32", Type::UInt32},
                {"sint32", Type::SInt32},     {"uint64", Type::UInt64}, {"sint64", Type::SInt64},
                {"real32", Type::Real32},     {"real64", Type::Real64}};
    for (const auto& row : rows) {
        const Class read = onlyClass(std::string("class A { ") + row.name + " P; };");
        ASSERT_EQ(read.properties.size(), 1U);
        EXPECT_EQ(read.properties[0].type, row.type) << row.name;
        EXPECT_STREQ(nameOf(row.type), row.name);
    }
}

TEST(MofParser, ReadsArraysAndTheirDefaults) {
    const Class read =
        onlyClass("class A { uint16 P[] = {1, 2}; string Q[3]; uint8 R[] = NULL; };");
    ASSERT_EQ(read.properties.size(), 3U);
    EXPECT_TRUE(read.properties[0].array);
    ASSERT_TRUE(read.properties[0].defaultValue.has_value());
    EXPECT_THAT(read.properties[0].defaultValue->items,
                testing::ElementsAre(Scalar(std::uint64_t{1}), Scalar(std::uint64_t{2})));
    EXPECT_TRUE(read.properties[1].array);
    EXPECT_FALSE(read.properties[1].defaultValue.has_value());
    EXPECT_EQ(read.properties[2].defaultValue->items[0], Scalar());
}

TEST(MofParser, JoinsStringsThatStandSideBySide) {
    const Class read = onlyClass("[Description(\"one \"\n // between\n \"two\")] class A {};");
    EXPECT_EQ(text(read.qualifiers, "Description"), "one two");
}

TEST(MofParser, ReadsQualifierListsAndFlavors) {
    const Class read = onlyClass(
        "class A { [Values{\"a\", \"b\"} : ToSubclass Translatable, Key : DisableOverride,\n"
        "MaxLen(256), ValueMap({\"1\"})] string P; };");
    const auto& qualifiers = read.properties.at(0).qualifiers;
    EXPECT_THAT(texts(qualifiers, "Values"), testing::ElementsAre("a", "b"));
    EXPECT_THAT(texts(qualifiers, "ValueMap"), testing::ElementsAre("1"));
    EXPECT_TRUE(isSet(qualifiers, "Key"));
    EXPECT_FALSE(isSet(qualifiers, "MaxLen"));
    EXPECT_FALSE(isSet(qualifiers, "Required"));
}

TEST(MofParser, TellsAFalseQualifierFromATrueOne) {
    const Class read = onlyClass("class A { [Key(FALSE), Gauge(true)] uint32 P; };");
    EXPECT_FALSE(isSet(read.properties[0].qualifiers, "Key"));
    EXPECT_TRUE(isSet(read.properties[0].qualifiers, "Gauge"));
}

TEST(MofParser, ReadsMethodsApartFromProperties) {
    const Class read = onlyClass(
        "class A { uint32 Reboot(); [Description(\"d\")] uint32 Change([IN] uint16 State, "
        "[OUT] CIM_Job REF Job, string Names[]); string P; };");
    ASSERT_EQ(read.methods.size(), 2U);
    EXPECT_EQ(read.methods[0].result.name, "Reboot");
    ASSERT_EQ(read.methods[1].parameters.size(), 3U);
    EXPECT_EQ(read.methods[1].parameters[1].referenceClass, "CIM_Job");
    EXPECT_TRUE(read.methods[1].parameters[2].array);
    ASSERT_EQ(read.properties.size(), 1U);
}

TEST(MofParser, PassesOverInstancesAndQualifierDeclarations) {
    const Document read = parse(
        "#pragma locale (\"en_US\")\n"
        "Qualifier Key : boolean = false, Scope(property, reference), Flavor(DisableOverride);\n"
        "Qualifier Values : string[], Scope(any);\n"
        "instance of A as $a { P = 1; [Key] Q = {\"x\", \"y\"}; R = NULL; S = $b; };\n"
        "class B as $c {};",
        "x.mof");
    ASSERT_EQ(read.classes.size(), 1U);
    EXPECT_EQ(read.classes[0].name, "B");
}

TEST(MofParser, KeepsTheNamesOfIncludedFiles) {
    const Document read =
        parse("#pragma include (\"a.mof\")\n#PRAGMA Include(\"b\" \".mof\")", "x.mof");
    EXPECT_THAT(read.includes, testing::ElementsAre("a.mof", "b.mof"));
}

TEST(MofParser, ReadsAHundredThousandQualifiersInAMoment) {
    std::string list = "[Q0";
    for (int index = 1; index < 100000; ++index) {
        list += ",Q" + std::to_string(index);
    }
    EXPECT_EQ(onlyClass(list + "] class A {};").qualifiers.size(), 100000U);
}

}  // namespace
