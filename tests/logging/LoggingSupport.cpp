#include "tests/logging/LoggingSupport.h"

#include <sys/wait.h>
#include <syslog.h>
#include <unistd.h>

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <sstream>
#include <stdexcept>
#include <utility>

#include "support/ProgramRun.h"

namespace logging_test {

timespec FakeEnvironment::utc() noexcept {
    if (stoppedAt_ != 0) return {stoppedAt_, 0};
    timespec now{};
    ::clock_gettime(CLOCK_REALTIME, &now);
    now.tv_sec += ahead_;
    return now;
}

void FakeEnvironment::writeSystemLog(int priority, const char* text) noexcept {
    const std::lock_guard<std::mutex> lock(mutex_);
    lines_.push_back(std::to_string(priority) + " " + text);
}

std::vector<std::string> FakeEnvironment::takeSystemLog() {
    const std::lock_guard<std::mutex> lock(mutex_);
    return std::exchange(lines_, {});
}

void writeFile(const std::string& path, const std::string& content) {
    std::ofstream file(path, std::ios::binary | std::ios::trunc);
    file << content;
    if (!file.flush()) throw std::runtime_error("cannot write " + path);
}

std::string readFile(const std::string& path) {
    std::ifstream file(path, std::ios::binary);
    std::ostringstream content;
    content << file.rdbuf();
    return content.str();
}

std::vector<std::string> textsOf(const std::string& text) {
    constexpr int fieldsBeforeText = 8;
    std::vector<std::string> texts;
    for (const std::string& line : ::lines(text)) {
        std::size_t start = 0;
        for (int field = 0; field < fieldsBeforeText && start <= line.size(); ++field) {
            const std::size_t blank = line.find(' ', start);
            start = blank == std::string::npos ? line.size() + 1 : blank + 1;
        }
        texts.push_back(start > line.size() ? "no record: " + line : line.substr(start));
    }
    return texts;
}

ZBLog::Record record(const std::string& text, int level, ZBLog::Channel channel) {
    return {channel, "work", "Work.cpp", 12, "Zumbrel.Test", level, text};
}

ZBLog::ChannelConfiguration everythingTo(ZBLog::Destination destination, const std::string& path) {
    ZBLog::ChannelConfiguration channel;
    channel.destination = destination;
    channel.path = path;
    return channel;
}

std::string warningOf(const std::string& text) {
    return std::to_string(LOG_DAEMON | LOG_WARNING) + " korva-osstatus: " + text;
}

std::string lossOf(const std::string& output, const std::string& reason) {
    return warningOf(output + ": " + reason +
                     "; records are dropped until it can be written again");
}

std::size_t openDescriptors() {
    std::size_t count = 0;
    for (const auto& entry : std::filesystem::directory_iterator("/proc/self/fd")) {
        static_cast<void>(entry);
        ++count;
    }
    return count;
}

int inChildProcess(const std::function<int()>& work) {
    const pid_t child = ::fork();
    if (child < 0) throw std::runtime_error("no child process");
    if (child == 0) ::_exit(work());
    int status = 0;
    ::waitpid(child, &status, 0);
    return WIFEXITED(status) ? WEXITSTATUS(status) : 1000 + WTERMSIG(status);
}

StandardErrorAs::StandardErrorAs(int descriptor) : former_(::dup(STDERR_FILENO)) {
    ::dup2(descriptor, STDERR_FILENO);
}

StandardErrorAs::~StandardErrorAs() {
    ::dup2(former_, STDERR_FILENO);
    ::close(former_);
}

}  // namespace logging_test
