#include "host/server/AccessLog.h"

#include <utility>

#include "base/Utf8.h"

namespace cmpihost::server {

namespace {

/// Of the complaints at a time.
constexpr std::size_t mostComplaints = 16;
constexpr std::size_t longestField = 128;

/// Blanks in it are written out: the fields of a line stay apart.
std::string field(const std::string& text) {
    if (text.empty()) return "-";
    std::string result = base::escape(text.substr(0, longestField), base::EscapeStyle::logField);
    if (text.size() > longestField) result += "...";
    return result;
}

bool isFailure(const HttpResponse& response) {
    return response.status != 200 || response.cimStatus != 0;
}

}  // namespace

AccessLog::AccessLog(Log& log, Complaints complaints)
    : log_(log), complaints_(std::move(complaints)) {}

void AccessLog::answered(const HttpRequest& request, const HttpResponse& response,
                         std::chrono::nanoseconds took) {
    const bool failure = isFailure(response);
    if (log_.level() == LogLevel::Requests || (failure && log_.level() == LogLevel::Failures)) {
        const auto microseconds = std::chrono::duration_cast<std::chrono::microseconds>(took);
        log_.writeClean(failure ? Priority::Notice : Priority::Info,
                        field(request.peer) + " " + field(response.user) + " " +
                            field(response.operation) + " " + std::to_string(response.status) +
                            " " + std::to_string(response.cimStatus) + " " +
                            std::to_string(microseconds.count()) + "us");
    }
    logComplaints();
}

void AccessLog::cut(const std::string& peer, const char* reason) {
    if (log_.level() != LogLevel::None)
        log_.write(Priority::Notice, (peer.empty() ? "-" : peer) + " cut: " + reason);
}

void AccessLog::logComplaints() {
    const std::vector<std::string> complaints = complaints_();
    std::size_t told = 0;
    for (const std::string& complaint : complaints) {
        if (told++ == mostComplaints) break;
        log_.write(Priority::Warning, "caught: " + complaint);
    }
    if (complaints.size() > mostComplaints)
        log_.write(Priority::Warning,
                   "caught: " + std::to_string(complaints.size() - mostComplaints) + " more");
}

HttpEvents AccessLog::events() {
    HttpEvents result;
    result.answered = [this](const HttpRequest& request, const HttpResponse& response,
                             std::chrono::nanoseconds took) { answered(request, response, took); };
    result.cut = [this](const std::string& peer, const char* reason) { cut(peer, reason); };
    return result;
}

void logProviderMessage(Log& log, const ProviderMessage& message) {
    const bool failure = message.level == CMPI_SEV_ERROR || message.level == CMPI_SEV_WARNING;
    const bool wanted =
        log.level() == LogLevel::Requests || (log.level() == LogLevel::Failures && failure);
    if (message.trace || !wanted) return;
    log.write(failure ? Priority::Error : Priority::Info,
              "provider: " + message.source + (message.source.empty() ? "" : ": ") + message.text);
}

}  // namespace cmpihost::server
