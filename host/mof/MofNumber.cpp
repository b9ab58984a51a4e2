#include "host/mof/MofNumber.h"

#include <charconv>
#include <limits>
#include <string_view>

namespace cmpihost::mof {

namespace {

struct Digits {
    std::string_view text;
    int base;
};

Digits split(std::string_view unsignedText) {
    const std::string_view start = unsignedText.substr(0, 2);
    if (start == "0x" || start == "0X") {
        return {unsignedText.substr(2), 16};
    }
    if (!unsignedText.empty() && (unsignedText.back() == 'b' || unsignedText.back() == 'B')) {
        return {unsignedText.substr(0, unsignedText.size() - 1), 2};
    }
    return {unsignedText, start.substr(0, 1) == "0" ? 8 : 10};
}

bool isReal(std::string_view unsignedText) {
    return unsignedText.find('.') != std::string_view::npos;
}

template <typename Number, typename... Base>
std::errc convert(std::string_view text, Number& number, Base... base) {
    const char* end = text.data() + text.size();
    const auto result = std::from_chars(text.data(), end, number, base...);
    return result.ec == std::errc() && result.ptr != end ? std::errc::invalid_argument : result.ec;
}

std::errc readInteger(std::string_view unsignedText, bool negative, Scalar& value) {
    const Digits digits = split(unsignedText);
    std::uint64_t magnitude{};
    const std::errc error = convert(digits.text, magnitude, digits.base);
    if (error != std::errc()) {
        return error;
    }
    constexpr std::uint64_t mostNegative = std::uint64_t{1} << 63U;
    if (!negative) {
        value = magnitude;
    } else if (magnitude > mostNegative) {
        return std::errc::result_out_of_range;
    } else if (magnitude == mostNegative) {
        value = std::numeric_limits<std::int64_t>::min();
    } else {
        value = -static_cast<std::int64_t>(magnitude);
    }
    return {};
}

std::errc readReal(std::string_view unsignedText, bool negative, Scalar& value) {
    double number{};
    const std::errc error = convert(unsignedText, number);
    value = negative ? -number : number;
    return error;
}

}  // namespace

bool readNumber(const std::string& written, Scalar& value, std::string& complaint) {
    std::string_view text = written;
    const std::string_view sign = text.substr(0, 1);
    const bool negative = sign == "-";
    if (negative || sign == "+") {
        text.remove_prefix(1);
    }
    const std::errc error =
        isReal(text) ? readReal(text, negative, value) : readInteger(text, negative, value);
    if (error == std::errc::result_out_of_range) {
        complaint = "the number " + written + " does not fit 64 bits";
    } else if (error != std::errc()) {
        complaint = "expected a number, found '" + written + "'";
    }
    return error == std::errc();
}

}  // namespace cmpihost::mof
