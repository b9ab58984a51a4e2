// What the endpoint costs beyond the broker: the same requests over a kept connection and inside
// this process, in turns, on this machine's host, and how much several connections get at once.
// korva_endpoint_speed CMPIHOST-SERVE: exit status 0 when the limits hold, 1 when one is missed, 2
// for failures.
#include <fcntl.h>
#include <unistd.h>

#include <algorithm>
#include <atomic>
#include <chrono>
#include <cstdio>
#include <iostream>
#include <memory>
#include <stdexcept>
#include <thread>
#include <vector>

#include "base/FileDescriptor.h"
#include "host/InstallPaths.h"
#include "host/broker/Router.h"
#include "host/mof/Schema.h"
#include "support/EndpointProcess.h"
#include "support/KeptConnection.h"

namespace {

using Clock = std::chrono::steady_clock;
using Microseconds = std::chrono::duration<double, std::micro>;

constexpr const char* className = "KORVA_OperatingSystem";

/// The providers behind a router, as cmpihost has them.
class Inside {
  public:
    explicit Inside(const std::filesystem::path& programFolder)
        : schema_(cmpihost::Schema::load({cmpihost::schemaFolder(programFolder)})),
          catalogue_(schema_),
          broker_(&catalogue_),
          router_(broker_, catalogue_,
                  cmpihost::Registrations::read({cmpihost::registrationFolder(programFolder)}),
                  cmpihost::libraryFolders(programFolder)) {}

    void ask(cmpihost::Operation operation) {
        cmpihost::OperationRequest request;
        request.operation = operation;
        request.path.className = className;
        request.path.nameSpace = "root/cimv2";
        const cmpihost::OperationResult result = router_.ask(request);
        if (result.instances.size() + result.paths.size() != 1)
            throw std::runtime_error("not one result inside");
    }

  private:
    const cmpihost::Schema schema_;
    const cmpihost::SchemaCatalogue catalogue_;
    cmpihost::Broker broker_;
    cmpihost::Router router_;
};

void askOver(KeptConnection& connection, const std::string& request) {
    if (connection.ask(request).find("<IRETURNVALUE><") == std::string_view::npos)
        throw std::runtime_error("no result from the endpoint");
}

template <class Work>
void measure(std::vector<double>& times, const Work& work) {
    const Clock::time_point begin = Clock::now();
    work();
    times.push_back(Microseconds(Clock::now() - begin).count());
}

double median(std::vector<double>& times) {
    const auto middle = times.begin() + static_cast<std::ptrdiff_t>(times.size() / 2);
    std::nth_element(times.begin(), middle, times.end());
    return *middle;
}

struct Row {
    const char* name;
    cmpihost::Operation operation;
    /// What the endpoint may take beyond the broker, in microseconds.
    double limit;
};

constexpr Row rows[] = {
    {"EnumerateInstances", cmpihost::Operation::EnumerateInstances, 60},
    {"EnumerateInstanceNames", cmpihost::Operation::EnumerateInstanceNames, 50},
};

std::string requestOf(const Row& row) {
    return intrinsicRequest("1001", row.name, classParameter("ClassName", className));
}

constexpr int blocks = 10;
constexpr int requestsOfABlock = 100;

/// Both times of a request, in turns.
struct Times {
    double over;
    double inside;
};
Times timesOf(const Row& row, std::uint16_t port, Inside& inside) {
    KeptConnection connection(port);
    const std::string request = requestOf(row);
    for (int warm = 0; warm < 200; ++warm) {
        askOver(connection, request);
        inside.ask(row.operation);
    }
    std::vector<double> over, within;
    for (int block = 0; block < blocks; ++block) {
        for (int count = 0; count < requestsOfABlock; ++count)
            measure(over, [&] { askOver(connection, request); });
        for (int count = 0; count < requestsOfABlock; ++count)
            measure(within, [&] { inside.ask(row.operation); });
    }
    return {median(over), median(within)};
}

/// Keeps the processors from sleeping for as long as it lives: it asks the kernel for no latency at
/// all. What a request takes is then the work, without the time that it takes to wake a processor.
class AwakeProcessors {
  public:
    AwakeProcessors()
        : latency_(base::FileDescriptor::open("/dev/cpu_dma_latency", O_WRONLY | O_CLOEXEC)) {
        const std::int32_t none = 0;
        awake_ = ::write(latency_.number(), &none, sizeof none) == sizeof none;
    }
    /// False without the right to it, or on a kernel that cannot.
    bool awake() const { return awake_; }

  private:
    const base::FileDescriptor latency_;
    bool awake_ = false;
};

/// Prints what the endpoint adds; whether the limits hold.
bool compareTimes(const char* title, const EndpointProcess& endpoint, Inside& inside) {
    std::printf(
        "| %s | over a connection (µs) | inside (µs) | difference | limit |\n"
        "|---|--:|--:|--:|--:|\n",
        title);
    bool hold = true;
    for (const Row& row : rows) {
        const Times times = timesOf(row, endpoint.port(), inside);
        const double difference = times.over - times.inside;
        const bool holds = difference <= row.limit;
        std::printf("| %s | %.1f | %.1f | %.1f | %.0f%s |\n", row.name, times.over, times.inside,
                    difference, row.limit, holds ? "" : " **missed**");
        hold = hold && holds;
    }
    std::puts("");
    return hold;
}

/// Requests in a second by so many connections at once.
double throughput(const Row& row, const EndpointProcess& endpoint, unsigned connections) {
    constexpr auto time = std::chrono::milliseconds(400);
    const std::string request = requestOf(row);
    std::atomic<bool> stop{false};
    std::atomic<unsigned long> answered{0};
    std::atomic<unsigned> failed{0};
    std::vector<std::thread> threads;
    const Clock::time_point begin = Clock::now();
    for (unsigned number = 0; number < connections; ++number)
        threads.emplace_back([&] {
            try {
                KeptConnection connection(endpoint.port());
                for (; !stop; ++answered) askOver(connection, request);
            } catch (const std::exception& failure) {
                std::cerr << failure.what() << "\n";
                ++failed;
            }
        });
    std::this_thread::sleep_for(time);
    stop = true;
    const double seconds = std::chrono::duration<double>(Clock::now() - begin).count();
    const auto count = static_cast<double>(answered);
    for (std::thread& thread : threads) thread.join();
    if (failed > 0) throw std::runtime_error("a connection failed");
    return count / seconds;
}

/// Prints a line of the table, of medians, for where a connection's two ends run is chance; whether
/// the limit holds.
bool compareThroughput(const Row& row, const EndpointProcess& endpoint) {
    constexpr double limit = 1.7;
    constexpr int rounds = 9;
    throughput(row, endpoint, 8);
    std::vector<double> ofOne, ofEight;
    for (int round = 0; round < rounds; ++round) {
        ofOne.push_back(throughput(row, endpoint, 1));
        ofEight.push_back(throughput(row, endpoint, 8));
    }
    const double one = median(ofOne);
    const double eight = median(ofEight);
    std::printf("| %s | %.0f | %.0f | %.2f | %.1f%s |\n", row.name, one, eight, eight / one, limit,
                eight >= limit * one ? "" : " **missed**");
    return eight >= limit * one;
}

}  // namespace

int main(int count, char** arguments) try {
    if (count != 2) throw std::invalid_argument("usage: korva_endpoint_speed CMPIHOST-SERVE");
    const std::string program = arguments[1];
    Inside inside(std::filesystem::path(program).parent_path());
    const EndpointProcess endpoint(program, {}, EndpointProcess::Host::Machine);
    compareTimes("processors that may sleep", endpoint, inside);
    const AwakeProcessors processors;
    if (!processors.awake())
        std::puts("The processors cannot be kept awake; what follows tells less.\n");
    bool hold = compareTimes("processors kept awake", endpoint, inside);
    std::puts(
        "| processors kept awake | 1 connection (1/s) | 8 connections | ratio | at least |\n"
        "|---|--:|--:|--:|--:|");
    for (const Row& row : rows) hold = compareThroughput(row, endpoint) && hold;
    return hold ? 0 : 1;
} catch (const std::exception& failure) {
    std::cerr << failure.what() << "\n";
    return 2;
}
