#include "ZBMessageBuffer.h"

#include <algorithm>
#include <locale>

#include "Gatherer.h"

namespace ZBLog {

IdlePool<ZBMessageBuffer::Gatherer, ZBMessageBuffer::Gatherer::idleLimit>
    ZBMessageBuffer::Gatherer::idle_;
const ZBMessageBuffer::Gatherer::AtUnload ZBMessageBuffer::Gatherer::atUnload_{};

ZBMessageBuffer::Gatherer::Gatherer() : stream_(this) {
    for (std::string& text : texts_) text.reserve(usualCapacity);
    resetStream();
}

std::unique_ptr<ZBMessageBuffer::Gatherer> ZBMessageBuffer::Gatherer::obtain() {
    std::unique_ptr<Gatherer> gatherer = idle_.take();
    return gatherer ? std::move(gatherer) : std::make_unique<Gatherer>();
}

void ZBMessageBuffer::Gatherer::release(std::unique_ptr<Gatherer> gatherer) noexcept {
    if (!gatherer->isWorthKeeping()) return;
    gatherer->take();
    gatherer->streamed_ = false;
    idle_.give(std::move(gatherer));
}

ZBMessageBuffer::Gatherer::AtUnload::~AtUnload() {
    idle_.close();
}

std::ostream& ZBMessageBuffer::Gatherer::stream() noexcept {
    streamed_ = true;
    return stream_;
}

const std::string& ZBMessageBuffer::Gatherer::take() noexcept {
    const std::string& taken = gathering();
    current_ ^= 1;
    gathering().clear();
    if (streamed_) resetStream();
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

/// One by one: copyfmt, with its look at every facet of the locale, takes ten times as long.
void ZBMessageBuffer::Gatherer::resetStream() noexcept {
    stream_.exceptions(std::ios::goodbit);
    stream_.rdbuf(this);
    stream_.tie(nullptr);
    stream_.flags(std::ios::dec | std::ios::skipws);
    stream_.width(0);
    stream_.precision(6);
    stream_.fill(' ');
    // Numbers look the same in every process, whatever its locale.
    if (stream_.getloc() != std::locale::classic()) stream_.imbue(std::locale::classic());
}

/// A huge text must not hold on to its memory for months.
bool ZBMessageBuffer::Gatherer::isWorthKeeping() const noexcept {
    return std::all_of(texts_.begin(), texts_.end(),
                       [](const std::string& text) { return text.capacity() <= keptCapacity; });
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

const std::string& ZBMessageBuffer::str(ZBMessageBuffer&) {
    return gatherer_->take();
}

const std::string& ZBMessageBuffer::str(std::ostream&) {
    return gatherer_->take();
}

}  // namespace ZBLog
