#include "support/FixtureTree.h"

#include <fcntl.h>
#include <sys/stat.h>

#include <filesystem>
#include <stdexcept>

namespace fs = std::filesystem;

void FixtureTree::makeFolder(const std::string& name) const {
    fs::create_directories(path(name));
}

void FixtureTree::makeFifo(const std::string& name) const {
    fs::create_directories(fs::path(path(name)).parent_path());
    if (::mkfifo(path(name).c_str(), 0644) != 0) throw std::runtime_error("no FIFO " + path(name));
}

void FixtureTree::makeLink(const std::string& name, const std::string& target) const {
    fs::create_directories(fs::path(path(name)).parent_path());
    fs::create_symlink(target, path(name));
}

void FixtureTree::remove(const std::string& name) const {
    fs::remove_all(path(name));
}

void FixtureTree::dateAhead(const std::string& name) const {
    // The last second that a 32-bit time holds: so much of it the standard library reads.
    constexpr struct timespec year2038 { 2147483647, 0 };
    const struct timespec dates[2] = {year2038, year2038};
    if (::utimensat(AT_FDCWD, path(name).c_str(), dates, 0) != 0)
        throw std::runtime_error("cannot date " + path(name));
}

void FixtureTree::writeCompleteHost() const {
    write("etc/os-release", "NAME=\"Test Linux\"\nVERSION_ID=\"7.1\"\n");
    write("etc/machine-id", "0123456789abcdef0123456789abcdef\n");
    write("proc/stat", "cpu  1 2 3 4 0 0 0 0 0 0\nbtime 1700000000\nprocesses 4711\n");
    write("proc/meminfo",
          "MemTotal:       16777216 kB\n"
          "MemFree:         1000000 kB\n"
          "MemAvailable:    8388608 kB\n"
          "Buffers:          500000 kB\n"
          "Cached:          3000000 kB\n"
          "SwapTotal:       2097152 kB\n"
          "SwapFree:        1048576 kB\n");
    write("proc/sys/kernel/pid_max", "32768\n");
    write("proc/sys/kernel/threads-max", "127412\n");
    for (const char* pid : {"1", "20", "300"}) makeFolder(std::string("proc/") + pid);
    write("run/systemd/sessions/1", "UID=1000\nSTATE=active\nCLASS=user\n");
    write("run/systemd/sessions/c2", "UID=1001\nSTATE=online\nCLASS=user\n");
}
