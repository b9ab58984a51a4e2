#include "LineBuffer.h"

#include <algorithm>
#include <charconv>

#include "TextUnit.h"

namespace ZBLog {

namespace {

constexpr std::string_view cutMark = "\\...";

struct EscapedUnit {
    std::size_t taken;    ///< bytes of the text
    std::size_t written;  ///< bytes of the line
    bool asItIs;
};

EscapedUnit measure(std::string_view text, LineBuffer::Blanks blanks) {
    const char first = text.front();
    if (first == '\\') return {1, 2, false};
    if (first == ' ' && blanks == LineBuffer::Blanks::escaped) return {1, 4, false};
    const TextUnit unit = firstUnit(text);
    return {unit.bytes, unit.printable ? unit.bytes : 4 * unit.bytes, unit.printable};
}

}  // namespace

void LineBuffer::put(char character) noexcept {
    put(std::string_view(&character, 1));
}

void LineBuffer::put(std::string_view text) noexcept {
    const std::size_t count = std::min(text.size(), free());
    std::copy_n(text.data(), count, bytes_.data() + 1 + size_);
    size_ += count;
}

void LineBuffer::putNumber(long long value, std::size_t digits) noexcept {
    std::array<char, 24> decimal{};
    const auto end = std::to_chars(decimal.data(), decimal.data() + decimal.size(), value).ptr;
    const auto length = static_cast<std::size_t>(end - decimal.data());
    for (std::size_t filled = length; filled < digits; ++filled) put('0');
    put(std::string_view(decimal.data(), length));
}

void LineBuffer::putUnit(std::string_view unit, bool asItIs) noexcept {
    if (asItIs) return put(unit);
    if (unit == "\\") return put("\\\\");
    constexpr std::string_view hex = "0123456789ABCDEF";
    for (const char character : unit) {
        const auto byte = static_cast<unsigned char>(character);
        put("\\x");
        put(hex[byte / 16]);
        put(hex[byte % 16]);
    }
}

void LineBuffer::putEscaped(std::string_view text, std::size_t room, Blanks blanks) noexcept {
    const std::size_t limit = size_ + std::min(room, free());
    std::size_t markFitsAt = size_;
    while (!text.empty()) {
        const EscapedUnit unit = measure(text, blanks);
        if (size_ + unit.written > limit) {
            size_ = markFitsAt;
            return put(cutMark.substr(0, limit - size_));
        }
        putUnit(text.substr(0, unit.taken), unit.asItIs);
        text.remove_prefix(unit.taken);
        if (size_ + cutMark.size() <= limit) markFitsAt = size_;
    }
}

std::string_view LineBuffer::text() const noexcept {
    return {bytes_.data() + 1, size_};
}

const char* LineBuffer::nulTerminated() noexcept {
    bytes_[size_ + 1] = '\0';
    return bytes_.data() + 1;
}

std::string_view LineBuffer::line() noexcept {
    bytes_[size_ + 1] = '\n';
    return {bytes_.data() + 1, size_ + 1};
}

std::string_view LineBuffer::lineAfterTornLine() noexcept {
    const std::string_view whole = line();
    return {whole.data() - 1, whole.size() + 1};
}

}  // namespace ZBLog
