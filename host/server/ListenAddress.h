#ifndef HOST_SERVER_LISTEN_ADDRESS_H
#define HOST_SERVER_LISTEN_ADDRESS_H

#include <sys/socket.h>

#include <string>
#include <vector>

#include "base/FileDescriptor.h"

namespace cmpihost::server {

/// Where clients reach the server: an address with a port, or a socket in the file system.
class ListenAddress {
  public:
    /// Reads "ADDRESS:PORT" (an IPv6 address in brackets), "localhost:PORT" (both loopback
    /// addresses), these behind "plain:" (without TLS where others have it), or "unix:PATH". Throws
    /// std::invalid_argument that says what is wrong.
    static std::vector<ListenAddress> read(const std::string& text);
    /// The address that a socket is bound to. Throws std::system_error.
    static ListenAddress of(int socket);

    bool isUnix() const noexcept { return storage_.ss_family == AF_UNIX; }
    /// Whether only processes of this host reach it.
    bool isLocal() const noexcept;
    /// Whether TLS is not spoken there, whatever else is configured.
    bool isPlain() const noexcept { return plain_ || isUnix(); }
    /// Whether it is no failure that this host has no such family of addresses.
    bool isOptional() const noexcept { return optional_; }

    /// "127.0.0.1:5988", "[::1]:5988", "unix:/run/cim".
    std::string text() const;

    /// A socket that listens there. A file of a socket that nobody listens on any more is replaced.
    /// Throws std::system_error.
    base::FileDescriptor listen() const;
    /// The same, with the address that the socket got: a port where this one says 0.
    ListenAddress at(int socket) const;
    /// Removes the file of a socket in the file system.
    void removeFile() const noexcept;

  private:
    static ListenAddress inet(const std::string& host, const std::string& port);
    static ListenAddress file(const std::string& path);
    void removeStaleFile() const;
    std::string path() const;

    sockaddr_storage storage_{};
    socklen_t length_ = 0;
    bool plain_ = false;
    bool optional_ = false;
};

}  // namespace cmpihost::server

#endif
