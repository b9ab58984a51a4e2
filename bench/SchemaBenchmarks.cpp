// A schema of the size of the CIM schema: what it costs to have it, and to ask it for a class.

#include <benchmark/benchmark.h>

#include <memory>

#include "bench/Benchmarks.h"
#include "bench/Counts.h"
#include "host/mof/ResolvedClass.h"
#include "tests/support/GeneratedSchema.h"

namespace bench {
namespace {

template <class Work>
void measure(benchmark::State& state, Work work) {
    for (auto iteration : state) {
        static_cast<void>(iteration);
        work();
    }
    const Watch watch;
    work();
    state.counters["allocations"] = static_cast<double>(watch.counts().allocations);
}

}  // namespace

void addSchemaBenchmarks() {
    const auto files = std::make_shared<GeneratedSchema>();
    // Seven levels below the root.
    const std::string last = GeneratedSchema::className(GeneratedSchema::classCount - 1);
    benchmark::RegisterBenchmark("schema/read", [files](benchmark::State& state) {
        measure(state, [&] {
            benchmark::DoNotOptimize(cmpihost::Schema::load(files->folder()).find("GEN_Class0"));
        });
    });
    benchmark::RegisterBenchmark("schema/resolve a class", [files, last](benchmark::State& state) {
        const cmpihost::Schema schema = cmpihost::Schema::load(files->folder());
        measure(state, [&] { benchmark::DoNotOptimize(cmpihost::resolvedClass(schema, last)); });
    });
    benchmark::RegisterBenchmark(
        "schema/declare a class to the broker", [files, last](benchmark::State& state) {
            const cmpihost::Schema schema = cmpihost::Schema::load(files->folder());
            measure(state, [&] {
                benchmark::DoNotOptimize(cmpihost::SchemaCatalogue(schema).find(last));
            });
        });
}

}  // namespace bench
