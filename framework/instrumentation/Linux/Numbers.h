#ifndef VA_LINUX_NUMBERS_H
#define VA_LINUX_NUMBERS_H

#include <cstdint>
#include <limits>
#include <optional>
#include <string_view>

/// Numbers as the kernel writes them, and the 32-bit values that properties are made of.
namespace VA::Linux {

/// True for one or more decimal digits and nothing else.
bool isAllDigits(std::string_view text);

/// The value of a text that is all digits; nothing for any other text, and for one past 64 bits.
std::optional<std::uint64_t> parseDecimal(std::string_view text);

/// The value of a file that holds one line with a positive number, such as the limits of
/// proc/sys/kernel.
std::optional<std::uint64_t> parseNumberFile(std::string_view text);

/// `value`, or the largest 32-bit number where that is less.
constexpr std::uint32_t saturated(std::uint64_t value) {
    constexpr std::uint32_t largest = std::numeric_limits<std::uint32_t>::max();
    return value < largest ? static_cast<std::uint32_t>(value) : largest;
}

/// The sum, or the largest 32-bit number where that is less.
constexpr std::uint32_t saturatedSum(std::uint32_t first, std::uint32_t second) {
    return saturated(std::uint64_t{first} + second);
}

}  // namespace VA::Linux

#endif
