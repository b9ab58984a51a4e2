// Documents as trees, and everything that is refused before anybody looks at what it means.
#include "host/server/XmlTree.h"

#include <gtest/gtest.h>

namespace cmpihost::server {
namespace {

using namespace std::string_literals;

/// Why a document is refused; empty: it is not.
std::string xmlRefusal(const std::string& document) {
    try {
        parseXml(document);
    } catch (const XmlError& error) {
        return error.what();
    }
    return {};
}

std::string repeated(const std::string& text, std::size_t times) {
    std::string result;
    for (std::size_t done = 0; done < times; ++done) result += text;
    return result;
}

TEST(XmlTree, HasElementsAttributesAndText) {
    const XmlElement root =
        parseXml("<A x='1' y=\"2\">one<B/>two<C z=''>three</C><B k='v'/></A>\n");
    EXPECT_EQ(root.name, "A");
    ASSERT_EQ(root.attributes.size(), 2U);
    EXPECT_EQ(*root.attribute("y"), "2");
    EXPECT_EQ(root.attribute("z"), nullptr);
    EXPECT_EQ(root.text, "onetwo");
    ASSERT_EQ(root.children.size(), 3U);
    EXPECT_EQ(root.child("C")->text, "three");
    EXPECT_EQ(*root.child("C")->attribute("z"), "");
    EXPECT_EQ(root.child("B"), &root.children[0]);
    EXPECT_EQ(root.child("D"), nullptr);
}

TEST(XmlTree, HasTextsAsTheyAreMeant) {
    const struct {
        const char* written;
        const char* meant;
    } rows[] = {
        {"", ""},
        {"  two blanks  ", "  two blanks  "},
        {"\n\t ", "\n\t "},
        {"a\r\nb\rc", "a\nb\nc"},
        {"&lt;&amp;&gt;&quot;&apos;", "<&>\"'"},
        {"&#9;&#10;&#13;&#xE9;&#x1F600;", "\t\n\r\xC3\xA9\xF0\x9F\x98\x80"},
        {"<![CDATA[<a> & ]]]]><![CDATA[>]]>", "<a> & ]]>"},
        {"be<!-- not this -->fore<?nor this?>, after", "before, after"},
        {"\xC3\xA9\xE2\x82\xAC\xF0\x9F\x98\x80", "\xC3\xA9\xE2\x82\xAC\xF0\x9F\x98\x80"},
    };
    for (const auto& row : rows) {
        EXPECT_EQ(parseXml("<V>"s + row.written + "</V>").text, row.meant) << row.written;
    }
    EXPECT_EQ(*parseXml("<V a='x&quot;&#38;\ny'/>").attribute("a"), "x\"& y");
}

TEST(XmlTree, MayHaveThingsAroundItsRoot) {
    for (const char* before : {
             "\xEF\xBB\xBF",
             "<?xml version='1.0'?>",
             "<?xml version='1.0' encoding='utf-8' ?>\n",
             "\xEF\xBB\xBF<?xml version=\"1.0\" encoding=\"UTF-8\" standalone=\"yes\"?>",
             "<!-- a comment --><?an instruction?>",
             "<!DOCTYPE A>",
             "<?xml version='1.0'?>\n<!DOCTYPE A SYSTEM 'http://example.com/a.dtd'>\n",
             "<!DOCTYPE A PUBLIC '-//X//Y' 'a.dtd'>",
         }) {
        EXPECT_EQ(parseXml(before + "<A>&lt;<B c='&amp;&#65;'/></A><!-- end -->\n"s).text, "<")
            << before;
    }
}

TEST(XmlTree, IsMadeOfNothingElse) {
    const struct {
        std::string document;
        const char* reason;
    } rows[] = {
        {"", "line 1: no element found"},
        {" \n ", "line 2: no element found"},
        {"<!-- only this -->", "line 1: no element found"},
        {"text", "line 1: syntax error"},
        {"<A>\n", "line 2: no element found"},
        {"<A>\n</B>", "line 2: mismatched tag"},
        {"<A><B></A></B>", "line 1: mismatched tag"},
        {"<A/><B/>", "line 1: junk after document element"},
        {"<A/>text", "line 1: junk after document element"},
        {"<A x='1' x='2'/>", "line 1: duplicate attribute"},
        {"<A x=1/>", "line 1: not well-formed (invalid token)"},
        {"<A x='<'/>", "line 1: not well-formed (invalid token)"},
        {"<A x/>", "line 1: not well-formed (invalid token)"},
        {"<A>a & b</A>", "line 1: not well-formed (invalid token)"},
        {"<A>]]></A>", "line 1: not well-formed (invalid token)"},
        {"<A>&nbsp;</A>", "line 1: undefined entity"},
        {"<A x='&nbsp;'/>", "line 1: undefined entity"},
        {" <?xml version='1.0'?><A/>", "line 1: XML or text declaration not at start of entity"},
        {"<?xml version='1.0' encoding='ISO-8859-1'?><A/>", "the encoding is not UTF-8"},
        {"<?xml version='1.0' encoding='UTF-16'?><A/>", "the encoding is not UTF-8"},
        {"\xFE\xFF\0<\0A\0/\0>"s, "the document is not UTF-8"},
        {"<\0A\0/\0>\0"s, "the document is not UTF-8"},
        {"\0<\0A\0/\0>"s, "the document is not UTF-8"},
        {"<A>\0</A>"s, "the document is not UTF-8"},
        {"<A>\1</A>", "line 1: not well-formed (invalid token)"},
        {"<A>&#0;</A>", "line 1: reference to invalid character number"},
        {"<A>&#1;</A>", "line 1: reference to invalid character number"},
        {"<A x='&#x1F;'/>", "line 1: reference to invalid character number"},
        {"<A>&#xD800;</A>", "line 1: reference to invalid character number"},
        {"<A>&#xFFFE;</A>", "line 1: reference to invalid character number"},
        {"<A>&#x110000;</A>", "line 1: reference to invalid character number"},
        {"<A>\xEF\xBF\xBE</A>", "line 1: not well-formed (invalid token)"},
    };
    for (const auto& row : rows) EXPECT_EQ(xmlRefusal(row.document), row.reason) << row.document;
}

TEST(XmlTree, IsUtf8EverywhereInTheDocument) {
    for (const char* bytes : {"\xC0\x80", "\xE0\x80\xAF", "\xED\xA0\x80", "\xF4\x90\x80\x80",
                              "\xFF", "\x80", "\xE2\x82", "\xC3"}) {
        for (const char* place : {"<A>*</A>", "<A x='*'/>", "<A><!--*--></A>", "<A/><!--*-->"}) {
            std::string document = place;
            document.replace(document.find('*'), 1, bytes);
            EXPECT_EQ(xmlRefusal(document), "the document is not UTF-8") << document;
        }
    }
}

TEST(XmlTree, HasNoEntitiesOfItsOwn) {
    const std::string laughs =
        "<!DOCTYPE A [<!ENTITY a 'ha'><!ENTITY b '&a;&a;&a;&a;&a;&a;&a;'>"
        "<!ENTITY c '&b;&b;&b;&b;&b;&b;&b;'>]><A>&c;&c;&c;</A>";
    for (const std::string& document : {
             laughs,
             "<!DOCTYPE A [<!ENTITY a '" + repeated("x", 10000) + "'>]><A>" +
                 repeated("&a;", 10000) + "</A>",
             "<!DOCTYPE A [<!ENTITY a SYSTEM 'file:///etc/passwd'>]><A>&a;</A>"s,
             "<!DOCTYPE A [<!ENTITY % a SYSTEM 'http://127.0.0.1/a'> %a;]><A/>"s,
             "<!DOCTYPE A [<!ATTLIST A x CDATA 'y'>]><A/>"s,
             "<!DOCTYPE A SYSTEM 'a.dtd' []><A/>"s,
             "<!DOCTYPE A []><A/>"s,
         }) {
        EXPECT_EQ(xmlRefusal(document), "the DOCTYPE has declarations") << document.substr(0, 60);
    }
    // Entities could be declared where nobody looks: a parser may skip them, this one does not.
    for (const char* root :
         {"<A>&a;</A>", "<A x='&a;'/>", "<A x='&amp;&a;'/>", "<A><B x='a&a;'/></A>"}) {
        EXPECT_EQ(xmlRefusal("<!DOCTYPE A SYSTEM 'a.dtd'>"s + root), "an entity is not declared")
            << root;
    }
}

TEST(XmlTree, IsOfBoundedSize) {
    EXPECT_EQ(xmlRefusal(repeated("<A>", 32) + repeated("</A>", 32)), "");
    EXPECT_EQ(xmlRefusal(repeated("<A>", 33) + repeated("</A>", 33)),
              "elements lie deeper than 32 levels");
    EXPECT_EQ(xmlRefusal(repeated("<A>", 300000)), "elements lie deeper than 32 levels");

    EXPECT_EQ(parseXml("<A>" + repeated("<B/>", 9999) + "</A>").children.size(), 9999U);
    EXPECT_EQ(xmlRefusal("<A>" + repeated("<B/>", 10000) + "</A>"),
              "there are more than 10000 elements");

    std::string attributes;
    for (int number = 1; number <= 16; ++number)
        attributes += " a" + std::to_string(number) + "=''";
    EXPECT_EQ(parseXml("<A" + attributes + "/>").attributes.size(), 16U);
    EXPECT_EQ(xmlRefusal("<A" + attributes + " b=''/>"), "an element has more than 16 attributes");

    const std::string longest = repeated("n", 256);
    EXPECT_EQ(parseXml("<" + longest + " " + longest + "='v'/>").name, longest);
    EXPECT_EQ(xmlRefusal("<n" + longest + "/>"), "a name is longer than 256 bytes");
    EXPECT_EQ(xmlRefusal("<A n" + longest + "=''/>"), "a name is longer than 256 bytes");
}

TEST(XmlTree, HasTextsOfAnyLength) {
    const std::string text = repeated("0123456789abcde\n", 65536);
    EXPECT_EQ(parseXml("<A>" + text + "</A>").text, text);
    EXPECT_EQ(parseXml("<A x='" + repeated("y", 1000000) + "'/>").attribute("x")->size(), 1000000U);
}

}  // namespace
}  // namespace cmpihost::server
