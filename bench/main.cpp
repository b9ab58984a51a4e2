// Measures the provider; takes the options of Google Benchmark.

#include <benchmark/benchmark.h>

#include "bench/Benchmarks.h"

#include <exception>
#include <iostream>

int main(int argc, char** argv) try {
    benchmark::Initialize(&argc, argv);
    if (benchmark::ReportUnrecognizedArguments(argc, argv)) return 2;
    bench::LoggingConfiguration logging;
    bench::BenchFixture fixture;
    fixture.compareAnswers();
    bench::addRequestBenchmarks(fixture);
    bench::addHostBenchmarks(fixture);
    bench::addLoggingBenchmarks(logging);
    bench::addSchemaBenchmarks();
    benchmark::RunSpecifiedBenchmarks();
    return 0;
} catch (const std::exception& caught) {
    std::cerr << "korva_bench: " << caught.what() << '\n';
    return 1;
}
