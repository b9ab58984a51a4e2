// Long expected texts stand in files of their own, so that a change of many is one command and its
// review is a diff.
#include "support/GoldenFile.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cstdlib>
#include <fstream>
#include <iterator>
#include <string_view>

#include "support/ProgramRun.h"

namespace {

// What lies between the lines that both begin with and those that both end with.
std::string difference(const std::vector<std::string>& expected,
                       const std::vector<std::string>& actual) {
    const auto begin =
        std::mismatch(expected.begin(), expected.end(), actual.begin(), actual.end());
    const auto end = std::mismatch(expected.rbegin(), std::make_reverse_iterator(begin.first),
                                   actual.rbegin(), std::make_reverse_iterator(begin.second));
    std::string text =
        "line " + std::to_string(begin.first - expected.begin() + 1) + " and following:\n";
    for (auto line = begin.first; line != end.first.base(); ++line) text += "- " + *line + '\n';
    for (auto line = begin.second; line != end.second.base(); ++line) text += "+ " + *line + '\n';
    return text;
}

}  // namespace

void expectGolden(const std::string& file, const std::string& actual) {
    const char* const update = std::getenv("UPDATE_GOLDEN");
    if (update != nullptr && std::string_view(update) == "1") {
        std::ofstream out(file, std::ios::binary);
        out << actual;
        EXPECT_TRUE(out.flush()) << "cannot write " << file;
        return;
    }
    std::ifstream in(file, std::ios::binary);
    EXPECT_TRUE(in) << "no file " << file;
    const std::string expected{std::istreambuf_iterator<char>(in), {}};
    EXPECT_TRUE(actual == expected) << file << ", " << difference(lines(expected), lines(actual))
                                    << "UPDATE_GOLDEN=1 writes the file anew.";
}
