// Numbers that must be equal, not nearly so: whatever the allocator and the kernel change by
// themselves is evened out before they are read.
#include "load/ProcessState.h"

#include <malloc.h>
#include <sys/mman.h>

#include <cstdint>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <sstream>
#include <stdexcept>

namespace load {
namespace {

// The number behind a name in a file of /proc/self.
long entry(const std::string& fileName, const std::string& name) {
    std::ifstream file("/proc/self/" + fileName);
    for (std::string line; std::getline(file, line);)
        if (line.rfind(name + ':', 0) == 0) return std::stol(line.substr(name.size() + 1));
    throw std::runtime_error("no " + name + " in /proc/self/" + fileName);
}

// Brings every page of the files that are mapped into memory. Which of them are there is otherwise
// the kernel's decision, and changes.
void readMappedFiles() {
    std::ifstream maps("/proc/self/maps");
    for (std::string line; std::getline(maps, line);) {
        std::istringstream fields(line);
        std::uintptr_t begin = 0;
        std::uintptr_t end = 0;
        char dash = 0;
        std::string rights, offset, device, inode;
        fields >> std::hex >> begin >> dash >> end >> rights >> offset >> device >> inode;
        if (inode != "0" && rights[0] == 'r')
            ::madvise(reinterpret_cast<void*>(begin), end - begin, MADV_POPULATE_READ);
    }
}

// Without the one that the count needs.
long openDescriptors() {
    const std::filesystem::directory_iterator all("/proc/self/fd"), end;
    return static_cast<long>(std::distance(all, end)) - 1;
}

}  // namespace

// The counters in statm and status lag behind; smaps_rollup counts the pages.
ProcessState readProcessState() {
    ::malloc_trim(0);
    readMappedFiles();
    return {entry("smaps_rollup", "Rss"), entry("smaps_rollup", "Anonymous"),
            entry("status", "VmHWM"), openDescriptors(), entry("status", "Threads")};
}

std::string describe(const ProcessState& state) {
    return std::to_string(state.residentKilobytes) + " KiB resident, of them " +
           std::to_string(state.anonymousKilobytes) + " anonymous (peak " +
           std::to_string(state.peakKilobytes) + "), " + std::to_string(state.descriptors) +
           " open files, " + std::to_string(state.threads) +
           (state.threads == 1 ? " thread" : " threads");
}

}  // namespace load
