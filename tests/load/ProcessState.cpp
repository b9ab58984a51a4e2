#include "load/ProcessState.h"

#include <malloc.h>

#include <filesystem>
#include <fstream>
#include <iterator>
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

// Without the one that the count needs.
long openDescriptors() {
    const std::filesystem::directory_iterator all("/proc/self/fd"), end;
    return static_cast<long>(std::distance(all, end)) - 1;
}

}  // namespace

// The counters in statm and status lag behind; smaps_rollup counts the pages.
ProcessState readProcessState() {
    ::malloc_trim(0);
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
