#include "framework/logging/Sinks.h"

#include <fcntl.h>
#include <gmock/gmock.h>
#include <sys/socket.h>
#include <unistd.h>

#include <array>
#include <chrono>
#include <csignal>
#include <thread>

#include "tests/logging/LoggingSupport.h"

namespace {

using namespace logging_test;
using testing::ElementsAre;

/// Two connected descriptors.
struct Pair {
    ~Pair() {
        closeEnd(0);
        closeEnd(1);
    }
    void closeEnd(std::size_t end) {
        if (ends[end] >= 0) ::close(ends[end]);
        ends[end] = -1;
    }
    std::string receive() const {
        std::array<char, 65536> buffer{};
        const ssize_t count = ::read(ends[0], buffer.data(), buffer.size());
        return count > 0 ? std::string(buffer.data(), static_cast<std::size_t>(count)) : "";
    }
    std::array<int, 2> ends{-1, -1};
};

struct Pipe : Pair {
    Pipe() { EXPECT_EQ(::pipe2(ends.data(), O_CLOEXEC), 0); }
    void fill() const {
        const std::string filler(4096, '\n');
        ::fcntl(ends[1], F_SETFL, O_NONBLOCK);
        while (::write(ends[1], filler.data(), filler.size()) > 0) {
        }
        ::fcntl(ends[1], F_SETFL, 0);
    }
    void drain() const {
        ::fcntl(ends[0], F_SETFL, O_NONBLOCK);
        while (!receive().empty()) {
        }
        ::fcntl(ends[0], F_SETFL, 0);
    }
};

struct Datagrams : Pair {
    Datagrams() {
        EXPECT_EQ(::socketpair(AF_UNIX, SOCK_DGRAM | SOCK_CLOEXEC | SOCK_NONBLOCK, 0, ends.data()),
                  0);
    }
};

class StandardErrorSinkTest : public testing::Test {
  protected:
    FakeEnvironment environment_;
    ZBLog::StandardErrorSink sink_{environment_};
};

TEST_F(StandardErrorSinkTest, WritesEachRecordAtOnce) {
    Datagrams datagrams;
    const std::string huge(100000, 'x');
    {
        const StandardErrorAs standardError(datagrams.ends[1]);
        sink_.write(record("one"));
        sink_.write(record(huge));
        sink_.write(record("two"));
    }
    EXPECT_THAT(textsOf(datagrams.receive()), ElementsAre("one"));
    const std::string second = datagrams.receive();
    EXPECT_EQ(second.size(), 4095u);
    EXPECT_EQ(second.substr(second.size() - 6), "x\\...\n");
    EXPECT_THAT(textsOf(datagrams.receive()), ElementsAre("two"));
    EXPECT_EQ(datagrams.receive(), "");
}

TEST_F(StandardErrorSinkTest, PipeThatNobodyReadsIsToldOnceAndRaisesNoSignal) {
    Pipe pipe;
    pipe.closeEnd(0);
    {
        const StandardErrorAs standardError(pipe.ends[1]);
        sink_.write(record("lost"));
        sink_.write(record("lost"));
    }
    EXPECT_THAT(environment_.takeSystemLog(), ElementsAre(lossOf("standard error", "Broken pipe")));
}

TEST_F(StandardErrorSinkTest, ClosedStandardErrorIsToldOnce) {
    const int former = ::dup(STDERR_FILENO);
    ::close(STDERR_FILENO);
    sink_.write(record("lost"));
    sink_.write(record("lost"));
    ::dup2(former, STDERR_FILENO);
    ::close(former);
    EXPECT_THAT(environment_.takeSystemLog(),
                ElementsAre(lossOf("standard error", "Bad file descriptor")));
}

TEST_F(StandardErrorSinkTest, TimesOutOnAFullPipeOnceAndGoesOnWhenItIsRead) {
    using Clock = std::chrono::steady_clock;
    Pipe pipe;
    for (int round = 0; round < 2; ++round) {
        pipe.fill();
        const auto start = Clock::now();
        {
            const StandardErrorAs standardError(pipe.ends[1]);
            for (int count = 0; count < 50; ++count) sink_.write(record("lost"));
        }
        const auto waited = Clock::now() - start;
        EXPECT_GE(waited, std::chrono::milliseconds(1900));
        EXPECT_LT(waited, std::chrono::milliseconds(3900));
        EXPECT_THAT(environment_.takeSystemLog(),
                    ElementsAre(lossOf("standard error", "Connection timed out")));

        pipe.drain();
        {
            const StandardErrorAs standardError(pipe.ends[1]);
            sink_.write(record("one"));
        }
        EXPECT_THAT(textsOf(pipe.receive()),
                    ElementsAre("50 records were dropped: Connection timed out", "one"));
    }
}

TEST_F(StandardErrorSinkTest, WaitsOnWhenASignalInterruptsIt) {
    std::signal(SIGUSR1, [](int) {});
    Pipe pipe;
    pipe.fill();
    std::string received;
    {
        const StandardErrorAs standardError(pipe.ends[1]);
        std::thread writer([&] { sink_.write(record("one")); });
        for (int count = 0; count < 10; ++count) {
            std::this_thread::sleep_for(std::chrono::milliseconds(20));
            ::pthread_kill(writer.native_handle(), SIGUSR1);
        }
        received = pipe.receive();
        writer.join();
    }
    std::signal(SIGUSR1, SIG_DFL);
    ::fcntl(pipe.ends[0], F_SETFL, O_NONBLOCK);
    received += pipe.receive();
    received.erase(0, received.find_first_not_of('\n'));  // what filled the pipe
    EXPECT_THAT(textsOf(received), ElementsAre("one"));
    EXPECT_TRUE(environment_.takeSystemLog().empty());
}

TEST_F(StandardErrorSinkTest, ChildOfAForkInTheMiddleOfAWriteIsNotHeldUpForLong) {
    Pipe pipe;
    pipe.fill();
    const StandardErrorAs standardError(pipe.ends[1]);
    std::thread writer([&] { sink_.write(record("waiting")); });
    std::this_thread::sleep_for(std::chrono::milliseconds(300));
    const int status = inChildProcess([&] {
        for (int count = 0; count < 100; ++count) sink_.write(record("of the child"));
        return environment_.takeSystemLog().size() == 1 ? 0 : 1;
    });
    writer.join();
    EXPECT_EQ(status, 0);
}

}  // namespace
