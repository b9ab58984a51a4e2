// Sends many requests through the provider in one process and compares what the process holds after
// the first of them and at the end: open files, threads and resident memory must be the same. For a
// meaningful count of memory the allocator is to keep no caches (see the script `run` beside this
// file). Exits with 0 when all are the same, 1 when one is not, 2 for wrong usage and failures.
#include <chrono>
#include <iostream>
#include <stdexcept>

#include "load/ProcessState.h"
#include "load/SoakOptions.h"
#include "load/Workload.h"

namespace {

using namespace load;

/// The readings of one soak.
struct Readings {
    ProcessState settled;
    ProcessState end;
    unsigned long requests;
    unsigned long loads;
    double seconds;
};

// Runs whole loads until `until` requests are sent.
void runUntil(unsigned long until, const SoakOptions& options, Workload& workload,
              Readings& readings) {
    while (readings.requests < until) {
        workload.runOnce(options.perLoad, static_cast<unsigned int>(options.threads));
        readings.requests += options.perLoad;
        ++readings.loads;
    }
}

Readings soak(const SoakOptions& options) {
    const auto started = std::chrono::steady_clock::now();
    Readings readings{};
    Workload workload;
    runUntil(options.settle, options, workload, readings);
    readings.settled = readProcessState();
    runUntil(options.requests, options, workload, readings);
    readings.end = readProcessState();
    readings.seconds =
        std::chrono::duration<double>(std::chrono::steady_clock::now() - started).count();
    return readings;
}

void report(const Readings& readings, const SoakOptions& options) {
    std::cout << readings.requests << " requests, " << readings.loads << " loads, "
              << options.threads << " threads, " << readings.seconds << " s\n"
              << "settled: " << describe(readings.settled) << "\n"
              << "at end:  " << describe(readings.end) << "\n";
}

bool isSteady(const Readings& readings, const SoakOptions& options) {
    const ProcessState& before = readings.settled;
    const ProcessState& after = readings.end;
    return after.descriptors == before.descriptors && after.threads == before.threads &&
           (!options.memory || (after.residentKilobytes == before.residentKilobytes &&
                                after.anonymousKilobytes == before.anonymousKilobytes));
}

}  // namespace

int main(int count, char** arguments) {
    try {
        const SoakOptions options = soakOptions(count, arguments);
        const Readings readings = soak(options);
        const bool steady = isSteady(readings, options);
        if (options.report || !steady) report(readings, options);
        return steady ? 0 : 1;
    } catch (const std::exception& failure) {
        std::cerr << failure.what() << "\n";
        return 2;
    }
}
