#include "host/server/BasicCredentials.h"

#include <string.h>

#include <algorithm>
#include <cstdint>
#include <utility>

#include "base/Ascii.h"

namespace cmpihost::server {

namespace {

constexpr std::size_t longestCredentials = 512;
constexpr std::string_view base64Digits =
    "ABCDEFGHIJKLMNOPQRSTUVWXYZabcdefghijklmnopqrstuvwxyz0123456789+/";

/// Four digits, of which the last `padding` are signs of equality: their bytes are appended. False:
/// one is no digit, or bits that stand for nothing are set.
bool appendQuartet(std::string_view quartet, std::size_t padding, std::string& bytes) {
    std::uint32_t bits = 0;
    for (std::size_t index = 0; index < 4; ++index) {
        const bool padded = index >= 4 - padding;
        const std::size_t digit = padded ? 0 : base64Digits.find(quartet[index]);
        if (digit == std::string_view::npos || (padded && quartet[index] != '=')) return false;
        bits = bits << 6U | static_cast<std::uint32_t>(digit);
    }
    for (unsigned shift = 16, count = 0; count < 3 - padding; shift -= 8, ++count)
        bytes += static_cast<char>(bits >> shift & 0xFFU);
    return (bits & ((1U << 8U * static_cast<unsigned>(padding)) - 1U)) == 0;
}

/// False: it is not base64 in the form that encoders write.
bool decodeBase64(std::string_view text, std::string& bytes) {
    if (text.empty() || text.size() % 4 != 0) return false;
    std::size_t padding = 0;
    while (padding < 2 && text[text.size() - 1 - padding] == '=') ++padding;
    // Grows no more: a buffer that moves would leave a copy behind.
    bytes.reserve(text.size());
    for (; !text.empty(); text.remove_prefix(4))
        if (!appendQuartet(text.substr(0, 4), text.size() == 4 ? padding : 0, bytes)) return false;
    return true;
}

bool isControl(char byte) {
    const auto code = static_cast<unsigned char>(byte);
    return code < 0x20 || code == 0x7F;
}

void wipe(std::string& text) {
    explicit_bzero(text.data(), text.size());
}

}  // namespace

BasicCredentials::BasicCredentials(std::string_view theName, std::string_view thePassword)
    : name(theName), password(thePassword) {}

// A short text is copied where it is moved, and the copy that stays behind wants to be wiped, too.
BasicCredentials::BasicCredentials(BasicCredentials&& other) noexcept
    : name(std::move(other.name)), password(std::move(other.password)) {
    other.password.resize(other.password.capacity());
    wipe(other.password);
}

BasicCredentials::~BasicCredentials() {
    wipe(password);
}

std::optional<BasicCredentials> readBasicCredentials(std::string_view header) {
    constexpr std::string_view scheme = "Basic ";
    if (header.size() > longestCredentials ||
        !base::equalsIgnoreCase(header.substr(0, scheme.size()), scheme))
        return std::nullopt;
    header.remove_prefix(std::min(header.find_first_not_of(' ', scheme.size()), header.size()));
    std::string decoded;
    std::optional<BasicCredentials> result;
    if (decodeBase64(header, decoded) && std::none_of(decoded.begin(), decoded.end(), isControl)) {
        // A password may hold colons, a name cannot.
        const std::string_view text = decoded;
        const std::size_t colon = text.find(':');
        if (colon != std::string_view::npos && colon > 0)
            result.emplace(text.substr(0, colon), text.substr(colon + 1));
    }
    wipe(decoded);
    return result;
}

}  // namespace cmpihost::server
