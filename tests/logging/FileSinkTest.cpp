// Files as the log uses them: descriptors that the process may take away, writes that raise no
// signal, and the file that bears a name at the moment of writing.
#include <fcntl.h>
#include <gmock/gmock.h>
#include <sys/mman.h>
#include <sys/resource.h>
#include <sys/stat.h>
#include <unistd.h>

#include <array>
#include <atomic>
#include <csignal>
#include <filesystem>
#include <functional>
#include <set>
#include <thread>

#include "framework/logging/Sinks.h"
#include "tests/logging/LoggingSupport.h"

namespace {

using namespace ZBLog;
using namespace logging_test;
using testing::ElementsAre;

TEST(PosixFile, HoldsOneFileAtATime) {
    const std::size_t before = openDescriptors();
    {
        PosixFile file;
        for (const char* path : {"/dev/null", "/dev/zero", "/dev/null"}) {
            EXPECT_EQ(file.open(path, O_RDONLY), 0);
            EXPECT_EQ(openDescriptors(), before + 1);
        }
        EXPECT_EQ(file.open("/dev/null/x", O_RDONLY), ENOTDIR);
        EXPECT_FALSE(file.isOpen());
        EXPECT_EQ(file.open("/dev/null", O_RDONLY), 0);
    }
    EXPECT_EQ(openDescriptors(), before);
}

TEST(PosixFile, IsNoneOfTheStandardStreamsAndIsNotInherited) {
    for (const int stream : {STDIN_FILENO, STDOUT_FILENO, STDERR_FILENO}) {
        const int status = inChildProcess([stream] {
            ::close(stream);
            PosixFile file;
            if (file.open("/dev/null", O_RDONLY) != 0 || !file.isOpen()) return 1;
            if (::fcntl(file.number(), F_GETFD) != FD_CLOEXEC) return 2;
            return ::fcntl(stream, F_GETFD) == -1 ? 0 : 3;
        });
        EXPECT_EQ(status, 0) << stream;
    }
}

/// A descriptor whose writes raise the signal: of a pipe that nobody reads, or of a file in a
/// process that may write none.
int raising(int signal) {
    if (signal == SIGXFSZ) {
        const rlimit none{0, 0};
        ::setrlimit(RLIMIT_FSIZE, &none);
        return ::memfd_create("limited", 0);
    }
    std::array<int, 2> ends{};
    if (::pipe(ends.data()) != 0) return -1;
    ::close(ends[0]);
    return ends[1];
}

/// Whether `signal` is blocked and pending after a write that raises it, as both were before.
int writeRaising(int signal, bool pendingBefore) {
    sigset_t set, mask, pending;
    ::sigemptyset(&set);
    ::sigaddset(&set, signal);
    if (pendingBefore) {
        ::pthread_sigmask(SIG_BLOCK, &set, nullptr);
        ::raise(signal);
    }
    const WriteResult result = writeFully(raising(signal), "text");
    if (result.error != (signal == SIGPIPE ? EPIPE : EFBIG) || result.written != 0) return 1;
    ::sigpending(&pending);
    ::pthread_sigmask(SIG_SETMASK, nullptr, &mask);
    const int expected = pendingBefore ? 1 : 0;
    return ::sigismember(&pending, signal) == expected && ::sigismember(&mask, signal) == expected
               ? 0
               : 2;
}

TEST(WriteFully, RaisesNoSignalAndLeavesOnePendingThatWasPendingBefore) {
    for (const int signal : {SIGPIPE, SIGXFSZ}) {
        for (const auto disposition : {SIG_DFL, SIG_IGN}) {
            for (const bool pendingBefore : {false, true}) {
                const int status = inChildProcess([&] {
                    std::signal(signal, disposition);
                    return writeRaising(signal, pendingBefore);
                });
                EXPECT_EQ(status, 0) << signal << (disposition == SIG_IGN ? " ignored" : "")
                                     << (pendingBefore ? " pending" : "");
            }
        }
    }
}

class FileSinkTest : public testing::Test {
  protected:
    /// The number of the descriptor that holds `path`, -1 if none does.
    static int descriptorOf(const std::string& path) {
        for (int number = 0; number < 256; ++number) {
            std::error_code error;
            const auto target =
                std::filesystem::read_symlink("/proc/self/fd/" + std::to_string(number), error);
            if (!error && target == path) return number;
        }
        return -1;
    }

    TemporaryDirectory folder_;
    FakeEnvironment environment_;
    const std::string path_ = folder_.path("korva.log");
    FileSink sink_{path_, environment_};
};

TEST_F(FileSinkTest, CreatesNothingBeforeTheFirstRecord) {
    EXPECT_FALSE(std::filesystem::exists(path_));
}

TEST_F(FileSinkTest, CreatesAFileThatTheGroupMayReadAndNobodyElse) {
    const mode_t mask = ::umask(0);
    sink_.write(record("one"));
    ::umask(mask);
    struct stat status {};
    ASSERT_EQ(::stat(path_.c_str(), &status), 0);
    EXPECT_EQ(status.st_mode & 07777u, 0640u);
}

TEST_F(FileSinkTest, WritesWholeLinesAtTheEnd) {
    writeFile(path_, "there already\n");
    sink_.write(record("one"));
    sink_.write(record("two\nthree"));
    const std::string time = "[0-9]{4}-[0-9]{2}-[0-9]{2}T[0-9:]{8}[.][0-9]{3}Z";
    const std::string start = time + " " + std::to_string(::getpid()) + " " +
                              std::to_string(::gettid()) +
                              " log 3000 Zumbrel.Test work Work.cpp:12 ";
    EXPECT_THAT(readFile(path_), testing::MatchesRegex("there already\n" + start + "one\n" + start +
                                                       "two\\\\x0Athree\n"));
    EXPECT_TRUE(environment_.takeSystemLog().empty());
}

TEST_F(FileSinkTest, GoesToTheFileThatBearsTheNameNow) {
    const struct {
        const char* description;
        std::function<void()> happen;
    } rows[] = {
        {"rotated", [&] { std::filesystem::rename(path_, path_ + ".1"); }},
        {"replaced",
         [&] {
             writeFile(path_ + ".new", "");
             std::filesystem::rename(path_ + ".new", path_);
         }},
        {"removed", [&] { std::filesystem::remove(path_); }},
        {"truncated", [&] { std::filesystem::resize_file(path_, 0); }},
    };
    for (const auto& row : rows) {
        sink_.write(record("one"));
        row.happen();
        sink_.write(record("two"));
        EXPECT_THAT(textsOf(readFile(path_)), ElementsAre("two")) << row.description;
        std::filesystem::remove(path_);
    }
    EXPECT_THAT(textsOf(readFile(path_ + ".1")), ElementsAre("one"));
}

/// The text of the record that `writer` writes as its `count`-th.
std::string textBy(std::size_t writer, int count) {
    return std::to_string(writer) + "/" + std::to_string(count) + std::string(200, 'x');
}

TEST_F(FileSinkTest, LosesNothingAndTearsNothingWhileThreadsWriteAndFilesRotate) {
    constexpr int rotations = 50;
    std::array<int, 8> written{};
    std::atomic<bool> stop{false};
    std::vector<std::thread> writers;
    for (std::size_t writer = 0; writer < written.size(); ++writer) {
        writers.emplace_back([&, writer] {
            while (!stop) sink_.write(record(textBy(writer, written[writer]++)));
        });
    }
    for (int rotated = 0; rotated < rotations;) {
        std::error_code error;
        std::filesystem::rename(path_, path_ + "." + std::to_string(rotated), error);
        if (!error) ++rotated;
        std::this_thread::sleep_for(std::chrono::milliseconds(1));
    }
    stop = true;
    for (std::thread& writer : writers) writer.join();

    std::multiset<std::string> found, expected;
    for (const auto& file : std::filesystem::directory_iterator(folder_.path())) {
        for (std::string& text : textsOf(readFile(file.path()))) found.insert(std::move(text));
    }
    for (std::size_t writer = 0; writer < written.size(); ++writer) {
        for (int count = 0; count < written[writer]; ++count)
            expected.insert(textBy(writer, count));
    }
    EXPECT_GE(found.size(), static_cast<std::size_t>(rotations));
    EXPECT_TRUE(found == expected) << found.size() << " of " << expected.size();
    EXPECT_TRUE(environment_.takeSystemLog().empty());
}

TEST_F(FileSinkTest, LeavesADescriptorAloneThatTheProcessTookFromIt) {
    sink_.write(record("one"));
    const int number = descriptorOf(path_);
    ASSERT_GE(number, 0);
    const std::string others = folder_.path("data");
    writeFile(others, "valuable");
    const int other = ::open(others.c_str(), O_RDWR | O_APPEND | O_CLOEXEC);
    ASSERT_EQ(::dup2(other, number), number);

    sink_.write(record("two"));
    EXPECT_EQ(readFile(others), "valuable");
    EXPECT_THAT(textsOf(readFile(path_)), ElementsAre("one", "two"));
    EXPECT_EQ(std::filesystem::read_symlink("/proc/self/fd/" + std::to_string(number)), others);
    ::close(number);
    ::close(other);
}

}  // namespace
