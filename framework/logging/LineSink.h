#ifndef ZBLOG_LINE_SINK_H
#define ZBLOG_LINE_SINK_H

#include <atomic>
#include <mutex>
#include <string>

#include "LineBuffer.h"
#include "Sink.h"
#include "Surroundings.h"

namespace ZBLog {

/// Writes records as lines (see formatLine), each with one write(2), one thread after the other.
///
/// A record that cannot be written is dropped and counted. The first one is told in the system's
/// log; when a write succeeds again, a line before it says how many are missing.
/// Whoever waits for the lock does so for two seconds at most (see patience); from then until a
/// write succeeds, nobody waits. So neither an output that is stuck nor a process that was forked
/// while another thread wrote (the lock is then lost to the child) holds up a request; records are
/// dropped.
class LineSink : public Sink {
  public:
    void write(const Record& record) noexcept final;

  protected:
    /// `name` is what the system's log is told.
    LineSink(std::string name, Surroundings& surroundings);

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
    int tellDropped(int descriptor, Channel channel) noexcept;
    void drop(int error) noexcept;
    void format(const Record& record, LineBuffer& line) noexcept;

    const std::string name_;
    Surroundings& surroundings_;
    std::timed_mutex mutex_;
    bool torn_ = false;                      // the output ends in an unfinished line
    std::atomic<unsigned long> dropped_{0};  // since the last line that told of them
    std::atomic<int> reason_{0};             // why the latest of them was dropped
    std::atomic<bool> stuck_{false};         // somebody lost patience, and nobody wrote since
};

}  // namespace ZBLog

#endif
