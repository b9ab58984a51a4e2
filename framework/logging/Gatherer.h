#ifndef ZBLOG_GATHERER_H
#define ZBLOG_GATHERER_H

#include <array>
#include <cstddef>
#include <memory>
#include <ostream>
#include <streambuf>
#include <string>
#include <string_view>

#include "IdlePool.h"
#include "ZBMessageBuffer.h"

namespace ZBLog {

/// What a message buffer works with: the text, and a stream that appends to it. Starting a stream
/// is dear, so gatherers are used again; their texts keep the memory that they have grown to.
class [[gnu::visibility("hidden")]] ZBMessageBuffer::Gatherer final : private std::streambuf {
  public:
    Gatherer();

    /// A gatherer without text and with a stream as a new one is. Throws std::bad_alloc.
    static std::unique_ptr<Gatherer> obtain();

    /// Takes back one that is no longer used.
    static void release(std::unique_ptr<Gatherer> gatherer) noexcept;

    void append(std::string_view text) {
        gathering().append(text);
    }

    std::ostream& stream() noexcept;

    /// Takes the text; the stream is as a new one afterwards. Valid until the next call.
    const std::string& take() noexcept;

  private:
    static constexpr std::size_t idleLimit = 32;
    static constexpr std::size_t usualCapacity = 512;
    static constexpr std::size_t keptCapacity = 8 * 1024;

    /// When the library is unloaded or the process ends, the idle ones are given back.
    struct AtUnload {
        ~AtUnload();
    };

    static IdlePool<Gatherer, idleLimit> idle_;
    static const AtUnload atUnload_;

    int_type overflow(int_type character) override;
    std::streamsize xsputn(const char* text, std::streamsize count) override;

    bool isWorthKeeping() const noexcept;
    void resetStream() noexcept;

    std::string& gathering() noexcept {
        return texts_[current_];
    }

    std::array<std::string, 2> texts_;  // the one that is gathered, and the one that was taken
    std::size_t current_ = 0;
    std::ostream stream_;
    bool streamed_ = false;  // whether the stream was given out, and may be in any state
};

}  // namespace ZBLog

#endif
