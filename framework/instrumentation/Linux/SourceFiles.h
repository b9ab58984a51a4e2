#ifndef VA_LINUX_SOURCE_FILES_H
#define VA_LINUX_SOURCE_FILES_H

#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "HostFiles.h"

namespace VA::Linux {

/// The files that a value is made of: reads them, and tells later whether the value still holds.
/// Each is looked at before it is opened; only what is a regular file, or a folder, is opened. One
/// thread makes the value; then any number of threads may ask.
class SourceFiles {
  public:
    /// So many files may a value be made of that is to be kept.
    static constexpr std::size_t mostFiles = 256;

    /// `now` is the time in seconds since the epoch, not later than the first read. The files
    /// outlive this object.
    SourceFiles(const HostFiles& files, std::int64_t now);

    std::optional<FileContent> read(const std::string& path);
    std::optional<std::vector<std::string>> names(const std::string& folder);

    /// True when a file or folder that was not simply missing could not be looked at, opened or
    /// read whole.
    bool metFailure() const { return metFailure_; }

    /// True when a later look can tell whether the value still holds: every file was read whole and
    /// none was changed so short a time before that another change could bear the same time.
    bool canBeKept() const;

    /// True when every file is as it was, those that were not there included. Takes one look each.
    bool areUnchanged() const;

  private:
    struct Look {
        std::string path;
        std::optional<FileState> state;
    };

    std::optional<FileState> lookAt(const std::string& path);

    const HostFiles* files_;
    std::int64_t now_;
    bool readWhole_ = true;
    bool metFailure_ = false;
    std::vector<Look> looks_;
};

}  // namespace VA::Linux

#endif
