#ifndef HOST_SERVER_HTTP_LIBRARY_H
#define HOST_SERVER_HTTP_LIBRARY_H

#include <microhttpd.h>
#include <sys/socket.h>

#include <atomic>
#include <cstdarg>
#include <cstddef>
#include <string>

#include "host/server/HttpConnections.h"
#include "host/server/HttpServer.h"

namespace cmpihost::server {

/// The HTTP library, which has a thread for each connection and speaks HTTP there: what it is told
/// and what it calls. It closes the sockets.
class HttpLibrary {
  public:
    /// Starts it. The references outlive this object. Throws as HttpServer does.
    HttpLibrary(HttpHandler& handler, const HttpLimits& limits, const HttpEvents& events,
                HttpConnections& connections, const TlsIdentity* tls);
    /// Waits for the threads of connections.
    ~HttpLibrary();
    HttpLibrary(const HttpLibrary&) = delete;
    HttpLibrary& operator=(const HttpLibrary&) = delete;

    /// Serves a connection that the table of connections has admitted; false where that failed. The
    /// socket is the library's in either case.
    bool serve(int socket, const sockaddr_storage& address, socklen_t length);

  private:
    MHD_Result take(MHD_Connection* library, HttpConnection& connection, const char* method,
                    const char* version, const char* data, std::size_t* size);
    bool begin(MHD_Connection* library, HttpConnection& connection, const char* method,
               const char* version);
    HttpResponse answerTo(const HttpRequest& request) noexcept;
    MHD_Result respond(MHD_Connection* library, HttpConnection& connection);
    void finish(HttpConnection& connection, bool complete) noexcept;

    static void* onRequestLine(void* self, const char* target, MHD_Connection* library) noexcept;
    static MHD_Result onRequest(void* self, MHD_Connection* library, const char* url,
                                const char* method, const char* version, const char* data,
                                std::size_t* size, void** context) noexcept;
    static void onCompleted(void* self, MHD_Connection* library, void** context,
                            MHD_RequestTerminationCode how) noexcept;
    static void onConnection(void* self, MHD_Connection* library, void** context,
                             MHD_ConnectionNotificationCode what) noexcept;
    static void onComplaint(void* self, const char* format, va_list arguments) noexcept;

    HttpHandler& handler_;
    const HttpLimits& limits_;
    const HttpEvents& events_;
    HttpConnections& connections_;
    /// What the library complained of while it started.
    std::string complaint_{};
    std::atomic<bool> started_ = false;
    MHD_Daemon* daemon_ = nullptr;
};

}  // namespace cmpihost::server

#endif
