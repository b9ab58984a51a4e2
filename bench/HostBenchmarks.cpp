// The Linux host as a source: each part of its snapshot, and whole requests.

#include <benchmark/benchmark.h>

#include "bench/Benchmarks.h"
#include "bench/Counts.h"
#include "framework/instrumentation/HostSource.h"
#include "tests/support/SystemCalls.h"

namespace bench {
namespace {

namespace Lexicon = VA::NodeLexicon;

struct Part {
    const char* name;
    void (*read)(VA::NodeCursor& cursor);
};

template <class Value, Lexicon::Properties... ids>
void read(VA::NodeCursor& cursor) {
    Value value{};
    (cursor.readProperty(ids, value), ...);
}

// One for each source, with the properties that it serves: the names are those of the figures.
constexpr Part parts[] = {
    {"no value", [](VA::NodeCursor&) {}},
    {"computer name",
     [](VA::NodeCursor& cursor) {
         std::string name;
         cursor.readComputerName(name);
     }},
    {"name and version", read<std::string, Lexicon::Name, Lexicon::Version>},
    {"boot time", read<std::string, Lexicon::LastBootUpTime>},
    {"install date", read<std::string, Lexicon::InstallDate>},
    {"limits", read<unsigned, Lexicon::MaxNumberOfProcesses, Lexicon::MaxProcessMemorySize>},
    {"processes", read<unsigned, Lexicon::NumberOfProcesses>},
    {"users", read<unsigned, Lexicon::NumberOfUsers>},
    {"memory",
     read<unsigned, Lexicon::TotalVirtualMemorySize, Lexicon::FreeVirtualMemory,
          Lexicon::FreePhysicalMemory, Lexicon::TotalVisibleMemorySize, Lexicon::TotalSwapSpaceSize,
          Lexicon::SizeStoredInPagingFiles, Lexicon::FreeSpaceInPagingFiles>},
    {"state", [](VA::NodeCursor& cursor) { cursor.nodeStatus(); }},
};

void readPart(VA::HostSource& host, const Part& part) {
    const std::unique_ptr<VA::NodeCursor> cursor = host.openCursor();
    cursor->select(Lexicon::OperatingSystemNode);
    part.read(*cursor);
}

// Once more, for what is counted and not timed.
template <class Work>
void countOpened(benchmark::State& state, Work work) {
    const Watch watch;
    work();
    state.counters["opened"] = static_cast<double>(watch.counts().opened);
}

void measurePart(benchmark::State& state, const Part& part) {
    const std::shared_ptr<VA::HostSource> host = VA::makeLinuxHost();
    for (auto iteration : state) {
        static_cast<void>(iteration);
        readPart(*host, part);
    }
    countOpened(state, [&] { readPart(*host, part); });
}

void measureRequest(benchmark::State& state, BenchFixture& fixture, Answerer answerer,
                    const cmpihost::OperationRequest& request) {
    fixture.useRealHost();
    for (auto iteration : state) {
        static_cast<void>(iteration);
        benchmark::DoNotOptimize(fixture.run(answerer, request));
    }
    const auto once = [&] { fixture.run(answerer, request); };
    countOpened(state, once);
    // Nothing where one process may not trace another.
    if (const auto calls = systemCallsOf(once))
        state.counters["systemCalls"] = static_cast<double>(calls->size());
    fixture.useSimulatedHost();
}

}  // namespace

void addHostBenchmarks(BenchFixture& fixture) {
    for (const Part& part : parts)
        benchmark::RegisterBenchmark(
            (std::string("host/snapshot: ") + part.name).c_str(),
            [&part](benchmark::State& state) { measurePart(state, part); });
    for (const char* name : {"EnumerateInstanceNames KORVA_OperatingSystem",
                             "EnumerateInstances KORVA_OperatingSystem"})
        for (const Answerer answerer : {Answerer::Provider, Answerer::Baseline})
            benchmark::RegisterBenchmark(
                (std::string("host/") + name + ", " + nameOf(answerer)).c_str(),
                [&fixture, answerer, name](benchmark::State& state) {
                    measureRequest(state, fixture, answerer, requestNamed(name));
                });
}

}  // namespace bench
