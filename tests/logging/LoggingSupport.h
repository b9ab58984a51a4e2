#ifndef TESTS_LOGGING_LOGGING_SUPPORT_H
#define TESTS_LOGGING_LOGGING_SUPPORT_H

#include <atomic>
#include <functional>
#include <mutex>
#include <string>
#include <vector>

#include "framework/logging/Configuration.h"
#include "framework/logging/Environment.h"
#include "support/TemporaryDirectory.h"

namespace logging_test {

/// An environment whose clocks stand still until they are moved, and whose system log is a list of
/// lines, each "PRIORITY TEXT".
class FakeEnvironment final : public ZBLog::Environment {
  public:
    std::uint32_t milliseconds() noexcept override { return milliseconds_; }
    timespec utc() noexcept override;
    void writeSystemLog(int priority, const char* text) noexcept override;
    ZBLog::ConfigurationSource configurationSource() override { return source; }

    void advance(std::uint32_t milliseconds) { milliseconds_ += milliseconds; }
    void setMilliseconds(std::uint32_t milliseconds) { milliseconds_ = milliseconds; }

    /// Seconds by which the time of day is ahead of the real one.
    void setAhead(long seconds) { ahead_ = seconds; }

    /// Makes the time of day stand still at `seconds`.
    void stopUtcAt(time_t seconds) { stoppedAt_ = seconds; }

    /// The lines since the last call.
    std::vector<std::string> takeSystemLog();

    ZBLog::ConfigurationSource source;

  private:
    std::atomic<std::uint32_t> milliseconds_{5000};
    std::atomic<long> ahead_{0};
    std::atomic<time_t> stoppedAt_{0};
    std::mutex mutex_;
    std::vector<std::string> lines_;
};

void writeFile(const std::string& path, const std::string& content);
std::string readFile(const std::string& path);

/// The texts of the records in `text`, one a line, without the fields before them.
std::vector<std::string> textsOf(const std::string& text);

/// The text of a message record.
constexpr const char* failure = "MESSAGE [File: Work.cpp, Line: 12]: it broke";

/// A record of a category "Zumbrel.Test" by the function "work" in "Work.cpp", line 12.
ZBLog::Record record(const std::string& text, int level = 3000,
                     ZBLog::Channel channel = ZBLog::Channel::log);

/// A channel that takes everything up to level 4000.
ZBLog::ChannelConfiguration everythingTo(ZBLog::Destination destination,
                                         const std::string& path = "");

/// What the system's log is told by the library itself.
std::string warningOf(const std::string& text);

/// What it is told when `output` loses its first record for `reason`.
std::string lossOf(const std::string& output, const std::string& reason);

/// The number of descriptors that the process has open.
std::size_t openDescriptors();

/// Runs `work` in a child process; its result is the child's exit status, or 1000 plus the signal
/// that ended it.
int inChildProcess(const std::function<int()>& work);

/// Puts another file in the place of standard error while it lives.
class StandardErrorAs {
  public:
    explicit StandardErrorAs(int descriptor);
    ~StandardErrorAs();
    StandardErrorAs(const StandardErrorAs&) = delete;
    StandardErrorAs& operator=(const StandardErrorAs&) = delete;

  private:
    int former_;
};

}  // namespace logging_test

#endif
