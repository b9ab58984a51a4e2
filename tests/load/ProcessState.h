#ifndef TESTS_LOAD_PROCESS_STATE_H
#define TESTS_LOAD_PROCESS_STATE_H

#include <string>

namespace load {

/// What the calling process holds at one moment.
struct ProcessState {
    long residentKilobytes;   ///< all resident memory: heap, stacks, and the files that are mapped
    long anonymousKilobytes;  ///< of that, what no file stands behind
    long peakKilobytes;       ///< the most resident memory so far
    long descriptors;         ///< open files
    long threads;
};

/// Reads it from /proc. Before, memory that the allocator keeps for later is given back
/// (malloc_trim), and the files that are mapped are brought into memory in whole (where the kernel
/// is 5.14 or newer), so that what is resident is what is in use and does not change by itself.
/// Throws std::runtime_error when /proc cannot be read.
ProcessState readProcessState();

/// In a line, for people.
std::string describe(const ProcessState& state);

}  // namespace load

#endif
