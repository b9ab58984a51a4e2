#ifndef ZBLOG_FILE_SINK_H
#define ZBLOG_FILE_SINK_H

#include <optional>
#include <string>

#include "Descriptor.h"
#include "LineSink.h"

namespace ZBLog {

/// Appends to the file that bears a name at the moment of writing.
///
/// The name is looked at before each record, so that a file that was renamed (rotation), removed or
/// replaced is followed at once; it is created, with mode 0640 less the process's umask, when it is
/// not there. Its folder is never created. The file is opened when the first record comes.
/// A name that is a symbolic link is refused: in a folder that others may write to, a link is how a
/// privileged process is made to append to a file of somebody else. Links among the folders before
/// it are followed. Only regular files and character devices are written to; a FIFO is refused.
class FileSink final : public LineSink {
  public:
    FileSink(const std::string& path, Surroundings& surroundings);

  private:
    Output output(bool wait) noexcept override;
    bool isCurrent() const noexcept;
    int reopen() noexcept;

    Descriptor file_;
    std::optional<FileIdentity> last_;  // the file that was written to last
};

}  // namespace ZBLog

#endif
