// Runs every request of the list under callgrind, which then tells the instructions of each: the
// totals of its dumps, which bear the names of the requests.

#include <valgrind/callgrind.h>

#include "bench/BenchFixture.h"
#include "bench/Logging.h"

#include <exception>
#include <iostream>
#include <string>

namespace {

constexpr int rounds = 100;

void measure(bench::BenchFixture& fixture, bench::Answerer answerer, const NamedRequest& request) {
    fixture.run(answerer, request.request);
    CALLGRIND_ZERO_STATS;
    for (int round = 0; round < rounds; ++round) fixture.run(answerer, request.request);
    const std::string name = request.name + "/" + nameOf(answerer);
    CALLGRIND_DUMP_STATS_AT(name.c_str());
}

}  // namespace

// The argument, if there is one, is a part of the names of the requests to run, or --rounds, which
// tells how often each is run.
int main(int argc, char** argv) try {
    const std::string part = argc > 1 ? argv[1] : "";
    if (part == "--rounds") {
        std::cout << rounds << '\n';
        return 0;
    }
    const bench::LoggingConfiguration logging;
    bench::BenchFixture fixture;
    fixture.compareAnswers();
    for (const NamedRequest& request : bench::requests()) {
        if (request.name.find(part) == std::string::npos) continue;
        measure(fixture, bench::Answerer::Provider, request);
        measure(fixture, bench::Answerer::Baseline, request);
    }
    return 0;
} catch (const std::exception& caught) {
    std::cerr << "korva_instructions: " << caught.what() << '\n';
    return 1;
}
