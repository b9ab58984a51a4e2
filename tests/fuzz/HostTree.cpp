// A whole Linux host whose files, kernel and service manager say anything.
#include <fuzzer/FuzzedDataProvider.h>

#include <algorithm>
#include <cerrno>
#include <ctime>
#include <map>

#include "framework/instrumentation/Linux/Parsing.h"
#include "framework/instrumentation/LinuxHost.h"
#include "fuzz/Invariant.h"

namespace {

using namespace VA;

// Every file that the host is read from; one that is not listed is not there.
constexpr const char* filePaths[] = {
    "etc/os-release",
    "usr/lib/os-release",
    "proc/stat",
    "proc/meminfo",
    "proc/sys/kernel/pid_max",
    "proc/sys/kernel/threads-max",
    "run/systemd/sessions/c1",
    "run/systemd/sessions/c2",
    "run/systemd/sessions/.#c2",
    "run/utmp",
    "var/run/utmp",
};
constexpr const char* folderPaths[] = {"proc", "run/systemd/sessions"};
constexpr const char* datedPaths[] = {"", "var/log/installer", "etc/machine-id"};

// Any instant, with those of the years 1966 to 2106 as the likely ones.
std::int64_t instant(FuzzedDataProvider& input) {
    return input.ConsumeBool() ? input.ConsumeIntegral<std::int64_t>()
                               : input.ConsumeIntegralInRange<std::int64_t>(-0x7FFFFFF, 0xFFFFFFFF);
}

class AnyFiles final : public Linux::HostFiles {
  public:
    explicit AnyFiles(FuzzedDataProvider& input) : HostFiles("/nonexistent") {
        for (const char* path : filePaths)
            if (input.ConsumeBool()) {
                const bool whole = input.ConsumeIntegralInRange(0, 7) != 0;
                Linux::FileContent& content = contents_[path];
                content = {whole ? input.ConsumeRandomLengthString() : "", whole, {}};
                content.state.kind = Linux::FileState::Kind::Regular;
                content.state.size = content.text.size();
            }
        for (const char* path : folderPaths)
            if (input.ConsumeBool()) addFolder(path, input);
        for (const char* path : datedPaths)
            if (input.ConsumeBool()) {
                Linux::FileState& state = states_[path];
                if (input.ConsumeBool()) state.birth = instant(input);
                state.changed.seconds = instant(input);
            }
        if (input.ConsumeBool())
            states_["run/systemd/system"].kind = Linux::FileState::Kind::Directory;
        for (const auto& [path, content] : contents_) states_[path] = content.state;
        for (const auto& [path, names] : folders_)
            states_[path].kind = Linux::FileState::Kind::Directory;
    }

    std::optional<Linux::FileContent> read(const std::string& path) const override {
        return found(contents_, path);
    }
    std::optional<Linux::FileState> forEachName(const std::string& path,
                                                const NameVisitor& visit) const override {
        const auto names = found(folders_, path);
        if (!names) return std::nullopt;
        std::for_each(names->begin(), names->end(), visit);
        return state(path);
    }
    std::optional<Linux::FileState> state(const std::string& path) const override {
        return found(states_, path);
    }

  private:
    template <class T>
    static std::optional<T> found(const std::map<std::string, T>& items, const std::string& path) {
        const auto item = items.find(path);
        if (item == items.end()) errno = ENOENT;
        return item == items.end() ? std::nullopt : std::optional<T>(item->second);
    }

    // A file system gives no empty name.
    void addFolder(const char* path, FuzzedDataProvider& input) {
        std::vector<std::string>& names = folders_[path];
        names = {"c1", "c2", ".#c2", "1", "4711"};
        for (auto more = input.ConsumeIntegralInRange(0, 3); more > 0; --more) {
            names.push_back(input.ConsumeRandomLengthString(32));
            if (names.back().empty()) names.back() = "gone";
        }
    }

    std::map<std::string, Linux::FileContent> contents_;
    std::map<std::string, std::vector<std::string>> folders_;
    std::map<std::string, Linux::FileState> states_;
};

class AnyKernel final : public Linux::Kernel {
  public:
    explicit AnyKernel(FuzzedDataProvider& input)
        : now_(instant(input)),
          boot_(instant(input)),
          limit_(input.ConsumeIntegral<std::uint64_t>()) {
        if (input.ConsumeBool())
            names_ = {input.ConsumeRandomLengthString(300), input.ConsumeRandomLengthString(300),
                      input.ConsumeRandomLengthString(300)};
        hasBoot_ = input.ConsumeBool();
        hasLimit_ = input.ConsumeBool();
    }

    std::optional<Linux::KernelNames> names() const override { return names_; }
    std::int64_t now() const override { return now_; }
    Linux::ClockedBoot bootTime() const override {
        if (!hasBoot_) return {};
        return {boot_, true};
    }
    bool isAlive(std::int32_t pid) const override { return pid % 2 != 0; }
    std::optional<std::uint64_t> addressSpaceLimit() const override {
        return hasLimit_ ? std::optional<std::uint64_t>(limit_) : std::nullopt;
    }

  private:
    std::optional<Linux::KernelNames> names_;
    std::int64_t now_;
    std::int64_t boot_;
    std::uint64_t limit_;
    bool hasBoot_ = false;
    bool hasLimit_ = false;
};

class AnyManager final : public Linux::SystemManager {
  public:
    explicit AnyManager(FuzzedDataProvider& input) {
        constexpr const char* states[] = {"running",     "degraded", "initializing", "starting",
                                          "maintenance", "stopping", "offline"};
        if (input.ConsumeBool()) state_ = input.PickValueInArray(states);
        if (input.ConsumeBool()) state_ = input.ConsumeRandomLengthString(31);
    }
    std::optional<std::string> systemState() override { return state_; }

  private:
    std::optional<std::string> state_;
};

// Reads a property twice: what a snapshot has told, it tells again.
template <class T>
void checkProperty(NodeCursor& cursor, NodeLexicon::Properties id) {
    T value{};
    T again{};
    const bool known = cursor.readProperty(id, value);
    fuzz::expect(cursor.readProperty(id, again) == known && again == value,
                 "a snapshot does not change");
    if constexpr (std::is_same_v<T, std::string>) {
        if (!known) return;
        fuzz::expect(Linux::isPlainText(value), "every text of the host is plain");
        if (id == NodeLexicon::InstallDate || id == NodeLexicon::LastBootUpTime)
            fuzz::expect(value.size() == 19, "the text of an instant has 19 characters");
    }
}

void checkCursor(NodeCursor& cursor) {
    fuzz::expect(cursor.select(NodeLexicon::OperatingSystemNode) && cursor.valid(),
                 "a host has an operating system");
    for (unsigned number = 100; number < 160; ++number) {
        const auto id = static_cast<NodeLexicon::Properties>(number);
        checkProperty<std::string>(cursor, id);
        checkProperty<unsigned int>(cursor, id);
        checkProperty<bool>(cursor, id);
        bool readOnly = false;
        cursor.isPropertyReadOnly(id, readOnly);
    }
    fuzz::expect(cursor.nodeStatus() <= 26, "a status has a meaning");
    std::string name;
    if (cursor.readComputerName(name))
        fuzz::expect(Linux::isPlainText(name), "every text of the host is plain");
    cursor.next();
    fuzz::expect(!cursor.valid(), "a host has one operating system");
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    FuzzedDataProvider input(data, size);
    timezone = input.ConsumeIntegralInRange<long>(-168 * 3600, 168 * 3600);
    Linux::HostParts parts{std::make_shared<AnyFiles>(input), std::make_shared<AnyKernel>(input),
                           std::make_shared<AnyManager>(input)};
    LinuxHost host(std::move(parts));
    checkCursor(*host.openCursor());
    return 0;
}
