// Every record of a request goes through a message buffer, whether it is written or not. Streams
// and the memory of texts are expensive to come by, so that what a buffer works with is kept in a
// pool when the buffer is gone: filtered records then allocate nothing.
#include "ZBMessageBuffer.h"

#include <algorithm>
#include <array>
#include <locale>
#include <streambuf>
#include <string_view>

#include "ObjectPool.h"

namespace ZBLog {

/// What a message buffer works with: the text, and a stream that appends to it.
class [[gnu::visibility("hidden")]] ZBMessageBuffer::MessageStream final : public std::streambuf {
  public:
    MessageStream();

    /// One without text and with a stream as a new one is. Throws std::bad_alloc.
    static std::unique_ptr<MessageStream> obtain();

    /// Takes back one that is no longer used.
    static void release(std::unique_ptr<MessageStream> stream) noexcept;

    void append(std::string_view text) {
        activeText().append(text);
    }

    std::ostream& stream() noexcept {
        streamed_ = true;
        return stream_;
    }

    /// Takes the text; the stream is as a new one afterwards. Valid until the next call.
    const std::string& take() noexcept;

  private:
    static constexpr std::size_t idleLimit = 32;
    static constexpr std::size_t usualCapacity = 512;
    static constexpr std::size_t keptCapacity = 8 * 1024;

    /// When the library is unloaded or the process ends, the idle ones are given back.
    struct AtUnload {
        ~AtUnload() { idle_.close(); }
    };

    static ObjectPool<MessageStream, idleLimit> idle_;
    static const AtUnload atUnload_;

    int_type overflow(int_type character) override;
    std::streamsize xsputn(const char* text, std::streamsize count) override;

    bool isWorthKeeping() const noexcept;
    void resetStream() noexcept;

    std::string& activeText() noexcept {
        return texts_[current_];
    }

    std::array<std::string, 2> texts_;  // the one that is gathered, and the one that was taken
    std::size_t current_ = 0;
    std::ostream stream_{this};
    bool streamed_ = false;  // whether the stream was given out, and may be in any state
};

ObjectPool<ZBMessageBuffer::MessageStream, ZBMessageBuffer::MessageStream::idleLimit>
    ZBMessageBuffer::MessageStream::idle_;
const ZBMessageBuffer::MessageStream::AtUnload ZBMessageBuffer::MessageStream::atUnload_{};

ZBMessageBuffer::MessageStream::MessageStream() {
    for (std::string& text : texts_) text.reserve(usualCapacity);
    resetStream();
}

std::unique_ptr<ZBMessageBuffer::MessageStream> ZBMessageBuffer::MessageStream::obtain() {
    std::unique_ptr<MessageStream> stream = idle_.take();
    return stream ? std::move(stream) : std::make_unique<MessageStream>();
}

void ZBMessageBuffer::MessageStream::release(std::unique_ptr<MessageStream> stream) noexcept {
    if (!stream->isWorthKeeping()) return;
    stream->take();
    stream->streamed_ = false;
    idle_.give(std::move(stream));
}

const std::string& ZBMessageBuffer::MessageStream::take() noexcept {
    const std::string& taken = activeText();
    current_ ^= 1;
    activeText().clear();
    if (streamed_) resetStream();
    return taken;
}

ZBMessageBuffer::MessageStream::int_type ZBMessageBuffer::MessageStream::overflow(
    int_type character) {
    if (!traits_type::eq_int_type(character, traits_type::eof())) {
        activeText().push_back(traits_type::to_char_type(character));
    }
    return traits_type::not_eof(character);
}

std::streamsize ZBMessageBuffer::MessageStream::xsputn(const char* text, std::streamsize count) {
    activeText().append(text, static_cast<std::size_t>(count));
    return count;
}

/// Brings the stream into the state of a new one. A new one in its place would look for all facets
/// of its locale: measured, a twelfth of all instructions of a request for one instance.
void ZBMessageBuffer::MessageStream::resetStream() noexcept {
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
bool ZBMessageBuffer::MessageStream::isWorthKeeping() const noexcept {
    return std::all_of(texts_.begin(), texts_.end(),
                       [](const std::string& text) { return text.capacity() <= keptCapacity; });
}

ZBMessageBuffer::ZBMessageBuffer() : stream_(MessageStream::obtain().release()) {}

ZBMessageBuffer::~ZBMessageBuffer() {
    MessageStream::release(std::unique_ptr<MessageStream>(stream_));
}

ZBMessageBuffer& ZBMessageBuffer::operator<<(const char* text) {
    if (text != nullptr) stream_->append(text);
    return *this;
}

ZBMessageBuffer::operator std::ostream&() {
    return stream_->stream();
}

const std::string& ZBMessageBuffer::str(ZBMessageBuffer&) {
    return stream_->take();
}

const std::string& ZBMessageBuffer::str(std::ostream&) {
    return stream_->take();
}

}  // namespace ZBLog
