// This machine, read a second time by other means: a shell and its tools.
#include <dlfcn.h>
#include <gtest/gtest.h>
#include <unistd.h>

#include <cstdlib>
#include <ctime>
#include <string>
#include <vector>

#include "framework/instrumentation/Linux/Systemd.h"
#include "framework/instrumentation/LinuxHost.h"
#include "support/ProgramRun.h"
#include "support/Properties.h"

namespace {

using namespace VA::NodeLexicon;

std::string shell(const std::string& command) {
    std::string output = runProgram("/bin/sh", {"-c", command}).out;
    while (!output.empty() && output.back() == '\n') output.pop_back();
    return output;
}

// The number that a shell command prints; nothing where it prints none.
std::optional<double> shellNumber(const std::string& command) {
    const std::string output = shell(command);
    char* end = nullptr;
    const double number = std::strtod(output.c_str(), &end);
    return end == output.c_str() ? std::nullopt : std::optional<double>(number);
}

// Prints the sum of such rows of meminfo.
std::string meminfo(const std::string& rows) {
    return "awk '/^(" + rows + "):/ {sum += $2} END {if (NR) printf \"%.0f\", sum}' /proc/meminfo";
}

// The seconds of a date that a walk tells, in the zone as it stood when the text was made.
std::optional<double> instantOf(const std::optional<std::string>& text) {
    if (!text) return std::nullopt;
    EXPECT_EQ(text->size(), 19u) << *text;
    const auto utc = shellNumber("date +%s -ud \"$(echo '" + *text + "' | sed 's/-/ /3')\"");
    EXPECT_TRUE(utc) << *text;
    const long west = ::timezone;
    return utc.value_or(0) - static_cast<double>(west / 60 * 60);
}

// In seconds, or parts of them.
constexpr const char* boot = "awk -v now=$(date +%s) '{printf \"%.2f\", now - $1}' /proc/uptime";

constexpr const char* installation =
    "now=$(date +%s); up=$(sed 's/[. ].*//' /proc/uptime); "
    "for t in $(stat -c %W /) $(stat -Lc %Z /var/log/installer) $(stat -Lc %Z /etc/machine-id); do "
    "if [ $t -ge 694224000 ] && [ $t -le $((now - up)) ]; then echo $t; break; fi; done";

constexpr const char* users =
    "if cd /run/systemd/sessions; then "
    "for s in *; do if [ -f \"$s\" ] && grep -qxE 'CLASS=user(-early)?(-light)?' \"$s\" && "
    "! grep -qx STATE=closing \"$s\"; then echo x; fi; done | wc -l; "
    "elif [ -r /run/utmp ] || [ -r /var/run/utmp ]; then who | wc -l; fi";

enum class Kind { Text, Date, Number, Flag };

// What a command prints of a property, give or take the tolerance; nothing where it is absent.
struct Reading {
    unsigned int id;
    Kind kind;
    std::string command;
    double tolerance = 0;
};

std::vector<Reading> machineReadings() {
    const double ram = shellNumber(meminfo("MemTotal")).value_or(0);
    const double swap = shellNumber(meminfo("SwapTotal")).value_or(0);
    const bool hasSessions = ::access("/run/systemd/sessions", R_OK | X_OK) == 0;
    std::vector<Reading> all{
        {InstallDate, Kind::Date, installation, 1},
        {LastBootUpTime, Kind::Date, boot, 2},
        {OSType, Kind::Number, "echo 35"},
        // others come and go meanwhile
        {NumberOfProcesses, Kind::Number, "ls -d /proc/[0-9]* | wc -l", 100},
        {NumberOfUsers, Kind::Number, users, hasSessions ? 0.0 : 10.0},
        {NumberOfLicensedUsers, Kind::Number, "echo 0"},
        {TotalVirtualMemorySize, Kind::Number, meminfo("MemTotal|SwapTotal"), 8},
        {FreeVirtualMemory, Kind::Number, meminfo("MemAvailable|SwapFree"), ram / 4},
        {FreePhysicalMemory, Kind::Number, meminfo("MemAvailable"), ram / 4},
        {TotalVisibleMemorySize, Kind::Number, meminfo("MemTotal"), 8},
        {TotalSwapSpaceSize, Kind::Number, meminfo("SwapTotal"), 1},
        {SizeStoredInPagingFiles, Kind::Number, meminfo("SwapTotal"), 1},
        {FreeSpaceInPagingFiles, Kind::Number, meminfo("SwapFree"), swap / 4},
        {Distributed, Kind::Flag, "echo 0"},
    };
    for (const PublishedProperty& each : operatingSystemProperties)
        if (each.command != nullptr)
            all.push_back({each.id, each.isText() ? Kind::Text : Kind::Number, each.command});
    return all;
}

class RealMachine : public testing::Test {
  protected:
    RealMachine() : cursor(host->openCursor()) { EXPECT_TRUE(cursor->select(OperatingSystemNode)); }

    template <class T>
    std::optional<T> read(unsigned int id) {
        T value{};
        const bool found = cursor->readProperty(Properties(id), value);
        return found ? std::optional<T>(value) : std::nullopt;
    }

    static void expectNear(std::optional<double> actual, const Reading& expected) {
        const auto value = shellNumber(expected.command);
        ASSERT_EQ(actual.has_value(), value.has_value());
        if (actual) {
            EXPECT_NEAR(*actual, std::min(*value, 4294967295.0), expected.tolerance);
        }
    }

    const std::shared_ptr<VA::HostSource> host = VA::makeLinuxHost();
    std::unique_ptr<VA::NodeCursor> cursor;
};

TEST_F(RealMachine, EveryPropertyAgreesWithAnIndependentReading) {
    std::vector<bool> isRead(1000);
    for (const Reading& expected : machineReadings()) {
        SCOPED_TRACE(expected.id);
        isRead[expected.id] = true;
        const auto text = read<std::string>(expected.id);
        const auto number = read<unsigned int>(expected.id);
        const auto flag = read<bool>(expected.id);
        EXPECT_TRUE(!text || expected.kind == Kind::Text || expected.kind == Kind::Date);
        EXPECT_TRUE(!number || expected.kind == Kind::Number);
        EXPECT_TRUE(!flag || expected.kind == Kind::Flag);
        if (expected.kind == Kind::Text) {
            EXPECT_EQ(text, shell(expected.command));
        } else if (expected.kind == Kind::Date) {
            expectNear(instantOf(text), expected);
        } else {
            std::optional<double> value = number;
            if (flag) value = *flag;
            expectNear(value, expected);
        }
    }
    for (unsigned int id = 0; id < isRead.size(); ++id) {
        const bool found =
            !isRead[id] && (read<std::string>(id) || read<unsigned int>(id) || read<bool>(id));
        EXPECT_FALSE(found) << "nothing here checks " << id;
    }
}

TEST_F(RealMachine, MemoryOfOneWalkAddsUp) {
    const auto number = [&](Properties id) {
        return std::uint64_t{read<unsigned int>(id).value()};
    };
    constexpr std::uint64_t most = 4294967295;
    EXPECT_EQ(number(TotalVirtualMemorySize),
              std::min(most, number(TotalVisibleMemorySize) + number(TotalSwapSpaceSize)));
    EXPECT_EQ(number(FreeVirtualMemory),
              std::min(most, number(FreePhysicalMemory) + number(FreeSpaceInPagingFiles)));
    EXPECT_LE(number(FreePhysicalMemory), number(TotalVisibleMemorySize));
    EXPECT_LE(number(FreeSpaceInPagingFiles), number(SizeStoredInPagingFiles));
}

TEST_F(RealMachine, ComputerNameIsTheHostName) {
    std::string name;
    EXPECT_TRUE(cursor->readComputerName(name));
    EXPECT_EQ(name, shell("uname -n"));
}

// The code that the host's own tool gives reason for; nothing where it says something else.
std::optional<double> statusBySystemctl() {
    return shellNumber(
        "case $(systemctl is-system-running) in running) echo 1;; initializing|starting) echo 2;; "
        "degraded) echo 21;; maintenance) echo 8;; stopping) echo 16;; offline) echo 12;; esac");
}

bool canAskSystemd() {
    void* const library = ::dlopen(VA::Linux::SystemdBus::defaultLibrary, RTLD_NOW | RTLD_LOCAL);
    if (library) ::dlclose(library);
    return library && ::access("/run/dbus/system_bus_socket", R_OK | W_OK) == 0;
}

TEST_F(RealMachine, StatusIsWhatSystemdSaysOrRunningWhereNoneRuns) {
    if (::access("/run/systemd/system", F_OK) != 0) {
        EXPECT_EQ(cursor->nodeStatus(), 1u);
        return;
    }
    if (!canAskSystemd()) {
        EXPECT_EQ(cursor->nodeStatus(), 0u);
        return;
    }
    const auto before = statusBySystemctl();
    const unsigned int status = cursor->nodeStatus();
    if (!before || before != statusBySystemctl()) GTEST_SKIP() << "the state is changing";
    EXPECT_EQ(status, before);
}

}  // namespace
