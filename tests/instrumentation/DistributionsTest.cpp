// Hosts as distributions lay them out.
#include <gtest/gtest.h>

#include "support/TestHost.h"

namespace {

using namespace VA::NodeLexicon;

TEST(Distributions, HostWithSystemdTellsEverything) {
    TestHost host;
    const FixtureTree& tree = host.tree();
    tree.write("proc/stat",
               "cpu  10 0 20 3000 4 0 1 0 0 0\ncpu0 10 0 20 3000 4 0 1 0 0 0\n"
               "intr 9000 12 0 0 7\nctxt 12345\nbtime 1700000000\nprocesses 9999\n"
               "procs_running 1\nprocs_blocked 0\n");
    tree.write("proc/meminfo",
               "MemTotal:        8000000 kB\nMemFree:         2000000 kB\n"
               "MemAvailable:    5000000 kB\nBuffers:          100000 kB\n"
               "Cached:          3000000 kB\nSwapCached:            0 kB\n"
               "SwapTotal:       1000000 kB\nSwapFree:         900000 kB\n");
    tree.write("proc/sys/kernel/pid_max", "4194304\n");
    tree.write("proc/sys/kernel/threads-max", "62432\n");
    for (const char* name : {"proc/1", "proc/512", "proc/513", "proc/irq"}) tree.makeFolder(name);
    tree.makeLink("proc/self", "512");
    tree.write("usr/lib/os-release",
               "PRETTY_NAME=\"Debian GNU/Linux 12 (bookworm)\"\nNAME=\"Debian GNU/Linux\"\n"
               "VERSION_ID=\"12\"\nID=debian\n");
    tree.makeLink("etc/os-release", "../usr/lib/os-release");
    tree.makeFolder("run/systemd/system");
    tree.write("run/systemd/sessions/1",
               "# private\nUID=1000\nUSER=ada\nACTIVE=1\nSTATE=active\nREMOTE=1\nTYPE=tty\n"
               "CLASS=user\nSCOPE=session-1.scope\n");
    tree.write("run/systemd/sessions/c1", "UID=110\nSTATE=online\nCLASS=greeter\n");
    tree.write("run/systemd/sessions/9", "UID=1001\nSTATE=closing\nCLASS=user\n");
    tree.makeFifo("run/systemd/sessions/1.ref");
    tree.write("run/utmp",
               utmpRecord(utmpUserProcess, 512, "ada") + utmpRecord(utmpUserProcess, 513, "bob"));
    host.files->fixedDates = {{"var/log/installer", {std::nullopt, 1650000000}}};
    host.manager->state = "degraded";

    const std::pair<Properties, unsigned int> numbers[] = {
        {OSType, 35},
        {MaxNumberOfProcesses, 62432},
        {MaxProcessMemorySize, 0},
        {NumberOfProcesses, 3},
        {NumberOfUsers, 1},
        {NumberOfLicensedUsers, 0},
        {TotalVirtualMemorySize, 9000000},
        {FreeVirtualMemory, 5900000},
        {FreePhysicalMemory, 5000000},
        {TotalVisibleMemorySize, 8000000},
        {TotalSwapSpaceSize, 1000000},
        {SizeStoredInPagingFiles, 1000000},
        {FreeSpaceInPagingFiles, 900000},
    };
    for (const auto& [id, number] : numbers) EXPECT_EQ(host.number(id), number) << id;
    EXPECT_EQ(host.flag(Distributed), false);
    EXPECT_EQ(host.text(Name), "Debian GNU/Linux");
    EXPECT_EQ(host.text(Version), "12");
    EXPECT_EQ(host.text(LastBootUpTime), "2023-11-14-22:13:20");
    EXPECT_EQ(host.text(InstallDate), "2022-04-15-05:20:00");
    EXPECT_EQ(host.cursor()->nodeStatus(), 21u);
}

TEST(Distributions, HaveTheirNameAndVersionInOsRelease) {
    const struct {
        const char *osRelease, *name, *version;
    } rows[] = {
        {"NAME=\"Red Hat Enterprise Linux\"\nVERSION=\"9.3 (Plow)\"\nID=\"rhel\"\n"
         "VERSION_ID=\"9.3\"\nLOGO='fedora-logo-icon'\n",
         "Red Hat Enterprise Linux", "9.3"},
        {"NAME=\"SLES\"\nVERSION=\"15-SP5\"\nVERSION_ID=\"15.5\"\n"
         "PRETTY_NAME=\"SUSE Linux Enterprise Server 15 SP5\"\n",
         "SLES", "15.5"},
        {"NAME='Alpine Linux'\nVERSION_ID=3.19.0\n", "Alpine Linux", "3.19.0"},
        // a rolling release has its build, or else its kernel
        {"NAME=\"Arch Linux\"\nID=arch\nBUILD_ID=rolling\nANSI_COLOR=\"38;2;23\"\n", "Arch Linux",
         "rolling"},
        {"NAME=\"Debian GNU/Linux\"\nID=debian\n", "Debian GNU/Linux", "6.1.0-18"},
    };
    TestHost host;
    for (const auto& row : rows) {
        host.tree().write("etc/os-release", row.osRelease);
        EXPECT_EQ(host.text(Name), row.name);
        EXPECT_EQ(host.text(Version), row.version);
    }
}

}  // namespace
