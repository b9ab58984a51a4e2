// What the reader says about texts that are no MOF.
#include <gmock/gmock.h>

#include "host/mof/MofParser.h"

namespace {

using cmpihost::mof::MofError;
using cmpihost::mof::parse;

struct ErrorRow {
    const char* name;
    const char* text;
    const char* message;
};

const ErrorRow rows[] = {
    {"UnknownProduction", "klass A {};",
     "x.mof:1:1: expected 'class', 'instance', 'qualifier' or '#pragma', found 'klass'"},
    {"NothingAfterQualifiers", "[Key]",
     "x.mof:1:6: expected 'class' or 'instance' after the qualifiers, found the end of the file"},
    {"NoClassName", "class { };", "x.mof:1:7: expected the name of the class, found '{'"},
    {"NoSuperclass", "class A : { };",
     "x.mof:1:11: expected the name of the superclass, found '{'"},
    {"NoBody", "class A\n;", "x.mof:2:1: expected '{' after the head of class 'A', found ';'"},
    {"NoSemicolonAfterClass", "class A {}\nclass B {};",
     "x.mof:2:1: expected ';' after class 'A', found 'class'"},
    {"EndWithinClass", "class A {\n string P;\n",
     "x.mof:3:1: expected a type, a class, qualifiers or '}', found the end of the file"},
    {"NoSemicolonAfterProperty", "class A { string P }",
     "x.mof:1:20: expected ';' after property 'P', found '}'"},
    {"UnknownType", "class A { text P; };", "x.mof:1:11: 'text' is no type, and no REF follows it"},
    {"NoPropertyName", "class A { string ; };",
     "x.mof:1:18: expected a name after the type 'string', found ';'"},
    {"PropertyTwice", "class A { string P; uint8 p; };",
     "x.mof:1:27: property 'p' is declared twice in class 'A'"},
    {"QualifierTwice", "class A { [Key, key] string P; };",
     "x.mof:1:17: qualifier 'key' stands twice in one list"},
    {"QualifiersNotClosed", "class A { [Key string P; };",
     "x.mof:1:16: expected ']' after the qualifiers, found 'string'"},
    {"NoQualifierName", "class A { [] string P; };",
     "x.mof:1:12: expected the name of a qualifier, found ']'"},
    {"QualifierValueNotClosed", "[Version(\"1\"] class A {};",
     "x.mof:1:13: expected ')' after the value of qualifier 'Version', found ']'"},
    {"NoFlavor", "[Key : ] class A {};",
     "x.mof:1:8: expected a flavor of qualifier 'Key', found ']'"},
    {"NestedList", "[Values{ {\"a\"} }] class A {};",
     "x.mof:1:10: expected a value (a string, a number, a character, TRUE, FALSE or NULL), found "
     "'{'"},
    {"ListNotClosed", "[Values{ \"a\" ] class A {};",
     "x.mof:1:14: expected '}' after the list of values, found ']'"},
    {"ListForScalar", "class A { uint8 P = {1}; };",
     "x.mof:1:21: expected a value (a string, a number, a character, TRUE, FALSE or NULL), found "
     "'{'"},
    {"ScalarForList", "class A { uint8 P[] = 1; };",
     "x.mof:1:23: expected '{' after '=', found '1'"},
    {"DefaultTooLarge", "class A { uint8 P = 256; };",
     "x.mof:1:21: the default of property 'P' is no value of type uint8"},
    {"DefaultTooSmall", "class A { sint8 P = -129; };",
     "x.mof:1:21: the default of property 'P' is no value of type sint8"},
    {"NegativeUnsigned", "class A { uint64 P = -1; };",
     "x.mof:1:22: the default of property 'P' is no value of type uint64"},
    {"TextForNumber", "class A { uint16 P[] = {1, \"2\"}; };",
     "x.mof:1:24: the default of property 'P' is no value of type uint16"},
    {"NumberForBoolean", "class A { boolean P = 1; };",
     "x.mof:1:23: the default of property 'P' is no value of type boolean"},
    {"ZeroArraySize", "class A { uint16 P[0]; };",
     "x.mof:1:20: expected the size of array 'P' as a positive integer, found '0'"},
    {"ArrayNotClosed", "class A { uint16 P[; };",
     "x.mof:1:20: expected ']' after the size of array 'P', found ';'"},
    {"ParametersNotClosed", "class A { uint32 M(uint8 P; };",
     "x.mof:1:27: expected ')' after the parameters of method 'M', found ';'"},
    {"UnknownPragma", "#include (\"a\")", "x.mof:1:1: expected '#pragma', found '#include'"},
    {"PragmaWithoutText", "#pragma include (a)",
     "x.mof:1:18: expected the parameter of the pragma as a string, found 'a'"},
    {"InstanceWithoutOf", "instance A {};",
     "x.mof:1:10: expected 'of' after 'instance', found 'A'"},
    {"InstanceWithoutValue", "instance of A { P; };",
     "x.mof:1:18: expected '=' after the name of property 'P', found ';'"},
    {"AliasWithoutDollar", "instance of A as b { };",
     "x.mof:1:18: expected an alias ($name) after 'as', found 'b'"},
    {"QualifierWithoutType", "qualifier Q : text;", "x.mof:1:15: 'text' is no type"},
    {"QualifierWithUnknownClause", "qualifier Q : boolean, Colour(red);",
     "x.mof:1:24: expected 'Scope' or 'Flavor', found 'Colour'"},
    {"ScopeNotClosed", "qualifier Q : boolean, Scope(any;",
     "x.mof:1:33: expected ')' after the scope, found ';'"},
    {"PragmaWithoutParenthesis", "#pragma include \"a\")",
     "x.mof:1:17: expected '(' after the name of the pragma, found the string \"a\""},
    {"PragmaNotClosed", "#pragma include (\"a\";",
     "x.mof:1:21: expected ')' after the parameter of the pragma, found ';'"},
    {"NoSemicolonAfterMethod", "class A { uint32 M() }",
     "x.mof:1:22: expected ';' after method 'M', found '}'"},
    {"QualifierWithoutColon", "qualifier Q boolean;",
     "x.mof:1:13: expected ':' after the name of qualifier 'Q', found 'boolean'"},
    {"NoSemicolonAfterQualifier", "qualifier Q : boolean",
     "x.mof:1:22: expected ';' after qualifier 'Q', found the end of the file"},
    {"ScopeWithoutParenthesis", "qualifier Q : boolean, Scope any);",
     "x.mof:1:30: expected '(' after the scope, found 'any'"},
    {"InstanceWithoutBody", "instance of A;",
     "x.mof:1:14: expected '{' after the head of the instance of 'A', found ';'"},
    {"NoSemicolonAfterValue", "instance of A { P = 1 };",
     "x.mof:1:23: expected ';' after the value of property 'P', found '}'"},
    {"NoSemicolonAfterInstance", "instance of A {}",
     "x.mof:1:17: expected ';' after the instance of 'A', found the end of the file"},
    {"ArraySizeBeyond32Bits", "class A { uint16 P[4294967296]; };",
     "x.mof:1:20: expected the size of array 'P' as a positive integer, found '4294967296'"},
    {"ReferenceWithoutClass", "class A { ref P; };",
     "x.mof:1:11: 'ref' is no type, and no REF follows it"},
    {"TokenOfFortyBytesIsWhole", "\"0123456789012345678901234567890123456789\"",
     "x.mof:1:1: expected 'class', 'instance', 'qualifier' or '#pragma', found the string "
     "\"0123456789012345678901234567890123456789\""},
    {"LongTokenIsCut", "\"0123456789012345678901234567890123456789tail\"",
     "x.mof:1:1: expected 'class', 'instance', 'qualifier' or '#pragma', found the string "
     "\"0123456789012345678901234567890123456789...\""},
};

class MofErrorRow : public testing::TestWithParam<ErrorRow> {};

TEST_P(MofErrorRow, SaysWhereAndWhatWasExpected) {
    try {
        parse(GetParam().text, "x.mof");
        FAIL() << "no error";
    } catch (const MofError& error) {
        EXPECT_STREQ(error.what(), GetParam().message);
    }
}

INSTANTIATE_TEST_SUITE_P(MofParser, MofErrorRow, testing::ValuesIn(rows),
                         [](const auto& row) { return std::string(row.param.name); });

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

}  // namespace
