#ifndef HOST_CLI_PROVIDER_RECORDS_H
#define HOST_CLI_PROVIDER_RECORDS_H

#include <filesystem>
#include <mutex>
#include <optional>
#include <ostream>
#include <string>
#include <vector>

#include "base/FileDescriptor.h"
#include "host/broker/Broker.h"
#include "host/cli/CommandLine.h"

namespace cmpihost {

/// A configuration of the providers' logging library that it finds in the environment, in place of
/// any other. To be made before the library is loaded; the configuration stays readable, and the
/// variable ZBLOG_CONF set, until the object goes. Not for use by several threads, as the
/// environment is not.
class ScopedLogConfiguration {
  public:
    /// Throws std::system_error.
    explicit ScopedLogConfiguration(const std::string& text);
    ~ScopedLogConfiguration();
    ScopedLogConfiguration(const ScopedLogConfiguration&) = delete;
    ScopedLogConfiguration& operator=(const ScopedLogConfiguration&) = delete;

  private:
    base::FileDescriptor file_;
};

/// The configuration that shows the records of the request on the standard error; empty when it is
/// about the broker's channel alone.
std::string stderrConfiguration(const LogRequest& request);

/// A folder for the records of failures, with what is in it gone at the end of the object's life.
/// Where no folder can be made there are no records.
class FailureRecords {
  public:
    FailureRecords();
    ~FailureRecords();
    FailureRecords(const FailureRecords&) = delete;
    FailureRecords& operator=(const FailureRecords&) = delete;

    /// What configures the logging library to keep a copy of its failures here, and to do besides
    /// what the configuration in the given file says. Empty when that one uses the library's trace
    /// itself, or there is no folder.
    std::string configuration(const std::filesystem::path& inForce = "/etc/zblog.conf") const;

    /// The texts of the failures so far, each once, in their order.
    std::vector<std::string> texts() const;

  private:
    std::filesystem::path folder_;
};

/// What providers log and trace through the broker: shown in lines that begin with "cmpi", as far
/// as the request wants it, and its failures kept.
class BrokerMessages {
  public:
    /// Without a request nothing is shown. The stream outlives the object.
    BrokerMessages(const std::optional<LogRequest>& request, std::ostream& stream)
        : request_(request), stream_(stream) {}

    /// For the broker's sink. Any threads may call it.
    void take(const ProviderMessage& message);

    /// The texts of the failures that were logged so far, in their order.
    std::vector<std::string> failures() const;

  private:
    bool isShown(const ProviderMessage& message) const;

    const std::optional<LogRequest> request_;
    std::ostream& stream_;
    mutable std::mutex mutex_;
    std::vector<std::string> failures_;
};

}  // namespace cmpihost

#endif
