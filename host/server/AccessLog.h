#ifndef HOST_SERVER_ACCESS_LOG_H
#define HOST_SERVER_ACCESS_LOG_H

#include <functional>
#include <string>
#include <vector>

#include "host/server/HttpMessage.h"
#include "host/server/Log.h"

namespace cmpihost::server {

/// Logs what another handler answers, and what it has to complain of afterwards. A line holds the
/// peer, the user (or -), the operation (or -), the HTTP status, the CIM status, the microseconds:
/// "127.0.0.1 - GetInstance 200 6 412us".
class AccessLog final : public HttpHandler {
  public:
    using Complaints = std::function<std::vector<std::string>()>;

    /// Handler and log outlive this object. `complaints` gives the lines that are to be logged
    /// after each answer; any threads may call it at once.
    AccessLog(HttpHandler& handler, Log& log, Complaints complaints);

    HttpResponse answer(const HttpRequest& request) override;

    /// Logs the complaints that there are.
    void logComplaints();

  private:
    HttpHandler& handler_;
    Log& log_;
    const Complaints complaints_;
};

}  // namespace cmpihost::server

#endif
