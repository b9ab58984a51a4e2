#include "Numbers.h"

#include <algorithm>
#include <charconv>

namespace VA::Linux {

bool isAllDigits(std::string_view text) {
    return !text.empty() &&
           std::all_of(text.begin(), text.end(), [](char c) { return c >= '0' && c <= '9'; });
}

std::optional<std::uint64_t> parseDecimal(std::string_view text) {
    if (!isAllDigits(text)) return std::nullopt;
    std::uint64_t value = 0;
    const auto result = std::from_chars(text.data(), text.data() + text.size(), value);
    if (result.ec != std::errc()) return std::nullopt;
    return value;
}

std::optional<std::uint64_t> parseNumberFile(std::string_view text) {
    // Without its newline the number was cut short.
    if (text.empty() || text.back() != '\n') return std::nullopt;
    const auto value = parseDecimal(text.substr(0, text.size() - 1));
    return value && *value > 0 ? value : std::nullopt;
}

}  // namespace VA::Linux
