#include "host/server/CimOverHttp.h"

#include <arpa/inet.h>

#include <algorithm>
#include <array>
#include <cstdint>
#include <string_view>
#include <utility>

#include "base/Ascii.h"
#include "host/server/Dispatcher.h"
#include "host/server/Message.h"

namespace cmpihost::server {

namespace {

constexpr std::size_t longestUsualBody = 64 * 1024;

/// Ends a request before it is an operation.
HttpResponse refusal(unsigned status, const char* cimError = nullptr,
                     std::string_view detail = {}) {
    constexpr std::string_view unreserved = "-._~";
    constexpr std::string_view digits = "0123456789ABCDEF";
    constexpr std::size_t mostDetail = 500;
    HttpResponse response;
    response.status = status;
    if (cimError != nullptr) {
        response.headers.emplace_back("CIMError", cimError);
        // Tells a client of another version which one it may speak.
        if (std::string_view(cimError).find("-version") != std::string_view::npos) {
            response.headers.emplace_back("CIMProtocolVersion", "1.0");
        }
    }
    if (detail.empty()) return response;
    std::string escaped;
    for (const char c : detail.substr(0, mostDetail)) {
        if (base::isAlpha(c) || base::isDigit(c) || unreserved.find(c) != std::string_view::npos) {
            escaped += c;
        } else {
            const auto byte = static_cast<unsigned char>(c);
            escaped += '%';
            escaped += digits[byte / 16U];
            escaped += digits[byte % 16U];
        }
    }
    response.headers.emplace_back("PGErrorDetail", std::move(escaped));
    return response;
}

std::string_view trimmed(std::string_view text) {
    const auto first = text.find_first_not_of(" \t");
    if (first == std::string_view::npos) return {};
    return text.substr(first, text.find_last_not_of(" \t") - first + 1);
}

/// Takes the part before the separator off the front of a text.
std::string_view takePart(std::string_view& text, char separator) {
    const auto end = std::min(text.find(separator), text.size());
    const std::string_view part = text.substr(0, end);
    text.remove_prefix(std::min(end + 1, text.size()));
    return trimmed(part);
}

std::string_view withoutSlashes(std::string_view text) {
    while (!text.empty() && text.front() == '/') text.remove_prefix(1);
    while (!text.empty() && text.back() == '/') text.remove_suffix(1);
    return text;
}

int valueOfHexDigit(char c) {
    if (base::isDigit(c)) return c - '0';
    const char lower = base::toLower(c);
    return lower >= 'a' && lower <= 'f' ? lower - 'a' + 10 : -1;
}

/// %hh decoded; a '%' that begins none stays.
std::string percentDecoded(std::string_view text) {
    std::string result;
    for (std::size_t i = 0; i < text.size(); ++i) {
        const bool escape = text[i] == '%' && i + 2 < text.size() &&
                            valueOfHexDigit(text[i + 1]) >= 0 && valueOfHexDigit(text[i + 2]) >= 0;
        if (escape) {
            result +=
                static_cast<char>(valueOfHexDigit(text[i + 1]) * 16 + valueOfHexDigit(text[i + 2]));
            i += 2;
        } else {
            result += text[i];
        }
    }
    return result;
}

bool isLiteralAddress(const std::string& host) {
    std::array<std::uint8_t, sizeof(in6_addr)> address{};
    if (host.size() > 2 && host.front() == '[' && host.back() == ']') {
        return inet_pton(AF_INET6, host.substr(1, host.size() - 2).c_str(), address.data()) == 1;
    }
    return inet_pton(AF_INET, host.c_str(), address.data()) == 1;
}

/// The port may be left out behind its colon.
bool isPort(const std::string& text) {
    return text.size() <= 5 && std::all_of(text.begin(), text.end(), base::isDigit);
}

/// Whether a Host header names this server. A browser that was told a foreign name for one of this
/// machine's addresses sends that name.
bool namesThisServer(const std::string& header, const std::vector<std::string>& names) {
    const std::size_t bracket = header.substr(0, 1) == "[" ? header.find(']') : 0;
    const auto colon = header.find(':', bracket);
    std::string host = header.substr(0, colon);
    if (colon != std::string::npos && !isPort(header.substr(colon + 1))) return false;
    if (!host.empty() && host.back() == '.') host.pop_back();
    return isLiteralAddress(host) || base::equalsIgnoreCase(host, "localhost") ||
           std::any_of(names.begin(), names.end(), [&host](const std::string& name) {
               return base::equalsIgnoreCase(host, name);
           });
}

/// XML in UTF-8; a type that tells no charset is taken for it.
bool isXml(std::string_view type) {
    const std::string_view essence = takePart(type, ';');
    if (!base::equalsIgnoreCase(essence, "application/xml") &&
        !base::equalsIgnoreCase(essence, "text/xml")) {
        return false;
    }
    while (!type.empty()) {
        std::string_view value = takePart(type, ';');
        if (!base::equalsIgnoreCase(takePart(value, '='), "charset")) continue;
        value = trimmed(value);
        if (value.size() > 2 && value.front() == '"' && value.back() == '"') {
            value = value.substr(1, value.size() - 2);
        }
        if (!base::equalsIgnoreCase(value, "utf-8")) return false;
    }
    return true;
}

/// "1." and digits.
bool isProtocolVersion(std::string_view version) {
    return version.size() > 2 && version.substr(0, 2) == "1." &&
           std::all_of(version.begin() + 2, version.end(), base::isDigit);
}

/// Whether the headers of a name are there and all tell the same as the message.
template <typename Agrees>
bool allAgree(const HttpRequest& request, std::string_view name, bool required, Agrees agrees) {
    bool found = false;
    for (const auto& [each, value] : request.headers) {
        if (!base::equalsIgnoreCase(each, name)) continue;
        if (!agrees(percentDecoded(value))) return false;
        found = true;
    }
    return found || !required;
}

/// Which header says something else than the message; null: none. What a message says of its
/// object is compared no further than its namespace, for honest clients spell paths in many ways.
const char* mismatch(const HttpRequest& request, const Message& message) {
    const bool sameVersion =
        allAgree(request, "CIMProtocolVersion", false,
                 [&](const std::string& value) { return value == message.protocolVersion; });
    if (!sameVersion) return "CIMProtocolVersion differs from PROTOCOLVERSION of the message";
    const bool sameMethod = allAgree(request, "CIMMethod", true, [&](const std::string& value) {
        return message.intrinsic ? base::equalsIgnoreCase(value, message.method)
                                 : value == message.method;
    });
    if (!sameMethod) return "CIMMethod differs from the method of the message";
    const bool sameObject = allAgree(request, "CIMObject", true, [&](const std::string& value) {
        return !message.intrinsic ||
               base::equalsIgnoreCase(withoutSlashes(value), message.nameSpace);
    });
    return sameObject ? nullptr : "CIMObject differs from the namespace of the message";
}

/// What surrounds the message, but for who sends it: none where all is well.
std::optional<HttpResponse> refusalOfMethodAndOrigin(const HttpRequest& request,
                                                     const std::vector<std::string>& hostNames) {
    if (request.method == "M-POST") return refusal(501);
    if (request.method != "POST") {
        HttpResponse response = refusal(405);
        response.headers.emplace_back("Allow", "POST");
        return response;
    }
    if (request.header("Origin") != nullptr) {
        return refusal(403, nullptr, "requests of web pages are not answered");
    }
    const std::string* host = request.header("Host");
    if (host != nullptr && !namesThisServer(*host, hostNames)) {
        return refusal(403, nullptr, "the Host header names another server");
    }
    return std::nullopt;
}

std::optional<HttpResponse> refusalOfCimHeaders(const HttpRequest& request) {
    if (request.header("Content-Length") == nullptr &&
        request.header("Transfer-Encoding") == nullptr) {
        return refusal(411);
    }
    const std::string* type = request.header("Content-Type");
    if (request.count("Content-Type") > 1 || type == nullptr || !isXml(*type)) {
        return refusal(400, nullptr, "Content-Type is not application/xml in UTF-8");
    }
    if (request.header("CIMBatch") != nullptr) {
        return refusal(501, "multiple-requests-unsupported", "one operation at a time");
    }
    const std::string* operation = request.header("CIMOperation");
    if (request.header("CIMExport") != nullptr || request.header("CIMExportMethod") != nullptr ||
        (operation != nullptr && !base::equalsIgnoreCase(*operation, "MethodCall"))) {
        return refusal(400, "unsupported-operation", "CIMOperation is not MethodCall");
    }
    if (operation == nullptr) return refusal(400, nullptr, "CIMOperation is missing");
    const std::string* version = request.header("CIMProtocolVersion");
    if (version != nullptr && !isProtocolVersion(*version)) {
        return refusal(501, "unsupported-protocol-version", "CIMProtocolVersion is not 1.x");
    }
    return std::nullopt;
}

/// Counts one more of what runs at once, while it lives.
class Turn {
  public:
    explicit Turn(std::atomic<unsigned>& running) : running_(running), number_(++running) {}
    ~Turn() { --running_; }
    Turn(const Turn&) = delete;
    Turn& operator=(const Turn&) = delete;
    unsigned number() const noexcept { return number_; }

  private:
    std::atomic<unsigned>& running_;
    const unsigned number_;
};

}  // namespace

CimOverHttp::CimOverHttp(ObjectManager& manager, AccessControl& access, Options options)
    : manager_(manager), access_(access), options_(std::move(options)) {}

HttpResponse CimOverHttp::answer(const HttpRequest& request) {
    if (auto refused = refusalOfMethodAndOrigin(request, options_.hostNames)) return *refused;
    // Which of two is meant, nobody can say.
    if (request.count("Authorization") > 1) return refusal(400);
    const AccessControl::Verdict verdict = access_.judge(request);
    if (!verdict.allowed) {
        HttpResponse response = refusal(401);
        response.headers.emplace_back("WWW-Authenticate", "Basic realm=\"cimom\"");
        response.delay = verdict.delay;
        return response;
    }
    auto refused = refusalOfCimHeaders(request);
    HttpResponse response = refused ? std::move(*refused) : carriedOut(request, verdict.user);
    response.user = verdict.user.value_or("");
    return response;
}

HttpResponse CimOverHttp::carriedOut(const HttpRequest& request,
                                     const std::optional<std::string>& user) {
    // What is read of a message takes many times the memory of its text: long ones, which honest
    // clients do not send, wait for each other.
    std::unique_lock<std::mutex> alone(longMessage_, std::defer_lock);
    if (request.body.size() > longestUsualBody) alone.lock();
    try {
        const Message message = readMessage(request.body);
        HttpResponse response;
        if (const char* difference = mismatch(request, message)) {
            response = refusal(400, "header-mismatch", difference);
        } else if (const Turn turn(running_); turn.number() > options_.mostAtOnce) {
            response = refusal(503);
            response.headers.emplace_back("Retry-After", "1");
        } else {
            Response answered = server::answer(manager_, message, user);
            response.headers = {{"Content-Type", "application/xml; charset=\"utf-8\""},
                                {"CIMOperation", "MethodResponse"},
                                {"Cache-Control", "no-cache"}};
            response.body = std::move(answered.document);
            response.cimStatus = answered.code;
        }
        response.operation = message.method;
        return response;
    } catch (const MessageError& error) {
        return refusal(error.httpStatus(), error.cimError(), error.what());
    }
}

}  // namespace cmpihost::server
