#ifndef HOST_SERVER_LISTENERS_H
#define HOST_SERVER_LISTENERS_H

#include <future>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "base/FileDescriptor.h"
#include "host/server/HttpServer.h"
#include "host/server/ListenAddress.h"
#include "host/server/Service.h"

namespace cmpihost::server {

/// The sockets that a service listens on, each with its HTTP server. One thread uses it.
class Listeners {
  public:
    /// Takes the sockets that were passed on, opens those that the options name, and serves on all;
    /// where there are neither, on localhost. The options, and the handler, outlive this object.
    /// Throws ServiceError for an address that is not safe or cannot be listened on,
    /// std::runtime_error for certificates that are none.
    Listeners(const ServiceOptions& options, HttpHandler& handler, const HttpEvents& events);

    /// Where clients find the service, as URLs: "http://127.0.0.1:5988".
    std::vector<std::string> urls() const;

    /// Reads certificate and key again. New connections are served with the new ones, requests that
    /// run are answered with the old ones. Throws std::runtime_error where the new ones do not
    /// serve, and changes nothing then.
    void replaceIdentity();

    /// Accepts nothing any more, waits for the requests that run and removes the files of sockets.
    void stop();

  private:
    struct Listener {
        ListenAddress address;
        /// Stays open while servers come and go.
        base::FileDescriptor socket;
        bool isPassed = false;
        std::unique_ptr<HttpServer> server{};
    };

    std::optional<TlsIdentity> readIdentity() const;
    void listenOn(const std::string& text);
    void refuseUnsafe(const ListenAddress& address) const;
    bool speaksTls(const Listener& listener) const;
    std::unique_ptr<HttpServer> serverFor(const Listener& listener,
                                          const std::optional<TlsIdentity>& identity) const;
    void retire(std::unique_ptr<HttpServer> server);

    const ServiceOptions& options_;
    HttpHandler& handler_;
    const HttpEvents events_;
    const bool speaksTls_;
    std::vector<Listener> listeners_;
    /// Servers that end with the requests that they have.
    std::vector<std::future<void>> retired_;
};

}  // namespace cmpihost::server

#endif
