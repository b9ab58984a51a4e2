#include "Snapshot.h"

#include <algorithm>
#include <ctime>
#include <utility>

#include "Assignments.h"
#include "BootTime.h"
#include "CivilDate.h"
#include "InstallDate.h"
#include "Numbers.h"
#include "PlainText.h"
#include "Users.h"

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

Snapshot::Snapshot(HostParts parts) : parts_(std::move(parts)) {}

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

const Snapshot::OsRelease& Snapshot::osRelease() {
    return osRelease_.value([this] { return readOsRelease(); });
}

const std::optional<KernelNames>& Snapshot::kernelNames() {
    return kernelNames_.value([this] { return parts_.kernel->names(); });
}

// The first file that can be opened is the only one that counts, whatever it lacks.
Snapshot::OsRelease Snapshot::readOsRelease() const {
    auto file = parts_.files->read("etc/os-release");
    if (!file) file = parts_.files->read("usr/lib/os-release");
    if (!file) return {};
    return {plain(assignedValue(file->text, "NAME")),
            plain(assignedValue(file->text, "VERSION_ID")),
            plain(assignedValue(file->text, "BUILD_ID"))};
}

// Dates

std::optional<std::string> Snapshot::installDate() {
    return dateText(installInstant());
}

std::optional<std::string> Snapshot::lastBootUpTime() {
    return dateText(bootInstant());
}

std::optional<std::int64_t> Snapshot::bootInstant() {
    return bootInstant_.value([this] { return readBootInstant(); });
}

std::optional<std::int64_t> Snapshot::installInstant() {
    return installInstant_.value([this] { return findInstallInstant(); });
}

std::optional<std::int64_t> Snapshot::readBootInstant() const {
    const auto text = parts_.files->text("proc/stat");
    const auto boot = text ? parseBootTime(*text) : std::nullopt;
    return boot ? boot : parts_.kernel->bootTime();
}

std::optional<std::int64_t> Snapshot::findInstallInstant() {
    const auto boot = bootInstant();
    const auto now = parts_.kernel->now();
    const auto root = parts_.files->dates("");
    if (root && root->birth && isPlausibleInstallDate(*root->birth, boot, now)) return root->birth;
    for (const char* path : {"var/log/installer", "etc/machine-id"}) {
        const auto dates = parts_.files->dates(path);
        if (dates && isPlausibleInstallDate(dates->change, boot, now)) return dates->change;
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
    if (!processList()) return std::nullopt;
    return processList()->count();
}

std::optional<unsigned int> Snapshot::users() {
    return users_.value([this] { return countUsers(); });
}

const std::optional<Processes>& Snapshot::processList() {
    return processList_.value([this] {
        const auto names = parts_.files->names("proc");
        return names ? Processes::among(*names) : std::nullopt;
    });
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

std::optional<unsigned int> Snapshot::countUsers() {
    if (const auto sessions = countSessions()) return sessions;
    for (const char* path : {"run/utmp", "var/run/utmp"}) {
        const auto text = parts_.files->text(path);
        if (!text) continue;
        const auto& listed = processList();
        const auto users = countUtmpUsers(
            *text, [&](std::uint64_t pid) { return !listed || listed->contains(pid); });
        if (users) return users;
    }
    return std::nullopt;
}

std::optional<unsigned int> Snapshot::countSessions() const {
    const std::string folder = "run/systemd/sessions";
    const auto names = parts_.files->names(folder);
    if (!names) return std::nullopt;
    unsigned int count = 0;
    for (const std::string& name : *names) {
        if (name.front() == '.') continue;  // a session file that is being written
        const auto text = parts_.files->text(folder + '/' + name);
        if (text && isUserSession(*text)) ++count;
    }
    return count;
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
    if (!parts_.files->isFolder("run/systemd/system")) return nodeStatusOf("running");
    const auto state = parts_.systemManager->systemState();
    return state ? nodeStatusOf(*state) : 0;
}

}  // namespace VA::Linux
