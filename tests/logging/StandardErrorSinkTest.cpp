#include "framework/logging/Sinks.h"

#include <fcntl.h>
#include <gmock/gmock.h>
#include <unistd.h>

#include <array>
#include <chrono>
#include <csignal>
#include <thread>

#include "tests/logging/LoggingSupport.h"

namespace {

using namespace logging_test;
using testing::ElementsAre;

/// A pipe that keeps each write apart, and whose reader never waits.
struct Pipe {
    Pipe() {
        EXPECT_EQ(::pipe2(ends.data(), O_CLOEXEC | O_DIRECT), 0);
        ::fcntl(ends[0], F_SETFL, O_NONBLOCK);
    }
    ~Pipe() {
        closeEnd(0);
        closeEnd(1);
    }
    Pipe(const Pipe&) = delete;
    Pipe& operator=(const Pipe&) = delete;

    void closeEnd(std::size_t end) {
        if (ends[end] >= 0) ::close(ends[end]);
        ends[end] = -1;
    }
    void fill() const {
        const std::string filler(4096, '\n');
        ::fcntl(ends[1], F_SETFL, O_DIRECT | O_NONBLOCK);
        while (::write(ends[1], filler.data(), filler.size()) > 0) {
        }
        ::fcntl(ends[1], F_SETFL, O_DIRECT);
    }
    /// What one write wrote; empty where there is none.
    std::string receive() const {
        std::array<char, 65536> buffer{};
        const ssize_t count = ::read(ends[0], buffer.data(), buffer.size());
        return count > 0 ? std::string(buffer.data(), static_cast<std::size_t>(count)) : "";
    }
    /// What all of them wrote, without what filled the pipe.
    std::string drain() const {
        std::string all;
        for (std::string next = receive(); !next.empty(); next = receive()) all += next;
        return all.erase(0, all.find_first_not_of('\n'));
    }
    std::array<int, 2> ends{-1, -1};
};

class StandardErrorSinkTest : public testing::Test {
  protected:
    FakeEnvironment environment_;
    ZBLog::StandardErrorSink sink_{environment_};
};

TEST_F(StandardErrorSinkTest, WritesEachRecordAtOnce) {
    const Pipe pipe;
    const std::string huge(100000, 'x');
    {
        const StandardErrorAs standardError(pipe.ends[1]);
        sink_.write(record("one"));
        sink_.write(record(huge));
        sink_.write(record("two"));
    }
    EXPECT_THAT(textsOf(pipe.receive()), ElementsAre("one"));
    const std::string second = pipe.receive();
    EXPECT_EQ(second.size(), 4095u);
    EXPECT_EQ(second.substr(second.size() - 6), "x\\...\n");
    EXPECT_THAT(textsOf(pipe.receive()), ElementsAre("two"));
    EXPECT_EQ(pipe.receive(), "");
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
        EXPECT_THAT(textsOf(pipe.drain()),
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
        received = pipe.drain();
        writer.join();
    }
    std::signal(SIGUSR1, SIG_DFL);
    EXPECT_THAT(textsOf(received + pipe.drain()), ElementsAre("one"));
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
