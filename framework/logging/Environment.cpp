// All that tests replace stands behind one interface. The steady clock is the coarse one: almost
// every record asks for the time, to learn that the configuration need not be looked at yet.
#include "Environment.h"

#include <syslog.h>

#include <cstdlib>

namespace ZBLog {

ConfigurationSource configurationSourceFrom(const char* variable) {
    if (variable == nullptr) return {"/etc/zblog.conf", false};
    return {variable, true};
}

std::uint32_t HostEnvironment::milliseconds() noexcept {
    timespec now{};
    ::clock_gettime(CLOCK_MONOTONIC_COARSE, &now);
    return static_cast<std::uint32_t>(now.tv_sec) * 1000u +
           static_cast<std::uint32_t>(now.tv_nsec / 1000000);
}

timespec HostEnvironment::utc() noexcept {
    timespec now{};
    ::clock_gettime(CLOCK_REALTIME, &now);
    return now;
}

void HostEnvironment::writeSystemLog(int priority, const char* text) noexcept {
    ::syslog(priority, "%s", text);
}

ConfigurationSource HostEnvironment::configurationSource() {
    return configurationSourceFrom(::secure_getenv("ZBLOG_CONF"));
}

}  // namespace ZBLog
