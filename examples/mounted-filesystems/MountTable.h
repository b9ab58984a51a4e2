// What is mounted on this host. Nothing here knows of CMPI: it can be tested and replaced by
// itself.
#ifndef MOUNT_TABLE_H
#define MOUNT_TABLE_H

#include <cstdint>
#include <map>
#include <optional>
#include <string>

/// How long the content lasts. The numbers are those of PersistenceType in the MOF.
enum class Persistence : std::uint16_t { Persistent = 2, Temporary = 3, External = 4 };

struct Space {
    std::uint64_t totalBytes;
    /// For users other than root.
    std::uint64_t availableBytes;
};

struct FileSystem {
    std::string device;
    std::string type;
    bool readOnly;
    Persistence persistence;
    /// None: it could not be read, or was not asked for.
    std::optional<Space> space;
};

/// By mount point.
using FileSystems = std::map<std::string, FileSystem>;

/// Reads what the calling process sees as mounted, for a host whose root folder is `root` (empty:
/// this one). Of several file systems on one mount point only the last is there, since it hides the
/// others; file systems that hold no data, such as /proc, are left out. File systems of a network
/// are not asked for their space: while their server is silent, the question would not return.
/// Throws std::system_error when the list of mounts cannot be opened. Any thread may call.
FileSystems readFileSystems(const std::string& root);

#endif
