#ifndef TESTS_INSTRUMENTATION_FAKE_SYSTEMD_H
#define TESTS_INSTRUMENTATION_FAKE_SYSTEMD_H

#include <atomic>
#include <cstdint>

/// What the fake libsystemd is to do, and what was done with it. Set while it is not used;
/// counted by any number of threads.
struct FakeSystemd {
    enum class Behaviour {
        Answer,           ///< replies with `state` after a few rounds
        ErrorReply,       ///< replies with an error instead of a value
        Silent,           ///< accepts the question and never replies
        Busy,             ///< has something to do for ever, and never replies
        Interrupted,      ///< like Answer, but each wait is ended by a signal first
        LosesConnection,  ///< fails while the question is under way
        WaitFails,        ///< cannot wait
    };

    Behaviour behaviour = Behaviour::Answer;
    const char* state = "running";
    const char* failingFunction = "";  ///< fails with -ENOTCONN when it is called

    // The address and the four names and two arguments of the question, as received last.
    char address[256] = "";
    char question[512] = "";

    std::atomic<int> connections{0};
    std::atomic<int> closed{0};
    std::atomic<int> released{0};
    std::atomic<int> questions{0};
    std::atomic<int> busClients{0};
    std::atomic<std::uint64_t> longestWaitMicroseconds{0};
};

/// The symbol of the function that gives the one control block: FakeSystemd* ().
constexpr const char* fakeSystemdSymbol = "fake_systemd";

#endif
