#ifndef FRAMEWORK_LOGGING_LOGGER_H
#define FRAMEWORK_LOGGING_LOGGER_H

#include <array>
#include <atomic>
#include <chrono>
#include <cstdint>
#include <memory>
#include <mutex>

#include "ConfigurationFile.h"
#include "Environment.h"
#include "Sinks.h"

namespace ZBLog {

/// What one channel lets pass, as far as one word can tell: almost every record is decided here, by
/// one load, without a look at the configuration. Categories are none of its business.
/// Any thread may ask and set at any time.
class LevelFilter {
  public:
    /// Nothing passes.
    constexpr LevelFilter() = default;

    void set(const ChannelConfiguration& channel) noexcept;
    void close() noexcept { word_ = closed; }

    bool passes(int level, std::string_view text) const noexcept {
        const int word = word_.load(std::memory_order_relaxed);
        if (word == closed || level > word / 2) return false;
        return word % 2 == 0 || isFailure(text);
    }

  private:
    static constexpr int closed = -1;

    std::atomic<int> word_{closed};  // else twice the finest level, plus one for failures only
};

/// A configuration in force: what it says, and the sinks that it needs. What readers look at never
/// changes.
struct ActiveConfiguration {
    Configuration configuration;
    std::array<std::shared_ptr<Sink>, channelCount> sinks;  ///< null: off
    std::unique_ptr<ActiveConfiguration> older;  ///< replaced ones that somebody may still read
};

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
    /// `environment` must outlive the logger. Constant-initialised: usable before any constructor
    /// of the program has run.
    explicit constexpr Logger(Environment& environment) noexcept : environment_(environment) {}
    /// Nobody may be writing.
    ~Logger() { close(); }
    Logger(const Logger&) = delete;
    Logger& operator=(const Logger&) = delete;

    /// Writes a record to its channel, if it passes. errno is left alone.
    void write(const Record& record) noexcept {
        checkConfiguration();
        if (filters_[indexOf(record.channel)].passes(record.level, record.text)) deliver(record);
    }

    /// Activates a configuration, and lets go of the file. For tests.
    /// Does nothing after close. Throws std::bad_alloc.
    void use(const Configuration& configuration);

    /// Ends logging for good: files are closed, memory is freed, later records go nowhere. If a
    /// thread is still writing (a process that exits does not wait for its threads), what that
    /// thread may use is left in place.
    void close() noexcept;

  private:
    enum class State { unread, running, closed };

    class ScopedReader;

    /// Looks at the configuration file when it is time to.
    void checkConfiguration() noexcept;
    /// Waits `limit` for another thread that is at it.
    void readConfiguration(std::chrono::milliseconds limit) noexcept;
    void follow(ConfigurationFile& file);
    void report(const std::string& path, const ConfigurationError& error) noexcept;
    void activate(const Configuration& configuration);
    void freeOlder() noexcept;
    void deliver(const Record& record) noexcept;

    Environment& environment_;
    std::atomic<State> state_{State::unread};
    std::atomic<std::uint32_t> lastCheck_{0};  // of the file, in milliseconds
    std::array<LevelFilter, channelCount> filters_{};
    std::atomic<ActiveConfiguration*> active_{nullptr};  // owned
    std::atomic<unsigned> readers_{
        0};                   // threads that may hold the active configuration or an older
    std::timed_mutex mutex_;  // for all below, and for changes of active_
    std::unique_ptr<ConfigurationFile> file_;
    std::unique_ptr<ActiveConfiguration> leftOver_;  // the last one, should somebody still read it
};

/// The logger behind ZBLogger.
Logger& processLogger() noexcept;

}  // namespace ZBLog

#endif
