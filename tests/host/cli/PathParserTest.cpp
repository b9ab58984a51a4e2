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
        return SchemaCatalogue(std::move(schema));
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

TEST(PathParser, TakesNamespaceHostAndKeysAsTheyAreWritten) {
    EXPECT_EQ(parsed("interop:Thing").nameSpace, "interop");
    EXPECT_EQ(parsed("root/PG_InterOp-2:Thing").nameSpace, "root/PG_InterOp-2");
    const ObjectPathValue path = parsed("//host.example:5988/root/cimv2:Thing.Name=\"a\"");
    EXPECT_EQ(path.hostName, "host.example:5988");
    EXPECT_EQ(path.nameSpace, "root/cimv2");
    EXPECT_EQ(path.keys.at(0).value, Value("a"));
    const ObjectPathValue keys = parsed("x.zeta=\"1\",Alpha=\"2\"");
    ASSERT_EQ(keys.keys.size(), 2U);
    EXPECT_EQ(keys.keys[0].name, "zeta");
    EXPECT_EQ(keys.keys[1].name, "Alpha");
}

TEST(PathParser, TakesNamesOfLettersDigitsAndUnderlines) {
    for (const char* name : {"azAZ_09", "_x", "Zebra", "\xC4\x80pfel", "x\xC4\x80"}) {
        EXPECT_EQ(parsed(name).className, name);
        EXPECT_EQ(parsed(std::string("X.") + name + "=1").keys.at(0).name, name);
    }
}

TEST(PathParser, ReadsTheValueOfAKey) {
    const char* const date = "20240102030405.000000+000";
    const std::pair<std::string, Value> rows[] = {
        {R"(X.A="say \"hi\" \\ ,=.:")", R"(say "hi" \ ,=.:)"},
        {"X.A=\"\"", ""},
        {"X.A=\"\xC3\xA9\"", "\xC3\xA9"},
        // Integers have the types that clients send, whatever the class declares.
        {"Thing.Number=7", Value::fromUnsigned(7, CMPI_uint64)},
        {"X.A=+7", Value::fromUnsigned(7, CMPI_uint64)},
        {"X.A=-7", Value::fromSigned(-7, CMPI_sint64)},
        {"X.A=-0", Value::fromUnsigned(0, CMPI_uint64)},
        {"X.A=18446744073709551615", Value::fromUnsigned(UINT64_MAX, CMPI_uint64)},
        {"X.A=-9223372036854775808", Value::fromSigned(INT64_MIN, CMPI_sint64)},
        {"X.A=TRUE", Value::fromBoolean(true)},
        {"X.A=false", Value::fromBoolean(false)},
        // A datetime is one where the class declares it.
        {std::string("Thing.When=\"") + date + "\"", Value::fromText(date, CMPI_dateTime)},
        {std::string("X.When=\"") + date + "\"", date},
    };
    for (const auto& [text, value] : rows) EXPECT_EQ(parsed(text).keys.at(0).value, value) << text;
    EXPECT_EQ(parsePath("Link.From=\"Thing.Number=1\"", nullptr).keys.at(0).value,
              Value("Thing.Number=1"));
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

TEST(PathParser, SaysAtWhichByteATextIsNoPath) {
    const char* const value =
        ": a text in quotes, an integer, TRUE or FALSE (a shell keeps the quotes when the path "
        "stands in '...')";
    const struct {
        const char* text;
        std::size_t offset;
        std::string complaint;
    } rows[] = {
        {"", 0, "expected the name of a class"},
        {"root/cimv2:", 11, "expected the name of a class"},
        {"root/cimv2.Name=\"x\"", 10,
         "expected ':' and the name of a class after the namespace 'root/cimv2'"},
        {"root//cimv2:X", 5, "expected a name before '/' in the namespace"},
        {"root/:X", 5, "expected a name after '/' in the namespace"},
        {"ns:1X", 3, "expected the name of a class"},
        {"My-Class.A=1", 2, "the name of a class holds letters, digits and '_' only"},
        {"my-root/x", 9, "expected ':' and the name of a class after the namespace 'my-root/x'"},
        {"My Class", 2, "expected '.' and keys, or the end, after the class 'My'"},
        {"X.", 2, "expected the name of a key"},
        {"X.Name", 6, "expected '=' after the key 'Name'"},
        {"X.CSName=h,Name=n", 9, std::string("expected the value of 'CSName'") + value},
        {"X.A=", 4, std::string("expected the value of 'A'") + value},
        {"X.A=\"abc", 4, "the text that begins here is not closed by '\"'"},
        {R"(X.A="abc\")", 4, "the text that begins here is not closed by '\"'"},
        {R"(X.A="a\n")", 6, "in a text '\\' stands before '\"' or '\\' only"},
        {"X.A=\"a\"b", 7, "expected ',' or the end after the value of 'A'"},
        {"X.A=1,", 6, "expected the name of a key"},
        {"X.A=1, B=2", 6, "expected the name of a key"},
        {"X.A=1,a=2", 6, "the key 'a' stands twice"},
        {"X.A=12x", 6, "expected the digits of an integer"},
        {"X.A=-", 5, "expected the digits of an integer"},
        {"X.A=+-5", 5, "expected the digits of an integer"},
        {"X.A=18446744073709551616", 4, "the integer does not fit 64 bits"},
        {"X.A=-9223372036854775809", 4, "the integer does not fit 64 bits"},
        {R"(Link.From="Thing.Name=\"a\";")", 27,
         "expected ',' or the end after the value of 'Name'"},
        {"Link.From=\"Thing.\"", 17, "expected the name of a key"},
        {"https://host:5989/root/cimv2:X", 0,
         "a path begins with its namespace or class: leave out 'https://...', the request stays on "
         "this machine"},
        {"HTTP://host/X", 0,
         "a path begins with its namespace or class: leave out 'http://...', the request stays on "
         "this machine"},
        {"X.A=\"\xC3\xA9\";", 8, "expected ',' or the end after the value of 'A'"},
        {"///root:X", 2, "expected the name of a host after '//'"},
        {"//host", 6, "expected '/' and a namespace after the host 'host'"},
    };
    for (const auto& row : rows) {
        try {
            parsed(row.text);
            ADD_FAILURE() << "no error in " << row.text;
        } catch (const PathError& error) {
            EXPECT_EQ(error.complaint(), row.complaint);
            EXPECT_EQ(error.offset(), row.offset) << row.text;
        }
    }
}

/// What a user is shown of a text that is no path or no namespace.
template <class Parse>
std::string shown(Parse parse, const std::string& text) {
    try {
        parse(text);
    } catch (const PathError& error) {
        return error.what();
    }
    return "no error in " + text;
}

TEST(PathParser, ShowsTheTextWithACaretUnderTheCharacter) {
    const std::pair<const char*, const char*> rows[] = {
        {"", "expected the name of a class\n  \n  ^"},
        {"X.A=1,", "expected the name of a key\n  X.A=1,\n        ^"},
        {R"(Link.From="Thing.Name=\"a\";")",
         "expected ',' or the end after the value of 'Name'\n"
         "  Link.From=\"Thing.Name=\\\"a\\\";\"\n"
         "                             ^"},
        {"X.A=\"\xC3\xA9\xC3\xA9\";",
         "expected ',' or the end after the value of 'A'\n"
         "  X.A=\"\xC3\xA9\xC3\xA9\";\n"
         "          ^"},
        {"X.A=\"\n\x1b\";",
         "expected ',' or the end after the value of 'A'\n"
         "  X.A=\"\\n\\x1b\";\n"
         "              ^"},
    };
    for (const auto& [text, message] : rows) EXPECT_EQ(shown(parsed, text), message);
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
        EXPECT_EQ(shown(parseNamespace, name), complaint);
    }
}

TEST(PathParser, ReadsBackWhatIsWritten) {
    const ObjectPathValue thing{
        "root/cimv2",
        "Thing",
        {{"Name", Value("q\" b\\ c, d=e.f:g'h/\n\t\x1b\xC3\xA9\xFF")},
         {"When", Value::fromText("20240102030405.000000+000", CMPI_dateTime)},
         {"Number", Value::fromUnsigned(18446744073709551615U)},
         {"Low", Value::fromSigned(INT64_MIN)},
         {"Yes", Value::fromBoolean(true)},
         {"Empty", Value("")}}};
    ObjectPathValue link{"interop", "Link", {{"From", Value::fromReference(thing)}}, "host"};
    for (int depth = 0; depth < 4; ++depth) {
        const std::string text = toString(link);
        const ObjectPathValue back = parsed(text);
        EXPECT_EQ(back, link) << text;
        EXPECT_EQ(back.hostName, "host");
        EXPECT_EQ(toString(back), text);
        link = {"interop", "Link", {{"Next", Value::fromReference(link)}}, "host"};
    }
}

}  // namespace
