#include "framework/logging/TextUnit.h"

#include <gtest/gtest.h>

#include <string>

namespace {

using ZBLog::firstUnit;
using ZBLog::TextUnit;

struct Row {
    const char* description;
    std::string text;
    std::size_t bytes;
    bool printable;
};

const Row rows[] = {
    {"letter", "a", 1, true},
    {"blank", " x", 1, true},
    {"tilde", "~", 1, true},
    {"NUL", std::string(1, '\0'), 1, false},
    {"newline", "\n", 1, false},
    {"escape", "\x1b", 1, false},
    {"DEL", "\x7f", 1, false},
    {"first of two bytes", "\xC2\xA0z", 2, true},
    {"last of two bytes", "\xDF\xBF", 2, true},
    {"first C1", "\xC2\x80", 2, false},
    {"control sequence introducer", "\xC2\x9B", 2, false},
    {"last C1", "\xC2\x9F", 2, false},
    {"first of three bytes", "\xE0\xA0\x80", 3, true},
    {"before the blank of no width", "\xE2\x80\x8A", 3, true},
    {"blank of no width", "\xE2\x80\x8B", 3, false},
    {"right-to-left mark", "\xE2\x80\x8F", 3, false},
    {"after the marks of direction", "\xE2\x80\x90", 3, true},
    {"before the line separator", "\xE2\x80\xA7", 3, true},
    {"line separator", "\xE2\x80\xA8", 3, false},
    {"right-to-left override", "\xE2\x80\xAE", 3, false},
    {"after the overrides", "\xE2\x80\xAF", 3, true},
    {"before the word joiner", "\xE2\x81\x9F", 3, true},
    {"word joiner", "\xE2\x81\xA0", 3, false},
    {"invisible plus", "\xE2\x81\xA4", 3, false},
    {"after the invisible operators", "\xE2\x81\xA5", 3, true},
    {"isolate", "\xE2\x81\xA6", 3, false},
    {"end of isolate", "\xE2\x81\xA9", 3, false},
    {"before the surrogates", "\xED\x9F\xBF", 3, true},
    {"before the byte order mark", "\xEF\xBB\xBE", 3, true},
    {"byte order mark", "\xEF\xBB\xBF", 3, false},
    {"after the byte order mark", "\xEF\xBC\x80", 3, true},
    {"last of three bytes", "\xEF\xBF\xBF", 3, true},
    {"first of four bytes", "\xF0\x90\x80\x80", 4, true},
    {"of the middle of four bytes", "\xF1\x80\x80\x80", 4, true},
    {"last of all", "\xF4\x8F\xBF\xBF", 4, true},
    {"continuation alone", "\x80", 1, false},
    {"overlong two bytes", "\xC0\x8A", 1, false},
    {"overlong two bytes of a letter", "\xC1\x81", 1, false},
    {"overlong three bytes", "\xE0\x80\x8A", 1, false},
    {"overlong four bytes", "\xF0\x80\x80\x8A", 1, false},
    {"surrogate", "\xED\xA0\x80", 1, false},
    {"beyond the last", "\xF4\x90\x80\x80", 1, false},
    {"five bytes", "\xF8\x88\x80\x80\x80", 1, false},
    {"two bytes, cut", "\xC3", 1, false},
    {"three bytes, cut", "\xE2\x82", 1, false},
    {"four bytes, cut", "\xF0\x9F\x98", 1, false},
    {"third byte is none", "\xE2\x82\x41", 1, false},
    {"fourth byte is none", "\xF0\x9F\x98\xFF", 1, false},
};

TEST(TextUnit, TellsCharactersFromControlsAndFromBytesThatAreNoText) {
    for (const Row& row : rows) {
        const TextUnit unit = firstUnit(row.text);
        EXPECT_EQ(unit.bytes, row.bytes) << row.description;
        EXPECT_EQ(unit.printable, row.printable) << row.description;
    }
}

}  // namespace
