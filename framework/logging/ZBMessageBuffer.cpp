#include "ZBMessageBuffer.h"

#include <locale>

#include "Gatherer.h"

namespace ZBLog {

IdlePool<ZBMessageBuffer::Gatherer, ZBMessageBuffer::Gatherer::idleLimit>
    ZBMessageBuffer::Gatherer::idle_;
const ZBMessageBuffer::Gatherer::AtUnload ZBMessageBuffer::Gatherer::atUnload_{};

ZBMessageBuffer::Gatherer::Gatherer() : stream_(this), pristine_(nullptr) {
    gathering_.reserve(usualCapacity);
    taken_.reserve(usualCapacity);
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
    gathering_.swap(taken_);
    gathering_.clear();
    if (streamed_) resetStream();
    return taken_;
}

ZBMessageBuffer::Gatherer::int_type ZBMessageBuffer::Gatherer::overflow(int_type character) {
    if (!traits_type::eq_int_type(character, traits_type::eof())) {
        gathering_.push_back(traits_type::to_char_type(character));
    }
    return traits_type::not_eof(character);
}

std::streamsize ZBMessageBuffer::Gatherer::xsputn(const char* text, std::streamsize count) {
    gathering_.append(text, static_cast<std::size_t>(count));
    return count;
}

/// A huge text must not hold on to its memory for months.
bool ZBMessageBuffer::Gatherer::isWorthKeeping() const noexcept {
    return gathering_.capacity() <= keptCapacity && taken_.capacity() <= keptCapacity;
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

const std::string& ZBMessageBuffer::str(ZBMessageBuffer&) {
    return gatherer_->take();
}

const std::string& ZBMessageBuffer::str(std::ostream&) {
    return gatherer_->take();
}

}  // namespace ZBLog
