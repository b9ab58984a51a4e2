#include "MountTable.h"

#include <mntent.h>
#include <sys/statvfs.h>

#include <algorithm>
#include <cerrno>
#include <cstdio>
#include <iterator>
#include <memory>
#include <system_error>
#include <vector>

namespace {

/// Served by another machine or by a program, either of which may fail to answer.
constexpr const char* externalTypes[] = {"9p",  "afs",  "ceph", "cifs",    "fuse",
                                         "nfs", "nfs4", "smb3", "virtiofs"};
constexpr const char* temporaryTypes[] = {"devtmpfs", "ramfs", "tmpfs"};

template <std::size_t count>
bool contains(const char* const (&types)[count], const std::string& type) {
    return std::find(std::begin(types), std::end(types), type) != std::end(types);
}

Persistence persistenceOf(const std::string& type) {
    // Programs add their name: fuse.sshfs.
    if (contains(externalTypes, type) || type.rfind("fuse.", 0) == 0) return Persistence::External;
    return contains(temporaryTypes, type) ? Persistence::Temporary : Persistence::Persistent;
}

std::optional<Space> spaceOf(const std::string& folder) {
    struct statvfs counts {};
    if (::statvfs(folder.c_str(), &counts) != 0) return std::nullopt;
    const std::uint64_t blockSize = counts.f_frsize;
    return Space{counts.f_blocks * blockSize, counts.f_bavail * blockSize};
}

struct CloseMounts {
    void operator()(std::FILE* file) const { ::endmntent(file); }
};

/// Everything on the list but the space.
FileSystems readList(const std::string& file) {
    const std::unique_ptr<std::FILE, CloseMounts> list(::setmntent(file.c_str(), "re"));
    if (list == nullptr) throw std::system_error(errno, std::generic_category(), file);
    FileSystems result;
    // A line has three texts of up to a page each: device, mount point, options.
    std::vector<char> line(16384);
    mntent entry{};
    // Unlike getmntent, it is safe in a process with several threads. It also undoes the escapes:
    // a blank in a name is \040 in the file.
    while (::getmntent_r(list.get(), &entry, line.data(), static_cast<int>(line.size()))) {
        const std::string type = entry.mnt_type;
        const bool readOnly = ::hasmntopt(&entry, MNTOPT_RO) != nullptr;
        result.insert_or_assign(entry.mnt_dir, FileSystem{entry.mnt_fsname, type, readOnly,
                                                          persistenceOf(type), std::nullopt});
    }
    return result;
}

}  // namespace

FileSystems readFileSystems(const std::string& root) {
    FileSystems result = readList(root + "/proc/self/mounts");
    for (auto item = result.begin(); item != result.end();) {
        FileSystem& fileSystem = item->second;
        // To ask a mount point of autofs would have something mounted there.
        bool empty = fileSystem.type == "autofs";
        if (!empty && fileSystem.persistence != Persistence::External) {
            fileSystem.space = spaceOf(root + item->first);
            empty = fileSystem.space && fileSystem.space->totalBytes == 0;
        }
        item = empty ? result.erase(item) : std::next(item);
    }
    return result;
}
