// Google Benchmark repeats and interleaves; a report wants one figure for each name.
#include "bench/Figures.h"

#include <algorithm>
#include <fstream>
#include <iterator>
#include <nlohmann/json.hpp>
#include <stdexcept>

namespace bench {

namespace {

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

}  // namespace

Figures::Figures(const std::vector<std::string>& files) {
    for (const std::string& file : files) add(file);
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

std::map<std::string, double> readInstructions(const std::string& file) {
    std::ifstream stream = opened(file);
    std::map<std::string, double> instructions;
    std::string name;
    double number = 0;
    while (std::getline(stream, name, '\t') && stream >> number >> std::ws)
        instructions[name] = number;
    return instructions;
}

}  // namespace bench
