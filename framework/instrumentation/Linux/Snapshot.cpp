#include "Snapshot.h"

#include <algorithm>
#include <ctime>
#include <utility>

#include "CivilDate.h"
#include "InstallDate.h"
#include "Numbers.h"
#include "PlainText.h"

namespace VA::Linux {

namespace {

constexpr unsigned int linuxOsType = 35;

std::optional<std::string> plain(std::optional<std::string> text) {
    return text && isPlainText(*text) ? std::move(text) : std::nullopt;
}

std::optional<std::string> dateText(std::optional<std::int64_t> instant) {
    return instant ? zonedDateText(*instant, ::timezone) : std::nullopt;
}

std::optional<unsigned int> sum(std::optional<std::uint32_t> first,
                                std::optional<std::uint32_t> second) {
    if (!first || !second) return std::nullopt;
    return saturatedSum(*first, *second);
}

}  // namespace

Snapshot::Snapshot(const HostParts& parts) : parts_(parts) {}

// Names and versions

std::optional<std::string> Snapshot::computerName() {
    return kernelNames() ? plain(kernelNames()->node) : std::nullopt;
}

std::optional<std::string> Snapshot::name() {
    if (osRelease().name) return osRelease().name;
    return kernelNames() ? plain(kernelNames()->system) : std::nullopt;
}

std::optional<std::string> Snapshot::version() {
    if (osRelease().versionId) return osRelease().versionId;
    if (osRelease().buildId) return osRelease().buildId;
    return kernelNames() ? plain(kernelNames()->release) : std::nullopt;
}

const OsRelease& Snapshot::osRelease() {
    return *osRelease_.value([this] {
        return parts_.kept->osRelease.value(*parts_.files, *parts_.kernel, readOsRelease);
    });
}

const std::optional<KernelNames>& Snapshot::kernelNames() {
    return kernelNames_.value([this] { return parts_.kernel->names(); });
}

// Dates

std::optional<std::string> Snapshot::installDate() {
    return dateText(installInstant());
}

std::optional<std::string> Snapshot::lastBootUpTime() {
    return dateText(bootInstant());
}

std::optional<std::int64_t> Snapshot::bootInstant() {
    return bootInstant_.value(
        [this] { return parts_.kept->bootTime.read(*parts_.files, *parts_.kernel); });
}

std::optional<std::int64_t> Snapshot::installInstant() {
    return installInstant_.value([this] { return findInstallInstant(); });
}

std::optional<std::int64_t> Snapshot::findInstallInstant() {
    const auto boot = bootInstant();
    const auto now = parts_.kernel->now();
    const auto root = parts_.files->state("");
    if (root && root->birth && isPlausibleInstallDate(*root->birth, boot, now)) return root->birth;
    for (const char* path : {"var/log/installer", "etc/machine-id"}) {
        const auto file = parts_.files->state(path);
        if (!file) continue;
        const auto changed = file->changed.seconds;
        if (isPlausibleInstallDate(changed, boot, now)) return changed;
    }
    return std::nullopt;
}

// Processes and users

std::optional<unsigned int> Snapshot::maxProcesses() {
    return maxProcesses_.value([this] { return readMaxProcesses(); });
}

std::optional<unsigned int> Snapshot::maxProcessMemoryKiB() {
    return maxProcessMemoryKiB_.value([this] { return readMaxProcessMemoryKiB(); });
}

std::optional<unsigned int> Snapshot::processes() {
    return processes_.value([this] { return countProcesses(); });
}

std::optional<unsigned int> Snapshot::users() {
    return users_.value([this] { return countUsers(); });
}

std::optional<unsigned int> Snapshot::readMaxProcesses() const {
    std::optional<std::uint64_t> least;
    for (const char* path : {"proc/sys/kernel/pid_max", "proc/sys/kernel/threads-max"}) {
        const auto text = parts_.files->text(path);
        const auto limit = text ? parseNumberFile(*text) : std::nullopt;
        if (limit) least = least ? std::min(*least, *limit) : limit;
    }
    if (!least) return std::nullopt;
    return saturated(*least);
}

std::optional<unsigned int> Snapshot::readMaxProcessMemoryKiB() const {
    const auto bytes = parts_.kernel->addressSpaceLimit();
    if (!bytes) return std::nullopt;
    if (*bytes == Kernel::unlimited) return 0;
    return std::max(1u, saturated(*bytes / 1024));  // 0 would mean that there is no limit
}

// A host has at least the process that asks: a proc that lists none is not that of this host.
std::optional<unsigned int> Snapshot::countProcesses() const {
    std::uint64_t count = 0;
    const auto listed = parts_.files->forEachName("proc", [&](std::string_view name) {
        if (isAllDigits(name)) ++count;
    });
    if (!listed || count == 0) return std::nullopt;
    return saturated(count);
}

std::optional<unsigned int> Snapshot::countUsers() const {
    const auto sessions =
        parts_.kept->userSessions.value(*parts_.files, *parts_.kernel, countUserSessions);
    if (sessions->listed) return sessions->number;
    const auto users = countUtmpUsers("run/utmp");
    return users ? users : countUtmpUsers("var/run/utmp");
}

std::optional<unsigned int> Snapshot::countUtmpUsers(const char* path) const {
    const auto file = SourceFiles(*parts_.files, parts_.kernel->now()).read(path);
    if (!file || !file->whole) return std::nullopt;
    return Linux::countUtmpUsers(file->text,
                                 [this](std::int32_t pid) { return parts_.kernel->isAlive(pid); });
}

// Memory

const std::optional<MemoryInfo>& Snapshot::memory() {
    return memory_.value([this] {
        const auto text = parts_.files->text("proc/meminfo");
        return text ? parseMemoryInfo(*text) : std::nullopt;
    });
}

std::optional<unsigned int> Snapshot::totalVirtualKiB() {
    return sum(totalPhysicalKiB(), totalSwapKiB());
}

std::optional<unsigned int> Snapshot::freeVirtualKiB() {
    return sum(freePhysicalKiB(), freeSwapKiB());
}

std::optional<unsigned int> Snapshot::totalPhysicalKiB() {
    if (!memory()) return std::nullopt;
    return memory()->totalKiB;
}

std::optional<unsigned int> Snapshot::freePhysicalKiB() {
    return memory() ? memory()->availableKiB : std::nullopt;
}

std::optional<unsigned int> Snapshot::totalSwapKiB() {
    return memory() ? memory()->swapTotalKiB : std::nullopt;
}

std::optional<unsigned int> Snapshot::freeSwapKiB() {
    return memory() ? memory()->swapFreeKiB : std::nullopt;
}

// What every Linux host has in common

std::optional<unsigned int> Snapshot::osType() {
    return linuxOsType;
}

std::optional<unsigned int> Snapshot::licensedUsers() {
    return 0;
}

std::optional<bool> Snapshot::distributed() {
    return false;
}

// State

unsigned int Snapshot::nodeStatus() {
    return nodeStatus_.value([this] { return askNodeStatus(); });
}

unsigned int Snapshot::askNodeStatus() const {
    // Where no systemd runs nobody knows better than this code, which is running.
    const auto folder = parts_.files->state("run/systemd/system");
    if (!folder || folder->kind != FileState::Kind::Folder) return nodeStatusOf("running");
    const auto state = parts_.systemManager->systemState();
    return state ? nodeStatusOf(*state) : 0;
}

}  // namespace VA::Linux
