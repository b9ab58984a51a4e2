// Sends many requests through the provider in one process and compares what the process holds after
// the first of them and later: open files, threads and resident memory must be the same. For a
// meaningful count of memory the allocator is to keep no caches (see the script `run` beside this
// file). Exits with 0 when all are the same, 1 when one is not, 2 for wrong usage and failures.
#include <malloc.h>
#include <sys/mman.h>

#include <atomic>
#include <chrono>
#include <cstdint>
#include <filesystem>
#include <fstream>
#include <iostream>
#include <iterator>
#include <map>
#include <sstream>
#include <stdexcept>
#include <string>
#include <thread>
#include <vector>

#include "load/Workload.h"

namespace {

/// What the process holds at one moment.
struct ProcessState {
    long residentKilobytes;   ///< all resident memory: heap, stacks, and the files that are mapped
    long anonymousKilobytes;  ///< of that, what no file stands behind
    long peakKilobytes;       ///< the most resident memory so far
    long descriptors;         ///< open files
    long threads;
};

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

// Numbers that must be equal, not nearly so: what the allocator and the kernel change by themselves
// is evened out before. The counters in statm and status lag behind; smaps_rollup counts the pages.
ProcessState readProcessState() {
    ::malloc_trim(0);
    readMappedFiles();
    return {entry("smaps_rollup", "Rss"), entry("smaps_rollup", "Anonymous"),
            entry("status", "VmHWM"), openDescriptors(), entry("status", "Threads")};
}

// A soak that measured nothing would pass: a file, a thread and memory in use must show.
void checkMeasurements() {
    constexpr long kilobytes = 3000;
    const ProcessState before = readProcessState();
    std::atomic<bool> stop{false};
    std::thread thread([&] {
        while (!stop) std::this_thread::yield();
    });
    const std::ifstream file("/proc/self/status");
    const std::vector<char> memory(kilobytes * 1024, 1);
    const ProcessState with = readProcessState();
    stop = true;
    thread.join();
    if (with.descriptors != before.descriptors + 1 || with.threads != before.threads + 1 ||
        with.anonymousKilobytes < before.anonymousKilobytes + kilobytes ||
        with.residentKilobytes < with.anonymousKilobytes ||
        with.peakKilobytes < with.anonymousKilobytes)
        throw std::runtime_error("a file, a thread or memory is not counted");
}

struct Options {
    unsigned long requests = 200000;  ///< requests of a turn, between two readings
    unsigned long settle = 2000;      ///< requests before the first reading
    unsigned long perLoad = 250;      ///< requests between loading and unloading
    unsigned long threads = 1;
    bool memory = true;  ///< whether resident memory is compared
};

Options parse(const std::vector<std::string>& arguments) {
    Options options;
    const std::map<std::string, unsigned long*> numbers = {{"--requests", &options.requests},
                                                           {"--settle", &options.settle},
                                                           {"--per-load", &options.perLoad},
                                                           {"--threads", &options.threads}};
    for (auto word = arguments.begin(); word != arguments.end(); ++word) {
        if (*word == "--no-memory") {
            options.memory = false;
            continue;
        }
        const auto number = numbers.find(*word);
        if (number == numbers.end() || ++word == arguments.end())
            throw std::invalid_argument(
                "usage: soak [--requests N] [--settle N] [--per-load N] [--threads N] "
                "[--no-memory]");
        *number->second = std::stoul(*word);
    }
    if (options.requests == 0 || options.perLoad == 0 || options.threads == 0)
        throw std::invalid_argument("requests, a load and the threads are at least one");
    return options;
}

/// What was sent, in whole loads.
class Soak {
  public:
    explicit Soak(const Options& options) : options_(options) {}

    ProcessState runUntil(unsigned long requests) {
        for (; requests_ < requests; requests_ += options_.perLoad, ++loads_)
            workload_.runOnce(options_.perLoad, static_cast<unsigned int>(options_.threads));
        return readProcessState();
    }
    unsigned long requests() const { return requests_; }
    unsigned long loads() const { return loads_; }

  private:
    const Options options_;
    load::Workload workload_;
    unsigned long requests_ = 0;
    unsigned long loads_ = 0;
};

std::ostream& operator<<(std::ostream& out, const ProcessState& state) {
    return out << state.residentKilobytes << " KiB resident, of them " << state.anonymousKilobytes
               << " anonymous (peak " << state.peakKilobytes << "), " << state.descriptors
               << " open files, " << state.threads << (state.threads == 1 ? " thread" : " threads");
}

bool isMemorySteady(const ProcessState& before, const ProcessState& after) {
    return after.residentKilobytes == before.residentKilobytes &&
           after.anonymousKilobytes == before.anonymousKilobytes;
}

// Threads that meet in a new place for the first time may take a page that stays. A leak takes more
// with every turn: memory is steady once it is the same after a turn as before it.
bool staysSteady(Soak& soak, const Options& options) {
    constexpr int turns = 4;
    ProcessState before = soak.runUntil(options.settle);
    std::cout << "settled: " << before << "\n";
    for (int turn = 1; turn <= turns; ++turn) {
        const ProcessState after = soak.runUntil(soak.requests() + options.requests);
        std::cout << "after " << soak.requests() << " requests: " << after << "\n";
        if (after.descriptors != before.descriptors || after.threads != before.threads)
            return false;
        if (!options.memory || isMemorySteady(before, after)) return true;
        before = after;
    }
    return false;
}

}  // namespace

int main(int count, char** arguments) try {
    const Options options = parse({arguments + 1, arguments + count});
    checkMeasurements();
    const auto started = std::chrono::steady_clock::now();
    Soak soak(options);
    const bool steady = staysSteady(soak, options);
    const std::chrono::duration<double> time = std::chrono::steady_clock::now() - started;
    std::cout << soak.loads() << " loads, " << options.threads << " threads, " << time.count()
              << " s\n";
    return steady ? 0 : 1;
} catch (const std::exception& failure) {
    std::cerr << failure.what() << "\n";
    return 2;
}
