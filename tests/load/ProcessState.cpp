#include "load/ProcessState.h"

#include <malloc.h>

#include <filesystem>
#include <fstream>
#include <iterator>
#include <stdexcept>

namespace load {
namespace {

// The number behind a name in /proc/self/status.
long statusEntry(const std::string& name) {
    std::ifstream file("/proc/self/status");
    for (std::string word; file >> word;) {
        long number = 0;
        if (word == name && file >> number) return number;
    }
    throw std::runtime_error("no " + name + " in /proc/self/status");
}

long residentPages() {
    std::ifstream file("/proc/self/statm");
    long all = 0;
    long resident = 0;
    if (!(file >> all >> resident)) throw std::runtime_error("/proc/self/statm cannot be read");
    return resident;
}

long openDescriptors() {
    const std::filesystem::directory_iterator all("/proc/self/fd"), end;
    return static_cast<long>(std::distance(all, end)) - 1;
}

}  // namespace

ProcessState readProcessState() {
    ::malloc_trim(0);
    return {residentPages(), statusEntry("RssAnon:"), statusEntry("VmHWM:"), openDescriptors(),
            statusEntry("Threads:")};
}

std::string describe(const ProcessState& state) {
    return std::to_string(state.residentPages) + " pages resident (" +
           std::to_string(state.anonymousKilobytes) + " KiB anonymous, peak " +
           std::to_string(state.peakKilobytes) + " KiB), " + std::to_string(state.descriptors) +
           " open files, " + std::to_string(state.threads) + " threads";
}

}  // namespace load
