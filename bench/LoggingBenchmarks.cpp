// One record, from its text to the two channels.

#include <benchmark/benchmark.h>

#include "Trace.h"
#include "bench/Benchmarks.h"
#include "bench/Counts.h"

namespace bench {
namespace {

const std::string category("Zumbrel.OperatingSystemProvider");

void plainRecord() {
    VA::writeRecord("getObjectPath", "CMPIOperatingSystem.cpp", 57, category, VA::recordLevel, [] {
        return VA::trace("CMPIOperatingSystem.cpp", "getObjectPath", 57U, VA::Entering);
    });
}

void measure(benchmark::State& state) {
    plainRecord();
    for (auto iteration : state) {
        static_cast<void>(iteration);
        plainRecord();
    }
    const Watch watch;
    plainRecord();
    state.counters["allocations"] = static_cast<double>(watch.counts().allocations);
}

}  // namespace

void addLoggingBenchmarks(LoggingConfiguration& logging) {
    const std::string file = logging.folder() + "/records.log";
    const struct {
        const char* name;
        std::string settings;
    } cases[] = {
        {"logging/filtered: off", "log.sink = off\ntrace.sink = off\n"},
        {"logging/filtered: failures only", LoggingConfiguration::failuresOnly},
        {"logging/written: trace to a file", "log.sink = off\ntrace.sink = file:" + file + "\n"},
    };
    for (const auto& each : cases)
        benchmark::RegisterBenchmark(each.name,
                                     [&logging, settings = each.settings](benchmark::State& state) {
                                         logging.use(settings);
                                         measure(state);
                                         // Others come next: repetitions alternate.
                                         logging.use(LoggingConfiguration::failuresOnly);
                                     })
            ->Iterations(100000)
            ->Repetitions(3);
}

}  // namespace bench
