#include "host/server/HttpLibrary.h"

#include <algorithm>
#include <array>
#include <cerrno>
#include <cstdio>
#include <cstring>
#include <functional>
#include <memory>
#include <stdexcept>
#include <utility>

#include "host/server/HttpRules.h"

namespace cmpihost::server {

namespace {

using Phase = HttpConnection::Phase;

/// Enough for a provider's work; only what is touched takes memory.
constexpr std::size_t threadStackBytes = 1024 * 1024;

/// Copies the fields of a header and watches that they are all that was sent. The library hands out
/// its read buffer, with nulls where names and values end. Where a field does not begin right after
/// the two bytes of the line end before it, the library has joined, cut or skipped something: a
/// folded line, a null, a field without a name, a line end without CR. Another program may have
/// read such a header in another way.
class FieldReader {
  public:
    FieldReader(const char* version, HttpRequest& request)
        : request_(request), next_(version + std::strlen(version) + lineEnd) {}

    /// Whether the fields and the empty line after them end there.
    bool endsAt(const char* end) const { return exact_ && next_ + lineEnd == end; }

    static MHD_Result read(void* self, MHD_ValueKind, const char* name, std::size_t nameLength,
                           const char* value, std::size_t valueLength) noexcept {
        try {
            static_cast<FieldReader*>(self)->read({name, nameLength}, {value, valueLength});
            return MHD_YES;
        } catch (const std::exception&) {
            static_cast<FieldReader*>(self)->exact_ = false;
            return MHD_NO;
        }
    }

  private:
    static constexpr std::size_t lineEnd = 2;

    void read(std::string_view name, std::string_view value) {
        const char* const colon = name.data() + name.size();
        exact_ = exact_ && name.data() == next_ && std::less<>()(colon, value.data()) &&
                 std::all_of(colon + 1, value.data(), [](char c) { return c == ' ' || c == '\t'; });
        next_ = value.data() + value.size() + lineEnd;
        while (!value.empty() && (value.back() == ' ' || value.back() == '\t')) {
            value.remove_suffix(1);
        }
        request_.headers.emplace_back(name, value);
    }

    HttpRequest& request_;
    const char* next_;
    bool exact_ = true;
};

/// Whether this is a version of the library that leaves a header in its buffer as FieldReader reads
/// it, and that is lenient with headers. Later versions are strict by themselves where they are
/// told to be.
bool isLenientVersion() {
    return std::string_view(MHD_get_version()).substr(0, 4) == "0.9.";
}

struct ResponseDeleter {
    void operator()(MHD_Response* response) const { MHD_destroy_response(response); }
};

HttpResponse closingResponse(unsigned status) {
    HttpResponse response;
    response.status = status;
    response.close = true;
    return response;
}

HttpConnection* connectionOf(MHD_Connection* library) {
    const auto* info = MHD_get_connection_info(library, MHD_CONNECTION_INFO_SOCKET_CONTEXT);
    return info == nullptr ? nullptr : static_cast<HttpConnection*>(info->socket_context);
}

}  // namespace

HttpLibrary::HttpLibrary(HttpHandler& handler, const HttpLimits& limits, const HttpEvents& events,
                         HttpConnections& connections, const TlsIdentity* tls)
    : handler_(handler), limits_(limits), events_(events), connections_(connections) {
    unsigned flags = MHD_USE_THREAD_PER_CONNECTION | MHD_USE_INTERNAL_POLLING_THREAD |
                     MHD_USE_POLL | MHD_USE_NO_LISTEN_SOCKET | MHD_USE_ITC | MHD_USE_ERROR_LOG;
    std::array<MHD_OptionItem, 4> secure{{{MHD_OPTION_END, 0, nullptr}}};
    if (tls != nullptr) {
        // The library declares these texts as if it might change them, and does not.
        static constexpr const char* versions = "NORMAL:-VERS-ALL:+VERS-TLS1.3:+VERS-TLS1.2";
        flags |= MHD_USE_TLS;
        secure = {{{MHD_OPTION_HTTPS_MEM_CERT, 0, const_cast<char*>(tls->certificate.c_str())},
                   {MHD_OPTION_HTTPS_MEM_KEY, 0, const_cast<char*>(tls->key.c_str())},
                   {MHD_OPTION_HTTPS_PRIORITIES, 0, const_cast<char*>(versions)},
                   {MHD_OPTION_END, 0, nullptr}}};
    }
    // It must never come to its own limit of connections, where it forgets to unlock its list of
    // them. Its memory for a connection holds the header, a list of its fields and what is being
    // read.
    daemon_ = MHD_start_daemon(
        flags, 0, nullptr, nullptr, &onRequest, this, MHD_OPTION_EXTERNAL_LOGGER, &onComplaint,
        this, MHD_OPTION_URI_LOG_CALLBACK, &onRequestLine, this, MHD_OPTION_NOTIFY_COMPLETED,
        &onCompleted, this, MHD_OPTION_NOTIFY_CONNECTION, &onConnection, this,
        MHD_OPTION_CONNECTION_LIMIT, 1000 + 2 * limits_.connections,
        MHD_OPTION_CONNECTION_MEMORY_LIMIT, 4 * limits_.headerBytes, MHD_OPTION_THREAD_STACK_SIZE,
        threadStackBytes, MHD_OPTION_STRICT_FOR_CLIENT, isLenientVersion() ? 0 : 1,
        MHD_OPTION_ARRAY, secure.data(), MHD_OPTION_END);
    if (daemon_ == nullptr) {
        throw std::runtime_error("HTTP does not start: " +
                                 (complaint_.empty() ? std::strerror(errno) : complaint_));
    }
    started_ = true;
}

HttpLibrary::~HttpLibrary() {
    MHD_stop_daemon(daemon_);
}

bool HttpLibrary::serve(int socket, const sockaddr_storage& address, socklen_t length) {
    return MHD_add_connection(daemon_, socket, reinterpret_cast<const sockaddr*>(&address),
                              length) == MHD_YES;
}

/// Reads the header; false where it is the end of the request, which has a response then.
bool HttpLibrary::begin(MHD_Connection* library, HttpConnection& connection, const char* method,
                        const char* version) {
    HttpRequest& request = connection.request;
    connection.begun = true;
    connection.asked = HttpConnection::Clock::now();
    request.method = method;
    request.version = version;
    request.peer = connection.peer;
    FieldReader fields(version, request);
    MHD_get_connection_values_n(library, MHD_HEADER_KIND, &FieldReader::read, &fields);
    const auto* size = MHD_get_connection_info(library, MHD_CONNECTION_INFO_REQUEST_HEADER_SIZE);
    const bool asSent =
        size != nullptr && (!isLenientVersion() || fields.endsAt(method + size->header_size));
    if (!asSent) {
        connection.response = closingResponse(400);
    } else if (const unsigned status = refusalOfHeader(request, size->header_size, limits_)) {
        connection.response = closingResponse(status);
    } else {
        return true;
    }
    return false;
}

MHD_Result HttpLibrary::take(MHD_Connection* library, HttpConnection& connection,
                             const char* method, const char* version, const char* data,
                             std::size_t* size) {
    if (!connection.begun) {
        if (!begin(library, connection, method, version)) return respond(library, connection);
        connection.enter(Phase::Body);
        return MHD_YES;
    }
    if (*size > 0) {
        // A body in chunks may get here; the library cannot respond any more by now.
        if (*size > limits_.bodyBytes - connection.request.body.size()) {
            connections_.tellCut(connection.peer, "the body was too long");
            connection.cut = true;
            return MHD_NO;
        }
        connection.request.body.append(data, *size);
        *size = 0;
        return MHD_YES;
    }
    connection.asked = HttpConnection::Clock::now();
    connection.enter(Phase::Answer);
    connection.response = answerTo(connection.request);
    if (connection.response.delay.count() > 0) {
        connections_.delay(connection, connection.response.delay);
    }
    // Programs differ in what they take for the end of a chunk: nothing after it is a request.
    if (connection.request.header("Transfer-Encoding") != nullptr) connection.response.close = true;
    return respond(library, connection);
}

HttpResponse HttpLibrary::answerTo(const HttpRequest& request) noexcept {
    try {
        return handler_.answer(request);
    } catch (...) {
        return closingResponse(500);
    }
}

MHD_Result HttpLibrary::respond(MHD_Connection* library, HttpConnection& connection) {
    HttpResponse& response = connection.response;
    connection.answered = true;
    connection.enter(Phase::Response);
    if (connections_.ending()) response.close = true;
    // The body stays where it is until the response is complete.
    const std::unique_ptr<MHD_Response, ResponseDeleter> queued(MHD_create_response_from_buffer(
        response.body.size(), response.body.data(), MHD_RESPMEM_PERSISTENT));
    if (queued == nullptr) return MHD_NO;
    for (const auto& [name, value] : response.headers) {
        if (MHD_add_response_header(queued.get(), name.c_str(), value.c_str()) != MHD_YES) {
            return MHD_NO;
        }
    }
    if (response.close) MHD_add_response_header(queued.get(), "Connection", "close");
    return MHD_queue_response(library, response.status, queued.get());
}

void HttpLibrary::finish(HttpConnection& connection, bool complete) noexcept {
    connection.enter(Phase::Idle);
    if (!complete && !connection.cut && !connections_.ending()) {
        connections_.tellCut(connection.peer, connection.answered
                                                  ? "the client left before its response"
                                                  : "the request was incomplete or malformed");
    }
    try {
        if (connection.answered && events_.answered) {
            events_.answered(connection.request, connection.response,
                             HttpConnection::Clock::now() - connection.asked);
        }
    } catch (const std::exception&) {
        // Whoever keeps the log has lost a line of it.
    }
    connection.request = {};
    connection.response = {};
    connection.begun = false;
    connection.answered = false;
}

void* HttpLibrary::onRequestLine(void*, const char* target, MHD_Connection* library) noexcept {
    HttpConnection* connection = connectionOf(library);
    if (connection == nullptr) return nullptr;
    connection->enter(Phase::Header);
    try {
        connection->request.target = target;
    } catch (const std::exception&) {
        // Nothing depends on it.
    }
    return nullptr;
}

MHD_Result HttpLibrary::onRequest(void* self, MHD_Connection* library, const char*,
                                  const char* method, const char* version, const char* data,
                                  std::size_t* size, void**) noexcept {
    HttpConnection* connection = connectionOf(library);
    if (connection == nullptr) return MHD_NO;
    try {
        return static_cast<HttpLibrary*>(self)->take(library, *connection, method, version, data,
                                                     size);
    } catch (const std::exception&) {
        return MHD_NO;
    }
}

void HttpLibrary::onCompleted(void* self, MHD_Connection* library, void**,
                              MHD_RequestTerminationCode how) noexcept {
    HttpConnection* connection = connectionOf(library);
    if (connection == nullptr) return;
    static_cast<HttpLibrary*>(self)->finish(*connection,
                                            how == MHD_REQUEST_TERMINATED_COMPLETED_OK);
}

void HttpLibrary::onConnection(void* self, MHD_Connection* library, void** context,
                               MHD_ConnectionNotificationCode what) noexcept {
    auto& connections = static_cast<HttpLibrary*>(self)->connections_;
    const auto* info = MHD_get_connection_info(library, MHD_CONNECTION_INFO_CONNECTION_FD);
    if (what == MHD_CONNECTION_NOTIFY_STARTED) {
        *context = connections.find(info->connect_fd);
    } else if (*context != nullptr) {
        connections.remove(static_cast<HttpConnection*>(*context)->socket);
        *context = nullptr;
    }
}

void HttpLibrary::onComplaint(void* self, const char* format, va_list arguments) noexcept {
    if (static_cast<HttpLibrary*>(self)->started_) return;
    auto& complaint = static_cast<HttpLibrary*>(self)->complaint_;
    std::array<char, 256> text{};
    const int length = std::vsnprintf(text.data(), text.size(), format, arguments);
    try {
        if (length > 0) complaint += (complaint.empty() ? "" : " ") + std::string(text.data());
        while (!complaint.empty() && complaint.back() == '\n') complaint.pop_back();
    } catch (const std::exception&) {
        // What was said before is there.
    }
}

}  // namespace cmpihost::server
