// What the built program prints of this machine, held against the machine itself.
#include <gmock/gmock.h>
#include <sys/utsname.h>
#include <unistd.h>

#include <cstdio>
#include <ctime>
#include <filesystem>
#include <fstream>
#include <nlohmann/json.hpp>

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

// Of a line "NAME=value" or "name value", the value without quotes.
std::string valueIn(const std::string& file, const std::string& name) {
    std::ifstream stream(file);
    for (std::string line; std::getline(stream, line);) {
        if (line.rfind(name, 0) != 0 || line.size() == name.size()) continue;
        if (line[name.size()] != '=' && line[name.size()] != ' ') continue;
        std::string value = line.substr(name.size() + 1);
        value.erase(0, value.find_first_not_of(" \t\""));
        value.erase(value.find_last_not_of(" \t\"") + 1);
        return value;
    }
    return "";
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
