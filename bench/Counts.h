// What the process does: allocations, memory in use, files opened. The counting functions take the
// place of the C library's in programs that link this, and count while a watch is on.
#ifndef BENCH_COUNTS_H
#define BENCH_COUNTS_H

#include <cstddef>

namespace bench {

struct Counts {
    std::size_t allocations;
    std::size_t opened;     ///< files and folders
    std::size_t peakBytes;  ///< the most that was in use beyond what was when the watch began
};

/// Counts what the whole process does while it lives. One at a time.
class Watch {
  public:
    Watch() noexcept;
    ~Watch();
    Watch(const Watch&) = delete;
    Watch& operator=(const Watch&) = delete;

    Counts counts() const noexcept;
};

}  // namespace bench

#endif
