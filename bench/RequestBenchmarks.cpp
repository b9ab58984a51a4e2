// Every request of the list, answered by the provider and by the baseline; what a growing number of
// nodes costs; and what the facade costs beyond the provider.

#include <benchmark/benchmark.h>

#include "bench/Benchmarks.h"
#include "bench/Counts.h"

namespace bench {
namespace {

constexpr unsigned nodeCounts[] = {0, 1, 10, 1000, 100000};
constexpr const char* growing[] = {
    "EnumerateInstances KORVA_OperatingSystem",
    "EnumerateInstanceNames KORVA_OperatingSystem",
    "EnumerateInstances KORVA_OperatingSystemCapabilities",
    "Associators KORVA_ComputerSystem KORVA_InstalledOS",
    "AssociatorNames KORVA_ComputerSystem KORVA_InstalledOS",
};

constexpr const char* throughFacade[] = {
    "EnumerateInstances KORVA_OperatingSystem",
    "EnumerateInstanceNames KORVA_OperatingSystem",
};

// One more request, for what is counted and not timed.
void count(benchmark::State& state, BenchFixture& fixture, Answerer answerer,
           const cmpihost::OperationRequest& request) {
    const Watch watch;
    fixture.run(answerer, request);
    const Counts counts = watch.counts();
    state.counters["allocations"] = static_cast<double>(counts.allocations);
    state.counters["opened"] = static_cast<double>(counts.opened);
    state.counters["peakBytes"] = static_cast<double>(counts.peakBytes);
}

void measure(benchmark::State& state, BenchFixture& fixture, Answerer answerer,
             const cmpihost::OperationRequest& request, unsigned nodes) {
    fixture.setNodes(nodes);
    for (auto iteration : state) {
        static_cast<void>(iteration);
        benchmark::DoNotOptimize(fixture.run(answerer, request));
    }
    count(state, fixture, answerer, request);
}

void add(BenchFixture& fixture, const std::string& group, const std::string& name,
         const cmpihost::OperationRequest& request, unsigned nodes,
         Answerer against = Answerer::Baseline) {
    for (const Answerer answerer : {Answerer::Provider, against}) {
        benchmark::RegisterBenchmark(
            (group + "/" + name + "/" + std::to_string(nodes) + "/" + nameOf(answerer)).c_str(),
            [&fixture, answerer, &request, nodes](benchmark::State& state) {
                measure(state, fixture, answerer, request, nodes);
            });
    }
}

}  // namespace

void addRequestBenchmarks(BenchFixture& fixture) {
    for (const NamedRequest& each : requests()) add(fixture, "request", each.name, each.request, 1);
    for (const char* name : growing)
        for (const unsigned nodes : nodeCounts)
            add(fixture, "nodes", name, requestNamed(name), nodes);
    for (const char* name : throughFacade)
        add(fixture, "facade", name, requestNamed(name), 1, Answerer::Facade);
}

}  // namespace bench
