#include "CimDateTime.h"

#include <algorithm>
#include <cstddef>
#include <limits>

namespace VA {
namespace {

struct Field {
    std::size_t begin;
    std::size_t length;
    int least;
    int most;
};

constexpr int any = std::numeric_limits<int>::max();

constexpr Field pointInTime[] = {
    {0, 4, 0, any},   // year
    {4, 2, 1, 12},    // month
    {6, 2, 1, 31},    // day
    {8, 2, 0, 23},    // hour
    {10, 2, 0, 59},   // minute
    {12, 2, 0, 60},   // second, a leap second included
    {15, 6, 0, any},  // microseconds
};
constexpr Field interval[] = {
    {0, 8, 0, any}, {8, 2, 0, 23}, {10, 2, 0, 59}, {12, 2, 0, 59}, {15, 6, 0, any},
};
constexpr Field offset = {22, 3, 0, any};

bool isDigit(char character) {
    return character >= '0' && character <= '9';
}

bool holds(const Field& field, std::string_view text) {
    const std::string_view part = text.substr(field.begin, field.length);
    if (std::all_of(part.begin(), part.end(), [](char c) { return c == '*'; })) return true;
    int value = 0;
    for (char character : part) {
        if (!isDigit(character)) return false;
        value = value * 10 + (character - '0');
    }
    return value >= field.least && value <= field.most;
}

}  // namespace

bool isCimDateTime(std::string_view text) {
    if (text.size() != 25 || text[14] != '.') return false;
    const auto valid = [text](const Field& field) { return holds(field, text); };
    if (text[21] == ':')
        return std::all_of(std::begin(interval), std::end(interval), valid) &&
               text.substr(22) == "000";
    return (text[21] == '+' || text[21] == '-') &&
           std::all_of(std::begin(pointInTime), std::end(pointInTime), valid) && valid(offset);
}

}  // namespace VA
