// A number that is wrong or too small would make a soak pass without measuring: it is refused.
#include "load/SoakOptions.h"

#include <stdexcept>
#include <string>

namespace load {
namespace {

constexpr const char* usage =
    "usage: soak [--requests N] [--settle N] [--per-load N] [--threads N]\n"
    "            [--no-memory] [--report]\n"
    "The requests must fill more loads than those before the first reading (--settle).";

struct NumberOption {
    const char* name;
    unsigned long SoakOptions::*number;
};
constexpr NumberOption numberOptions[] = {
    {"--requests", &SoakOptions::requests},
    {"--settle", &SoakOptions::settle},
    {"--per-load", &SoakOptions::perLoad},
    {"--threads", &SoakOptions::threads},
};

unsigned long number(const char* text) {
    const bool digits = text != nullptr && *text != '\0' &&
                        std::string(text).find_first_not_of("0123456789") == std::string::npos;
    if (!digits) throw std::invalid_argument(usage);
    return std::stoul(text);
}

bool takeNumber(SoakOptions& options, const std::string& name, const char* text) {
    for (const NumberOption& each : numberOptions) {
        if (name != each.name) continue;
        options.*each.number = number(text);
        return true;
    }
    return false;
}

// Requests are sent by whole loads.
unsigned long loads(unsigned long requests, unsigned long perLoad) {
    return requests / perLoad + (requests % perLoad == 0 ? 0 : 1);
}

bool measuresSomething(const SoakOptions& options) {
    if (options.perLoad == 0 || options.threads == 0) return false;
    return loads(options.requests, options.perLoad) > loads(options.settle, options.perLoad);
}

}  // namespace

SoakOptions soakOptions(int count, const char* const* arguments) {
    SoakOptions options;
    for (int at = 1; at < count; ++at) {
        const std::string name = arguments[at];
        if (name == "--report") {
            options.report = true;
        } else if (name == "--no-memory") {
            options.memory = false;
        } else if (takeNumber(options, name, arguments[at + 1])) {
            ++at;
        } else {
            throw std::invalid_argument(usage);
        }
    }
    if (!measuresSomething(options)) throw std::invalid_argument(usage);
    return options;
}

}  // namespace load
