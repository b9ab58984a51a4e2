#include "framework/logging/Sinks.h"

#include <fcntl.h>
#include <gmock/gmock.h>
#include <sys/stat.h>
#include <unistd.h>

#include <array>
#include <atomic>
#include <filesystem>
#include <set>
#include <thread>

#include "tests/logging/LoggingSupport.h"

namespace {

using logging_test::readFile;
using logging_test::record;
using logging_test::textsOf;
using testing::ElementsAre;

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

    logging_test::TemporaryFolder folder_;
    logging_test::FakeEnvironment environment_;
    const std::string path_ = folder_ / "korva.log";
    ZBLog::FileSink sink_{path_, environment_};
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
    logging_test::writeFile(path_, "there already\n");
    sink_.write(record("one"));
    sink_.write(record("two\nthree"));
    const std::string content = readFile(path_);
    EXPECT_EQ(content.substr(0, 14), "there already\n");
    EXPECT_THAT(textsOf(content.substr(14)), ElementsAre("one", "two\\x0Athree"));
    EXPECT_THAT(content, testing::ContainsRegex(
                             " [0-9]+ [0-9]+ log 3000 Zumbrel\\.Test work Work\\.cpp:12 one\n"));
    EXPECT_TRUE(environment_.takeSystemLog().empty());
}

TEST_F(FileSinkTest, TellsProcessAndThread) {
    sink_.write(record("one"));
    EXPECT_NE(readFile(path_).find(" " + std::to_string(::getpid()) + " " +
                                   std::to_string(::gettid()) + " log "),
              std::string::npos);
}

TEST_F(FileSinkTest, GoesToTheNewFileAfterARotation) {
    sink_.write(record("one"));
    std::filesystem::rename(path_, path_ + ".1");
    sink_.write(record("two"));
    EXPECT_THAT(textsOf(readFile(path_ + ".1")), ElementsAre("one"));
    EXPECT_THAT(textsOf(readFile(path_)), ElementsAre("two"));
}

TEST_F(FileSinkTest, GoesToTheFileThatWasPutInItsPlace) {
    sink_.write(record("one"));
    logging_test::writeFile(path_ + ".new", "");
    std::filesystem::rename(path_ + ".new", path_);
    sink_.write(record("two"));
    EXPECT_THAT(textsOf(readFile(path_)), ElementsAre("two"));
}

TEST_F(FileSinkTest, CreatesTheFileAgainWhenItWasRemoved) {
    sink_.write(record("one"));
    std::filesystem::remove(path_);
    sink_.write(record("two"));
    EXPECT_THAT(textsOf(readFile(path_)), ElementsAre("two"));
}

TEST_F(FileSinkTest, ContinuesAtTheStartAfterATruncation) {
    sink_.write(record("one"));
    std::filesystem::resize_file(path_, 0);
    sink_.write(record("two"));
    EXPECT_THAT(textsOf(readFile(path_)), ElementsAre("two"));
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

TEST_F(FileSinkTest, IsNotInheritedByChildProcesses) {
    sink_.write(record("one"));
    const int number = descriptorOf(path_);
    ASSERT_GE(number, 0);
    EXPECT_NE(::fcntl(number, F_GETFD) & FD_CLOEXEC, 0);
}

TEST_F(FileSinkTest, NeverTakesThePlaceOfAStandardStream) {
    const int status = logging_test::inChildProcess([&] {
        ::close(STDIN_FILENO);
        sink_.write(record("one"));
        return ::fcntl(STDIN_FILENO, F_GETFD) == -1 ? 0 : 1;
    });
    EXPECT_EQ(status, 0);
    EXPECT_THAT(textsOf(readFile(path_)), ElementsAre("one"));
}

TEST_F(FileSinkTest, LeavesADescriptorAloneThatTheProcessTookFromIt) {
    sink_.write(record("one"));
    const int number = descriptorOf(path_);
    ASSERT_GE(number, 0);
    const std::string others = folder_ / "data";
    logging_test::writeFile(others, "valuable");
    const int other = ::open(others.c_str(), O_RDWR | O_APPEND | O_CLOEXEC);
    ASSERT_EQ(::dup2(other, number), number);

    sink_.write(record("two"));
    EXPECT_EQ(readFile(others), "valuable");
    EXPECT_THAT(textsOf(readFile(path_)), ElementsAre("one", "two"));
    EXPECT_NE(::fcntl(number, F_GETFD), -1);
    ::close(number);
    ::close(other);
}

}  // namespace
