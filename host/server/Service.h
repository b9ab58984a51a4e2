#ifndef HOST_SERVER_SERVICE_H
#define HOST_SERVER_SERVICE_H

#include <filesystem>
#include <stdexcept>
#include <string>
#include <vector>

#include "host/server/HttpServer.h"
#include "host/server/Log.h"

namespace cmpihost::server {

/// The exit statuses of cmpihost-serve.
enum ServiceStatus {
    /// A signal ended it, after the requests that ran.
    serviceEnded = 0,
    /// It cannot listen or serve, or a request would not end.
    serviceFailed = 1,
    /// Wrong usage; a file that is named cannot be used, or what is asked for is not safe.
    serviceRefused = 2,
    /// The registrations or the classes cannot be read.
    serviceNotLoaded = 3
};

/// Why there is no service; what() holds one line.
class ServiceError : public std::runtime_error {
  public:
    ServiceError(ServiceStatus status, const std::string& what)
        : std::runtime_error(what), status_(status) {}
    ServiceStatus status() const noexcept { return status_; }

  private:
    ServiceStatus status_;
};

/// What the user wants, as written.
struct ServiceOptions {
    /// As ListenAddress reads them; empty: the sockets that were passed on, else localhost.
    std::vector<std::string> listen{};
    /// Registration files and folders of them; empty: the ones beside the program.
    std::vector<std::string> registrations{};
    /// MOF files and folders of them; empty: the folder beside the program.
    std::vector<std::string> schemas{};
    /// PEM files; empty: no TLS.
    std::string certificate{};
    std::string key{};
    /// Empty: nobody is asked for a password.
    std::string users{};
    /// What requests may name this host, beside localhost and its own name.
    std::vector<std::string> hostNames{};
    HttpLimits limits{};
    LogLevel logLevel = LogLevel::Failures;
};

/// Serves until a signal ends it (SIGTERM, SIGINT); SIGHUP reads certificate, key and users again,
/// SIGUSR1 logs the counters. To be called once, by the only thread of the process, which finds
/// these signals blocked afterwards. What belongs to a program in `programFolder` is taken where
/// the options name nothing. Throws ServiceError where it cannot start.
ServiceStatus serve(const ServiceOptions& options, const std::filesystem::path& programFolder,
                    Log& log);

}  // namespace cmpihost::server

#endif
