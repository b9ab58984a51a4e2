// Sends many requests to a running endpoint over several kept connections at once. Each answer must
// be the one that its request had before anything else ran, but for the identifier of the message;
// what the endpoint holds must not grow. Exits with 0 when all of that holds, 1 when something does
// not, 2 for wrong usage and failures.
#include <chrono>
#include <iostream>
#include <map>
#include <stdexcept>
#include <string>
#include <vector>

#include "load/EndpointClients.h"
#include "support/EndpointProcess.h"

namespace {

struct Options {
    std::string program;
    unsigned long requests = 200000;  ///< between two readings
    unsigned long settle = 20000;     ///< before the first reading
    unsigned long connections = 1;
    bool memory = true;  ///< whether resident memory is compared
};

Options parse(const std::vector<std::string>& arguments) {
    const std::string usage =
        "usage: endpoint_load PROGRAM [--requests N] [--settle N] [--connections N] [--no-memory]";
    if (arguments.empty()) throw std::invalid_argument(usage);
    Options options;
    options.program = arguments[0];
    const std::map<std::string, unsigned long*> numbers = {{"--requests", &options.requests},
                                                           {"--settle", &options.settle},
                                                           {"--connections", &options.connections}};
    for (auto word = arguments.begin() + 1; word != arguments.end(); ++word) {
        if (*word == "--no-memory") {
            options.memory = false;
            continue;
        }
        const auto number = numbers.find(*word);
        if (number == numbers.end() || ++word == arguments.end())
            throw std::invalid_argument(usage);
        *number->second = std::stoul(*word);
    }
    return options;
}

void print(const char* when, const EndpointProcess::State& state) {
    std::cout << when << ": " << state.residentKilobytes << " KiB resident, " << state.descriptors
              << " open files, " << state.threads << " threads\n";
}

// Threads that meet in a new place may take some pages that stay. A leak takes more with every
// turn: memory is steady once a turn leaves it as it was, give or take what the allocator keeps.
bool staysSteady(const EndpointProcess& endpoint, EndpointClients& clients,
                 const Options& options) {
    constexpr unsigned long turns = 4;
    constexpr long grain = 256;
    clients.run(options.settle);
    EndpointProcess::State before = endpoint.state();
    print("settled", before);
    for (unsigned long turn = 1; turn <= turns; ++turn) {
        clients.run(options.requests);
        const EndpointProcess::State after = endpoint.state();
        print(("after " + std::to_string(options.requests * turn) + " requests more").c_str(),
              after);
        if (after.descriptors != before.descriptors || after.threads != before.threads)
            return false;
        if (!options.memory || after.residentKilobytes <= before.residentKilobytes + grain)
            return true;
        before = after;
    }
    return false;
}

}  // namespace

int main(int count, char** arguments) try {
    const Options options = parse({arguments + 1, arguments + count});
    // Room for the connection of before, which may end a little later.
    EndpointProcess endpoint(options.program,
                             {"--connections", std::to_string(options.connections + 16)});
    const EndpointProcess::State idle = endpoint.state();
    print("started", idle);
    const auto started = std::chrono::steady_clock::now();
    bool steady = false;
    {
        EndpointClients clients(endpoint.port(), options.connections, "fixture.example",
                                "Fixture Linux");
        steady = staysSteady(endpoint, clients, options);
    }
    const std::chrono::duration<double> time = std::chrono::steady_clock::now() - started;
    std::cout << options.connections << " connections, " << time.count() << " s\n";
    const EndpointProcess::End end = endpoint.stop();
    if (end.status != 0 || !end.err.empty())
        throw std::runtime_error("the endpoint ended with " + std::to_string(end.status) + ": " +
                                 end.err);
    return steady ? 0 : 1;
} catch (const std::exception& failure) {
    std::cerr << failure.what() << "\n";
    return 2;
}
