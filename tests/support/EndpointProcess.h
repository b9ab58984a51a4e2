#ifndef TESTS_SUPPORT_ENDPOINT_PROCESS_H
#define TESTS_SUPPORT_ENDPOINT_PROCESS_H

#include <sys/types.h>

#include <cstdint>
#include <string>
#include <vector>

#include "base/FileDescriptor.h"
#include "support/TemporaryDirectory.h"

/// The built cmpihost-serve in a process of its own, on a free port of 127.0.0.1. It serves until
/// stop(), at the latest until the object dies.
class EndpointProcess {
  public:
    /// Which host the providers look at: that of tests/support/fixture_host, or this machine.
    enum class Host { Fixture, Machine };

    /// What it holds at one moment.
    struct State {
        long residentKilobytes;
        long descriptors;
        long threads;
    };

    /// How it ended: the exit status, or minus the number of the signal.
    struct End {
        int status = 0;
        /// What it wrote to stderr, but for the line that tells where it listens.
        std::string err{};
    };

    /// Starts `program` with the options and waits until it serves. Throws std::runtime_error,
    /// with what it wrote to stderr, when it does not within ten seconds.
    explicit EndpointProcess(const std::string& program,
                             const std::vector<std::string>& options = {},
                             Host host = Host::Fixture);
    ~EndpointProcess();
    EndpointProcess(const EndpointProcess&) = delete;
    EndpointProcess& operator=(const EndpointProcess&) = delete;

    std::uint16_t port() const noexcept { return port_; }
    pid_t pid() const noexcept { return pid_; }
    State state() const;

    /// Has it end by SIGTERM and waits for that. Ends it by force after ten seconds.
    End stop();

  private:
    /// Waits until it says so; false: it ended, or says nothing.
    bool isReady(const base::FileDescriptor& notifications);
    void end() noexcept;
    /// What waitpid gave, after at most ten seconds.
    int awaitEnd();
    std::string written() const;

    const TemporaryDirectory folder_;
    std::uint16_t port_ = 0;
    pid_t pid_ = -1;
};

#endif
