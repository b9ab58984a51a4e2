#ifndef VA_LINUX_OS_RELEASE_H
#define VA_LINUX_OS_RELEASE_H

#include <optional>
#include <string>

#include "SourceFiles.h"

namespace VA::Linux {

/// The values of os-release that are plain text.
struct OsRelease {
    std::optional<std::string> name, versionId, buildId;
};

/// Reads etc/os-release or, where that cannot be opened, usr/lib/os-release; never both.
OsRelease readOsRelease(SourceFiles& files);

}  // namespace VA::Linux

#endif
