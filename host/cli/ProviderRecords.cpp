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

}  // namespace cmpihost
