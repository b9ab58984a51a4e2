// This machine, read a second time by other means: a shell, the C library, sysinfo.
#include <dlfcn.h>
#include <glob.h>
#include <gtest/gtest.h>
#include <sys/resource.h>
#include <sys/sysinfo.h>
#include <sys/utsname.h>
#include <unistd.h>

#include <cstdio>
#include <cstdlib>
#include <ctime>
#include <fstream>
#include <functional>
#include <map>
#include <sstream>
#include <variant>

#include "framework/instrumentation/Linux/Systemd.h"
#include "framework/instrumentation/LinuxHost.h"

namespace {

using namespace VA::NodeLexicon;

// A property as the host source tells it: absent, or of one of the three types.
using Reading = std::variant<std::monostate, std::string, unsigned int, bool>;

void print(const Reading& reading, std::ostream& out) {
    if (const auto* text = std::get_if<std::string>(&reading)) out << '"' << *text << '"';
    if (const auto* number = std::get_if<unsigned int>(&reading)) out << *number;
    if (const auto* flag = std::get_if<bool>(&reading)) out << (*flag ? "true" : "false");
    if (std::holds_alternative<std::monostate>(reading)) out << "absent";
}

std::string described(const Reading& reading) {
    std::ostringstream out;
    print(reading, out);
    return out.str();
}

std::string shell(const std::string& command) {
    std::string output;
    FILE* pipe = ::popen(command.c_str(), "r");
    for (int c = std::fgetc(pipe); c != EOF; c = std::fgetc(pipe)) output += static_cast<char>(c);
    ::pclose(pipe);
    while (!output.empty() && output.back() == '\n') output.pop_back();
    return output;
}

// The first number that a shell command prints; nothing where it prints none.
std::optional<double> shellNumber(const std::string& command) {
    const std::string output = shell(command);
    char* end = nullptr;
    const double number = std::strtod(output.c_str(), &end);
    return end == output.c_str() ? std::nullopt : std::optional<double>(number);
}

std::optional<double> meminfo(const std::string& row) {
    return shellNumber("awk '$1 == \"" + row + ":\" {print $2}' /proc/meminfo 2>/dev/null");
}

Reading saturatedNumber(std::optional<double> expected) {
    if (!expected) return std::monostate{};
    return static_cast<unsigned int>(std::min(*expected, 4294967295.0));
}

// Fails unless `actual` is `expected`, give or take `tolerance`; absent when nothing is expected.
void expectNear(const Reading& actual, std::optional<double> expected, double tolerance) {
    if (!expected) {
        EXPECT_TRUE(std::holds_alternative<std::monostate>(actual)) << described(actual);
        return;
    }
    const auto* number = std::get_if<unsigned int>(&actual);
    ASSERT_TRUE(number) << described(actual);
    EXPECT_NEAR(static_cast<double>(*number), *expected, tolerance);
}

double sysinfoKiB(unsigned long value, unsigned int unit) {
    return static_cast<double>(value) * static_cast<double>(unit) / 1024.0;
}

struct sysinfo systemInfo() {
    struct sysinfo info {};
    EXPECT_EQ(::sysinfo(&info), 0);
    return info;
}

double instantOf(const std::string& text) {
    struct tm parts {};
    char end = 0;
    EXPECT_EQ(std::sscanf(text.c_str(), "%4d-%2d-%2d-%2d:%2d:%2d%c", &parts.tm_year, &parts.tm_mon,
                          &parts.tm_mday, &parts.tm_hour, &parts.tm_min, &parts.tm_sec, &end),
              6)
        << text;
    parts.tm_year -= 1900;
    parts.tm_mon -= 1;
    const long west = ::timezone;  // as it stood when the text was made
    return static_cast<double>(::timegm(&parts)) - static_cast<double>(west / 60 * 60);
}

double bootInstant() {
    double up = 0;
    std::ifstream("/proc/uptime") >> up;
    return static_cast<double>(std::time(nullptr)) - up;
}

// A value of os-release, unquoted by a shell.
std::string osReleaseValue(const std::string& name) {
    return shell(
        "for f in /etc/os-release /usr/lib/os-release; do if [ -e $f ]; then . $f; break; "
        "fi; done; printf %s \"$" +
        name + "\"");
}

std::string firstNonEmpty(std::initializer_list<std::string> texts) {
    for (const auto& text : texts) {
        if (!text.empty()) return text;
    }
    return {};
}

void checkInstallDate(const Reading& actual) {
    const double now = static_cast<double>(std::time(nullptr));
    std::optional<double> expected;
    for (const char* command : {"stat -c %W /", "stat -L -c %Z /var/log/installer 2>/dev/null",
                                "stat -L -c %Z /etc/machine-id 2>/dev/null"}) {
        const auto found = shellNumber(command);
        const bool plausible =
            found && *found > 694224000 - 1 && *found < bootInstant() + 1 && *found <= now;
        if (plausible && !expected) expected = found;
    }
    if (!expected) {
        EXPECT_TRUE(std::holds_alternative<std::monostate>(actual)) << described(actual);
        return;
    }
    ASSERT_TRUE(std::holds_alternative<std::string>(actual)) << described(actual);
    EXPECT_NEAR(instantOf(std::get<std::string>(actual)), *expected, 1.0);
}

void checkBootTime(const Reading& actual) {
    ASSERT_TRUE(std::holds_alternative<std::string>(actual)) << described(actual);
    EXPECT_NEAR(instantOf(std::get<std::string>(actual)), bootInstant(), 2.0);
}

void checkMaxProcesses(const Reading& actual) {
    const auto pids = shellNumber("cat /proc/sys/kernel/pid_max 2>/dev/null");
    const auto threads = shellNumber("cat /proc/sys/kernel/threads-max 2>/dev/null");
    if (pids && threads) {
        EXPECT_EQ(described(actual), described(saturatedNumber(std::min(*pids, *threads))));
    } else {
        EXPECT_EQ(described(actual), described(saturatedNumber(pids ? pids : threads)));
    }
}

void checkMaxProcessMemory(const Reading& actual) {
    const auto kiB = shellNumber("ulimit -S -v");
    EXPECT_EQ(described(actual), described(saturatedNumber(kiB ? *kiB : 0.0)));
}

void checkProcesses(const Reading& actual) {
    glob_t found{};
    ASSERT_EQ(::glob("/proc/[0-9]*", GLOB_ONLYDIR, nullptr, &found), 0);
    const auto count = static_cast<double>(found.gl_pathc);
    ::globfree(&found);
    expectNear(actual, count, 100.0);  // others come and go meanwhile
}

void checkUsers(const Reading& actual) {
    if (::access("/run/systemd/sessions", R_OK | X_OK) == 0) {
        expectNear(
            actual,
            shellNumber("cd /run/systemd/sessions; for s in *; do "
                        "if [ -f \"$s\" ] && grep -qxE 'CLASS=user(-early)?(-light)?' \"$s\" && "
                        "! grep -qx STATE=closing \"$s\"; then echo x; fi; done | wc -l"),
            0.0);
    } else if (::access("/run/utmp", R_OK) == 0 || ::access("/var/run/utmp", R_OK) == 0) {
        expectNear(actual, shellNumber("who | wc -l"), 10.0);
    } else {
        expectNear(actual, std::nullopt, 0.0);
    }
}

void checkFreePhysical(const Reading& actual) {
    const auto total = meminfo("MemTotal");
    expectNear(actual, meminfo("MemAvailable"), total.value_or(0) / 4);
}

void checkFreeVirtual(const Reading& actual) {
    const auto total = meminfo("MemTotal");
    const auto available = meminfo("MemAvailable");
    ASSERT_TRUE(total && available);
    expectNear(actual, *available + meminfo("SwapFree").value_or(0), *total / 4);
}

void checkTotalSwap(const Reading& actual) {
    const auto info = systemInfo();
    expectNear(actual, sysinfoKiB(info.totalswap, info.mem_unit), 1.0);
}

// The value of an independent reading that must be met exactly.
std::function<void(const Reading&)> equals(std::function<Reading()> expected) {
    return
        [expected](const Reading& actual) { EXPECT_EQ(described(actual), described(expected())); };
}

const std::map<unsigned int, std::function<void(const Reading&)>> checks{
    {Name, equals([] {
         struct utsname names {};
         ::uname(&names);
         return Reading(firstNonEmpty({osReleaseValue("NAME"), names.sysname}));
     })},
    {OSType, equals([] { return Reading(35u); })},
    {Version, equals([] {
         struct utsname names {};
         ::uname(&names);
         return Reading(firstNonEmpty(
             {osReleaseValue("VERSION_ID"), osReleaseValue("BUILD_ID"), names.release}));
     })},
    {InstallDate, checkInstallDate},
    {Distributed, equals([] { return Reading(false); })},
    {LastBootUpTime, checkBootTime},
    {MaxNumberOfProcesses, checkMaxProcesses},
    {MaxProcessMemorySize, checkMaxProcessMemory},
    {NumberOfProcesses, checkProcesses},
    {NumberOfUsers, checkUsers},
    {NumberOfLicensedUsers, equals([] { return Reading(0u); })},
    {TotalVirtualMemorySize,
     [](const Reading& actual) {
         const auto info = systemInfo();
         expectNear(
             actual,
             sysinfoKiB(info.totalram, info.mem_unit) + sysinfoKiB(info.totalswap, info.mem_unit),
             8.0);
     }},
    {FreeVirtualMemory, checkFreeVirtual},
    {FreePhysicalMemory, checkFreePhysical},
    {TotalVisibleMemorySize,
     [](const Reading& actual) {
         const auto info = systemInfo();
         expectNear(actual, sysinfoKiB(info.totalram, info.mem_unit), 8.0);
     }},
    {TotalSwapSpaceSize, checkTotalSwap},
    {SizeStoredInPagingFiles, checkTotalSwap},
    {FreeSpaceInPagingFiles,
     [](const Reading& actual) {
         const auto info = systemInfo();
         expectNear(actual, sysinfoKiB(info.freeswap, info.mem_unit),
                    sysinfoKiB(info.totalswap, info.mem_unit) / 4);
     }},
};

Reading readingOf(VA::NodeCursor& cursor, Properties id) {
    std::string text;
    if (cursor.readProperty(id, text)) return text;
    unsigned int number = 0;
    if (cursor.readProperty(id, number)) return number;
    bool flag = false;
    if (cursor.readProperty(id, flag)) return flag;
    return std::monostate{};
}

class RealMachine : public testing::Test {
  protected:
    RealMachine() : cursor(host->openCursor()) { EXPECT_TRUE(cursor->select(OperatingSystemNode)); }

    const std::shared_ptr<VA::HostSource> host = VA::makeLinuxHost();
    std::unique_ptr<VA::NodeCursor> cursor;
};

TEST_F(RealMachine, EveryPropertyAgreesWithAnIndependentReading) {
    for (unsigned int id = 0; id < 1000; ++id) {
        SCOPED_TRACE(id);
        const Reading reading = readingOf(*cursor, Properties(id));
        const auto check = checks.find(id);
        if (check != checks.end()) {
            check->second(reading);
        } else {
            EXPECT_TRUE(std::holds_alternative<std::monostate>(reading))
                << "nothing here checks " << described(reading);
        }
    }
}

TEST_F(RealMachine, MemoryOfOneWalkAddsUp) {
    const auto number = [&](Properties id) {
        unsigned int value = 0;
        EXPECT_TRUE(cursor->readProperty(id, value)) << id;
        return std::uint64_t{value};
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
    char expected[256] = "";
    ASSERT_EQ(::gethostname(expected, sizeof expected), 0);
    std::string name;
    EXPECT_TRUE(cursor->readComputerName(name));
    EXPECT_EQ(name, expected);
}

// The code that the host's own tool gives reason for; nothing where it says something else.
std::optional<unsigned int> statusBySystemctl() {
    const std::map<std::string, unsigned int> codes{
        {"running", 1},     {"initializing", 2}, {"starting", 2}, {"degraded", 21},
        {"maintenance", 8}, {"stopping", 16},    {"offline", 12}};
    const auto found = codes.find(shell("systemctl is-system-running 2>/dev/null"));
    return found == codes.end() ? std::nullopt : std::optional(found->second);
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
