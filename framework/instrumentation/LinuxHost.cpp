// Where each property of the node comes from: a row of the tables at the end names the property and
// its value in the snapshot. What several properties share is read once and kept in the snapshot,
// so that the values of one walk belong together.
#include "LinuxHost.h"

#include <ctime>
#include <optional>
#include <string>
#include <utility>

#include "Linux/Dates.h"
#include "Linux/Parsing.h"
#include "Linux/Sessions.h"

namespace VA {

namespace {

using namespace Linux;
using NodeLexicon::Properties;

using Text = std::optional<std::string>;
using Number = std::optional<unsigned int>;
using Seconds = std::optional<std::int64_t>;

constexpr unsigned int linuxOsType = 35;

// A value that is made when it is first asked for, and kept.
template <class T>
class Lazy {
  public:
    template <class Make>
    const T& value(Make make) {
        if (!value_) value_.emplace(make());
        return *value_;
    }

  private:
    std::optional<T> value_;
};

// The values of os-release that are plain text.
struct OsRelease {
    Text name, versionId, buildId;
};

// Never both files: each describes the system as a whole.
OsRelease readOsRelease(TrackedFiles& files) {
    auto file = files.read("etc/os-release");
    if (!file) file = files.read("usr/lib/os-release");
    if (!file) return {};
    const auto plainValue = [&](const char* name) {
        auto value = envFileValue(file->text, name);
        return value && isPlainText(*value) ? value : std::nullopt;
    };
    return {plainValue("NAME"), plainValue("VERSION_ID"), plainValue("BUILD_ID")};
}

// What is known of a host from one snapshot to the next.
struct HostCache {
    FileCache<OsRelease> osRelease;
    FileCache<SessionCount> sessions;
    BootTime bootTime;
};

Number sum(Number first, Number second) {
    if (!first || !second) return std::nullopt;
    return clampedSum(*first, *second);
}

// The values of one host at one time. Each source behind them is read once, when the first value
// that needs it is asked for. Returns nullopt for what is not known. Must not outlive what it reads
// through.
class Snapshot {
  public:
    Snapshot(const HostParts& parts, HostCache& cache) : parts_(parts), cache_(cache) {}

    // What uname gives; nullopt unless it is plain text.
    Text kernelName(std::string KernelNames::*part) {
        const auto& names = kernelNames_.value([this] { return parts_.kernel->names(); });
        if (!names || !isPlainText(*names.*part)) return std::nullopt;
        return *names.*part;
    }

    Text computerName() { return kernelName(&KernelNames::node); }

    Text name() {
        if (osRelease().name) return osRelease().name;
        return kernelName(&KernelNames::system);
    }

    Text version() {
        if (osRelease().versionId) return osRelease().versionId;
        if (osRelease().buildId) return osRelease().buildId;
        return kernelName(&KernelNames::release);
    }

    Text installDate() {
        return dateText(installDate_.value(
            [this] { return findInstallDate(*parts_.files, *parts_.kernel, bootTime()); }));
    }

    Text lastBootUpTime() { return dateText(bootTime()); }

    Number maxProcesses() {
        return maxProcesses_.value([this] { return readMaxProcesses(*parts_.files); });
    }

    Number maxProcessMemory() {
        return maxProcessMemory_.value([this] { return maxProcessMemoryKiB(*parts_.kernel); });
    }

    Number processes() {
        return processes_.value([this] { return countProcesses(*parts_.files); });
    }

    Number users() {
        return users_.value(
            [this] { return countSessions(*parts_.files, *parts_.kernel, cache_.sessions); });
    }

    const MemoryInfo& memory() {
        return memory_.value(
            [this] { return readMemoryInfo(*parts_.files).value_or(MemoryInfo()); });
    }

    // In the codes of Instrumentation::getNodeStatus.
    unsigned int nodeStatus() {
        return nodeStatus_.value(
            [this] { return readNodeStatus(*parts_.files, *parts_.systemManager); });
    }

  private:
    // In the zone that the global `timezone` names at the moment of the call.
    static Text dateText(Seconds instant) {
        return instant ? zonedDateText(*instant, ::timezone) : std::nullopt;
    }

    const OsRelease& osRelease() {
        return *osRelease_.value(
            [this] { return cache_.osRelease.get(*parts_.files, *parts_.kernel, readOsRelease); });
    }

    Seconds bootTime() {
        return bootTime_.value(
            [this] { return cache_.bootTime.read(*parts_.files, *parts_.kernel); });
    }

    const HostParts& parts_;
    HostCache& cache_;
    Lazy<std::shared_ptr<const OsRelease>> osRelease_;
    Lazy<std::optional<KernelNames>> kernelNames_;
    Lazy<Seconds> bootTime_, installDate_;
    Lazy<MemoryInfo> memory_;
    Lazy<Number> maxProcesses_, maxProcessMemory_, processes_, users_;
    Lazy<unsigned int> nodeStatus_;
};

// The type of a row is the only overload that reads the property. Memory is in kilobytes of 1024
// bytes.
template <class T>
struct Row {
    Properties id;
    std::optional<T> (*value)(Snapshot&);
};

constexpr Row<std::string> texts[] = {
    {NodeLexicon::Name, [](Snapshot& s) { return s.name(); }},
    {NodeLexicon::Version, [](Snapshot& s) { return s.version(); }},
    {NodeLexicon::InstallDate, [](Snapshot& s) { return s.installDate(); }},
    {NodeLexicon::LastBootUpTime, [](Snapshot& s) { return s.lastBootUpTime(); }},
};

constexpr Row<unsigned int> numbers[] = {
    {NodeLexicon::OSType, [](Snapshot&) { return Number(linuxOsType); }},
    {NodeLexicon::MaxNumberOfProcesses, [](Snapshot& s) { return s.maxProcesses(); }},
    {NodeLexicon::MaxProcessMemorySize, [](Snapshot& s) { return s.maxProcessMemory(); }},
    {NodeLexicon::NumberOfProcesses, [](Snapshot& s) { return s.processes(); }},
    {NodeLexicon::NumberOfUsers, [](Snapshot& s) { return s.users(); }},
    {NodeLexicon::NumberOfLicensedUsers, [](Snapshot&) { return Number(0); }},  // unlimited
    {NodeLexicon::TotalVirtualMemorySize,
     [](Snapshot& s) { return sum(s.memory().totalKiB, s.memory().swapTotalKiB); }},
    {NodeLexicon::FreeVirtualMemory,
     [](Snapshot& s) { return sum(s.memory().availableKiB, s.memory().swapFreeKiB); }},
    {NodeLexicon::FreePhysicalMemory, [](Snapshot& s) { return Number(s.memory().availableKiB); }},
    {NodeLexicon::TotalVisibleMemorySize, [](Snapshot& s) { return Number(s.memory().totalKiB); }},
    {NodeLexicon::TotalSwapSpaceSize, [](Snapshot& s) { return Number(s.memory().swapTotalKiB); }},
    {NodeLexicon::SizeStoredInPagingFiles,
     [](Snapshot& s) { return Number(s.memory().swapTotalKiB); }},
    {NodeLexicon::FreeSpaceInPagingFiles,
     [](Snapshot& s) { return Number(s.memory().swapFreeKiB); }},
};

constexpr Row<bool> flags[] = {
    {NodeLexicon::Distributed, [](Snapshot&) { return std::optional<bool>(false); }},
};

// The walk over the one node that a Linux host has.
class LinuxCursor final : public NodeCursor {
  public:
    LinuxCursor(const HostParts& parts, HostCache& cache) : snapshot_(parts, cache) {}

    bool select(NodeLexicon::NodeType type) override {
        onNode_ = type == NodeLexicon::OperatingSystemNode;
        return onNode_;
    }

    bool valid() override { return onNode_; }
    void next() override { onNode_ = false; }

    bool readProperty(Properties id, std::string& value) override { return read(texts, id, value); }
    bool readProperty(Properties id, unsigned int& value) override {
        return read(numbers, id, value);
    }
    bool readProperty(Properties id, bool& value) override { return read(flags, id, value); }

    // The name alone is asked about; nothing here can rename an operating system.
    bool isPropertyReadOnly(Properties id, bool& value) override {
        if (!onNode_ || id != NodeLexicon::Name) return false;
        value = true;
        return true;
    }

    unsigned int nodeStatus() override { return onNode_ ? snapshot_.nodeStatus() : 0; }

    bool readComputerName(std::string& name) override {
        return assign(snapshot_.computerName(), name);
    }

  private:
    template <class T>
    static bool assign(std::optional<T> found, T& value) {
        if (!found) return false;
        value = *std::move(found);
        return true;
    }

    template <class T, std::size_t Count>
    bool read(const Row<T> (&rows)[Count], Properties id, T& value) {
        if (!onNode_) return false;
        for (const Row<T>& row : rows) {
            if (row.id == id) return assign(row.value(snapshot_), value);
        }
        return false;
    }

    Snapshot snapshot_;
    bool onNode_ = false;
};

}  // namespace

struct LinuxHost::State {
    const HostParts parts;
    HostCache cache;
};

LinuxHost::LinuxHost(HostParts parts) : state_(new State{std::move(parts), {}}) {}

LinuxHost::~LinuxHost() = default;

std::unique_ptr<NodeCursor> LinuxHost::openCursor() {
    return std::make_unique<LinuxCursor>(state_->parts, state_->cache);
}

std::shared_ptr<HostSource> makeLinuxHost(std::string root) {
    auto files = std::make_shared<const HostFiles>(std::move(root));
    auto bus = std::make_shared<SystemdBus>(files->absolute("run/dbus/system_bus_socket"));
    return std::make_shared<LinuxHost>(
        HostParts{std::move(files), std::make_shared<const Kernel>(), std::move(bus)});
}

}  // namespace VA
