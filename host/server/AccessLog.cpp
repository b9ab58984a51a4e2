#include "host/server/AccessLog.h"

#include <chrono>
#include <utility>

#include "base/Utf8.h"

namespace cmpihost::server {

namespace {

/// Of the complaints after one answer.
constexpr std::size_t mostComplaints = 16;
constexpr std::size_t longestField = 128;

std::string field(const std::string& text) {
    if (text.empty()) return "-";
    return text.size() <= longestField ? text : text.substr(0, longestField) + "...";
}

bool isFailure(const HttpResponse& response) {
    return response.status != 200 || response.cimStatus != 0;
}

}  // namespace

AccessLog::AccessLog(HttpHandler& handler, Log& log, Complaints complaints)
    : handler_(handler), log_(log), complaints_(std::move(complaints)) {}

HttpResponse AccessLog::answer(const HttpRequest& request) {
    using Clock = std::chrono::steady_clock;
    const Clock::time_point begin = Clock::now();
    HttpResponse response = handler_.answer(request);
    const bool failure = isFailure(response);
    if (log_.level() == LogLevel::Requests || (failure && log_.level() == LogLevel::Failures)) {
        const auto took =
            std::chrono::duration_cast<std::chrono::microseconds>(Clock::now() - begin);
        log_.write(failure ? Priority::Notice : Priority::Info,
                   request.peer + " " + field(response.user) + " " + field(response.operation) +
                       " " + std::to_string(response.status) + " " +
                       std::to_string(response.cimStatus) + " " + std::to_string(took.count()) +
                       "us");
    }
    logComplaints();
    return response;
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

}  // namespace cmpihost::server
