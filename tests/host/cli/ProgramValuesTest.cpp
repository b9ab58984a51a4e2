// What the built program prints of this machine, held against the machine itself.
#include <gmock/gmock.h>
#include <sys/stat.h>
#include <sys/utsname.h>
#include <unistd.h>

#include <cctype>
#include <cstdio>
#include <ctime>
#include <filesystem>
#include <fstream>
#include <nlohmann/json.hpp>
#include <sstream>

#include "host/cli/Cmpihost.h"

namespace {

using nlohmann::json;

json thisMachine() {
    const ProgramRun run = cmpihost({"--format", "json", "ei", "KORVA_OperatingSystem"});
    EXPECT_EQ(run.status, 0);
    const json printed = json::parse(run.out);
    EXPECT_EQ(printed.size(), 1U);
    return printed.at(0).at("properties");
}

// NAME=value or Name: value, without quotes.
std::string valueIn(const std::string& file, const std::string& name) {
    std::ifstream stream(file);
    for (std::string line; std::getline(stream, line);) {
        if (line.rfind(name, 0) != 0 || line.size() == name.size()) continue;
        if (line[name.size()] != '=' && line[name.size()] != ':' && line[name.size()] != ' ')
            continue;
        std::string value = line.substr(name.size() + 1);
        value.erase(0, value.find_first_not_of(" \t\""));
        value.erase(value.find_last_not_of(" \t\"") + 1);
        return value;
    }
    return "";
}

long long kibibytes(const std::string& name) {
    return std::stoll("0" + valueIn("/proc/meminfo", name));
}

std::size_t processes() {
    std::size_t count = 0;
    for (const auto& entry : std::filesystem::directory_iterator("/proc")) {
        const std::string name = entry.path().filename();
        if (name.find_first_not_of("0123456789") == std::string::npos) ++count;
    }
    return count;
}

// The instant that a text shows, in seconds since 1970; the format reads year, month, day, hour,
// minute and second, then the sign, hours and minutes of the offset. 0 when the text is none.
std::time_t instant(const std::string& text, const char* format) {
    std::tm fields{};
    char sign = '+';
    int hours = 0;
    int minutes = 0;
    if (std::sscanf(text.c_str(), format, &fields.tm_year, &fields.tm_mon, &fields.tm_mday,
                    &fields.tm_hour, &fields.tm_min, &fields.tm_sec, &sign, &hours,
                    &minutes) != 9) {
        return 0;
    }
    fields.tm_year -= 1900;
    fields.tm_mon -= 1;
    const int offset = (hours * 60 + minutes) * 60;
    return timegm(&fields) - (sign == '-' ? -offset : offset);
}

TEST(ProgramValues, NameAndVersionAreThoseOfTheDistribution) {
    utsname names{};
    uname(&names);
    const json machine = thisMachine();
    EXPECT_EQ(machine.at("CSName"), nodeName());
    const std::string name = valueIn("/etc/os-release", "NAME");
    const std::string version = valueIn("/etc/os-release", "VERSION_ID");
    EXPECT_EQ(machine.at("Name"), name.empty() ? names.sysname : name);
    if (!version.empty()) {
        EXPECT_EQ(machine.at("Version"), version);
    }
    EXPECT_EQ(machine.at("OSType"), 36);
    EXPECT_EQ(machine.at("Status"), "OK");
    EXPECT_EQ(machine.at("Description"), "");
    EXPECT_EQ(machine.at("Distributed"), false);
    EXPECT_EQ(machine.at("NumberOfLicensedUsers"), 0);
}

TEST(ProgramValues, NumbersAreNamedInTheTable) {
    const ProgramRun run = cmpihost({"ei", "KORVA_OperatingSystem", "OSType,EnabledState"});
    EXPECT_THAT(run.out, testing::HasSubstr("  OSType               36 (LINUX)\n"));
    EXPECT_THAT(run.out, testing::ContainsRegex("  EnabledState         [0-9]+ \\([A-Z]"));
}

TEST(ProgramValues, StateIsTheOneOfSystemdOrEnabledAndInServiceWhereNoneRuns) {
    const json running = {2, 5, {2, 11}};
    const json states[] = {
        running,       // running
        {10, 0, {0}},  // initializing, starting
        {5, 10, {3}},  // degraded
        {9, 0, {0}},   // maintenance
        {3, 0, {0}},   // stopping
        {6, 0, {0}},   // offline
        {0, 0, {0}},   // no answer
    };
    const json machine = thisMachine();
    const json state = {machine.at("EnabledState"), machine.at("HealthState"),
                        machine.at("OperationalStatus")};
    EXPECT_THAT(states, testing::Contains(state));
    struct stat folder {};
    if (stat("/run/systemd/system", &folder) != 0) {
        EXPECT_EQ(state, running);
    }
}

TEST(ProgramValues, BootTimeIsTheKernelsAndTheSameInstantInEveryZone) {
    const std::string boot = valueIn("/proc/stat", "btime");
    ASSERT_FALSE(boot.empty());
    EXPECT_EQ(instant(thisMachine().at("LastBootUpTime"), "%4d%2d%2d%2d%2d%2d.000000%c%1d%2d"),
              std::stoll(boot));
    for (const char* zone : {"TZ=UTC0", "TZ=EST5", "TZ=IST-5:30", "TZ=NST3:30", "TZ=CET-1CEST"}) {
        const ProgramRun run = cmpihost({"ei", "KORVA_OperatingSystem", "LastBootUpTime"}, {zone});
        const std::size_t shown = run.out.find('(', run.out.find("LastBootUpTime"));
        ASSERT_NE(shown, std::string::npos) << run.out;
        EXPECT_EQ(instant(run.out.substr(shown), "(%d-%d-%d %d:%d:%d %c%d:%d)"), std::stoll(boot))
            << zone << run.out;
    }
}

TEST(ProgramValues, MemoryAndSwapAreTheKernels) {
    const json machine = thisMachine();
    const long long total = kibibytes("MemTotal");
    const long long swap = kibibytes("SwapTotal");
    EXPECT_EQ(machine.at("TotalVisibleMemorySize"), total);
    EXPECT_EQ(machine.at("TotalSwapSpaceSize"), swap);
    EXPECT_EQ(machine.at("SizeStoredInPagingFiles"), swap);
    EXPECT_EQ(machine.at("TotalVirtualMemorySize"), total + swap);
    const long long available = kibibytes("MemAvailable");
    EXPECT_NEAR(machine.at("FreePhysicalMemory").get<double>(), static_cast<double>(available),
                static_cast<double>(total) / 4);
    EXPECT_EQ(machine.at("FreeVirtualMemory").get<long long>() -
                  machine.at("FreePhysicalMemory").get<long long>(),
              machine.at("FreeSpaceInPagingFiles").get<long long>());
}

TEST(ProgramValues, ProcessesAreThoseThatProcLists) {
    const double before = static_cast<double>(processes());
    EXPECT_NEAR(thisMachine().at("NumberOfProcesses").get<double>(), before, before / 2 + 20);
}

// What finds the one operating system of this machine, and what does not.
TEST(ProgramValues, BareGetFindsTheNodeByEitherKeyInAnyLetterCase) {
    const json machine = thisMachine();
    const auto inUpperCase = [&](const char* key) {
        std::string text = machine.at(key);
        for (char& character : text) character = static_cast<char>(std::toupper(character));
        return text;
    };
    const std::string name = inUpperCase("Name");
    const std::string computer = inUpperCase("CSName");
    const std::string start = "KORVA_OperatingSystem.";
    for (const std::string& keys :
         {"CSName=\"" + computer + "\",Name=\"" + name + "\"", "Name=\"" + name + "\"",
          "CSName=\"" + computer + "\"",
          "CSCreationClassName=\"Wrong\",CreationClassName=\"Wrong\",Name=\"" + name + "\""}) {
        const ProgramRun run = cmpihost({"--bare", "gi", start + keys, "Status"});
        EXPECT_EQ(run.status, 0) << keys;
        EXPECT_THAT(run.out, testing::HasSubstr("  Status  ")) << keys;
    }
    for (const std::string& keys : {"Name=\"" + name + " \"", std::string("Name=\"unknown\""),
                                    "CSName=\"" + computer + ".\""}) {
        const ProgramRun run = cmpihost({"--bare", "gi", start + keys});
        EXPECT_EQ(run.status, 0) << keys;
        EXPECT_EQ(run.out, "") << keys;
    }
}

TEST(ProgramValues, FullDiskUnderTheLogCostsNoRequest) {
    const std::string configuration =
        testing::TempDir() + "full-disk-" + std::to_string(::getpid()) + ".conf";
    std::ofstream(configuration) << "log.sink = file:/dev/full\nlog.level = 4000\n"
                                    "log.records = all\n";
    const ProgramRun run =
        cmpihost({"ein", "KORVA_OperatingSystem"}, {"ZBLOG_CONF=" + configuration});
    EXPECT_EQ(run.status, 0);
    EXPECT_THAT(run.out, testing::StartsWith("root/cimv2:KORVA_OperatingSystem."));
    std::filesystem::remove(configuration);
}

}  // namespace
