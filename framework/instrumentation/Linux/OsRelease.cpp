#include "OsRelease.h"

#include "Assignments.h"
#include "PlainText.h"

namespace VA::Linux {

OsRelease readOsRelease(SourceFiles& files) {
    auto file = files.read("etc/os-release");
    if (!file) file = files.read("usr/lib/os-release");
    if (!file) return {};
    const auto plainValue = [&](const char* name) {
        auto value = assignedValue(file->text, name);
        return value && isPlainText(*value) ? value : std::nullopt;
    };
    return {plainValue("NAME"), plainValue("VERSION_ID"), plainValue("BUILD_ID")};
}

}  // namespace VA::Linux
