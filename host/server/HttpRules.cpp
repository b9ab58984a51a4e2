#include "host/server/HttpRules.h"

#include <algorithm>
#include <charconv>
#include <string>
#include <string_view>

#include "base/Ascii.h"

namespace cmpihost::server {

namespace {

bool isTokenCharacter(char c) {
    return base::isAlpha(c) || base::isDigit(c) ||
           std::string_view("!#$%&'*+-.^_`|~").find(c) != std::string_view::npos;
}

bool isValueCharacter(char c) {
    const auto byte = static_cast<unsigned char>(c);
    return byte == '\t' || (byte >= ' ' && byte != 0x7F);
}

bool isWellFormed(const std::pair<std::string, std::string>& header) {
    const auto& [name, value] = header;
    return !name.empty() && std::all_of(name.begin(), name.end(), isTokenCharacter) &&
           std::all_of(value.begin(), value.end(), isValueCharacter);
}

/// What Host may hold: a name or address, and a port.
bool isHost(const std::string& text) {
    return text.empty() ||
           (text.front() != '.' && std::all_of(text.begin(), text.end(), [](char c) {
                return base::isAlpha(c) || base::isDigit(c) ||
                       std::string_view("-._:[]").find(c) != std::string_view::npos;
            }));
}

bool isHeaderWellFormed(const HttpRequest& request) {
    const std::string& target = request.target;
    if (std::any_of(target.begin(), target.end(), [](char c) { return c <= ' ' || c == 0x7F; })) {
        return false;
    }
    if (!std::all_of(request.headers.begin(), request.headers.end(), isWellFormed)) return false;
    const std::size_t hosts = request.count("Host");
    if (hosts > 1 || (hosts == 0 && request.version != "HTTP/1.0")) return false;
    return hosts == 0 || isHost(*request.header("Host"));
}

/// 0 for a length that is told once and clearly, and within the limit.
unsigned refusalOfLength(const HttpRequest& request, std::size_t most) {
    const std::string* coding = request.header("Transfer-Encoding");
    const std::string* length = request.header("Content-Length");
    if (coding != nullptr) {
        if (length != nullptr || request.count("Transfer-Encoding") > 1) return 400;
        if (request.version == "HTTP/1.0") return 400;
        return base::equalsIgnoreCase(*coding, "chunked") ? 0 : 501;
    }
    if (length == nullptr) return 0;
    if (request.count("Content-Length") > 1 || length->empty()) return 400;
    if (!std::all_of(length->begin(), length->end(), base::isDigit)) return 400;
    std::size_t bytes = 0;
    const auto [end, error] =
        std::from_chars(length->data(), length->data() + length->size(), bytes);
    return error != std::errc{} || bytes > most ? 413 : 0;
}

unsigned refusalOfExpectation(const HttpRequest& request) {
    const std::string* expected = request.header("Expect");
    if (expected == nullptr) return 0;
    const bool known =
        request.count("Expect") == 1 && base::equalsIgnoreCase(*expected, "100-continue");
    return known ? 0 : 417;
}

}  // namespace

unsigned refusalOfHeader(const HttpRequest& request, std::size_t headerBytes,
                         const HttpLimits& limits) {
    if (headerBytes > limits.headerBytes) return 431;
    if (request.headers.size() > limits.headerFields) return 431;
    if (!isHeaderWellFormed(request)) return 400;
    if (const unsigned status = refusalOfLength(request, limits.bodyBytes)) return status;
    return refusalOfExpectation(request);
}

}  // namespace cmpihost::server
