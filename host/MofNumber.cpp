#include "host/MofNumber.h"

#include <charconv>
#include <limits>
#include <string_view>

namespace cmpihost::mof {

namespace {

struct Digits {
    std::string_view text;
    int base = 10;
};

Digits split(std::string_view unsignedText) {
    const std::size_t length = unsignedText.size();
    if (length > 2 && unsignedText[0] == '0' &&
        (unsignedText[1] == 'x' || unsignedText[1] == 'X')) {
        return {unsignedText.substr(2), 16};
    }
    if (length > 1 && (unsignedText.back() == 'b' || unsignedText.back() == 'B')) {
        return {unsignedText.substr(0, length - 1), 2};
    }
    if (length > 1 && unsignedText[0] == '0') {
        return {unsignedText.substr(1), 8};
    }
    return {unsignedText, 10};
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

bool readInteger(Digits digits, bool negative, Scalar& value, std::errc& error) {
    std::uint64_t magnitude = 0;
    error = convert(digits.text, magnitude, digits.base);
    if (error != std::errc()) {
        return false;
    }
    constexpr std::uint64_t mostNegative = std::uint64_t{1} << 63U;
    if (!negative) {
        value = magnitude;
    } else if (magnitude > mostNegative) {
        error = std::errc::result_out_of_range;
        return false;
    } else if (magnitude == mostNegative) {
        value = std::numeric_limits<std::int64_t>::min();
    } else {
        value = -static_cast<std::int64_t>(magnitude);
    }
    return true;
}

}  // namespace

bool readNumber(const std::string& written, Scalar& value, std::string& complaint) {
    std::string_view text = written;
    const bool negative = !text.empty() && text.front() == '-';
    if (!text.empty() && (negative || text.front() == '+')) {
        text.remove_prefix(1);
    }
    std::errc error{};
    if (isReal(text)) {
        double number = 0;
        error = convert(text, number);
        value = negative ? -number : number;
    } else {
        readInteger(split(text), negative, value, error);
    }
    if (error == std::errc::result_out_of_range) {
        complaint = "the number " + written + " does not fit 64 bits";
    } else if (error != std::errc()) {
        complaint = "expected a number, found '" + written + "'";
    }
    return error == std::errc();
}

}  // namespace cmpihost::mof
