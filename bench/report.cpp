// Writes the figures of a run, as Google Benchmark and callgrind leave them, as Markdown:
// korva_bench_report INSTRUCTIONS.txt TIMES.json... [--before TIMES.json...]

#include <algorithm>
#include <cstdio>
#include <exception>
#include <fstream>
#include <iostream>
#include <iterator>
#include <map>
#include <nlohmann/json.hpp>
#include <stdexcept>
#include <string>
#include <string_view>
#include <vector>

namespace {

/// One benchmark: the quickest of its repetitions, and what was counted beside.
struct Figure {
    double nanoseconds = 0;
    std::map<std::string, double> counts{};
};

/// Benchmarks by name, in the order of the list.
class Figures {
  public:
    /// Reads files of Google Benchmark's JSON, as repetitions of one run; throws
    /// std::runtime_error.
    explicit Figures(const std::vector<std::string>& files) {
        for (const std::string& file : files) add(file);
    }

    const std::vector<std::string>& names() const noexcept { return names_; }
    bool has(const std::string& name) const { return figures_.count(name) != 0; }
    /// The benchmark of that name, which must be there.
    const Figure& at(const std::string& name) const { return figures_.at(name); }
    const std::string& machine() const noexcept { return machine_; }

  private:
    void add(const std::string& file);

    std::vector<std::string> names_;
    std::map<std::string, Figure> figures_;
    std::string machine_;
};

std::ifstream opened(const std::string& file) {
    std::ifstream stream(file);
    if (!stream) throw std::runtime_error("cannot read " + file);
    return stream;
}

// Deviations of counts that are always 0 are written as NaN, which is no JSON.
std::string withoutNaN(std::istream& stream) {
    std::string text(std::istreambuf_iterator<char>(stream), {});
    const std::string nan = ": NaN";
    for (std::size_t place = text.find(nan); place != std::string::npos; place = text.find(nan))
        text.replace(place, nan.size(), ": null");
    return text;
}

std::string describe(const nlohmann::json& context) {
    return std::to_string(context.at("num_cpus").get<int>()) + " processors of " +
           std::to_string(context.at("mhz_per_cpu").get<int>()) + " MHz";
}

void Figures::add(const std::string& file) {
    std::ifstream stream = opened(file);
    const nlohmann::json all = nlohmann::json::parse(withoutNaN(stream));
    machine_ = describe(all.at("context"));
    // Repetitions that alternate leave the benchmarks in no order; the index is that of the list.
    std::multimap<int, std::string> places;
    for (const nlohmann::json& each : all.at("benchmarks")) {
        if (each.at("run_type") != "iteration") continue;
        const auto name = each.at("run_name").get<std::string>();
        const auto time = each.at("cpu_time").get<double>();
        const auto [place, isNew] = figures_.try_emplace(name, Figure{time});
        if (isNew) places.emplace(each.at("family_index").get<int>(), name);
        Figure& figure = place->second;
        figure.nanoseconds = std::min(figure.nanoseconds, time);
        for (const char* count : {"allocations", "opened", "peakBytes", "systemCalls"})
            if (each.contains(count)) figure.counts[count] = each.at(count).get<double>();
    }
    for (const auto& [place, name] : places) names_.push_back(name);
}

/// Instructions a request by name ("EnumerateInstances KORVA_RunningOS/baseline"): lines of the
/// name, a tab and the number. Throws std::runtime_error.
std::map<std::string, double> readInstructions(const std::string& file) {
    std::ifstream stream = opened(file);
    std::map<std::string, double> instructions;
    std::string name;
    double number = 0;
    while (std::getline(stream, name, '\t') && stream >> number >> std::ws)
        instructions[name] = number;
    return instructions;
}

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

/// The highest ratio to the baseline that a request is to have, 0 for none.
double limitOf(const std::string& request) {
    if (request == "EnumerateInstances KORVA_OperatingSystem" ||
        request == "GetInstance KORVA_OperatingSystem")
        return 2;
    return 0;
}

/// Limits, and which of them hold.
class Verdict {
  public:
    /// A cell: the limit, in bold when it is passed.
    std::string cell(double value, double limit, int digits = 1) {
        if (limit == 0) return "";
        ++limits_;
        const bool holds = value <= limit;
        if (holds) ++held_;
        return holds ? fixed(limit, digits) : "**" + fixed(limit, digits) + " missed**";
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

const Figure& figureOf(const Figures& figures, const std::string& group, const std::string& request,
                       unsigned nodes, const char* who) {
    return figures.at(group + request + "/" + std::to_string(nodes) + "/" + who);
}

/// What a request on the machine's own host is to keep to.
struct HostLimit {
    const char* request;
    double ratio;  ///< to the state before
    double systemCalls;
};

constexpr HostLimit hostLimits[] = {
    {"EnumerateInstances KORVA_OperatingSystem", 0.75, 30},
    {"EnumerateInstanceNames KORVA_OperatingSystem", 2.0 / 3, 2},
};

void printHostRequests(const Figures& figures, const Figures& before, Verdict& verdict) {
    std::cout << "## Requests on this machine's Linux host\n\nThe provider, with the host source "
                 "as it is now and, in the same run, as it was before. System calls are those of a "
                 "request that is not the first.\n\n"
                 "| request | time (µs) | before | ratio | limit | system calls | before | limit "
                 "|\n|---|--:|--:|--:|--:|--:|--:|--:|\n";
    const auto calls = [](const Figure& figure) {
        const auto found = figure.counts.find("systemCalls");
        return found == figure.counts.end() ? -1 : found->second;
    };
    const auto cell = [&](const Figure& figure) {
        return calls(figure) < 0 ? "" : fixed(calls(figure), 0);
    };
    for (const HostLimit& row : hostLimits) {
        const std::string name = std::string("host/") + row.request + ", provider";
        const Figure& now = figures.at(name);
        std::cout << "| " << row.request << " | " << microseconds(now.nanoseconds) << " | ";
        const bool compared = before.has(name);
        if (compared) {
            const double ratio = now.nanoseconds / before.at(name).nanoseconds;
            std::cout << microseconds(before.at(name).nanoseconds) << " | " << fixed(ratio, 2)
                      << " | " << verdict.cell(ratio, row.ratio, 2);
        } else {
            std::cout << " | | ";
        }
        std::cout << " | " << cell(now) << " | " << (compared ? cell(before.at(name)) : "") << " | "
                  << (calls(now) < 0 ? "" : verdict.cell(calls(now), row.systemCalls, 0)) << " |\n";
    }
}

void printRequests(const Figures& figures, const std::map<std::string, double>& instructions,
                   Verdict& verdict) {
    std::cout
        << "\n## Requests on a simulated host\n\nOne node. Times in microseconds, "
           "instructions in thousands.\n\n"
           "| request | time | baseline | ratio | limit | instructions | baseline | ratio | "
           "allocations | baseline | opened |\n|---|--:|--:|--:|--:|--:|--:|--:|--:|--:|--:|\n";
    for (const std::string& request : requestsOf(figures, "request/")) {
        const Figure& ours = figureOf(figures, "request/", request, 1, "provider");
        const Figure& baseline = figureOf(figures, "request/", request, 1, "baseline");
        const double ratio = ours.nanoseconds / baseline.nanoseconds;
        const double ourWork = instructions.at(request + "/provider");
        const double baselineWork = instructions.at(request + "/baseline");
        std::cout << "| " << request << " | " << microseconds(ours.nanoseconds) << " | "
                  << microseconds(baseline.nanoseconds) << " | " << fixed(ratio, 2) << " | "
                  << verdict.cell(ratio, limitOf(request)) << " | " << fixed(ourWork / 1000, 1)
                  << " | " << fixed(baselineWork / 1000, 1) << " | "
                  << fixed(ourWork / baselineWork, 2) << " | " << ours.counts.at("allocations")
                  << " | " << baseline.counts.at("allocations") << " | " << ours.counts.at("opened")
                  << " |\n";
    }
}

/// How much longer than the provider's own the facade's answer may take, in nanoseconds.
constexpr double mostOfFacade = 5000;

void printFacade(const Figures& figures, Verdict& verdict) {
    std::cout << "\n## The facade\n\nOne node of a simulated host. Times in microseconds.\n\n"
                 "| request | facade | provider | beyond | limit |\n|---|--:|--:|--:|--:|\n";
    for (const std::string& request : requestsOf(figures, "facade/")) {
        const double facade = figureOf(figures, "facade/", request, 1, "facade").nanoseconds;
        const double provider = figureOf(figures, "facade/", request, 1, "provider").nanoseconds;
        std::cout << "| " << request << " | " << microseconds(facade) << " | "
                  << microseconds(provider) << " | " << microseconds(facade - provider) << " | "
                  << verdict.cell((facade - provider) / 1000, mostOfFacade / 1000) << " |\n";
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
           "request has in use at its peak beyond what the baseline has, in bytes a node.\n\n"
           "| request | nodes | a node | to the first | limit | baseline | to the first | memory "
           "|\n|---|--:|--:|--:|--:|--:|--:|--:|\n";
    for (const std::string& request : requestsOf(figures, "nodes/")) {
        const double first = costOfNode(figures, request, "provider", 1);
        const double baselineFirst = costOfNode(figures, request, "baseline", 1);
        for (const unsigned nodes : {1U, 10U, 1000U, 100000U}) {
            const double ours = costOfNode(figures, request, "provider", nodes);
            const double baseline = costOfNode(figures, request, "baseline", nodes);
            const auto peak = [&](const char* who) {
                return figureOf(figures, "nodes/", request, nodes, who).counts.at("peakBytes");
            };
            std::cout << "| " << request << " | " << nodes << " | " << microseconds(ours) << " | "
                      << fixed(ours / first, 2) << " | "
                      << (nodes == 1 ? "" : verdict.cell(ours / first, 1.2)) << " | "
                      << microseconds(baseline) << " | " << fixed(baseline / baselineFirst, 2)
                      << " | " << fixed((peak("provider") - peak("baseline")) / nodes, 0) << " |\n";
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

/// How long reading a whole CIM schema may take, in microseconds.
constexpr double mostOfSchema = 120000;

void printSchema(const Figures& figures, Verdict& verdict) {
    printGroup(figures, "A schema of 1 442 classes", "schema/", "allocations");
    const double read = figures.at("schema/read").nanoseconds / 1000;
    std::cout << "\nReading is to take at most " << verdict.cell(read, mostOfSchema, 0) << " µs.\n";
}

}  // namespace

int main(int argc, char** argv) try {
    const std::vector<std::string> arguments(argv + 1, argv + argc);
    const auto before = std::find(arguments.begin(), arguments.end(), "--before");
    if (before - arguments.begin() < 2) {
        std::cerr << "usage: korva_bench_report INSTRUCTIONS.txt TIMES.json... "
                     "[--before TIMES.json...]\n";
        return 2;
    }
    const Figures figures({arguments.begin() + 1, before});
    const Figures figuresBefore({before == arguments.end() ? before : before + 1, arguments.end()});
    const std::map<std::string, double> instructions = readInstructions(arguments[0]);
    std::cout << "# Benchmark figures\n\nWritten by `bench/run`; [benchmarks.md](benchmarks.md) "
                 "says what is measured and how. Processor time, the quickest of several "
                 "repetitions, on "
              << figures.machine() << ".\n\n";
    Verdict verdict;
    printHostRequests(figures, figuresBefore, verdict);
    printRequests(figures, instructions, verdict);
    printNodes(figures, verdict);
    printFacade(figures, verdict);
    printGroup(figures, "The parts of the Linux host", "host/snapshot: ", "opened");
    printGroup(figures, "A record", "logging/", "allocations");
    printSchema(figures, verdict);
    verdict.print();
    return 0;
} catch (const std::exception& caught) {
    std::cerr << "korva_bench_report: " << caught.what() << '\n';
    return 1;
}
