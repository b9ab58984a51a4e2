#ifndef HOST_SERVER_ACCESS_LOG_H
#define HOST_SERVER_ACCESS_LOG_H

#include <chrono>
#include <functional>
#include <mutex>
#include <string>
#include <vector>

#include "host/broker/Broker.h"
#include "host/server/HttpServer.h"
#include "host/server/Log.h"

namespace cmpihost::server {

/// Logs what clients were answered, as far as the level of the log goes, and what the server has to
/// complain of afterwards. The line of a request holds the peer, the user (or -), the operation (or
/// -), the HTTP status, the CIM status and the microseconds: "127.0.0.1 - GetInstance 200 6 412us".
/// Any threads may call it at once.
class AccessLog {
  public:
    using Complaints = std::function<std::vector<std::string>()>;

    /// The log outlives this object. `complaints` gives the lines that came since its last call.
    /// Of the connections that are cut in each `period` ten are told, and later how many more.
    AccessLog(Log& log, Complaints complaints,
              std::chrono::milliseconds period = std::chrono::seconds(1));

    void answered(const HttpRequest& request, const HttpResponse& response,
                  std::chrono::nanoseconds took);
    void cut(const std::string& peer, const char* reason);
    void logComplaints();

  private:
    using Clock = std::chrono::steady_clock;

    void logMoreCuts();

    Log& log_;
    const Complaints complaints_;
    const std::chrono::milliseconds period_;
    /// Guards what follows.
    std::mutex mutex_;
    Clock::time_point periodStart_{};
    unsigned cuts_ = 0;
};

/// Logs what a provider logs through its broker, as far as the level of the log goes. Any thread
/// may call it.
void logProviderMessage(Log& log, const ProviderMessage& message);

}  // namespace cmpihost::server

#endif
