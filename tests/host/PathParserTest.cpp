#include <gmock/gmock.h>

#include "host/cli/PathParser.h"
#include "host/mof/MofParser.h"
#include "host/mof/Schema.h"

namespace {

using namespace cmpihost;

const SchemaCatalogue& catalogue() {
    static const SchemaCatalogue instance = [] {
        Schema schema;
        schema.add(
            mof::parse("class Thing { [Key] string Name; [Key] uint16 Number; "
                       "[Key] datetime When; };"
                       "[Association] class Link { [Key] Thing REF From; "
                       "[Key] Link REF Next; };",
                       "x.mof"));
        return SchemaCatalogue(schema);
    }();
    return instance;
}

ObjectPathValue parsed(const std::string& text) {
    return parsePath(text, &catalogue());
}

TEST(PathParser, PutsAPathWithoutNamespaceIntoTheUsualOne) {
    const ObjectPathValue path = parsed("KORVA_OperatingSystem");
    EXPECT_EQ(path.nameSpace, "root/cimv2");
    EXPECT_EQ(path.className, "KORVA_OperatingSystem");
    EXPECT_TRUE(path.keys.empty());
    EXPECT_EQ(path.hostName, "");
}

TEST(PathParser, TakesNamespaceAndHost) {
    EXPECT_EQ(parsed("interop:Thing").nameSpace, "interop");
    EXPECT_EQ(parsed("root/PG_InterOp-2:Thing").nameSpace, "root/PG_InterOp-2");
    const ObjectPathValue path = parsed("//host.example:5988/root/cimv2:Thing.Name=\"a\"");
    EXPECT_EQ(path.hostName, "host.example:5988");
    EXPECT_EQ(path.nameSpace, "root/cimv2");
    EXPECT_EQ(path.keys.at(0).value, Value("a"));
}

TEST(PathParser, TakesNamesOfLettersDigitsAndUnderlines) {
    for (const char* name : {"azAZ_09", "_x", "Zebra", "\xC4\x80pfel", "x\xC4\x80"}) {
        EXPECT_EQ(parsed(name).className, name);
        EXPECT_EQ(parsed(std::string("X.") + name + "=1").keys.at(0).name, name);
    }
}

TEST(PathParser, KeepsTheOrderAndTheSpellingOfKeys) {
    const ObjectPathValue path = parsed("x.zeta=\"1\",Alpha=\"2\"");
    ASSERT_EQ(path.keys.size(), 2U);
    EXPECT_EQ(path.keys[0].name, "zeta");
    EXPECT_EQ(path.keys[1].name, "Alpha");
}

TEST(PathParser, ResolvesEscapesInTexts) {
    EXPECT_EQ(parsed(R"(X.A="say \"hi\" \\ ,=.:")").keys.at(0).value, Value(R"(say "hi" \ ,=.:)"));
    EXPECT_EQ(parsed("X.A=\"\"").keys.at(0).value, Value(""));
    EXPECT_EQ(parsed("X.A=\"\xC3\xA9\"").keys.at(0).value, Value("\xC3\xA9"));
}

TEST(PathParser, TakesIntegersAsClientsSendThem) {
    EXPECT_EQ(parsed("Thing.Number=7").keys.at(0).value, Value::fromUnsigned(7, CMPI_uint64));
    EXPECT_EQ(parsed("X.A=+7").keys.at(0).value, Value::fromUnsigned(7, CMPI_uint64));
    EXPECT_EQ(parsed("X.A=-7").keys.at(0).value, Value::fromSigned(-7, CMPI_sint64));
    EXPECT_EQ(parsed("X.A=-0").keys.at(0).value, Value::fromUnsigned(0, CMPI_uint64));
    EXPECT_EQ(parsed("X.A=18446744073709551615").keys.at(0).value,
              Value::fromUnsigned(18446744073709551615U, CMPI_uint64));
    EXPECT_EQ(parsed("X.A=-9223372036854775808").keys.at(0).value,
              Value::fromSigned(INT64_MIN, CMPI_sint64));
}

TEST(PathParser, TakesBooleansInAnyCase) {
    EXPECT_EQ(parsed("X.A=TRUE").keys.at(0).value, Value::fromBoolean(true));
    EXPECT_EQ(parsed("X.A=false").keys.at(0).value, Value::fromBoolean(false));
}

TEST(PathParser, TakesADatetimeWhereTheClassDeclaresOne) {
    const char* text = "20240102030405.000000+000";
    EXPECT_EQ(parsed(std::string("Thing.When=\"") + text + "\"").keys.at(0).value,
              Value::fromText(text, CMPI_dateTime));
    EXPECT_EQ(parsed(std::string("X.When=\"") + text + "\"").keys.at(0).value, Value(text));
}

TEST(PathParser, TakesAPathWhereTheClassDeclaresAReference) {
    const ObjectPathValue path =
        parsed(R"(interop:link.from="Thing.Name=\"a \\\"b\\\" \\\\ c\",Number=3")");
    ASSERT_EQ(path.keys.size(), 1U);
    ASSERT_EQ(path.keys[0].value.type(), CMPI_ref);
    const ObjectPathValue& reference = path.keys[0].value.reference();
    EXPECT_EQ(reference.nameSpace, "interop");
    EXPECT_EQ(reference.className, "Thing");
    EXPECT_EQ(reference.key("Name")->text(), "a \"b\" \\ c");
    EXPECT_EQ(reference.key("Number")->unsignedInteger(), 3U);
}

TEST(PathParser, TakesReferencesWithinReferences) {
    const ObjectPathValue path =
        parsed(R"(Link.Next="root/x:Link.Next=\"Link.From=\\\"root/y:Thing.Number=1\\\"\"")");
    const ObjectPathValue& inner = path.keys.at(0).value.reference().key("Next")->reference();
    EXPECT_EQ(inner.nameSpace, "root/x");
    EXPECT_EQ(inner.key("From")->reference().nameSpace, "root/y");
}

TEST(PathParser, TakesAnythingQuotedAsTextWithoutACatalogue) {
    const ObjectPathValue path = parsePath("Link.From=\"Thing.Number=1\"", nullptr);
    EXPECT_EQ(path.keys.at(0).value, Value("Thing.Number=1"));
}

struct PathErrorRow {
    const char* name;
    const char* text;
    const char* message;
};

const PathErrorRow errors[] = {
    {"Empty", "",
     "expected the name of a class\n"
     "  \n"
     "  ^"},
    {"NoClassAfterNamespace", "root/cimv2:",
     "expected the name of a class\n"
     "  root/cimv2:\n"
     "             ^"},
    {"NamespaceWithoutColon", "root/cimv2.Name=\"x\"",
     "expected ':' and the name of a class after the namespace 'root/cimv2'\n"
     "  root/cimv2.Name=\"x\"\n"
     "            ^"},
    {"EmptyNamespaceSegment", "root//cimv2:X",
     "expected a name before '/' in the namespace\n"
     "  root//cimv2:X\n"
     "       ^"},
    {"NamespaceEndsInSlash", "root/:X",
     "expected a name after '/' in the namespace\n"
     "  root/:X\n"
     "       ^"},
    {"ClassBeginsWithDigit", "ns:1X",
     "expected the name of a class\n"
     "  ns:1X\n"
     "     ^"},
    {"DashInClass", "My-Class.A=1",
     "the name of a class holds letters, digits and '_' only\n"
     "  My-Class.A=1\n"
     "    ^"},
    {"NamespaceWithDashWithoutColon", "my-root/x",
     "expected ':' and the name of a class after the namespace 'my-root/x'\n"
     "  my-root/x\n"
     "           ^"},
    {"BlankInClass", "My Class",
     "expected '.' and keys, or the end, after the class 'My'\n"
     "  My Class\n"
     "    ^"},
    {"NoKeyAfterDot", "X.",
     "expected the name of a key\n"
     "  X.\n"
     "    ^"},
    {"NoEqualSign", "X.Name",
     "expected '=' after the key 'Name'\n"
     "  X.Name\n"
     "        ^"},
    {"ValueWithoutQuotes", "X.CSName=h,Name=n",
     "expected the value of 'CSName': a text in quotes, an integer, TRUE or FALSE (a shell keeps "
     "the quotes when the path stands in '...')\n"
     "  X.CSName=h,Name=n\n"
     "           ^"},
    {"NoValue", "X.A=",
     "expected the value of 'A': a text in quotes, an integer, TRUE or FALSE (a shell keeps the "
     "quotes when the path stands in '...')\n"
     "  X.A=\n"
     "      ^"},
    {"TextNotClosed", "X.A=\"abc",
     "the text that begins here is not closed by '\"'\n"
     "  X.A=\"abc\n"
     "      ^"},
    {"TextClosedByEscapedQuote", "X.A=\"abc\\\"",
     "the text that begins here is not closed by '\"'\n"
     "  X.A=\"abc\\\"\n"
     "      ^"},
    {"UnknownEscape", "X.A=\"a\\n\"",
     "in a text '\\' stands before '\"' or '\\' only\n"
     "  X.A=\"a\\n\"\n"
     "        ^"},
    {"TextAfterValue", "X.A=\"a\"b",
     "expected ',' or the end after the value of 'A'\n"
     "  X.A=\"a\"b\n"
     "         ^"},
    {"CommaAtEnd", "X.A=1,",
     "expected the name of a key\n"
     "  X.A=1,\n"
     "        ^"},
    {"BlankAfterComma", "X.A=1, B=2",
     "expected the name of a key\n"
     "  X.A=1, B=2\n"
     "        ^"},
    {"KeyTwice", "X.A=1,a=2",
     "the key 'a' stands twice\n"
     "  X.A=1,a=2\n"
     "        ^"},
    {"LetterInNumber", "X.A=12x",
     "expected the digits of an integer\n"
     "  X.A=12x\n"
     "        ^"},
    {"SignAlone", "X.A=-",
     "expected the digits of an integer\n"
     "  X.A=-\n"
     "       ^"},
    {"TwoSigns", "X.A=+-5",
     "expected the digits of an integer\n"
     "  X.A=+-5\n"
     "       ^"},
    {"NumberTooLarge", "X.A=18446744073709551616",
     "the integer does not fit 64 bits\n"
     "  X.A=18446744073709551616\n"
     "      ^"},
    {"NumberTooSmall", "X.A=-9223372036854775809",
     "the integer does not fit 64 bits\n"
     "  X.A=-9223372036854775809\n"
     "      ^"},
    {"WithinReference", R"(Link.From="Thing.Name=\"a\";")",
     "expected ',' or the end after the value of 'Name'\n"
     "  Link.From=\"Thing.Name=\\\"a\\\";\"\n"
     "                             ^"},
    {"EndOfReference", R"(Link.From="Thing.")",
     "expected the name of a key\n"
     "  Link.From=\"Thing.\"\n"
     "                   ^"},
    {"ServerAddress", "https://host:5989/root/cimv2:X",
     "a path begins with its namespace or class: leave out 'https://...', the request stays on "
     "this machine\n"
     "  https://host:5989/root/cimv2:X\n"
     "  ^"},
    {"HostWithoutName", "///root:X",
     "expected the name of a host after '//'\n"
     "  ///root:X\n"
     "    ^"},
    {"HostAlone", "//host",
     "expected '/' and a namespace after the host 'host'\n"
     "  //host\n"
     "        ^"},
    {"CaretCountsCharacters", "X.A=\"\xC3\xA9\xC3\xA9\";",
     "expected ',' or the end after the value of 'A'\n"
     "  X.A=\"\xC3\xA9\xC3\xA9\";\n"
     "          ^"},
    {"CaretFollowsEscapedControls", "X.A=\"\n\x1b\";",
     "expected ',' or the end after the value of 'A'\n"
     "  X.A=\"\\n\\x1b\";\n"
     "              ^"},
};

class PathErrorText : public testing::TestWithParam<PathErrorRow> {};

TEST_P(PathErrorText, ShowsTheTextWithACaretUnderTheCharacter) {
    try {
        parsed(GetParam().text);
        FAIL() << "no error";
    } catch (const PathError& error) {
        EXPECT_STREQ(error.what(), GetParam().message);
    }
}

INSTANTIATE_TEST_SUITE_P(PathParser, PathErrorText, testing::ValuesIn(errors),
                         [](const auto& row) { return std::string(row.param.name); });

TEST(PathParser, TellsTheByteOfTheError) {
    try {
        parsed("X.A=\"\xC3\xA9\";");
        FAIL() << "no error";
    } catch (const PathError& error) {
        EXPECT_EQ(error.offset(), 8U);
        EXPECT_EQ(error.complaint(), "expected ',' or the end after the value of 'A'");
    }
}

TEST(PathParser, AnswersEveryBeginningOfAGoodPathWithAResultOrAnError) {
    const std::string good =
        R"(//h/root/cimv2:Link.From="//g/a/b:Thing.Name=\"x\\\"y\",Number=-1",Next="Link.A=TRUE")";
    parsed(good);
    for (std::size_t length = 0; length <= good.size(); ++length) {
        for (const char* tail : {"", "\"", "\\", ",", "=", "/"}) {
            try {
                parsed(good.substr(0, length) + tail);
            } catch (const PathError& error) {
                EXPECT_LE(error.offset(), length + 1);
            }
        }
    }
}

std::string complaintAboutNamespace(const std::string& text) {
    try {
        return "accepted as " + parseNamespace(text);
    } catch (const PathError& error) {
        return error.what();
    }
}

TEST(NamespaceParser, TakesWhatAPathTakes) {
    for (const char* name : {"interop", "root/cimv2", "root/PG_InterOp", "a-b/c_1"}) {
        EXPECT_EQ(parseNamespace(name), name);
    }
}

TEST(NamespaceParser, ShowsWhereANameIsNone) {
    const std::vector<std::pair<const char*, const char*>> rows = {
        {"", "expected the name of a namespace\n  \n  ^"},
        {"/root", "expected a name before '/' in the namespace\n  /root\n  ^"},
        {"root//cimv2", "expected a name before '/' in the namespace\n  root//cimv2\n       ^"},
        {"root/", "expected a name after '/' in the namespace\n  root/\n       ^"},
        {"root cimv2",
         "the name of a namespace holds letters, digits, '_', '-' and '/' only\n"
         "  root cimv2\n      ^"},
        {"root:X",
         "the name of a namespace holds letters, digits, '_', '-' and '/' only\n"
         "  root:X\n      ^"},
    };
    for (const auto& [name, complaint] : rows) {
        EXPECT_EQ(complaintAboutNamespace(name), complaint);
    }
}

}  // namespace
