#include "Kernel.h"

#include <signal.h>
#include <sys/resource.h>
#include <sys/utsname.h>

#include <cerrno>
#include <ctime>

namespace VA::Linux {

namespace {

constexpr std::int64_t nanosecondsPerSecond = 1000000000;

std::int64_t nanoseconds(const struct timespec& time) {
    return time.tv_sec * nanosecondsPerSecond + time.tv_nsec;
}

}  // namespace

std::optional<KernelNames> Kernel::names() const {
    struct utsname names;
    if (::uname(&names) != 0) return std::nullopt;
    return KernelNames{names.sysname, names.nodename, names.release};
}

std::int64_t Kernel::now() const {
    struct timespec now {};
    ::clock_gettime(CLOCK_REALTIME, &now);
    return now.tv_sec;
}

ClockedBoot Kernel::bootTime() const {
    struct timespec before {};
    struct timespec now {};
    struct timespec after {};
    if (::clock_gettime(CLOCK_BOOTTIME, &before) != 0 ||
        ::clock_gettime(CLOCK_REALTIME, &now) != 0 ||
        ::clock_gettime(CLOCK_BOOTTIME, &after) != 0) {
        return {};
    }
    // Cut to whole seconds as the kernel cuts its own boot time.
    const auto latest = (nanoseconds(now) - nanoseconds(before)) / nanosecondsPerSecond;
    const auto earliest = (nanoseconds(now) - nanoseconds(after)) / nanosecondsPerSecond;
    return {latest, latest == earliest};
}

// Asked of the kernel, not of proc, which may hide the processes of other users.
bool Kernel::isAlive(std::int32_t pid) const {
    return ::kill(pid, 0) == 0 || errno == EPERM;
}

std::optional<std::uint64_t> Kernel::addressSpaceLimit() const {
    struct rlimit limit;
    static_assert(sizeof limit.rlim_cur == 8, "a limit is 64-bit in either word size");
    if (::getrlimit(RLIMIT_AS, &limit) != 0) return std::nullopt;
    return limit.rlim_cur == RLIM_INFINITY ? unlimited : limit.rlim_cur;
}

}  // namespace VA::Linux
