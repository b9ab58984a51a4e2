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

TEST(MofParser, PassesOverInstances) {
    const Document read = parse(
        "#pragma locale (\"en_US\")\n#pragma namespace (\"root/cimv2\")\n"
        "instance of A as $a { P = 1; [Key] Q = {\"x\", \"y\"}; R = NULL; S = $b; };\n"
        "class B as $c { B REF Next = $d; };",
        "x.mof");
    ASSERT_EQ(read.classes.size(), 1U);
    EXPECT_EQ(read.classes[0].name, "B");
}

TEST(MofParser, ReadsQualifierDeclarations) {
    const Document read = parse(
        "Qualifier Key : boolean = false, Scope(property, reference), Flavor(DisableOverride);\n"
        "Qualifier Values : string[], Scope(any), Flavor(Translatable, ToSubclass);\n"
        "Qualifier Abstract : boolean = false, Scope(class),\n"
        "  Flavor(Restricted, EnableOverride);\n"
        "Qualifier MaxLen : uint32 = null, Scope(property);",
        "x.mof");
    ASSERT_EQ(read.qualifierTypes.size(), 4U);
    const QualifierType& key = read.qualifierTypes[0];
    EXPECT_EQ(key.name, "Key");
    EXPECT_EQ(key.type, Type::Boolean);
    EXPECT_FALSE(key.array);
    EXPECT_EQ(key.defaultValue->items[0], Scalar(false));
    EXPECT_THAT(key.scopes, testing::ElementsAre("property", "reference"));
    EXPECT_EQ(key.flavor, (Flavor{std::nullopt, false, false}));
    EXPECT_TRUE(read.qualifierTypes[1].array);
    EXPECT_FALSE(read.qualifierTypes[1].defaultValue.has_value());
    EXPECT_EQ(read.qualifierTypes[1].flavor, (Flavor{true, std::nullopt, true}));
    EXPECT_EQ(read.qualifierTypes[2].flavor, (Flavor{false, true, false}));
    EXPECT_EQ(read.qualifierTypes[3].flavor, Flavor());
    EXPECT_EQ(read.qualifierTypes[3].position.line, 5U);
}

TEST(MofParser, ReadsTheFlavorsOfAQualifierAndPassesOverUnknownOnes) {
    const auto flavorOf = [](const std::string& words) {
        return onlyClass("[Q : " + words + "] class A {};").qualifiers.at(0).flavor;
    };
    EXPECT_EQ(flavorOf("restricted"), (Flavor{false, std::nullopt, false}));
    EXPECT_EQ(flavorOf("ToSubclass DisableOverride Translatable"), (Flavor{true, false, true}));
    EXPECT_EQ(flavorOf("EnableOverride"), (Flavor{std::nullopt, true, false}));
    EXPECT_EQ(flavorOf("ToInstance"), Flavor());
}

TEST(MofParser, KeepsTheNamesOfIncludedFiles) {
    const Document read =
        parse("#pragma include (\"a.mof\")\n#PRAGMA Include(\"b\" \".mof\")", "x.mof");
    ASSERT_EQ(read.includes.size(), 2U);
    EXPECT_EQ(read.includes[0].file, "a.mof");
    EXPECT_EQ(read.includes[1].file, "b.mof");
    EXPECT_EQ(read.includes[1].position.line, 2U);
}

TEST(MofParser, ReadsEveryProductionOfTheGrammar) {
    const Document read = parse(R"mof(
        #pragma include ("Core/CIM_Core.mof")
        #pragma locale ("de_DE")
        Qualifier ValueMap : string[], Scope(property, method, parameter);
        Qualifier Counted : uint16[3] = { 1, 0x2, 11b }, Scope(any),
            Flavor(EnableOverride, ToSubclass);
        /* All constants. */
        [Abstract, Version("2." "41"), UMLPackagePath ( "CIM::Core" ),
         Bool(FALSE), Real(-1.5e+3), Char('\x41'),
         List { 1, -2, 017, 0xFF, 101b, NULL } : Restricted]
        class CIM_Everything : CIM_Base {
              [Key, Override("Id"), MaxLen(256):DisableOverride]
           string Id = "a" "b";
              [ArrayType("Ordered"), EmbeddedInstance("CIM_Base")]
           string Parts[10] = { "x", "y" };
           datetime When = "19980525133015.000000-300";
           char16 Letter = 'B';
           real32 Ratio = .5;  real64 Big = -1.0E+10;
           sint64 Low = -9223372036854775808;  uint64 High = 0xFFFFFFFFFFFFFFFF;
           boolean Flags[] = { true, FALSE, Null };
              [Static, Exception(false)]
           CIM_Everything REF Best = "CIM_Everything.Id=\"b\"";
              [Description("Does it.")]
           uint32 Do([IN, Required] CIM_Base REF What[],
             [OUT, IN(false)] datetime Until, real64 How);
           boolean Undo();
        };
        [Association, Aggregation] class CIM_Holds { [Key, Aggregate] CIM_Base REF Whole;
            [Key, Min(1)] CIM_Everything REF Part; };
        [Indication] class CIM_Told {};
        [Description("One.")] instance of CIM_Holds as $One {
            Whole = "CIM_Base.Id=1"; [Read] Part = $Two; };
    )mof",
                                "x.mof");
    EXPECT_EQ(read.includes.size(), 1U);
    EXPECT_EQ(read.qualifierTypes.size(), 2U);
    ASSERT_EQ(read.classes.size(), 3U);
    const Class& everything = read.classes[0];
    EXPECT_EQ(everything.qualifiers.size(), 7U);
    EXPECT_EQ(everything.properties.size(), 10U);
    EXPECT_EQ(everything.properties[3].defaultValue->items[0], Scalar(Character{'B'}));
    EXPECT_EQ(everything.properties[9].defaultValue->items[0], Scalar("CIM_Everything.Id=\"b\""));
    ASSERT_EQ(everything.methods.size(), 2U);
    EXPECT_TRUE(everything.methods[0].parameters[0].array);
    EXPECT_EQ(everything.methods[1].result.type, Type::Boolean);
}

TEST(MofParser, ReadsAHundredThousandQualifiersInAMoment) {
    std::string list = "[Q0";
    for (int index = 1; index < 100000; ++index) {
        list += ",Q" + std::to_string(index);
    }
    EXPECT_EQ(onlyClass(list + "] class A {};").qualifiers.size(), 100000U);
}

TEST(MofParser, SaysWhereAndWhatWasExpected) {
    const struct {
        const char* text;
        const char* message;
    } rows[] = {
        {"klass A {};",
         "1:1: expected 'class', 'instance', 'qualifier' or '#pragma', found 'klass'"},
        {"[Key]",
         "1:6: expected 'class' or 'instance' after the qualifiers, found the end of the file"},
        {"[Key] qualifier Q : boolean;",
         "1:7: expected 'class' or 'instance' after the qualifiers, found 'qualifier'"},
        {"class { };", "1:7: expected the name of the class, found '{'"},
        {"class A : { };", "1:11: expected the name of the superclass, found '{'"},
        {"class A\n;", "2:1: expected '{' after the head of class 'A', found ';'"},
        {"class A {}\nclass B {};", "2:1: expected ';' after class 'A', found 'class'"},
        {"class A {\n string P;\n",
         "3:1: expected a type, a class, qualifiers or '}', found the end of the file"},
        {"class A { string P }", "1:20: expected ';' after property 'P', found '}'"},
        {"class A { text P; };", "1:11: 'text' is no type, and no REF follows it"},
        {"class A { string ; };", "1:18: expected a name after the type 'string', found ';'"},
        {"class A { string P; uint8 p; };", "1:27: property 'p' is declared twice in class 'A'"},
        {"class A { uint8 M(); uint8 m(); };", "1:28: method 'm' is declared twice in class 'A'"},
        {"class A { [Key, key] string P; };", "1:17: qualifier 'key' stands twice in one list"},
        {"class A { [Key string P; };", "1:16: expected ']' after the qualifiers, found 'string'"},
        {"class A { [] string P; };", "1:12: expected the name of a qualifier, found ']'"},
        {"[Version(\"1\"] class A {};",
         "1:13: expected ')' after the value of qualifier 'Version', found ']'"},
        {"[Key : ] class A {};", "1:8: expected a flavor of qualifier 'Key', found ']'"},
        {"[Values{ {\"a\"} }] class A {};",
         "1:10: expected a value (a string, a number, a character, TRUE, FALSE or NULL), found "
         "'{'"},
        {"[Values{ \"a\" ] class A {};", "1:14: expected '}' after the list of values, found ']'"},
        {"class A { uint8 P = {1}; };",
         "1:21: expected a value (a string, a number, a character, TRUE, FALSE or NULL), found "
         "'{'"},
        {"class A { uint8 P[] = 1; };", "1:23: expected '{' after '=', found '1'"},
        {"class A { uint8 P = 256; };",
         "1:21: the default of property 'P' is no value of type uint8"},
        {"class A { sint8 P = -129; };",
         "1:21: the default of property 'P' is no value of type sint8"},
        {"class A { uint64 P = -1; };",
         "1:22: the default of property 'P' is no value of type uint64"},
        {"class A { uint16 P[] = {1, \"2\"}; };",
         "1:24: the default of property 'P' is no value of type uint16"},
        {"class A { boolean P = 1; };",
         "1:23: the default of property 'P' is no value of type boolean"},
        {"class A { uint16 P[0]; };",
         "1:20: expected the size of array 'P' as a positive integer, found '0'"},
        {"class A { uint16 P[; };", "1:20: expected ']' after the size of array 'P', found ';'"},
        {"class A { uint32 M(uint8 P; };",
         "1:27: expected ')' after the parameters of method 'M', found ';'"},
        {"#include (\"a\")", "1:1: expected '#pragma', found '#include'"},
        {"#pragma include (a)",
         "1:18: expected the parameter of the pragma as a string, found 'a'"},
        {"instance A {};", "1:10: expected 'of' after 'instance', found 'A'"},
        {"instance of A { P; };", "1:18: expected '=' after the name of property 'P', found ';'"},
        {"instance of A as b { };", "1:18: expected an alias ($name) after 'as', found 'b'"},
        {"qualifier Q : text;", "1:15: 'text' is no type"},
        {"qualifier Q : boolean, Colour(red);",
         "1:24: expected 'Scope' or 'Flavor', found 'Colour'"},
        {"qualifier Q : boolean, Scope(any;", "1:33: expected ')' after the scope, found ';'"},
        {"#pragma include \"a\")",
         "1:17: expected '(' after the name of the pragma, found the string \"a\""},
        {"#pragma include (\"a\";",
         "1:21: expected ')' after the parameter of the pragma, found ';'"},
        {"class A { uint32 M() }", "1:22: expected ';' after method 'M', found '}'"},
        {"qualifier Q boolean;",
         "1:13: expected ':' after the name of qualifier 'Q', found 'boolean'"},
        {"qualifier Q : boolean",
         "1:22: expected ';' after qualifier 'Q', found the end of the file"},
        {"qualifier Q : boolean, Scope any);", "1:30: expected '(' after the scope, found 'any'"},
        {"instance of A;", "1:14: expected '{' after the head of the instance of 'A', found ';'"},
        {"instance of A { P = 1 };",
         "1:23: expected ';' after the value of property 'P', found '}'"},
        {"instance of A {}",
         "1:17: expected ';' after the instance of 'A', found the end of the file"},
        {"class A { uint16 P[4294967296]; };",
         "1:20: expected the size of array 'P' as a positive integer, found '4294967296'"},
        {"class A { ref P; };", "1:11: 'ref' is no type, and no REF follows it"},
        {"\"0123456789012345678901234567890123456789\"",
         "1:1: expected 'class', 'instance', 'qualifier' or '#pragma', found the string "
         "\"0123456789012345678901234567890123456789\""},
        {"\"0123456789012345678901234567890123456789tail\"",
         "1:1: expected 'class', 'instance', 'qualifier' or '#pragma', found the string "
         "\"0123456789012345678901234567890123456789...\""},
    };
    for (const auto& row : rows) {
        try {
            parse(row.text, "x.mof");
            ADD_FAILURE() << "no error in " << row.text;
        } catch (const MofError& error) {
            EXPECT_EQ(error.what(), std::string("x.mof:") + row.message);
        }
    }
}

TEST(MofParser, AnswersEveryBeginningOfAGoodTextWithAResultOrAnError) {
    const std::string good =
        "#pragma include (\"a\")\n[Version(\"1\"), Values{\"a\",'b',1,-2,0x3,1.5,NULL,TRUE}] class "
        "A "
        ": B { [Key] string P[2] = {\"\\x41\\n\"}; C REF r; uint32 M([IN] uint8 x[]); };\n"
        "qualifier Q : boolean = false, Scope(any), Flavor(x); instance of A as $a { P = $b; };";
    parse(good, "x.mof");
    for (std::size_t length = 0; length < good.size(); ++length) {
        for (const char* tail : {"", "{", "\"", "/*", "[", "\\", "9"}) {
            try {
                parse(good.substr(0, length) + tail, "x.mof");
            } catch (const MofError& error) {
                EXPECT_THAT(error.what(), testing::StartsWith("x.mof:"));
            }
        }
    }
}

TEST(MofTypes, IntegersFitFromTheLeastToTheLargestOfTheirType) {
    const struct {
        Type type;
        std::int64_t least;
        std::uint64_t largest;
    } rows[] = {{Type::UInt8, 0, UINT8_MAX},   {Type::SInt8, INT8_MIN, INT8_MAX},
                {Type::UInt16, 0, UINT16_MAX}, {Type::SInt16, INT16_MIN, INT16_MAX},
                {Type::UInt32, 0, UINT32_MAX}, {Type::SInt32, INT32_MIN, INT32_MAX},
                {Type::UInt64, 0, UINT64_MAX}, {Type::SInt64, INT64_MIN, INT64_MAX}};
    for (const auto& row : rows) {
        EXPECT_TRUE(fits(Scalar(row.least), row.type)) << nameOf(row.type);
        EXPECT_TRUE(fits(Scalar(row.largest), row.type)) << nameOf(row.type);
        if (row.least != INT64_MIN) {
            EXPECT_FALSE(fits(Scalar(row.least - 1), row.type)) << nameOf(row.type);
        }
        if (row.largest != UINT64_MAX) {
            EXPECT_FALSE(fits(Scalar(row.largest + 1), row.type)) << nameOf(row.type);
        }
    }
}

TEST(MofTypes, EveryTypeTakesConstantsOfItsKindAndNull) {
    const Scalar null;
    const Scalar flag(true);
    const Scalar positive(std::uint64_t{1});
    const Scalar negative(std::int64_t{-1});
    const Scalar real(1.5);
    const Scalar character(Character{0xFFFF});
    const Scalar text(std::string("x"));
    const struct {
        Type type;
        std::vector<Scalar> fitting;
    } rows[] = {{Type::Boolean, {null, flag}},
                {Type::String, {null, text}},
                {Type::DateTime, {null, text}},
                {Type::Reference, {null, text}},
                {Type::Char16, {null, character}},
                {Type::UInt8, {null, positive}},
                {Type::SInt64, {null, positive, negative}},
                {Type::Real32, {null, positive, negative, real}},
                {Type::Real64, {null, positive, negative, real}}};
    for (const auto& row : rows) {
        std::vector<Scalar> fitting;
        for (const Scalar& scalar : {null, flag, positive, negative, real, character, text}) {
            if (fits(scalar, row.type)) fitting.push_back(scalar);
        }
        EXPECT_EQ(fitting, row.fitting) << nameOf(row.type);
    }
    EXPECT_FALSE(fits(Scalar(Character{0x10000}), Type::Char16));
}

}  // namespace
