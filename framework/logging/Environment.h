#ifndef FRAMEWORK_LOGGING_ENVIRONMENT_H
#define FRAMEWORK_LOGGING_ENVIRONMENT_H

#include <cstdint>
#include <ctime>
#include <string>

namespace ZBLog {

/// Where the configuration stands.
struct ConfigurationSource {
    std::string path;       ///< empty: there is none, the defaults hold
    bool required = false;  ///< whether it is worth a complaint that the file is missing
};

/// The source that an environment variable's value names: null stands for the file that the system
/// has for it, whose absence is normal; an empty text for no file.
ConfigurationSource configurationSourceFrom(const char* variable);

/// What the library needs of the process and the host around it, apart from files. Tests put
/// their own in its place. All functions may be called from any number of threads.
class Environment {
  public:
    /// A steady time in milliseconds that wraps around, read without a system call; it may lag by
    /// a few milliseconds.
    virtual std::uint32_t milliseconds() noexcept = 0;

    /// The time of day.
    virtual timespec utc() noexcept = 0;

    /// Hands one line to the system's log. `priority` contains the facility.
    virtual void writeSystemLog(int priority, const char* text) noexcept = 0;

    /// Asked once, when the first record comes. Throws std::bad_alloc.
    virtual ConfigurationSource configurationSource() = 0;

  protected:
    ~Environment() = default;
};

/// The real one.
///
/// The system's log is only written to: its name, options and mask belong to the process, so
/// openlog, closelog and setlogmask are never called. The C library's own syslog keeps a connection
/// of the process and looks at the time zone, as it does for the process's own lines.
class HostEnvironment final : public Environment {
  public:
    std::uint32_t milliseconds() noexcept override;
    timespec utc() noexcept override;
    void writeSystemLog(int priority, const char* text) noexcept override;

    /// From the environment variable ZBLOG_CONF, which a set-user-id program does not heed; else
    /// /etc/zblog.conf.
    ConfigurationSource configurationSource() override;
};

}  // namespace ZBLog

#endif
