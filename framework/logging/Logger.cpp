#include "Logger.h"

#include <syslog.h>

#include "CallerState.h"
#include "Patience.h"
#include "RecordLine.h"

namespace ZBLog {

/// Keeps the setup that it finds, and all later ones, from being freed. The count goes up before
/// the pointer is read, and whoever replaces the setup reads the count after that: a count of zero
/// then means that nobody holds the one that was replaced.
class Logger::Reading {
  public:
    explicit Reading(Logger& logger) noexcept : logger_(logger) { ++logger_.readers_; }
    ~Reading() { --logger_.readers_; }
    Reading(const Reading&) = delete;
    Reading& operator=(const Reading&) = delete;

    const Setup* setup() const noexcept { return logger_.setup_; }

  private:
    Logger& logger_;
};

void Logger::deliver(const Record& record) noexcept {
    const CallerState caller;
    const Reading reading(*this);
    const Setup* const setup = reading.setup();
    if (setup == nullptr) return;
    const std::size_t index = indexOf(record.channel);
    if (!setup->configuration.channels[index].categories.passes(record.category)) return;
    if (Sink* const sink = setup->sinks[index].get()) sink->write(record);
}

void Logger::keepUp() noexcept {
    constexpr std::uint32_t interval = 1000;
    if (state_.load(std::memory_order_acquire) == State::unread) return readConfiguration(patience);
    const std::uint32_t now = surroundings_.milliseconds();
    std::uint32_t last = lookedAt_.load(std::memory_order_relaxed);
    if (now - last >= interval && lookedAt_.compare_exchange_strong(last, now)) {
        readConfiguration(std::chrono::milliseconds::zero());
    }
}

void Logger::readConfiguration(std::chrono::milliseconds longest) noexcept {
    const CallerState caller;
    const auto lock = lockPatiently(mutex_, longest);
    if (!lock.owns_lock() || state_ == State::closed) return;
    try {
        if (!file_) {
            file_ = std::make_unique<ConfigurationFile>(surroundings_.configurationSource(),
                                                        surroundings_);
        }
        follow(*file_);
        freeOlder();
        lookedAt_ = surroundings_.milliseconds();
        State unread = State::unread;  // not if the end has come meanwhile
        state_.compare_exchange_strong(unread, State::running);
    } catch (...) {
        file_.reset();  // out of memory: all is news again at the next look
    }
}

void Logger::follow(ConfigurationFile& file) {
    const auto news = file.news();
    if (!news) return;
    putInForce(news->configuration);
    for (const ConfigurationError& error : news->errors) report(file.path(), error);
    if (!news->errors.empty()) report(file.path(), {0, "not in force; the defaults hold"});
}

void Logger::report(const std::string& path, const ConfigurationError& error) noexcept {
    LineBuffer line;
    line.put(programName);
    line.put(": ");
    line.putEscaped(path);
    if (error.line != 0) {
        line.put(':');
        line.putNumber(error.line);
    }
    line.put(": ");
    line.put(error.message);
    surroundings_.writeSystemLog(LOG_DAEMON | LOG_WARNING, line.nulTerminated());
}

void Logger::putInForce(const Configuration& configuration) {
    Setup* const former = setup_;
    auto next = makeSetup(configuration, former, surroundings_);
    next->older.reset(former);
    Setup* const current = next.release();
    setup_ = current;
    for (const Channel channel : allChannels) {
        gates_[indexOf(channel)].set(current->configuration.of(channel));
    }
}

void Logger::freeOlder() noexcept {
    if (readers_ == 0) setup_.load()->older.reset();
}

void Logger::use(const Configuration& configuration) {
    const auto lock = lockPatiently(mutex_, patience);
    if (!lock.owns_lock() || state_ == State::closed) return;
    putInForce(configuration);
    freeOlder();
    file_ = std::make_unique<ConfigurationFile>(ConfigurationSource{}, surroundings_);
    static_cast<void>(file_->news());
    state_ = State::running;
}

void Logger::close() noexcept {
    const CallerState caller;
    state_ = State::closed;
    const auto lock = lockPatiently(mutex_, patience);
    for (Gate& gate : gates_) gate.close();
    if (!lock.owns_lock()) return;
    file_.reset();
    if (Setup* const last = setup_.exchange(nullptr)) leftOver_.reset(last);
    if (readers_ == 0) leftOver_.reset();
}

}  // namespace ZBLog
