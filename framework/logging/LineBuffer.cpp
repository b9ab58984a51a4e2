// A record is put together on the stack and written with one call: a log that allocated could fail
// just when somebody has to read why memory ran out, and two calls could be torn apart by another
// process that appends to the same file.
#include "LineBuffer.h"

#include <algorithm>
#include <charconv>

namespace ZBLog {

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

void LineBuffer::putEscaped(std::string_view text, std::size_t room,
                            base::EscapeStyle style) noexcept {
    constexpr std::string_view cutMark = "\\...";
    const std::size_t limit = size_ + std::min(room, free());
    std::size_t markFitsAt = size_;
    while (!text.empty()) {
        const base::EscapedChar character(text, style);
        if (size_ + character.written().size() > limit) {
            size_ = markFitsAt;
            return put(cutMark.substr(0, limit - size_));
        }
        put(character.written());
        text.remove_prefix(character.length());
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
