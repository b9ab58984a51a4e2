#include <gmock/gmock.h>

#include "host/cli/PathParser.h"
#include "host/mof/MofParser.h"
#include "host/mof/Schema.h"

namespace {

using namespace cmpihost;

TEST(PathWriter, WritesClassPathsWithoutADot) {
    EXPECT_EQ(writePath({"root/cimv2", "Thing"}), "root/cimv2:Thing");
    EXPECT_EQ(writePath({"", "Thing"}), "Thing");
    EXPECT_EQ(writePath({"root", "Thing", {}, "host"}), "//host/root:Thing");
}

TEST(PathWriter, WritesEveryKindOfKey) {
    const ObjectPathValue path{"n",
                               "X",
                               {{"S", Value("a\"b\\c")},
                                {"C", Value::fromText("d", CMPI_chars)},
                                {"U", Value::fromUnsigned(18446744073709551615U)},
                                {"I", Value::fromSigned(-5, CMPI_sint16)},
                                {"T", Value::fromBoolean(true)},
                                {"F", Value::fromBoolean(false)},
                                {"W", Value::fromText("20240102030405.000000+000", CMPI_dateTime)},
                                {"K", Value::fromUnsigned(0x20AC, CMPI_char16)},
                                {"N", Value::null(CMPI_string)}}};
    EXPECT_EQ(writePath(path),
              R"(n:X.S="a\"b\\c",C="d",U=18446744073709551615,I=-5,T=TRUE,F=FALSE,)"
              "W=\"20240102030405.000000+000\",K=\"\xE2\x82\xAC\",N=\"\"");
}

TEST(PathWriter, QuotesReferencesWithinReferences) {
    const ObjectPathValue thing{"a/b", "Thing", {{"Name", Value("x\"y")}}};
    const ObjectPathValue link{"a/b", "Link", {{"From", Value::fromReference(thing)}}};
    EXPECT_EQ(writePath(link), R"(a/b:Link.From="a/b:Thing.Name=\"x\\\"y\"")");
    const ObjectPathValue outer{"a/b", "Link", {{"Next", Value::fromReference(link)}}};
    EXPECT_EQ(writePath(outer),
              R"(a/b:Link.Next="a/b:Link.From=\"a/b:Thing.Name=\\\"x\\\\\\\"y\\\"\"")");
}

TEST(PathWriter, WritesWhatTheParserReadsBack) {
    Schema schema;
    schema.add(
        mof::parse("class Thing { [Key] string Name; [Key] datetime When; };"
                   "class Link { [Key] Thing REF From; [Key] Link REF Next; };",
                   "x.mof"));
    const SchemaCatalogue catalogue(schema);
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
        const std::string text = writePath(link);
        const ObjectPathValue back = parsePath(text, &catalogue);
        EXPECT_EQ(back, link) << text;
        EXPECT_EQ(back.hostName, "host");
        EXPECT_EQ(writePath(back), text);
        link = {"interop", "Link", {{"Next", Value::fromReference(link)}}, "host"};
    }
}

}  // namespace
