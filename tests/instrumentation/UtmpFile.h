#ifndef TESTS_INSTRUMENTATION_UTMP_FILE_H
#define TESTS_INSTRUMENTATION_UTMP_FILE_H

#include <cstdint>
#include <string>

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

#endif
