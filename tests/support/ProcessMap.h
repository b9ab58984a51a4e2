#ifndef TESTS_SUPPORT_PROCESS_MAP_H
#define TESTS_SUPPORT_PROCESS_MAP_H

#include <fstream>
#include <string>

/// Whether a file whose path contains `name` is mapped into this process: a library that was
/// unloaded is not.
inline bool isMapped(const std::string& name) {
    std::ifstream maps("/proc/self/maps");
    for (std::string line; std::getline(maps, line);) {
        if (line.find(name) != std::string::npos) return true;
    }
    return false;
}

#endif
