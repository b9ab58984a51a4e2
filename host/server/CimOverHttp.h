#ifndef HOST_SERVER_CIM_OVER_HTTP_H
#define HOST_SERVER_CIM_OVER_HTTP_H

#include <atomic>
#include <chrono>
#include <mutex>
#include <optional>
#include <string>
#include <vector>

#include "host/server/HttpMessage.h"
#include "host/server/ObjectManager.h"

namespace cmpihost::server {

/// Says who may ask. Several threads call it at once.
class AccessControl {
  public:
    virtual ~AccessControl() = default;

    struct Verdict {
        bool allowed = false;
        /// Who it is; none: a client that need not say.
        std::optional<std::string> user{};
        /// So long the client waits for a refusal.
        std::chrono::milliseconds delay{0};
    };
    /// Judges the header Authorization.
    virtual Verdict judge(const HttpRequest& request) = 0;

  protected:
    AccessControl() = default;
    AccessControl(const AccessControl&) = default;
    AccessControl& operator=(const AccessControl&) = default;
};

/// CIM operations over HTTP: looks at what surrounds a message, has it carried out and wraps the
/// response.
class CimOverHttp final : public HttpHandler {
  public:
    struct Options {
        /// What a Host header may name, without a port; literal addresses are always welcome.
        std::vector<std::string> hostNames{};
        /// So many operations run at once; one more is answered 503.
        unsigned mostAtOnce = 64;
    };

    /// Both references outlive this object.
    CimOverHttp(ObjectManager& manager, AccessControl& access, Options options);

    /// An empty body, or one over the limits, is a request like any other.
    HttpResponse answer(const HttpRequest& request) override;

  private:
    HttpResponse carriedOut(const HttpRequest& request, const std::optional<std::string>& user);

    ObjectManager& manager_;
    AccessControl& access_;
    const Options options_;
    std::atomic<unsigned> running_ = 0;
    /// Held while a long message is worked on.
    std::mutex longMessage_;
};

}  // namespace cmpihost::server

#endif
