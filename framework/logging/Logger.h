#ifndef ZBLOG_LOGGER_H
#define ZBLOG_LOGGER_H

#include <array>
#include <atomic>
#include <chrono>
#include <cstdint>
#include <memory>
#include <mutex>

#include "ConfigurationFile.h"
#include "Gate.h"
#include "Setup.h"
#include "Surroundings.h"

namespace ZBLog {

/// The two channels and the configuration that they follow.
///
/// The configuration is read when the first record comes. From then on, a record that comes a
/// second or more after the last look at the file causes another look (one stat); the thread that
/// brought it does the reading, the others go on with the configuration that they find. Errors go
/// to the system's log, once for each change of the file, and the defaults hold.
/// A record that does not pass costs a few loads and a look at the clock: no system call apart from
/// that stat, no allocation, no lock.
///
/// Any number of threads may write. After a fork, the child goes on with the same files; if another
/// thread was writing at that moment, or reading the configuration, the child has lost that lock:
/// it then drops the records of that sink (see LineSink) or keeps the configuration that it has.
class Logger {
  public:
    /// `surroundings` must outlive the logger. Constant-initialised: usable before any constructor
    /// of the program has run.
    explicit constexpr Logger(Surroundings& surroundings) noexcept : surroundings_(surroundings) {}
    /// Nobody may be writing.
    ~Logger() { close(); }
    Logger(const Logger&) = delete;
    Logger& operator=(const Logger&) = delete;

    /// Writes a record to its channel, if it passes. errno is left alone.
    void write(const Record& record) noexcept {
        keepUp();
        if (gates_[indexOf(record.channel)].passes(record.level, record.text)) deliver(record);
    }

    /// Puts a configuration in force, and lets go of the file. For tests.
    /// Does nothing after close. Throws std::bad_alloc.
    void use(const Configuration& configuration);

    /// Ends logging for good: files are closed, memory is freed, later records go nowhere. If a
    /// thread is still writing (a process that exits does not wait for its threads), what that
    /// thread may use is left in place.
    void close() noexcept;

  private:
    enum class State { unread, running, closed };

    class Reading;

    /// Looks at the configuration file when it is time to.
    void keepUp() noexcept;
    /// Waits `longest` for another thread that is at it.
    void readConfiguration(std::chrono::milliseconds longest) noexcept;
    void follow(ConfigurationFile& file);
    void report(const std::string& path, const ConfigurationError& error) noexcept;
    void putInForce(const Configuration& configuration);
    void freeOlder() noexcept;
    void deliver(const Record& record) noexcept;

    Surroundings& surroundings_;
    std::atomic<State> state_{State::unread};
    std::atomic<std::uint32_t> lookedAt_{0};  // milliseconds, of the last look at the file
    std::array<Gate, channelCount> gates_{};
    std::atomic<Setup*> setup_{nullptr};  // owned
    std::atomic<unsigned> readers_{0};    // threads that may hold a setup, the current or an older
    std::timed_mutex mutex_;              // for all below, and for changes of setup_
    std::unique_ptr<ConfigurationFile> file_;
    std::unique_ptr<Setup> leftOver_;  // the last setup, should somebody still read it
};

/// The logger behind ZBLogger.
Logger& processLogger() noexcept;

}  // namespace ZBLog

#endif
