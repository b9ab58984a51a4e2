#ifndef ZBLOG_WHOLE_WRITE_H
#define ZBLOG_WHOLE_WRITE_H

#include <cstddef>
#include <string_view>

namespace ZBLog {

struct WriteResult {
    int error;            ///< 0: everything was written; else the error number
    std::size_t written;  ///< bytes that were written in either case
};

/// Writes `bytes` with one write(2); goes on only where the system took a part of them. No signal
/// reaches the process by it: neither SIGPIPE (nobody reads the pipe any more) nor SIGXFSZ (the
/// file has reached the limit of the process), both of which would end a process that does not
/// expect them. Signal handlers are not touched, and the thread's mask is as it was afterwards.
WriteResult writeWhole(int descriptor, std::string_view bytes) noexcept;

}  // namespace ZBLog

#endif
