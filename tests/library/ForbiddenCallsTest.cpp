// Requests on the host that they run on, in a child process that ends at the first attempt to start
// another process or to use the network: an object manager runs as root and allows neither.
#include <linux/filter.h>
#include <linux/seccomp.h>
#include <sched.h>
#include <sys/prctl.h>
#include <sys/socket.h>
#include <sys/syscall.h>
#include <sys/wait.h>
#include <unistd.h>

#include <cerrno>
#include <csignal>
#include <cstddef>
#include <cstdlib>
#include <filesystem>
#include <functional>
#include <vector>

#include "framework/instrumentation/HostSource.h"
#include "library/LibraryFixture.h"

namespace {

using testing::ExitedWithCode;
using testing::KilledBySignal;

constexpr auto kill = static_cast<unsigned int>(SECCOMP_RET_KILL_PROCESS);
constexpr auto allow = static_cast<unsigned int>(SECCOMP_RET_ALLOW);

/// A filter of system calls. All processors that this runs on are little-endian.
class Filter {
  public:
    Filter() { put(BPF_STMT(BPF_LD | BPF_W | BPF_ABS, offsetof(seccomp_data, nr))); }

    void answer(long call, unsigned int result) {
        put(BPF_JUMP(BPF_JMP | BPF_JEQ | BPF_K, static_cast<unsigned int>(call), 0, 1));
        put(BPF_STMT(BPF_RET | BPF_K, result));
    }

    /// Kills the process at `call` when its first argument passes `jump` (a BPF_J...) by `operand`.
    void killWhen(long call, unsigned short jump, unsigned int operand, bool passes) {
        put(BPF_JUMP(BPF_JMP | BPF_JEQ | BPF_K, static_cast<unsigned int>(call), 0, 4));
        put(BPF_STMT(BPF_LD | BPF_W | BPF_ABS, offsetof(seccomp_data, args)));
        put({static_cast<unsigned short>(BPF_JMP | jump | BPF_K), !passes, passes, operand});
        put(BPF_STMT(BPF_RET | BPF_K, kill));
        put(BPF_STMT(BPF_RET | BPF_K, allow));
    }

    /// True when it holds from now on.
    bool install() {
        put(BPF_STMT(BPF_RET | BPF_K, allow));
        const sock_fprog filter{static_cast<unsigned short>(program_.size()), program_.data()};
        return ::prctl(PR_SET_NO_NEW_PRIVS, 1, 0, 0, 0) == 0 &&
               ::prctl(PR_SET_SECCOMP, SECCOMP_MODE_FILTER, &filter) == 0;
    }

  private:
    void put(sock_filter step) { program_.push_back(step); }

    std::vector<sock_filter> program_;
};

// The library starts threads by clone3 where there is one; what that would start, a filter cannot
// see.
void forbidProcesses(Filter& filter) {
    for (const long call : {SYS_fork, SYS_vfork, SYS_execve, SYS_execveat})
        filter.answer(call, kill);
    filter.answer(SYS_clone3, static_cast<unsigned int>(SECCOMP_RET_ERRNO) | ENOSYS);
    filter.killWhen(SYS_clone, BPF_JSET, CLONE_THREAD, false);
}

// Where systemd runs, it is asked for the state of the system, through a socket of this host. What
// kind of socket socketcall is for (a 32-bit process may use it), a filter cannot see.
void forbidNetwork(Filter& filter) {
    if (std::filesystem::is_directory("/run/systemd/system")) {
        filter.killWhen(SYS_socket, BPF_JEQ, AF_UNIX, false);
        return;
    }
    for (const long call : {SYS_socket, SYS_connect}) filter.answer(call, kill);
#ifdef SYS_socketcall
    filter.answer(SYS_socketcall, kill);
#endif
}

class ForbiddenCalls : public LibraryFixture {
  protected:
    ForbiddenCalls() { VA::setHostSource(nullptr); }

    /// Does `work` in a child process under the filter, and ends it: with 0 when `work` is true.
    template <class Work>
    [[noreturn]] static void doForbidden(Work work) {
        Filter filter;
        forbidProcesses(filter);
        forbidNetwork(filter);
        if (!filter.install()) ::_exit(2);
        ::_exit(work() ? 0 : 1);
    }

    static bool opensSocket(int domain) {
        return ::syscall(SYS_socket, domain, SOCK_STREAM | SOCK_CLOEXEC, 0) >= 0;
    }
};

TEST_F(ForbiddenCalls, AreNoticedHere) {
    const std::function<bool()> forbidden[] = {
        [] { return ::fork() >= 0; },
        [] { return ::vfork() >= 0; },
        [] { return std::system("true") == 0; },
        [] { return ::execl("/bin/true", "true", nullptr) == 0; },
        [] { return opensSocket(AF_INET); },
        [] { return opensSocket(AF_INET6); }};
    for (const auto& each : forbidden) EXPECT_EXIT(doForbidden(each), KilledBySignal(SIGSYS), "");
}

TEST_F(ForbiddenCalls, RequestsStartNoProcessAndUseNoNetwork) {
    for (const char* className : {"KORVA_OperatingSystem", "KORVA_OperatingSystemCapabilities"}) {
        SCOPED_TRACE(className);
        EXPECT_EXIT(doForbidden([&] {
                        const cmpihost::Outcome outcome = enumerate(className);
                        return outcome.rc == CMPI_RC_OK && outcome.instances.size() == 1;
                    }),
                    ExitedWithCode(0), "");
    }
}

}  // namespace
