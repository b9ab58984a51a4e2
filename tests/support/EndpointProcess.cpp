// The endpoint is started as a service manager starts it: it tells when it serves.
#include "support/EndpointProcess.h"

#include <fcntl.h>
#include <poll.h>
#include <spawn.h>
#include <sys/socket.h>
#include <sys/un.h>
#include <sys/wait.h>
#include <unistd.h>

#include <chrono>
#include <csignal>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <stdexcept>
#include <thread>

namespace {

using namespace std::chrono_literals;
constexpr auto patience = 10s;

base::FileDescriptor notificationSocket(const std::string& path) {
    base::FileDescriptor socket(::socket(AF_UNIX, SOCK_DGRAM | SOCK_CLOEXEC, 0));
    sockaddr_un address{};
    address.sun_family = AF_UNIX;
    path.copy(address.sun_path, sizeof address.sun_path - 1);
    if (::bind(socket.number(), reinterpret_cast<const sockaddr*>(&address), sizeof address) != 0)
        throw std::runtime_error("no socket " + path);
    return socket;
}

std::vector<char*> pointers(std::vector<std::string>& texts) {
    std::vector<char*> result;
    for (std::string& text : texts) result.push_back(text.data());
    result.push_back(nullptr);
    return result;
}

pid_t spawn(std::vector<std::string> words, std::vector<std::string> variables,
            const std::string& errorFile) {
    for (char** variable = environ; *variable != nullptr; ++variable)
        variables.emplace_back(*variable);
    posix_spawn_file_actions_t actions;
    posix_spawn_file_actions_init(&actions);
    posix_spawn_file_actions_addopen(&actions, STDIN_FILENO, "/dev/null", O_RDONLY, 0);
    posix_spawn_file_actions_addopen(&actions, STDERR_FILENO, errorFile.c_str(),
                                     O_WRONLY | O_CREAT | O_APPEND, 0600);
    pid_t child = -1;
    const int failed = ::posix_spawn(&child, words[0].c_str(), &actions, nullptr,
                                     pointers(words).data(), pointers(variables).data());
    posix_spawn_file_actions_destroy(&actions);
    if (failed != 0) throw std::runtime_error(words[0] + ": " + std::strerror(failed));
    return child;
}

// 0: there is none.
std::uint16_t portIn(const std::string& line) {
    const std::string lead = "listening on ";
    const std::size_t at = line.find(lead);
    if (at == std::string::npos) return 0;
    return static_cast<std::uint16_t>(std::stoul(line.substr(line.rfind(':') + 1)));
}

// The number behind a name in a file of /proc/<pid>.
long entry(const std::string& fileName, const std::string& name) {
    std::ifstream file(fileName);
    for (std::string line; std::getline(file, line);)
        if (line.rfind(name + ':', 0) == 0) return std::stol(line.substr(name.size() + 1));
    throw std::runtime_error("no " + name + " in " + fileName);
}

}  // namespace

EndpointProcess::EndpointProcess(const std::string& program,
                                 const std::vector<std::string>& options, Host host) {
    const base::FileDescriptor notifications = notificationSocket(folder_.path("notify"));
    std::vector<std::string> words = {program, "--log", "none", "--listen", "127.0.0.1:0"};
    words.insert(words.end(), options.begin(), options.end());
    // The first of two variables of one name counts.
    std::vector<std::string> variables = {"TZ=UTC0", "NOTIFY_SOCKET=" + folder_.path("notify")};
    if (host == Host::Fixture)
        variables.push_back(
            "LD_LIBRARY_PATH=" +
            (std::filesystem::path(program).parent_path().parent_path() / "fixture-host").string());
    pid_ = spawn(std::move(words), std::move(variables), folder_.path("stderr"));
    // The one line that it has written by then: "… listening on http://127.0.0.1:PORT".
    if (isReady(notifications)) port_ = portIn(written());
    if (port_ != 0) return;
    end();
    throw std::runtime_error("the endpoint does not serve: " + written());
}

EndpointProcess::~EndpointProcess() {
    end();
}

void EndpointProcess::end() noexcept {
    if (pid_ < 0) return;
    ::kill(pid_, SIGKILL);
    ::waitpid(pid_, nullptr, 0);
    pid_ = -1;
}

EndpointProcess::State EndpointProcess::state() const {
    // The counters in status lag behind; smaps_rollup counts the pages.
    const std::string folder = "/proc/" + std::to_string(pid_) + '/';
    const std::filesystem::directory_iterator files(folder + "fd"), end;
    return {entry(folder + "smaps_rollup", "Rss"), static_cast<long>(std::distance(files, end)),
            entry(folder + "status", "Threads")};
}

EndpointProcess::End EndpointProcess::stop() {
    ::kill(pid_, SIGTERM);
    const int status = awaitEnd();
    const std::string text = written();
    return {WIFEXITED(status) ? WEXITSTATUS(status) : -WTERMSIG(status),
            text.substr(text.find('\n') + 1)};
}

bool EndpointProcess::isReady(const base::FileDescriptor& notifications) {
    const auto deadline = std::chrono::steady_clock::now() + patience;
    while (std::chrono::steady_clock::now() < deadline) {
        pollfd waiting{notifications.number(), POLLIN, 0};
        char message[512] = "";
        if (::poll(&waiting, 1, 50) > 0 &&
            ::recv(notifications.number(), message, sizeof message - 1, 0) > 0 &&
            std::strstr(message, "READY=1") != nullptr)
            return true;
        if (::waitpid(pid_, nullptr, WNOHANG) == pid_) {
            pid_ = -1;
            break;
        }
    }
    return false;
}

int EndpointProcess::awaitEnd() {
    const auto deadline = std::chrono::steady_clock::now() + patience;
    int status = 0;
    while (::waitpid(pid_, &status, WNOHANG) == 0) {
        if (std::chrono::steady_clock::now() > deadline) ::kill(pid_, SIGKILL);
        std::this_thread::sleep_for(5ms);
    }
    pid_ = -1;
    return status;
}

std::string EndpointProcess::written() const {
    std::ifstream file(folder_.path("stderr"), std::ios::binary);
    return {std::istreambuf_iterator<char>(file), {}};
}
