#ifndef ZBLOG_GATE_H
#define ZBLOG_GATE_H

#include <atomic>
#include <string_view>

#include "Configuration.h"

namespace ZBLog {

/// What one channel lets pass, as far as one word can tell: almost every record is decided here, by
/// one load, without a look at the configuration. Categories are none of its business.
/// Any thread may ask and set at any time.
class Gate {
  public:
    /// Closed: nothing passes.
    constexpr Gate() = default;

    void set(const ChannelConfiguration& channel) noexcept;
    void close() noexcept { word_ = closed; }

    bool passes(int level, std::string_view text) const noexcept {
        const int word = word_.load(std::memory_order_relaxed);
        if (word == closed || level > word / 2) return false;
        return word % 2 == 0 || isFailure(text);
    }

  private:
    static constexpr int closed = -1;

    std::atomic<int> word_{closed};  // else twice the finest level, plus one for failures only
};

}  // namespace ZBLog

#endif
