#include "host/server/AccessLog.h"

#include <utility>

#include "base/Utf8.h"

namespace cmpihost::server {

namespace {

/// Of the complaints at a time.
constexpr std::size_t mostComplaints = 16;
constexpr std::size_t longestField = 128;
/// Of the connections that were cut, in a period.
constexpr unsigned mostCuts = 10;

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

AccessLog::AccessLog(Log& log, Complaints complaints, std::chrono::milliseconds period)
    : log_(log), complaints_(std::move(complaints)), period_(period) {}

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
    {
        const std::lock_guard<std::mutex> lock(mutex_);
        logMoreCuts();
    }
    logComplaints();
}

void AccessLog::cut(const std::string& peer, const char* reason) {
    if (log_.level() == LogLevel::None) return;
    const std::lock_guard<std::mutex> lock(mutex_);
    logMoreCuts();
    if (++cuts_ <= mostCuts)
        log_.write(Priority::Notice, (peer.empty() ? "-" : peer) + " cut: " + reason);
}

/// Tells, where a period is over, how many were not told in it.
void AccessLog::logMoreCuts() {
    const Clock::time_point now = Clock::now();
    if (now - periodStart_ < period_) return;
    if (cuts_ > mostCuts)
        log_.write(Priority::Notice, std::to_string(cuts_ - mostCuts) + " more connections cut");
    periodStart_ = now;
    cuts_ = 0;
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

void logProviderMessage(Log& log, const ProviderMessage& message) {
    const bool failure = message.level == CMPI_SEV_ERROR || message.level == CMPI_SEV_WARNING;
    const bool wanted =
        log.level() == LogLevel::Requests || (log.level() == LogLevel::Failures && failure);
    if (message.trace || !wanted) return;
    log.write(failure ? Priority::Error : Priority::Info,
              "provider: " + message.source + (message.source.empty() ? "" : ": ") + message.text);
}

}  // namespace cmpihost::server
