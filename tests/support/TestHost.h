#ifndef TESTS_SUPPORT_TEST_HOST_H
#define TESTS_SUPPORT_TEST_HOST_H

#include <atomic>
#include <cstdint>
#include <map>
#include <memory>
#include <mutex>
#include <optional>
#include <set>
#include <string>

#include "framework/instrumentation/LinuxHost.h"
#include "support/FixtureTree.h"

/// One record of a utmp file, byte by byte as an x86 host writes it in either word size.
inline std::string utmpRecord(std::int16_t type, std::int32_t pid, const std::string& user) {
    std::string record(384, '\0');
    record.replace(0, 2, reinterpret_cast<const char*>(&type), 2);
    record.replace(4, 4, reinterpret_cast<const char*>(&pid), 4);
    record.replace(8, 5, "pts/0");
    record.replace(44, user.size(), user);
    return record;
}

constexpr std::int16_t utmpBootTime = 2;
constexpr std::int16_t utmpLoginProcess = 6;
constexpr std::int16_t utmpUserProcess = 7;
constexpr std::int16_t utmpDeadProcess = 8;

/// Files of a fixture tree that count each look ("look at /etc/os-release"), and each file or
/// folder that is read, by path. Those that date an installation have the dates that they are
/// given.
class CountingFiles final : public VA::Linux::HostFiles {
  public:
    struct Dates {
        std::optional<std::int64_t> birth;
        std::int64_t change = 0;
    };

    using HostFiles::HostFiles;

    std::optional<VA::Linux::FileState> state(const std::string& path) const override {
        count("look at /" + path);
        if (path != "" && path != "var/log/installer" && path != "etc/machine-id")
            return sized(path, HostFiles::state(path));
        const auto found = fixedDates.find(path);
        if (found == fixedDates.end()) return std::nullopt;
        VA::Linux::FileState state;
        state.birth = found->second.birth;
        state.changed.seconds = found->second.change;
        return state;
    }
    std::optional<VA::Linux::FileContent> read(const std::string& path) const override {
        count(path);
        auto content = HostFiles::read(path);
        if (content) content->state = *sized(path, content->state);
        return content;
    }
    std::optional<VA::Linux::FileState> forEachName(const std::string& path,
                                                    const NameVisitor& visit) const override {
        count(path);
        return HostFiles::forEachName(path, visit);
    }

    std::map<std::string, int> counts() const {
        const std::lock_guard<std::mutex> lock(mutex_);
        return counts_;
    }
    void resetCounts() {
        const std::lock_guard<std::mutex> lock(mutex_);
        counts_.clear();
    }

    std::map<std::string, Dates> fixedDates;
    std::set<std::string> sizeless;  ///< these have the size 0, as the kernel's own files do

  private:
    std::optional<VA::Linux::FileState> sized(const std::string& path,
                                              std::optional<VA::Linux::FileState> state) const {
        if (state && sizeless.count(path) != 0) state->size = 0;
        return state;
    }

    void count(const std::string& path) const {
        const std::lock_guard<std::mutex> lock(mutex_);
        ++counts_[path];
    }

    mutable std::mutex mutex_;
    mutable std::map<std::string, int> counts_;
};

/// A kernel that says what it was told to.
class FixedKernel final : public VA::Linux::Kernel {
  public:
    std::optional<VA::Linux::KernelNames> names() const override {
        ++namesCalls;
        return fixedNames;
    }
    std::int64_t now() const override { return fixedNow; }
    VA::Linux::ClockedBoot bootTime() const override { return {fixedBootTime, bootTimeIsExact}; }
    bool isAlive(std::int32_t pid) const override { return livingPids.count(pid) != 0; }
    std::optional<std::uint64_t> addressSpaceLimit() const override { return fixedLimit; }

    std::optional<VA::Linux::KernelNames> fixedNames{{"Linux", "node.example", "6.1.0-18"}};
    std::int64_t fixedNow = 1700100000;
    std::optional<std::int64_t> fixedBootTime = 1699999999;
    bool bootTimeIsExact = true;
    std::set<std::int32_t> livingPids{1, 20, 300, 512, 513};
    std::optional<std::uint64_t> fixedLimit = unlimited;
    mutable std::atomic<int> namesCalls{0};
};

class FixedSystemManager final : public VA::Linux::SystemManager {
  public:
    std::optional<std::string> systemState() override {
        ++calls;
        return state;
    }

    std::optional<std::string> state = "running";
    std::atomic<int> calls{0};
};

/// Asks a cursor for all that it may be asked for, in every type.
inline void readEverything(VA::NodeCursor& cursor) {
    std::string text;
    unsigned int number = 0;
    bool flag = false;
    for (unsigned int id = 100; id < 160; ++id) {
        cursor.readProperty(VA::NodeLexicon::Properties(id), text);
        cursor.readProperty(VA::NodeLexicon::Properties(id), number);
        cursor.readProperty(VA::NodeLexicon::Properties(id), flag);
        cursor.isPropertyReadOnly(VA::NodeLexicon::Properties(id), flag);
    }
    cursor.readComputerName(text);
    cursor.nodeStatus();
}

/// A Linux host over a fixture tree, with each of its parts within reach.
class TestHost {
  public:
    TestHost() : TestHost(std::make_shared<FixtureTree>()) {}

    const FixtureTree& tree() const { return *tree_; }

    /// A walk that stands on the node; lives no longer than this object.
    std::unique_ptr<VA::NodeCursor> cursor() {
        auto cursor = host_->openCursor();
        cursor->select(VA::NodeLexicon::OperatingSystemNode);
        return cursor;
    }

    /// Reads from a new walk. T is the overload; nothing where that gives false.
    template <class T>
    std::optional<T> read(VA::NodeLexicon::Properties id) {
        T value{};
        const bool found = cursor()->readProperty(id, value);
        return found ? std::optional<T>(value) : std::nullopt;
    }
    auto text(VA::NodeLexicon::Properties id) { return read<std::string>(id); }
    auto number(VA::NodeLexicon::Properties id) { return read<unsigned int>(id); }
    auto flag(VA::NodeLexicon::Properties id) { return read<bool>(id); }

  private:
    explicit TestHost(std::shared_ptr<FixtureTree> tree)
        : tree_(std::move(tree)),
          files(std::make_shared<CountingFiles>(tree_->root())),
          host_(std::make_unique<VA::LinuxHost>(VA::Linux::HostParts{files, kernel, manager})) {}

    std::shared_ptr<FixtureTree> tree_;

  public:
    std::shared_ptr<CountingFiles> files;
    std::shared_ptr<FixedKernel> kernel = std::make_shared<FixedKernel>();
    std::shared_ptr<FixedSystemManager> manager = std::make_shared<FixedSystemManager>();

  private:
    std::unique_ptr<VA::LinuxHost> host_;
};

#endif
