#ifndef HOST_SERVER_LOG_H
#define HOST_SERVER_LOG_H

#include <cstdint>
#include <mutex>
#include <string>
#include <string_view>

namespace cmpihost::server {

/// How much of what clients ask is logged. What the server has to say about itself always is.
enum class LogLevel { None, Failures, Requests };

/// The priorities of the system log.
enum class Priority { Error = 3, Warning = 4, Notice = 5, Info = 6 };

/// Lines for an open file, the standard error as a rule. Each goes out in one piece; where nobody
/// takes it at once it is lost and counted, so that a reader who stops reads does not stop the
/// server. Any threads may write.
class Log {
  public:
    /// The file stays the caller's. `priorities`: each line begins with its priority, "<6>", as the
    /// journal has it.
    Log(int file, LogLevel level, bool priorities);

    LogLevel level() const noexcept { return level_; }

    /// Writes a line. Of the text, bytes that are no printable characters become \xNN, and what is
    /// longer than a line may be is cut.
    void write(Priority priority, std::string_view text);
    /// The same for a text that is written out already.
    void writeClean(Priority priority, std::string_view text);

    /// How many lines were lost.
    std::uint64_t lost() const;

  private:
    std::string lead(Priority priority) const;
    bool put(std::string_view line);

    const int file_;
    const LogLevel level_;
    const bool priorities_;
    /// Guards what follows.
    mutable std::mutex mutex_;
    std::uint64_t lost_ = 0;
    std::uint64_t untold_ = 0;
};

}  // namespace cmpihost::server

#endif
