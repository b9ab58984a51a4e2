#include "StandardErrorSink.h"

#include <poll.h>
#include <unistd.h>

#include <cerrno>
#include <chrono>

#include "Patience.h"

namespace ZBLog {

StandardErrorSink::StandardErrorSink(Surroundings& surroundings)
    : LineSink("standard error", surroundings) {}

LineSink::Output StandardErrorSink::output(bool wait) noexcept {
    using Clock = std::chrono::steady_clock;
    const auto deadline = Clock::now() + (wait ? patience : std::chrono::milliseconds::zero());
    for (;;) {
        const auto rest =
            std::chrono::duration_cast<std::chrono::milliseconds>(deadline - Clock::now()).count();
        pollfd output{STDERR_FILENO, POLLOUT, {}};
        const int ready = ::poll(&output, 1, rest > 0 ? static_cast<int>(rest) : 0);
        // A stream in error is written to all the same: the write names the reason.
        if (ready > 0) return {STDERR_FILENO, 0};
        if (ready == 0) return {-1, ETIMEDOUT};
        if (errno != EINTR) return {-1, errno};
    }
}

}  // namespace ZBLog
