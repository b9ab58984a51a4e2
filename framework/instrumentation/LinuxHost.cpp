#include "LinuxHost.h"

#include <optional>
#include <utility>

#include "Linux/Snapshot.h"
#include "Linux/SystemdBus.h"

namespace VA {

namespace {

using Linux::HostFiles;
using Linux::HostParts;
using Linux::Kernel;
using Linux::Snapshot;
using Linux::SystemdBus;
using NodeLexicon::Properties;

// Which value of the snapshot a property is.
template <class T>
struct Row {
    Properties id;
    std::optional<T> (Snapshot::*value)();
};

constexpr Row<std::string> texts[] = {
    {NodeLexicon::Name, &Snapshot::name},
    {NodeLexicon::Version, &Snapshot::version},
    {NodeLexicon::InstallDate, &Snapshot::installDate},
    {NodeLexicon::LastBootUpTime, &Snapshot::lastBootUpTime},
};

constexpr Row<unsigned int> numbers[] = {
    {NodeLexicon::OSType, &Snapshot::osType},
    {NodeLexicon::MaxNumberOfProcesses, &Snapshot::maxProcesses},
    {NodeLexicon::MaxProcessMemorySize, &Snapshot::maxProcessMemoryKiB},
    {NodeLexicon::NumberOfProcesses, &Snapshot::processes},
    {NodeLexicon::NumberOfUsers, &Snapshot::users},
    {NodeLexicon::NumberOfLicensedUsers, &Snapshot::licensedUsers},
    {NodeLexicon::TotalVirtualMemorySize, &Snapshot::totalVirtualKiB},
    {NodeLexicon::FreeVirtualMemory, &Snapshot::freeVirtualKiB},
    {NodeLexicon::FreePhysicalMemory, &Snapshot::freePhysicalKiB},
    {NodeLexicon::TotalVisibleMemorySize, &Snapshot::totalPhysicalKiB},
    {NodeLexicon::TotalSwapSpaceSize, &Snapshot::totalSwapKiB},
    {NodeLexicon::SizeStoredInPagingFiles, &Snapshot::totalSwapKiB},
    {NodeLexicon::FreeSpaceInPagingFiles, &Snapshot::freeSwapKiB},
};

constexpr Row<bool> flags[] = {
    {NodeLexicon::Distributed, &Snapshot::distributed},
};

// The walk over the one node that a Linux host has.
class LinuxCursor final : public NodeCursor {
  public:
    explicit LinuxCursor(const HostParts& parts) : snapshot_(parts) {}

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
    bool readOnlyProperty(Properties id, bool& value) override {
        if (!onNode_ || id != NodeLexicon::Name) return false;
        value = true;
        return true;
    }

    unsigned int nodeStatus() override { return onNode_ ? snapshot_.nodeStatus() : 0; }

    bool readComputerName(std::string& name) override {
        return take(snapshot_.computerName(), name);
    }

  private:
    template <class T>
    static bool take(std::optional<T> found, T& value) {
        if (found) value = *std::move(found);
        return found.has_value();
    }

    template <class T, std::size_t Count>
    bool read(const Row<T> (&rows)[Count], Properties id, T& value) {
        if (!onNode_) return false;
        for (const Row<T>& row : rows) {
            if (row.id == id) return take((snapshot_.*row.value)(), value);
        }
        return false;
    }

    Snapshot snapshot_;
    bool onNode_ = false;
};

HostParts partsUnder(std::string root) {
    auto files = std::make_shared<const HostFiles>(std::move(root));
    auto bus = std::make_shared<SystemdBus>(files->absolute("run/dbus/system_bus_socket"));
    return {std::move(files), std::make_shared<const Kernel>(), std::move(bus)};
}

}  // namespace

LinuxHost::LinuxHost(std::string root) : LinuxHost(partsUnder(std::move(root))) {}

LinuxHost::LinuxHost(HostParts parts)
    : parts_(std::make_unique<const HostParts>(std::move(parts))) {}

LinuxHost::~LinuxHost() = default;

std::unique_ptr<NodeCursor> LinuxHost::openCursor() {
    return std::make_unique<LinuxCursor>(*parts_);
}

std::shared_ptr<HostSource> makeLinuxHost(std::string root) {
    return std::make_shared<LinuxHost>(std::move(root));
}

}  // namespace VA
