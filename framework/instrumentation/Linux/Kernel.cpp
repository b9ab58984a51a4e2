// Values of the kernel are read as texts of proc where there is no call that gives them; sysinfo,
// for one, knows nothing of the memory that caches would give back, and counts threads.
#include "Kernel.h"

#include <signal.h>
#include <sys/resource.h>
#include <sys/utsname.h>

#include <algorithm>
#include <cerrno>
#include <ctime>

#include "Files.h"
#include "Parsing.h"

namespace VA::Linux {

namespace {

constexpr std::int64_t nanosecondsPerSecond = 1000000000;

std::int64_t nanoseconds(const struct timespec& time) {
    return time.tv_sec * nanosecondsPerSecond + time.tv_nsec;
}

struct Field {
    bool present = false;
    std::optional<std::uint32_t> kiB;  // nullopt if the line is malformed
};

struct Fields {
    Field total, free, available, buffers, cached, swapTotal, swapFree;
};

struct Row {
    std::string_view name;
    Field Fields::*field;
};

constexpr Row rows[] = {
    {"MemTotal", &Fields::total},         {"MemFree", &Fields::free},
    {"MemAvailable", &Fields::available}, {"Buffers", &Fields::buffers},
    {"Cached", &Fields::cached},          {"SwapTotal", &Fields::swapTotal},
    {"SwapFree", &Fields::swapFree},
};

// "   1024 kB": the unit shows that the number is whole.
std::optional<std::uint32_t> parseKiB(std::string_view text) {
    constexpr std::string_view unit = " kB";
    text.remove_prefix(std::min(text.find_first_not_of(' '), text.size()));
    if (text.size() < unit.size()) return std::nullopt;
    const auto digits = text.size() - unit.size();
    if (text.substr(digits) != unit) return std::nullopt;
    const auto value = parseDecimal(text.substr(0, digits));
    if (!value) return std::nullopt;
    return clampToUint32(*value);
}

Fields parseFields(std::string_view meminfo) {
    Fields fields;
    forEachLine(meminfo, [&](std::string_view line, bool) {
        const auto colon = line.find(':');
        if (colon == std::string_view::npos) return;
        for (const Row& row : rows) {
            Field& field = fields.*row.field;
            if (field.present || row.name != line.substr(0, colon)) continue;
            field = {true, parseKiB(line.substr(colon + 1))};
        }
    });
    return fields;
}

std::optional<std::uint32_t> availableKiB(const Fields& fields) {
    if (fields.available.kiB) return fields.available.kiB;
    if (!fields.free.kiB || !fields.buffers.kiB || !fields.cached.kiB) return std::nullopt;
    return clampedSum(clampedSum(*fields.free.kiB, *fields.buffers.kiB), *fields.cached.kiB);
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

std::optional<MemoryInfo> parseMemoryInfo(std::string_view meminfo) {
    const Fields fields = parseFields(meminfo);
    if (!fields.total.kiB) return std::nullopt;
    MemoryInfo info;
    info.totalKiB = fields.total.kiB;
    info.availableKiB = availableKiB(fields);
    info.swapTotalKiB = fields.swapTotal.present ? fields.swapTotal.kiB : 0;
    info.swapFreeKiB = info.swapTotalKiB == 0u ? 0 : fields.swapFree.kiB;
    return info;
}

std::optional<std::uint64_t> parseNumberFile(std::string_view text) {
    // Without its newline the number was cut short.
    if (text.empty() || text.back() != '\n') return std::nullopt;
    const auto value = parseDecimal(text.substr(0, text.size() - 1));
    return value && *value > 0 ? value : std::nullopt;
}

std::optional<MemoryInfo> readMemoryInfo(const HostFiles& files) {
    const auto text = files.text("proc/meminfo");
    return text ? parseMemoryInfo(*text) : std::nullopt;
}

std::optional<std::uint32_t> readMaxProcesses(const HostFiles& files) {
    std::optional<std::uint64_t> least;
    for (const char* path : {"proc/sys/kernel/pid_max", "proc/sys/kernel/threads-max"}) {
        const auto text = files.text(path);
        const auto limit = text ? parseNumberFile(*text) : std::nullopt;
        if (limit) least = least ? std::min(*least, *limit) : limit;
    }
    if (!least) return std::nullopt;
    return clampToUint32(*least);
}

// A host has at least the process that asks: a proc that lists none is not that of this host.
std::optional<std::uint32_t> countProcesses(const HostFiles& files) {
    std::uint64_t count = 0;
    const auto listed = files.forEachName("proc", [&](std::string_view name) {
        if (isAllDigits(name)) ++count;
    });
    if (!listed || count == 0) return std::nullopt;
    return clampToUint32(count);
}

std::optional<std::uint32_t> maxProcessMemoryKiB(const Kernel& kernel) {
    const auto bytes = kernel.addressSpaceLimit();
    if (!bytes) return std::nullopt;
    if (*bytes == Kernel::unlimited) return 0;
    return std::max(1u, clampToUint32(*bytes / 1024));  // 0 would mean that there is no limit
}

}  // namespace VA::Linux
