#ifndef FRAMEWORK_LOGGING_SINKS_H
#define FRAMEWORK_LOGGING_SINKS_H

#include <atomic>
#include <mutex>
#include <optional>
#include <string>

#include "Environment.h"
#include "LineBuffer.h"
#include "PosixFile.h"
#include "Record.h"

namespace ZBLog {

/// Where records end. Any number of threads may write at the same time.
class Sink {
  public:
    Sink() = default;
    virtual ~Sink() = default;
    Sink(const Sink&) = delete;
    Sink& operator=(const Sink&) = delete;

    /// Writes one record. What goes wrong stays inside: a sink never fails its caller.
    virtual void write(const Record& record) noexcept = 0;
};

/// Hands records to the system's log (see formatForSystemLog and systemLogPriority).
class SystemLogSink final : public Sink {
  public:
    /// `environment` must outlive the sink, here as below.
    explicit SystemLogSink(Environment& environment) : environment_(environment) {}
    void write(const Record& record) noexcept override;

  private:
    Environment& environment_;
};

/// Writes records as lines (see formatLine), each with one write(2), one thread after the other.
///
/// A record that cannot be written is dropped and counted. The first one is reported to the
/// system's log; when a write succeeds again, a line before it says how many are missing.
/// Whoever waits for the lock does so for two seconds at most (see timeout); from then until a
/// write succeeds, nobody waits. So neither an output that is stuck nor a process that was forked
/// while another thread wrote (the lock is then lost to the child) holds up a request; records are
/// dropped.
class LineSink : public Sink {
  public:
    void write(const Record& record) noexcept final;

  protected:
    /// `name` is the one that the system's log shows.
    LineSink(std::string name, Environment& environment);

    /// A descriptor, or the error that keeps it from being there.
    struct Output {
        int descriptor;
        int error;
    };

    /// Makes ready for the next line. `wait` is false when nothing may be waited for. Called with
    /// the lock held.
    virtual Output output(bool wait) noexcept = 0;

    /// To be called when the output is another file than before: it has no unfinished line.
    void startOfOutput() noexcept { torn_ = false; }

    const std::string& name() const noexcept { return name_; }

  private:
    int writeLocked(const Record& record, LineBuffer& line) noexcept;
    int writeLine(int descriptor, LineBuffer& line) noexcept;
    int writeDropped(int descriptor, Channel channel) noexcept;
    void drop(int error) noexcept;
    void format(const Record& record, LineBuffer& line) noexcept;

    const std::string name_;
    Environment& environment_;
    std::timed_mutex mutex_;
    bool torn_ = false;                      // the output ends in an unfinished line
    std::atomic<unsigned long> dropped_{0};  // since the last line that reported them
    std::atomic<int> reason_{0};             // why the latest of them was dropped
    std::atomic<bool> stuck_{false};         // somebody timed out, and nobody wrote since
};

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
    FileSink(const std::string& path, Environment& environment);

  private:
    Output output(bool wait) noexcept override;
    bool isCurrent() const noexcept;
    int reopen() noexcept;

    PosixFile file_;
    std::optional<FileIdentity> last_;  // the file that was written to last
};

/// Writes to the process's standard error, whatever that is at the moment of writing. A pipe or a
/// terminal that nobody takes from is waited for until the timeout.
class StandardErrorSink final : public LineSink {
  public:
    explicit StandardErrorSink(Environment& environment);

  private:
    Output output(bool wait) noexcept override;
};

}  // namespace ZBLog

#endif
