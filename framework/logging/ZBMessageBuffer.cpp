#include "ZBMessageBuffer.h"

#include <charconv>
#include <cstdint>
#include <locale>

#include "Gatherer.h"

namespace ZBLog {

IdlePool<ZBMessageBuffer::Gatherer, ZBMessageBuffer::Gatherer::idleLimit>
    ZBMessageBuffer::Gatherer::idle_;
const ZBMessageBuffer::Gatherer::AtUnload ZBMessageBuffer::Gatherer::atUnload_{};

ZBMessageBuffer::Gatherer::Gatherer() : stream_(this), pristine_(nullptr) {
    for (std::string& text : texts_) text.reserve(usualCapacity);
    // Numbers look the same in every process, whatever its locale.
    pristine_.imbue(std::locale::classic());
    stream_.imbue(std::locale::classic());
}

std::unique_ptr<ZBMessageBuffer::Gatherer> ZBMessageBuffer::Gatherer::obtain() {
    std::unique_ptr<Gatherer> gatherer = idle_.take();
    return gatherer ? std::move(gatherer) : std::make_unique<Gatherer>();
}

void ZBMessageBuffer::Gatherer::release(std::unique_ptr<Gatherer> gatherer) noexcept {
    if (!gatherer->isWorthKeeping()) return;
    gatherer->take();
    gatherer->streamed_ = false;
    gatherer->lent_ = false;
    idle_.give(std::move(gatherer));
}

ZBMessageBuffer::Gatherer::AtUnload::~AtUnload() {
    idle_.close();
}

std::ostream& ZBMessageBuffer::Gatherer::stream() noexcept {
    streamed_ = true;
    return stream_;
}

std::ostream& ZBMessageBuffer::Gatherer::appendAddress(const void* address) {
    if (streamed_ || (lent_ && !isStreamAsNew())) return stream() << address;
    lent_ = true;
    if (address == nullptr) {
        append("0");
        return stream_;
    }
    char text[2 + 2 * sizeof(std::uintptr_t)] = {'0', 'x'};
    const auto number = reinterpret_cast<std::uintptr_t>(address);
    const char* const end = std::to_chars(text + 2, text + sizeof text, number, 16).ptr;
    append({text, static_cast<std::size_t>(end - text)});
    return stream_;
}

const std::string& ZBMessageBuffer::Gatherer::take() noexcept {
    const std::string& taken = gathering();
    current_ ^= 1;
    gathering().clear();
    if (streamed_ || (lent_ && !isStreamAsNew())) resetStream();
    return taken;
}

ZBMessageBuffer::Gatherer::int_type ZBMessageBuffer::Gatherer::overflow(int_type character) {
    if (!traits_type::eq_int_type(character, traits_type::eof())) {
        gathering().push_back(traits_type::to_char_type(character));
    }
    return traits_type::not_eof(character);
}

std::streamsize ZBMessageBuffer::Gatherer::xsputn(const char* text, std::streamsize count) {
    gathering().append(text, static_cast<std::size_t>(count));
    return count;
}

/// A huge text must not hold on to its memory for months.
bool ZBMessageBuffer::Gatherer::isWorthKeeping() const noexcept {
    return texts_[0].capacity() <= keptCapacity && texts_[1].capacity() <= keptCapacity;
}

bool ZBMessageBuffer::Gatherer::isStreamAsNew() const noexcept {
    return stream_.rdbuf() == this && stream_.rdstate() == std::ios::goodbit &&
           stream_.flags() == pristine_.flags() && stream_.width() == pristine_.width() &&
           stream_.precision() == pristine_.precision() && stream_.fill() == pristine_.fill() &&
           stream_.exceptions() == pristine_.exceptions() && stream_.tie() == pristine_.tie() &&
           stream_.getloc() == pristine_.getloc();
}

void ZBMessageBuffer::Gatherer::resetStream() noexcept {
    stream_.rdbuf(this);
    stream_.copyfmt(pristine_);
}

ZBMessageBuffer::ZBMessageBuffer() : gatherer_(Gatherer::obtain().release()) {}

ZBMessageBuffer::~ZBMessageBuffer() {
    Gatherer::release(std::unique_ptr<Gatherer>(gatherer_));
}

ZBMessageBuffer& ZBMessageBuffer::operator<<(const char* text) {
    if (text != nullptr) gatherer_->append(text);
    return *this;
}

ZBMessageBuffer::operator std::ostream&() {
    return gatherer_->stream();
}

std::ostream& ZBMessageBuffer::appendAddress(const void* address) {
    return gatherer_->appendAddress(address);
}

const std::string& ZBMessageBuffer::str(ZBMessageBuffer&) {
    return gatherer_->take();
}

const std::string& ZBMessageBuffer::str(std::ostream&) {
    return gatherer_->take();
}

}  // namespace ZBLog
