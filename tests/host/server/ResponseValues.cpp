#include "host/server/ResponseValues.h"

#include <algorithm>
#include <cctype>
#include <limits>

namespace cmpihost::server::validator {

namespace {

bool isDigit(char letter) {
    return letter >= '0' && letter <= '9';
}

/// Decimal digits without leading zeros, at most `most`.
bool isNumberUpTo(const std::string& digits, std::uint64_t most) {
    if (digits.empty() || !std::all_of(digits.begin(), digits.end(), isDigit)) return false;
    if (digits.size() > 1 && digits.front() == '0') return false;
    // Decimal numbers without leading zeros are ordered by their length, then by their digits.
    const std::string limit = std::to_string(most);
    return digits.size() < limit.size() || (digits.size() == limit.size() && digits <= limit);
}

/// `type` is like "sint16".
bool isInteger(const std::string& type, const std::string& text) {
    const unsigned bits = static_cast<unsigned>(std::stoul(type.substr(4)));
    const std::uint64_t most = std::numeric_limits<std::uint64_t>::max() >> (64 - bits);
    if (type.front() == 'u') return isNumberUpTo(text, most);
    const std::uint64_t half = most / 2;
    if (text.empty() || text.front() != '-') return isNumberUpTo(text, half);
    return text != "-0" && isNumberUpTo(text.substr(1), half + 1);
}

/// Like "-1.50000000e+00", with so many digits behind the point.
bool isReal(const std::string& text, std::size_t digits) {
    if (text == "INF" || text == "-INF" || text == "NaN") return true;
    std::string form = "d." + std::string(digits, 'd') + "esdd";
    if (!text.empty() && text.front() == '-') form.insert(0, "-");
    if (text.size() == form.size() + 1) form += 'd';
    const auto fits = [](char letter, char kind) {
        if (kind == 'd') return isDigit(letter);
        if (kind == 's') return letter == '+' || letter == '-';
        return letter == kind;
    };
    return std::equal(text.begin(), text.end(), form.begin(), form.end(), fits);
}

/// Whether a field is asterisks, or a number within bounds.
bool isField(const std::string& text, std::size_t start, std::size_t length, int least, int most) {
    const std::string field = text.substr(start, length);
    if (field == std::string(length, '*')) return true;
    if (!std::all_of(field.begin(), field.end(), isDigit)) return false;
    const int number = std::stoi(field);
    return number >= least && number <= most;
}

bool isDateTime(const std::string& text) {
    if (text.size() != 25 || text[14] != '.') return false;
    const bool time = isField(text, 8, 2, 0, 23) && isField(text, 10, 2, 0, 59) &&
                      isField(text, 12, 2, 0, 59) && isField(text, 15, 6, 0, 999999);
    if (text[21] == ':')
        return time && isField(text, 0, 8, 0, 99999999) && text.substr(22) == "000";
    const bool date =
        isField(text, 0, 4, 1, 9999) && isField(text, 4, 2, 1, 12) && isField(text, 6, 2, 1, 31);
    return time && date && (text[21] == '+' || text[21] == '-') && isField(text, 22, 3, 0, 999);
}

/// One character that needs no more than three bytes.
bool isCharacter(const std::string& text) {
    return characterCount(text) == 1 && text.size() <= 3;
}

}  // namespace

bool isType(const std::string& name) {
    constexpr const char* names[] = {"boolean", "string",   "char16", "uint8",  "sint8",
                                     "uint16",  "sint16",   "uint32", "sint32", "uint64",
                                     "sint64",  "datetime", "real32", "real64"};
    return std::find(std::begin(names), std::end(names), name) != std::end(names);
}

bool isValueText(const std::string& type, const std::string& text) {
    if (type == "string") return true;
    if (type == "boolean") return text == "TRUE" || text == "FALSE";
    if (type == "datetime") return isDateTime(text);
    if (type == "char16") return isCharacter(text);
    if (type == "real32") return isReal(text, 8);
    if (type == "real64") return isReal(text, 16);
    return isInteger(type, text);
}

bool isKeyText(const std::string& valueType, const std::string& text) {
    if (valueType != "numeric") return isValueText(valueType, text);
    return isInteger("uint64", text) || isInteger("sint64", text) || isReal(text, 8) ||
           isReal(text, 16);
}

bool isIdentifier(const std::string& text) {
    const auto isLetter = [](char letter) {
        const auto byte = static_cast<unsigned char>(letter);
        return byte >= 0x80 || letter == '_' || std::isalpha(byte) != 0;
    };
    return !text.empty() && isLetter(text.front()) &&
           std::all_of(text.begin(), text.end(),
                       [&](char letter) { return isLetter(letter) || isDigit(letter); });
}

std::size_t characterCount(const std::string& text) {
    return static_cast<std::size_t>(std::count_if(text.begin(), text.end(), [](char letter) {
        return (static_cast<unsigned char>(letter) & 0xC0U) != 0x80U;
    }));
}

}  // namespace cmpihost::server::validator
