#include "Configuration.h"

namespace ZBLog {

namespace {

bool matches(std::string_view pattern, std::string_view category) {
    if (pattern.empty() || pattern.back() != '*') return category == pattern;
    pattern.remove_suffix(1);
    return category.substr(0, pattern.size()) == pattern;
}

}  // namespace

void CategoryFilter::add(std::string_view pattern) {
    patterns_.emplace_back(pattern);
}

bool CategoryFilter::passes(std::string_view category) const noexcept {
    if (patterns_.empty()) return true;
    for (const std::string& pattern : patterns_) {
        if (matches(pattern, category)) return true;
    }
    return false;
}

Configuration::Configuration() {
    ChannelConfiguration& log = of(Channel::log);
    log.destination = Destination::systemLog;
    log.level = 3000;
    log.failuresOnly = true;
}

}  // namespace ZBLog
