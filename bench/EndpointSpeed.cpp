// What the endpoint costs beyond the broker: the same requests over a kept connection and inside
// this process, in turns, on this machine's host, and how much several connections get at once.
// korva_endpoint_speed CMPIHOST-SERVE: exit status 0 when the limits hold, 1 when one is missed, 2
// for failures.
#include <arpa/inet.h>
#include <sched.h>
#include <sys/socket.h>

#include <algorithm>
#include <atomic>
#include <chrono>
#include <cstdio>
#include <iostream>
#include <memory>
#include <stdexcept>
#include <thread>
#include <vector>

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

/// Keeps this thread, and what it starts meanwhile, on one processor.
class OneProcessor {
  public:
    OneProcessor() {
        sched_getaffinity(0, sizeof before_, &before_);
        cpu_set_t one;
        CPU_ZERO(&one);
        CPU_SET(static_cast<std::size_t>(sched_getcpu()), &one);
        if (sched_setaffinity(0, sizeof one, &one) != 0)
            throw std::runtime_error("cannot stay on one processor");
    }
    ~OneProcessor() { sched_setaffinity(0, sizeof before_, &before_); }
    OneProcessor(const OneProcessor&) = delete;
    OneProcessor& operator=(const OneProcessor&) = delete;

  private:
    cpu_set_t before_{};
};

/// Prints what the endpoint adds when it and its client share a processor, so that the work counts
/// and not the waking of another processor; whether the limits hold.
bool compareOnOneProcessor(const std::string& program, Inside& inside) {
    const OneProcessor here;
    const EndpointProcess endpoint(program, {}, EndpointProcess::Host::Machine);
    std::puts(
        "| on one processor | over a connection (µs) | inside (µs) | difference | limit |\n"
        "|---|--:|--:|--:|--:|");
    bool hold = true;
    for (const Row& row : rows) {
        const Times times = timesOf(row, endpoint.port(), inside);
        const double difference = times.over - times.inside;
        const bool holds = difference <= row.limit;
        std::printf("| %s | %.1f | %.1f | %.1f | %.0f%s |\n", row.name, times.over, times.inside,
                    difference, row.limit, holds ? "" : " **missed**");
        hold = hold && holds;
    }
    return hold;
}

/// Answers each request on one connection with the same bytes, without looking at it.
class Echo {
  public:
    explicit Echo(std::string answer)
        : answer_(std::move(answer)), listener_(::socket(AF_INET, SOCK_STREAM | SOCK_CLOEXEC, 0)) {
        if (::listen(listener_.number(), 1) != 0) throw std::runtime_error("cannot listen");
        thread_ = std::thread([this] { serve(); });
    }
    /// Once its client is gone.
    ~Echo() { thread_.join(); }
    Echo(const Echo&) = delete;
    Echo& operator=(const Echo&) = delete;

    std::uint16_t port() const {
        sockaddr_in address{};
        socklen_t size = sizeof address;
        ::getsockname(listener_.number(), reinterpret_cast<sockaddr*>(&address), &size);
        return ntohs(address.sin_port);
    }

  private:
    void serve() const {
        const base::FileDescriptor connection(::accept(listener_.number(), nullptr, nullptr));
        std::string request(65536, '\0');
        while (::recv(connection.number(), request.data(), request.size(), 0) > 0)
            ::send(connection.number(), answer_.data(), answer_.size(), MSG_NOSIGNAL);
    }

    const std::string answer_;
    const base::FileDescriptor listener_;
    std::thread thread_;
};

double echoTime(const std::string& request, const std::string& body) {
    const Echo echo("HTTP/1.1 200 OK\r\nContent-Length: " + std::to_string(body.size()) +
                    "\r\n\r\n" + body);
    KeptConnection connection(echo.port());
    std::vector<double> times;
    for (int count = 0; count < blocks * requestsOfABlock; ++count)
        measure(times, [&] { askOver(connection, request); });
    return median(times);
}

/// Prints the same for processes that run where the system puts them, beside what the exchange of
/// as many bytes takes alone.
void compareAnywhere(const EndpointProcess& endpoint, Inside& inside) {
    std::puts(
        "\n| anywhere | over a connection (µs) | inside (µs) | difference | bytes alone (µs) |\n"
        "|---|--:|--:|--:|--:|");
    for (const Row& row : rows) {
        const Times times = timesOf(row, endpoint.port(), inside);
        const std::string request = requestOf(row);
        const std::string body(KeptConnection(endpoint.port()).ask(request));
        std::printf("| %s | %.1f | %.1f | %.1f | %.1f |\n", row.name, times.over, times.inside,
                    times.over - times.inside, echoTime(request, body));
    }
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
    bool hold = compareOnOneProcessor(program, inside);
    const EndpointProcess endpoint(program, {}, EndpointProcess::Host::Machine);
    compareAnywhere(endpoint, inside);
    std::puts(
        "\n| anywhere | 1 connection (1/s) | 8 connections | ratio | at least |\n"
        "|---|--:|--:|--:|--:|");
    for (const Row& row : rows) hold = compareThroughput(row, endpoint) && hold;
    return hold ? 0 : 1;
} catch (const std::exception& failure) {
    std::cerr << failure.what() << "\n";
    return 2;
}
