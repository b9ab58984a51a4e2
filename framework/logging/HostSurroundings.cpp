#include <syslog.h>

#include <cstdlib>

#include "Surroundings.h"

namespace ZBLog {

ConfigurationSource configurationSourceFrom(const char* variable) {
    if (variable == nullptr) return {"/etc/zblog.conf", false};
    return {variable, true};
}

std::uint32_t HostSurroundings::milliseconds() noexcept {
    timespec now{};
    ::clock_gettime(CLOCK_MONOTONIC_COARSE, &now);
    return static_cast<std::uint32_t>(now.tv_sec) * 1000u +
           static_cast<std::uint32_t>(now.tv_nsec / 1000000);
}

timespec HostSurroundings::utc() noexcept {
    timespec now{};
    ::clock_gettime(CLOCK_REALTIME, &now);
    return now;
}

void HostSurroundings::writeSystemLog(int priority, const char* text) noexcept {
    ::syslog(priority, "%s", text);
}

ConfigurationSource HostSurroundings::configurationSource() {
    return configurationSourceFrom(::secure_getenv("ZBLOG_CONF"));
}

}  // namespace ZBLog
