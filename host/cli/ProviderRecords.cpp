// A configuration is a file in memory: the logging library reads files only, and one on a disk
// would need a folder that can be written and would stay behind when the process is killed. The
// library opens what it writes to by a name that must be no link, so records need a real file.
#include "host/cli/ProviderRecords.h"

#include <sys/mman.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <cstdlib>
#include <fstream>
#include <sstream>
#include <system_error>

#include "base/Utf8.h"

namespace cmpihost {

namespace fs = std::filesystem;

namespace {

constexpr const char* logVariable = "ZBLOG_CONF";
constexpr const char* recordsFile = "records";

std::string contents(const fs::path& file) {
    std::ostringstream text;
    text << std::ifstream(file).rdbuf();
    return text.str();
}

/// Whether a line of the configuration sets anything of the trace.
bool usesTrace(const std::string& configuration) {
    std::istringstream lines(configuration);
    for (std::string line; std::getline(lines, line);) {
        const std::size_t start = line.find_first_not_of(" \t");
        if (start != std::string::npos && line.compare(start, 6, "trace.") == 0) return true;
    }
    return false;
}

/// The text of a message record: "... MESSAGE [File: FILE, Line: N]: TEXT".
std::string messageOf(const std::string& record) {
    const std::size_t message = record.find(" MESSAGE [File: ");
    const std::size_t end = record.find("]: ", std::min(message, record.size()));
    return end == std::string::npos ? std::string() : record.substr(end + 3);
}

bool isFailure(const ProviderMessage& message) {
    return !message.trace && message.level == CMPI_SEV_ERROR;
}

/// The name of a severity or of a level of the trace; a number that has none as it is.
std::string levelName(const ProviderMessage& message) {
    constexpr const char* severities[] = {"error", "info", "warning"};
    constexpr const char* levels[] = {"info", "warning", "verbose"};
    if (message.level < 1 || message.level > 3) return std::to_string(message.level);
    return (message.trace ? levels : severities)[message.level - 1];
}

}  // namespace

ScopedLogConfiguration::ScopedLogConfiguration(const std::string& text)
    : file_(::memfd_create("cmpihost-log", MFD_CLOEXEC)) {
    const int file = file_.number();
    const bool written = file_.isOpen() && ::write(file, text.data(), text.size()) ==
                                               static_cast<ssize_t>(text.size());
    const std::string name = "/proc/self/fd/" + std::to_string(file);
    if (!written || ::setenv(logVariable, name.c_str(), 1) != 0) {
        throw std::system_error(errno, std::generic_category(), "the records cannot be shown");
    }
}

ScopedLogConfiguration::~ScopedLogConfiguration() {
    ::unsetenv(logVariable);
}

std::string stderrConfiguration(const LogRequest& request) {
    if (request.channel == LogChannel::Cmpi) return {};
    // One channel alone: the trace carries the same records as the log once more.
    const bool trace = request.channel == LogChannel::Trace;
    const std::string shown = trace ? "trace" : "log";
    const char* level = request.level == LogLevel::Everything ? "4000" : "3000";
    const char* records = request.level == LogLevel::Failures ? "failures" : "all";
    return shown + ".sink = stderr\n" + shown + ".level = " + level + "\n" + shown +
           ".records = " + records + "\n" + (trace ? "log" : "trace") + ".sink = off\n";
}

FailureRecords::FailureRecords() {
    std::error_code error;
    std::string name = (fs::temp_directory_path(error) / "cmpihost.XXXXXX").string();
    if (!error && ::mkdtemp(name.data()) != nullptr) folder_ = name;
}

FailureRecords::~FailureRecords() {
    if (folder_.empty()) return;
    std::error_code ignored;
    fs::remove(folder_ / recordsFile, ignored);
    fs::remove(folder_, ignored);
}

std::string FailureRecords::configuration(const fs::path& inForce) const {
    const std::string configured = contents(inForce);
    if (folder_.empty() || usesTrace(configured)) return {};
    return configured + "\ntrace.sink = file:" + (folder_ / recordsFile).string() +
           "\ntrace.records = failures\n";
}

std::vector<std::string> FailureRecords::texts() const {
    std::vector<std::string> result;
    if (folder_.empty()) return result;
    std::ifstream records(folder_ / recordsFile);
    for (std::string line; std::getline(records, line);) {
        const std::string text = messageOf(line);
        const bool known = std::find(result.begin(), result.end(), text) != result.end();
        if (!text.empty() && !known) result.push_back(text);
    }
    return result;
}

void BrokerMessages::take(const ProviderMessage& message) {
    const std::lock_guard<std::mutex> lock(mutex_);
    if (isFailure(message)) failures_.push_back(message.text);
    if (!isShown(message)) return;
    stream_ << "cmpi " << (message.trace ? "trace " : "log ") << levelName(message) << ' '
            << base::escapeForTerminal(message.source) << (message.source.empty() ? "" : ": ")
            << base::escapeForTerminal(message.text) << '\n';
}

std::vector<std::string> BrokerMessages::failures() const {
    const std::lock_guard<std::mutex> lock(mutex_);
    return failures_;
}

bool BrokerMessages::isShown(const ProviderMessage& message) const {
    if (!request_ || request_->channel.value_or(LogChannel::Cmpi) != LogChannel::Cmpi) return false;
    if (request_->level == LogLevel::Failures) return isFailure(message);
    return request_->level == LogLevel::Everything || !message.trace;
}

}  // namespace cmpihost
