// Requests run on threads of an object manager that nobody may hold up, and most of their records
// are filtered out. So readers take no lock: a configuration never changes once it is active, and
// one that was replaced is freed when no reader can be holding it.
#include "Logger.h"

#include <pthread.h>
#include <syslog.h>

#include <cerrno>

#include "Timeout.h"

namespace ZBLog {

namespace {

/// Leaves a thread as it was found: errno keeps its value, and while this object lives the thread
/// is not cancelled (a cancellation would unwind through code that promises not to throw, with
/// locks held; it takes effect at the thread's next cancellation point instead).
class ScopedErrnoAndCancelState {
  public:
    ScopedErrnoAndCancelState() noexcept : error_(errno) {
        ::pthread_setcancelstate(PTHREAD_CANCEL_DISABLE, &cancelState_);
    }
    ~ScopedErrnoAndCancelState() {
        int ignored = 0;
        ::pthread_setcancelstate(cancelState_, &ignored);
        errno = error_;
    }
    ScopedErrnoAndCancelState(const ScopedErrnoAndCancelState&) = delete;
    ScopedErrnoAndCancelState& operator=(const ScopedErrnoAndCancelState&) = delete;

  private:
    int error_;
    int cancelState_ = PTHREAD_CANCEL_ENABLE;
};

bool sameDestination(const ChannelConfiguration& one, const ChannelConfiguration& other) {
    return one.destination == other.destination && one.path == other.path;
}

std::shared_ptr<Sink> existingSink(const ChannelConfiguration& wanted,
                                   const ActiveConfiguration* active) {
    if (active == nullptr) return nullptr;
    for (const Channel channel : allChannels) {
        const std::shared_ptr<Sink>& sink = active->sinks[indexOf(channel)];
        if (sink && sameDestination(wanted, active->configuration.of(channel))) return sink;
    }
    return nullptr;
}

std::shared_ptr<Sink> newSink(const ChannelConfiguration& wanted, Environment& environment) {
    switch (wanted.destination) {
        case Destination::off:
            return nullptr;
        case Destination::standardError:
            return std::make_shared<StandardErrorSink>(environment);
        case Destination::systemLog:
            return std::make_shared<SystemLogSink>(environment);
        case Destination::file:
            return std::make_shared<FileSink>(wanted.path, environment);
    }
    return nullptr;
}

/// Channels with the same destination share one sink, so that their lines do not get in each
/// other's way, and a sink that `former` (may be null) has already is taken over with all it knows.
/// Nothing is opened yet.
std::unique_ptr<ActiveConfiguration> makeActive(const Configuration& configuration,
                                                const ActiveConfiguration* former,
                                                Environment& environment) {
    auto active = std::make_unique<ActiveConfiguration>();
    active->configuration = configuration;
    for (const Channel channel : allChannels) {
        const ChannelConfiguration& wanted = configuration.of(channel);
        std::shared_ptr<Sink> sink = existingSink(wanted, former);
        if (!sink) sink = existingSink(wanted, active.get());
        active->sinks[indexOf(channel)] = sink ? std::move(sink) : newSink(wanted, environment);
    }
    return active;
}

}  // namespace

void LevelFilter::set(const ChannelConfiguration& channel) noexcept {
    if (channel.destination == Destination::off) return close();
    word_ = 2 * channel.level + (channel.failuresOnly ? 1 : 0);
}

/// Keeps the configuration that it finds, and all later ones, from being freed. The count goes up
/// before the pointer is read, and whoever replaces the configuration reads the count after that: a
/// count of zero then means that nobody holds the one that was replaced.
class Logger::ScopedReader {
  public:
    explicit ScopedReader(Logger& logger) noexcept : logger_(logger) { ++logger_.readers_; }
    ~ScopedReader() { --logger_.readers_; }
    ScopedReader(const ScopedReader&) = delete;
    ScopedReader& operator=(const ScopedReader&) = delete;

    const ActiveConfiguration* active() const noexcept { return logger_.active_; }

  private:
    Logger& logger_;
};

void Logger::deliver(const Record& record) noexcept {
    const ScopedErrnoAndCancelState scope;
    const ScopedReader reader(*this);
    const ActiveConfiguration* const active = reader.active();
    if (active == nullptr) return;
    if (!active->configuration.of(record.channel).categories.passes(record.category)) return;
    if (Sink* const sink = active->sinks[indexOf(record.channel)].get()) sink->write(record);
}

void Logger::checkConfiguration() noexcept {
    constexpr std::uint32_t interval = 1000;
    if (state_.load(std::memory_order_acquire) == State::unread) return readConfiguration(timeout);
    const std::uint32_t now = environment_.milliseconds();
    std::uint32_t last = lastCheck_.load(std::memory_order_relaxed);
    if (now - last >= interval && lastCheck_.compare_exchange_strong(last, now)) {
        readConfiguration(noWaiting);
    }
}

void Logger::readConfiguration(std::chrono::milliseconds limit) noexcept {
    const ScopedErrnoAndCancelState scope;
    const auto lock = tryLockFor(mutex_, limit);
    if (!lock.owns_lock() || state_ == State::closed) return;
    try {
        if (!file_) {
            file_ = std::make_unique<ConfigurationFile>(environment_.configurationSource(),
                                                        environment_);
        }
        follow(*file_);
        freeOlder();
        lastCheck_ = environment_.milliseconds();
        State unread = State::unread;  // not if the end has come meanwhile
        state_.compare_exchange_strong(unread, State::running);
    } catch (...) {
        file_.reset();  // out of memory: the next look begins anew
    }
}

void Logger::follow(ConfigurationFile& file) {
    const auto changed = file.readIfChanged();
    if (!changed) return;
    activate(changed->configuration);
    for (const ConfigurationError& error : changed->errors) report(file.path(), error);
    if (!changed->errors.empty()) report(file.path(), {0, "not in force; the defaults hold"});
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
    environment_.writeSystemLog(LOG_DAEMON | LOG_WARNING, line.nulTerminated());
}

void Logger::activate(const Configuration& configuration) {
    ActiveConfiguration* const former = active_;
    auto next = makeActive(configuration, former, environment_);
    next->older.reset(former);
    ActiveConfiguration* const current = next.release();
    active_ = current;
    for (const Channel channel : allChannels) {
        filters_[indexOf(channel)].set(current->configuration.of(channel));
    }
}

void Logger::freeOlder() noexcept {
    if (readers_ == 0) active_.load()->older.reset();
}

void Logger::use(const Configuration& configuration) {
    const auto lock = tryLockFor(mutex_, timeout);
    if (!lock.owns_lock() || state_ == State::closed) return;
    activate(configuration);
    freeOlder();
    file_ = std::make_unique<ConfigurationFile>(ConfigurationSource{}, environment_);
    static_cast<void>(file_->readIfChanged());
    state_ = State::running;
}

void Logger::close() noexcept {
    const ScopedErrnoAndCancelState scope;
    state_ = State::closed;
    const auto lock = tryLockFor(mutex_, timeout);
    for (LevelFilter& filter : filters_) filter.close();
    if (!lock.owns_lock()) return;
    file_.reset();
    if (ActiveConfiguration* const last = active_.exchange(nullptr)) leftOver_.reset(last);
    if (readers_ == 0) leftOver_.reset();
}

}  // namespace ZBLog
