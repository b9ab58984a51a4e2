// Writes the figures of a run as Markdown: korva_bench_report TIMES.json INSTRUCTIONS.txt

#include "bench/Figures.h"

#include <cstdio>
#include <exception>
#include <iostream>
#include <string>
#include <string_view>
#include <vector>

namespace {

using bench::Figures;

bool beginsWith(std::string_view text, std::string_view beginning) {
    return text.substr(0, beginning.size()) == beginning;
}

bool endsWith(std::string_view text, std::string_view end) {
    return text.size() >= end.size() && text.substr(text.size() - end.size()) == end;
}

std::string fixed(double number, int digits) {
    char text[64];
    std::snprintf(text, sizeof text, "%.*f", digits, number);
    return text;
}

std::string microseconds(double nanoseconds) {
    return fixed(nanoseconds / 1000, 2);
}

/// The highest ratio to the floor that a request is to have, 0 for none.
double limitOf(const std::string& request) {
    if (request == "EnumerateInstances KORVA_OperatingSystem" ||
        request == "GetInstance KORVA_OperatingSystem")
        return 2;
    if (beginsWith(request, "EnumerateInstanceNames ") || beginsWith(request, "Associators ") ||
        beginsWith(request, "AssociatorNames "))
        return 4;
    return 0;
}

/// Limits, and which of them hold.
class Verdict {
  public:
    /// A cell: the limit, in bold when it is passed.
    std::string cell(double value, double limit) {
        if (limit == 0) return "";
        ++limits_;
        const bool holds = value <= limit;
        if (holds) ++held_;
        return holds ? fixed(limit, 1) : "**" + fixed(limit, 1) + " missed**";
    }
    void print() const { std::cout << "\n" << held_ << " of " << limits_ << " limits hold.\n"; }

  private:
    int limits_ = 0;
    int held_ = 0;
};

/// The requests of a group, in the order of the list.
std::vector<std::string> requestsOf(const Figures& figures, const std::string& group) {
    constexpr std::string_view suffix = "/1/provider";
    std::vector<std::string> requests;
    for (const std::string& name : figures.names())
        if (beginsWith(name, group) && endsWith(name, suffix))
            requests.push_back(
                name.substr(group.size(), name.size() - group.size() - suffix.size()));
    return requests;
}

const bench::Figure& figureOf(const Figures& figures, const std::string& group,
                              const std::string& request, unsigned nodes, const char* who) {
    return figures.at(group + request + "/" + std::to_string(nodes) + "/" + who);
}

void printRequests(const Figures& figures, const std::map<std::string, double>& instructions,
                   Verdict& verdict) {
    std::cout << "## Requests\n\nOne node. Times in microseconds, instructions in thousands.\n\n"
                 "| request | time | floor | ratio | limit | instructions | floor | ratio | "
                 "allocations | floor | opened |\n|---|--:|--:|--:|--:|--:|--:|--:|--:|--:|--:|\n";
    for (const std::string& request : requestsOf(figures, "request/")) {
        const bench::Figure& ours = figureOf(figures, "request/", request, 1, "provider");
        const bench::Figure& floor = figureOf(figures, "request/", request, 1, "floor");
        const double ratio = ours.nanoseconds / floor.nanoseconds;
        const double ourWork = instructions.at(request + "/provider");
        const double floorWork = instructions.at(request + "/floor");
        std::cout << "| " << request << " | " << microseconds(ours.nanoseconds) << " | "
                  << microseconds(floor.nanoseconds) << " | " << fixed(ratio, 2) << " | "
                  << verdict.cell(ratio, limitOf(request)) << " | " << fixed(ourWork / 1000, 1)
                  << " | " << fixed(floorWork / 1000, 1) << " | " << fixed(ourWork / floorWork, 2)
                  << " | " << ours.counts.at("allocations") << " | "
                  << floor.counts.at("allocations") << " | " << ours.counts.at("opened") << " |\n";
    }
}

/// What one more node costs, from the requests with `nodes` nodes and with none.
double costOfNode(const Figures& figures, const std::string& request, const char* who,
                  unsigned nodes) {
    const auto time = [&](unsigned count) {
        return figureOf(figures, "nodes/", request, count, who).nanoseconds;
    };
    return (time(nodes) - time(0)) / nodes;
}

void printNodes(const Figures& figures, Verdict& verdict) {
    std::cout
        << "\n## Nodes\n\nWhat one node costs beyond a request without nodes, in "
           "microseconds, and how that compares with the first node. The memory is what a "
           "request has in use at its peak beyond what the floor has, in bytes a node.\n\n"
           "| request | nodes | a node | to the first | limit | floor | to the first | memory "
           "|\n|---|--:|--:|--:|--:|--:|--:|--:|\n";
    for (const std::string& request : requestsOf(figures, "nodes/")) {
        const double first = costOfNode(figures, request, "provider", 1);
        const double floorFirst = costOfNode(figures, request, "floor", 1);
        for (const unsigned nodes : {1U, 10U, 1000U, 100000U}) {
            const double ours = costOfNode(figures, request, "provider", nodes);
            const double floor = costOfNode(figures, request, "floor", nodes);
            const auto peak = [&](const char* who) {
                return figureOf(figures, "nodes/", request, nodes, who).counts.at("peakBytes");
            };
            std::cout << "| " << request << " | " << nodes << " | " << microseconds(ours) << " | "
                      << fixed(ours / first, 2) << " | "
                      << (nodes == 1 ? "" : verdict.cell(ours / first, 1.2)) << " | "
                      << microseconds(floor) << " | " << fixed(floor / floorFirst, 2) << " | "
                      << fixed((peak("provider") - peak("floor")) / nodes, 0) << " |\n";
        }
    }
}

void printGroup(const Figures& figures, const char* title, const char* group, const char* count) {
    std::cout << "\n## " << title << "\n\n| what | time (µs) | " << count << " |\n|---|--:|--:|\n";
    for (const std::string& name : figures.names()) {
        if (!beginsWith(name, group)) continue;
        // Google Benchmark adds a fixed number of iterations to the name.
        const std::size_t begin = std::string_view(group).size();
        std::cout << "| " << name.substr(begin, name.find("/iterations:") - begin) << " | "
                  << microseconds(figures.at(name).nanoseconds) << " | "
                  << figures.at(name).counts.at(count) << " |\n";
    }
}

}  // namespace

int main(int argc, char** argv) try {
    if (argc != 3) {
        std::cerr << "usage: korva_bench_report TIMES.json INSTRUCTIONS.txt\n";
        return 2;
    }
    const Figures figures(argv[1]);
    const std::map<std::string, double> instructions = bench::readInstructions(argv[2]);
    std::cout << "# Benchmark figures\n\nWritten by `bench/run`; [benchmarks.md](benchmarks.md) "
                 "says what is measured and how. Processor time, the quickest of several "
                 "repetitions, on "
              << figures.machine() << ".\n\n";
    Verdict verdict;
    printRequests(figures, instructions, verdict);
    printNodes(figures, verdict);
    printGroup(figures, "The Linux host", "host/", "opened");
    printGroup(figures, "A record", "logging/", "allocations");
    verdict.print();
    return 0;
} catch (const std::exception& caught) {
    std::cerr << "korva_bench_report: " << caught.what() << '\n';
    return 1;
}
