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
#include <string>

#include "framework/instrumentation/Linux/Systemd.h"
#include "framework/instrumentation/LinuxHost.h"
#include "support/Properties.h"

namespace {

using namespace VA::NodeLexicon;

// What a number, or the instant of a date, has to be, give or take the tolerance; nothing where the
// property is to be absent.
struct Expected {
    std::optional<double> value;
    double tolerance = 0;
};

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

std::optional<double> meminfoKiB(const std::string& row) {
    return shellNumber("awk '$1 == \"" + row + ":\" {print $2}' /proc/meminfo 2>/dev/null");
}

// A size that sysinfo tells, in kilobytes.
double sysinfoKiB(unsigned long size(const struct sysinfo&)) {
    struct sysinfo info {};
    EXPECT_EQ(::sysinfo(&info), 0);
    return static_cast<double>(size(info)) * info.mem_unit / 1024.0;
}

double ram() {
    return sysinfoKiB([](const struct sysinfo& info) { return info.totalram; });
}

double swap() {
    return sysinfoKiB([](const struct sysinfo& info) { return info.totalswap; });
}

Expected totalSwap() {
    return {swap(), 1.0};
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

Expected installDate() {
    for (const char* command : {"stat -c %W /", "stat -L -c %Z /var/log/installer 2>/dev/null",
                                "stat -L -c %Z /etc/machine-id 2>/dev/null"}) {
        const auto found = shellNumber(command);
        if (found && *found > 694224000 - 1 && *found < bootInstant() + 1 &&
            *found <= static_cast<double>(std::time(nullptr)))
            return {found, 1.0};
    }
    return {};
}

Expected processes() {
    glob_t found{};
    EXPECT_EQ(::glob("/proc/[0-9]*", GLOB_ONLYDIR, nullptr, &found), 0);
    const auto count = static_cast<double>(found.gl_pathc);
    ::globfree(&found);
    return {count, 100.0};  // others come and go meanwhile
}

Expected users() {
    if (::access("/run/systemd/sessions", R_OK | X_OK) == 0) {
        return {
            shellNumber("cd /run/systemd/sessions; for s in *; do "
                        "if [ -f \"$s\" ] && grep -qxE 'CLASS=user(-early)?(-light)?' \"$s\" && "
                        "! grep -qx STATE=closing \"$s\"; then echo x; fi; done | wc -l")};
    }
    if (::access("/run/utmp", R_OK) == 0 || ::access("/var/run/utmp", R_OK) == 0)
        return {shellNumber("who | wc -l"), 10.0};
    return {};
}

const std::map<unsigned int, std::function<Expected()>> dates{
    {InstallDate, installDate},
    {LastBootUpTime,
     [] {
         return Expected{bootInstant(), 2.0};
     }},
};

const std::map<unsigned int, std::function<Expected()>> numbers{
    {OSType, [] { return Expected{35}; }},
    {NumberOfProcesses, processes},
    {NumberOfUsers, users},
    {NumberOfLicensedUsers, [] { return Expected{0}; }},
    {TotalVirtualMemorySize,
     [] {
         return Expected{ram() + swap(), 8.0};
     }},
    {FreeVirtualMemory,
     [] {
         return Expected{meminfoKiB("MemAvailable").value() + meminfoKiB("SwapFree").value_or(0),
                         ram() / 4};
     }},
    {FreePhysicalMemory,
     [] {
         return Expected{meminfoKiB("MemAvailable"), ram() / 4};
     }},
    {TotalVisibleMemorySize,
     [] {
         return Expected{ram(), 8.0};
     }},
    {TotalSwapSpaceSize, totalSwap},
    {SizeStoredInPagingFiles, totalSwap},
    {FreeSpaceInPagingFiles,
     [] {
         return Expected{sysinfoKiB([](const struct sysinfo& info) { return info.freeswap; }),
                         swap() / 4};
     }},
};

const std::map<unsigned int, bool> flags{{Distributed, false}};

// The commands of the properties that a shell can read, by number.
std::map<unsigned int, std::string> shellCommands(bool ofTexts) {
    std::map<unsigned int, std::string> commands;
    for (const PublishedProperty& each : operatingSystemProperties)
        if (each.command != nullptr && each.isText() == ofTexts) commands[each.id] = each.command;
    return commands;
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

    static void expectNear(std::optional<double> actual, const Expected& expected) {
        ASSERT_EQ(actual.has_value(), expected.value.has_value());
        if (actual) {
            EXPECT_NEAR(*actual, std::min(*expected.value, 4294967295.0), expected.tolerance);
        }
    }

    const std::shared_ptr<VA::HostSource> host = VA::makeLinuxHost();
    std::unique_ptr<VA::NodeCursor> cursor;
};

TEST_F(RealMachine, EveryPropertyAgreesWithAnIndependentReading) {
    const auto textCommands = shellCommands(true);
    const auto numberCommands = shellCommands(false);
    for (unsigned int id = 0; id < 1000; ++id) {
        SCOPED_TRACE(id);
        const auto text = read<std::string>(id);
        const auto number = read<unsigned int>(id);
        if (textCommands.count(id) != 0) {
            EXPECT_EQ(text, shell(textCommands.at(id)));
        } else if (dates.count(id) != 0) {
            expectNear(text ? std::optional(instantOf(*text)) : std::nullopt, dates.at(id)());
        } else {
            EXPECT_FALSE(text) << "nothing here checks " << *text;
        }
        const auto actual = number ? std::optional<double>(*number) : std::nullopt;
        if (numberCommands.count(id) != 0) {
            expectNear(actual, {shellNumber(numberCommands.at(id))});
        } else if (numbers.count(id) != 0) {
            expectNear(actual, numbers.at(id)());
        } else {
            EXPECT_FALSE(number) << "nothing here checks " << *number;
        }
        const auto flag = flags.find(id);
        EXPECT_EQ(read<bool>(id), flag == flags.end() ? std::nullopt : std::optional(flag->second));
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
