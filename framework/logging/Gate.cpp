#include "Gate.h"

namespace ZBLog {

void Gate::set(const ChannelConfiguration& channel) noexcept {
    if (channel.destination == Destination::nowhere) return close();
    word_ = 2 * channel.level + (channel.failuresOnly ? 1 : 0);
}

}  // namespace ZBLog
