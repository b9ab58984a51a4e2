// Whole hosts, as distributions lay them out.
#include <gtest/gtest.h>

#include "support/TestHost.h"

namespace {

using namespace VA::NodeLexicon;

void writeKernelFiles(const FixtureTree& tree) {
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
    tree.write("proc/1/stat", "1 (systemd) S 0 1\n");
    tree.write("proc/512/stat", "512 (a name) with ) signs) S 1 1\n");
    tree.write("proc/513/stat", "513 (tmux: server) S 1 1\n");
    tree.makeFolder("proc/irq");
    tree.makeLink("proc/self", "512");
}

void expectKernelValues(TestHost& host) {
    const std::pair<Properties, unsigned int> numbers[] = {
        {OSType, 35},
        {MaxNumberOfProcesses, 62432},
        {MaxProcessMemorySize, 0},
        {NumberOfProcesses, 3},
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
    EXPECT_EQ(host.text(LastBootUpTime), "2023-11-14-22:13:20");
}

TEST(Distributions, DebianWithSystemd) {
    TestHost host;
    const FixtureTree& tree = host.tree();
    writeKernelFiles(tree);
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

    expectKernelValues(host);
    EXPECT_EQ(host.text(Name), "Debian GNU/Linux");
    EXPECT_EQ(host.text(Version), "12");
    EXPECT_EQ(host.text(InstallDate), "2022-04-15-05:20:00");
    EXPECT_EQ(host.number(NumberOfUsers), 1u);
    EXPECT_EQ(host.cursor()->nodeStatus(), 21u);
}

TEST(Distributions, RedHatLikeWithBirthTimeOfTheRootFolder) {
    TestHost host;
    const FixtureTree& tree = host.tree();
    writeKernelFiles(tree);
    tree.write("usr/lib/os-release",
               "NAME=\"Red Hat Enterprise Linux\"\nVERSION=\"9.3 (Plow)\"\nID=\"rhel\"\n"
               "VERSION_ID=\"9.3\"\nLOGO='fedora-logo-icon'\n");
    tree.makeLink("etc/os-release", "../usr/lib/os-release");
    tree.makeFolder("run/systemd/system");
    tree.makeFolder("run/systemd/sessions");
    host.files->fixedDates = {{"", {1660000000, 1}},
                              {"etc/machine-id", {std::nullopt, 1650000000}}};

    expectKernelValues(host);
    EXPECT_EQ(host.text(Name), "Red Hat Enterprise Linux");
    EXPECT_EQ(host.text(Version), "9.3");
    EXPECT_EQ(host.text(InstallDate), "2022-08-08-23:06:40");
    EXPECT_EQ(host.number(NumberOfUsers), 0u);
    EXPECT_EQ(host.cursor()->nodeStatus(), 1u);
}

TEST(Distributions, SuseLikeWithoutUtmp) {
    TestHost host;
    const FixtureTree& tree = host.tree();
    writeKernelFiles(tree);
    tree.write("usr/lib/os-release",
               "NAME=\"SLES\"\nVERSION=\"15-SP5\"\nVERSION_ID=\"15.5\"\n"
               "PRETTY_NAME=\"SUSE Linux Enterprise Server 15 SP5\"\n");
    tree.makeFolder("run/systemd/system");
    tree.write("run/systemd/sessions/4", "CLASS=user\nSTATE=active\n");
    host.manager->state = "starting";

    expectKernelValues(host);
    EXPECT_EQ(host.text(Name), "SLES");
    EXPECT_EQ(host.text(Version), "15.5");
    EXPECT_EQ(host.text(InstallDate), std::nullopt);
    EXPECT_EQ(host.number(NumberOfUsers), 1u);
    EXPECT_EQ(host.cursor()->nodeStatus(), 2u);
}

TEST(Distributions, RollingReleaseHasItsBuildForAVersionOrElseItsKernel) {
    TestHost host;
    writeKernelFiles(host.tree());
    host.tree().write("etc/os-release",
                      "NAME=\"Arch Linux\"\nID=arch\nBUILD_ID=rolling\nANSI_COLOR=\"38;2;23\"\n");
    expectKernelValues(host);
    EXPECT_EQ(host.text(Name), "Arch Linux");
    EXPECT_EQ(host.text(Version), "rolling");
    host.tree().write("etc/os-release", "NAME=\"Debian GNU/Linux\"\nID=debian\n");
    EXPECT_EQ(host.text(Version), "6.1.0-18");
}

TEST(Distributions, SmallHostWithoutSystemdCountsUsersInUtmp) {
    TestHost host;
    writeKernelFiles(host.tree());
    host.tree().write("etc/os-release", "NAME='Alpine Linux'\nVERSION_ID=3.19.0\n");
    host.tree().write("run/utmp", utmpRecord(utmpUserProcess, 512, "ada"));
    expectKernelValues(host);
    EXPECT_EQ(host.text(Name), "Alpine Linux");
    EXPECT_EQ(host.text(Version), "3.19.0");
    EXPECT_EQ(host.number(NumberOfUsers), 1u);
    EXPECT_EQ(host.cursor()->nodeStatus(), 1u);
    EXPECT_EQ(host.manager->calls, 0);
}

TEST(Distributions, ContainerWithHalfOfProcMissingLeavesOutWhatItCannotKnow) {
    TestHost host;
    host.tree().write("etc/os-release", "NAME=\"Container Linux\"\nVERSION_ID=\"1\"\n");
    host.tree().write("proc/meminfo", "MemTotal: 4000 kB\nMemFree: 100 kB\n");
    host.kernel->fixedBootTime = std::nullopt;

    EXPECT_EQ(host.text(Name), "Container Linux");
    for (const Properties id : {InstallDate, LastBootUpTime})
        EXPECT_EQ(host.text(id), std::nullopt) << id;
    for (const Properties id : {MaxNumberOfProcesses, NumberOfProcesses, NumberOfUsers,
                                FreePhysicalMemory, FreeVirtualMemory})
        EXPECT_EQ(host.number(id), std::nullopt) << id;
    EXPECT_EQ(host.number(TotalVisibleMemorySize), 4000u);
    EXPECT_EQ(host.number(TotalVirtualMemorySize), 4000u);
    EXPECT_EQ(host.number(TotalSwapSpaceSize), 0u);
}

TEST(Distributions, HostWithSixTebibytesOfMemorySaturates) {
    TestHost host;
    host.tree().write("proc/meminfo",
                      "MemTotal:     6597069766656 kB\nMemFree:      5497558138880 kB\n"
                      "MemAvailable: 5497558138880 kB\nSwapTotal: 4294967294 kB\n"
                      "SwapFree: 1 kB\n");
    EXPECT_EQ(host.number(TotalVisibleMemorySize), 4294967295u);
    EXPECT_EQ(host.number(FreePhysicalMemory), 4294967295u);
    EXPECT_EQ(host.number(TotalVirtualMemorySize), 4294967295u);
    EXPECT_EQ(host.number(FreeVirtualMemory), 4294967295u);
    EXPECT_EQ(host.number(TotalSwapSpaceSize), 4294967294u);
}

}  // namespace
