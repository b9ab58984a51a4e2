#include "Kernel.h"

#include <sys/resource.h>
#include <sys/utsname.h>

#include <ctime>

namespace VA::Linux {

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

std::optional<std::int64_t> Kernel::bootTime() const {
    struct timespec now {};
    struct timespec sinceBoot {};
    if (::clock_gettime(CLOCK_REALTIME, &now) != 0) return std::nullopt;
    if (::clock_gettime(CLOCK_BOOTTIME, &sinceBoot) != 0) return std::nullopt;
    // Cut to whole seconds as the kernel cuts its own boot time.
    const std::int64_t borrowed = now.tv_nsec < sinceBoot.tv_nsec ? 1 : 0;
    return now.tv_sec - sinceBoot.tv_sec - borrowed;
}

std::optional<std::uint64_t> Kernel::addressSpaceLimit() const {
    struct rlimit limit;
    static_assert(sizeof limit.rlim_cur == 8, "a limit is 64-bit in either word size");
    if (::getrlimit(RLIMIT_AS, &limit) != 0) return std::nullopt;
    return limit.rlim_cur == RLIM_INFINITY ? unlimited : limit.rlim_cur;
}

}  // namespace VA::Linux
