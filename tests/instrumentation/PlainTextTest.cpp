#include "framework/instrumentation/Linux/Parsing.h"

#include <gtest/gtest.h>

#include <string>

namespace {

using VA::Linux::isPlainText;
using namespace std::string_literals;

TEST(PlainText, AcceptsWordsInAnyScript) {
    for (const char* text : {"a", "Debian GNU/Linux", "12 (x)", " a", "Größe", "Линукс", "龍蜥",
                             "\xf0\x9f\x90\xa7", "\xed\x9f\xbf", "\xf4\x8f\xbf\xbf"}) {
        EXPECT_TRUE(isPlainText(text)) << text;
    }
}

TEST(PlainText, RefusesNothingAndBlanks) {
    EXPECT_FALSE(isPlainText(""));
    EXPECT_FALSE(isPlainText(" "));
    EXPECT_FALSE(isPlainText("    "));
}

TEST(PlainText, RefusesControlCharacters) {
    for (const auto& text :
         {"a\0b"s, "a\tb"s, "a\nb"s, "\x1b[31m"s, "\x7f"s, "\xc2\x85"s, "\xc2\x9f"s}) {
        EXPECT_FALSE(isPlainText(text)) << testing::PrintToString(text);
    }
    EXPECT_TRUE(isPlainText("\xc2\xa0"));
}

TEST(PlainText, RefusesWhatIsNotUtf8) {
    for (const char* text : {
             "\x80",                                          // continuation without a start
             "\xff", "\xfe",                                  // never a byte of UTF-8
             "\xc3", "a\xe2\x82", "\xf0\x9f\x90",             // cut short
             "\xc3(", "\xe2\x82(",                            // continuation missing
             "\xc1\xbf", "\xe0\x9f\xbf", "\xf0\x8f\xbf\xbf",  // longer than need be
             "\xed\xa0\x80", "\xed\xbf\xbf",                  // surrogates
             "\xf4\x90\x80\x80", "\xf8\x88\x80\x80\x80",      // past the last character
         }) {
        EXPECT_FALSE(isPlainText(text)) << testing::PrintToString(text);
    }
}

TEST(PlainText, RefusesMoreThan256Characters) {
    EXPECT_TRUE(isPlainText(std::string(256, 'x')));
    EXPECT_FALSE(isPlainText(std::string(257, 'x')));
}

TEST(PlainText, CountsCharactersNotBytes) {
    std::string text;
    for (int i = 0; i < 256; ++i) text += "ö";
    EXPECT_TRUE(isPlainText(text));
    EXPECT_FALSE(isPlainText(text + "ö"));
}

}  // namespace
