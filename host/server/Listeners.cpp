#include "host/server/Listeners.h"

#include <fcntl.h>

#include <algorithm>
#include <chrono>
#include <stdexcept>
#include <system_error>
#include <utility>

#include "host/server/ConfigurationFile.h"
#include "host/server/ServiceManager.h"

namespace cmpihost::server {

Listeners::Listeners(const ServiceOptions& options, HttpHandler& handler, const HttpEvents& events)
    : options_(options),
      handler_(handler),
      events_(events),
      speaksTls_(!options.certificate.empty()) {
    const std::optional<TlsIdentity> identity = readIdentity();
    for (base::FileDescriptor& socket : takePassedSockets()) {
        const ListenAddress address = ListenAddress::of(socket.number());
        refuseUnsafe(address);
        listeners_.push_back({address, std::move(socket), true});
    }
    for (const std::string& text : options_.listen) listenOn(text);
    if (listeners_.empty()) listenOn(speaksTls_ ? "localhost:5989" : "localhost:5988");
    for (Listener& listener : listeners_) listener.server = serverFor(listener, identity);
}

/// Absent: no TLS.
std::optional<TlsIdentity> Listeners::readIdentity() const {
    if (!speaksTls_) return std::nullopt;
    return TlsIdentity{readConfigurationFile(options_.certificate, false),
                       readConfigurationFile(options_.key, true)};
}

void Listeners::listenOn(const std::string& text) {
    for (const ListenAddress& address : ListenAddress::read(text)) {
        refuseUnsafe(address);
        try {
            base::FileDescriptor socket = address.listen();
            const ListenAddress bound = address.at(socket.number());
            listeners_.push_back({bound, std::move(socket)});
        } catch (const std::system_error& error) {
            const bool noFamily = error.code() == std::errc::address_family_not_supported ||
                                  error.code() == std::errc::address_not_available;
            if (!address.isOptional() || !noFamily)
                throw ServiceError(serviceFailed, std::string("cannot listen on ") + error.what());
        }
    }
}

void Listeners::refuseUnsafe(const ListenAddress& address) const {
    if (address.isLocal()) return;
    if (address.isPlain())
        throw ServiceError(serviceRefused, address.text() +
                                               " can be reached from other hosts: plain: is for "
                                               "loopback addresses");
    const bool safe = speaksTls_ && !options_.users.empty();
    if (!safe)
        throw ServiceError(serviceRefused, address.text() +
                                               " can be reached from other hosts: this takes TLS "
                                               "(--tls-cert, --tls-key) and --users");
}

bool Listeners::speaksTls(const Listener& listener) const {
    return speaksTls_ && !listener.address.isPlain();
}

/// Throws std::runtime_error.
std::unique_ptr<HttpServer> Listeners::serverFor(const Listener& listener,
                                                 const std::optional<TlsIdentity>& identity) const {
    base::FileDescriptor socket(fcntl(listener.socket.number(), F_DUPFD_CLOEXEC, 0));
    const bool tls = speaksTls(listener);
    try {
        return std::make_unique<HttpServer>(std::move(socket), handler_, options_.limits,
                                            tls ? &*identity : nullptr, events_);
    } catch (const std::runtime_error& error) {
        if (!tls) throw;
        throw std::runtime_error(options_.certificate + ", " + options_.key + ": " + error.what());
    }
}

std::vector<std::string> Listeners::urls() const {
    std::vector<std::string> urls;
    for (const Listener& listener : listeners_) {
        const char* const scheme = listener.address.isUnix() ? ""
                                   : speaksTls(listener)     ? "https://"
                                                             : "http://";
        urls.push_back(scheme + listener.address.text());
    }
    return urls;
}

void Listeners::replaceIdentity() {
    const std::optional<TlsIdentity> identity = readIdentity();
    std::vector<std::unique_ptr<HttpServer>> servers;
    for (const Listener& listener : listeners_)
        servers.push_back(speaksTls(listener) ? serverFor(listener, identity) : nullptr);
    for (std::size_t place = 0; place < servers.size(); ++place) {
        if (servers[place])
            retire(std::exchange(listeners_[place].server, std::move(servers[place])));
    }
}

void Listeners::retire(std::unique_ptr<HttpServer> server) {
    const auto isDone = [](const std::future<void>& each) {
        return each.wait_for(std::chrono::seconds(0)) == std::future_status::ready;
    };
    retired_.erase(std::remove_if(retired_.begin(), retired_.end(), isDone), retired_.end());
    server->stopListening();
    retired_.push_back(
        std::async(std::launch::async, [ending = std::move(server)]() mutable { ending.reset(); }));
}

void Listeners::stop() {
    for (Listener& listener : listeners_) {
        retire(std::move(listener.server));
        if (!listener.isPassed) listener.address.removeFile();
    }
    retired_.clear();
}

}  // namespace cmpihost::server
