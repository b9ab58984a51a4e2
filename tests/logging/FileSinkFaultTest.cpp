#include <fcntl.h>
#include <gmock/gmock.h>
#include <sys/resource.h>
#include <sys/stat.h>
#include <unistd.h>

#include <filesystem>
#include <functional>

#include "framework/logging/Sinks.h"
#include "tests/logging/LoggingSupport.h"

namespace {

using namespace ZBLog;
using namespace logging_test;
using testing::ElementsAre;

/// A limit on the size of files that the process may write, while it lives.
class FileSizeLimit {
  public:
    explicit FileSizeLimit(rlim_t bytes) {
        ::getrlimit(RLIMIT_FSIZE, &former_);
        const rlimit limited{bytes, former_.rlim_max};
        ::setrlimit(RLIMIT_FSIZE, &limited);
    }
    ~FileSizeLimit() { ::setrlimit(RLIMIT_FSIZE, &former_); }
    FileSizeLimit(const FileSizeLimit&) = delete;
    FileSizeLimit& operator=(const FileSizeLimit&) = delete;

  private:
    rlimit former_{};
};

class FileSinkFaultTest : public testing::Test {
  protected:
    TemporaryDirectory folder_;
    FakeEnvironment environment_;
};

TEST_F(FileSinkFaultTest, LossIsToldOnceToTheSystemsLogAndInTheFileWhenItCanBeWrittenAgain) {
    const std::string disk = folder_.path("disk");
    const std::string path = disk + "/full";
    const struct {
        const char* reason;
        std::function<void()> breakDisk;
    } rows[] = {
        {"No space left on device",
         [&] { std::filesystem::create_directory_symlink("/dev", disk); }},
        {"No such file or directory", [] {}},
    };
    for (const auto& row : rows) {
        const std::string dropped = std::string(" dropped: ") + row.reason;
        row.breakDisk();
        FileSink sink(path, environment_);
        for (int count = 0; count < 12; ++count) sink.write(record("lost"));
        EXPECT_THAT(environment_.takeSystemLog(), ElementsAre(lossOf(path, row.reason)));

        std::filesystem::remove(disk);
        std::filesystem::create_directory(disk);
        sink.write(record("one"));
        sink.write(record("two"));
        EXPECT_THAT(textsOf(readFile(path)),
                    ElementsAre("12 records were" + dropped, "one", "two"));
        EXPECT_THAT(readFile(path), testing::HasSubstr(" log 0 ZBLog - -:0 12 records were"));
        EXPECT_TRUE(environment_.takeSystemLog().empty());

        std::filesystem::remove_all(disk);
        row.breakDisk();
        sink.write(record("lost"));
        EXPECT_THAT(environment_.takeSystemLog(), ElementsAre(lossOf(path, row.reason)));
        std::filesystem::remove(disk);
        std::filesystem::create_directory(disk);
        sink.write(record("three"));
        EXPECT_THAT(textsOf(readFile(path)), ElementsAre("1 record was" + dropped, "three"));
        std::filesystem::remove_all(disk);
    }
}

TEST_F(FileSinkFaultTest, UnwritableFolderIsToldOnceAndTheFileIsUsedWhenItBecomesWritable) {
    ASSERT_EQ(::chmod(folder_.path().c_str(), 0555), 0);
    const std::string path = folder_.path("korva.log");
    const int status = inChildProcess([&] {
        if (::geteuid() == 0 && ::setresuid(65534, 65534, 0) != 0) return 1;
        FileSink sink(path, environment_);
        sink.write(record("lost"));
        sink.write(record("lost"));
        const bool told = environment_.takeSystemLog() ==
                          std::vector<std::string>{lossOf(path, "Permission denied")};
        if (::getuid() == 65534 && ::setresuid(0, 0, 0) != 0) return 2;
        ::chmod(folder_.path().c_str(), 0755);
        sink.write(record("one"));
        return told ? 0 : 3;
    });
    EXPECT_EQ(status, 0);
    EXPECT_THAT(textsOf(readFile(path)),
                ElementsAre("2 records were dropped: Permission denied", "one"));
}

TEST_F(FileSinkFaultTest, HalfALineIsNeverContinuedByAnotherRecord) {
    const std::string path = folder_.path("korva.log");
    FileSink sink(path, environment_);
    sink.write(record("one"));
    const std::string before = readFile(path);
    {
        const FileSizeLimit limit(before.size() + 10);
        sink.write(record("torn"));
        sink.write(record("lost"));
    }
    const std::string torn = readFile(path);
    EXPECT_EQ(torn.size(), before.size() + 10);
    sink.write(record("two"));
    sink.write(record("three"));

    const std::string after = readFile(path);
    EXPECT_EQ(after.substr(0, torn.size()), torn);
    EXPECT_EQ(after[torn.size()], '\n');
    EXPECT_THAT(textsOf(after.substr(torn.size() + 1)),
                ElementsAre("2 records were dropped: File too large", "two", "three"));
    EXPECT_EQ(environment_.takeSystemLog().size(), 1u);
}

TEST_F(FileSinkFaultTest, NewFileAfterATornLineBeginsWithoutAnEmptyLine) {
    const std::string path = folder_.path("korva.log");
    FileSink sink(path, environment_);
    {
        const FileSizeLimit limit(10);
        sink.write(record("torn"));
    }
    std::filesystem::rename(path, path + ".1");
    sink.write(record("one"));
    EXPECT_THAT(textsOf(readFile(path)),
                ElementsAre("1 record was dropped: File too large", "one"));
}

TEST_F(FileSinkFaultTest, TornLineIsRememberedWhileTheFileIsAway) {
    const std::string path = folder_.path("var/korva.log");
    std::filesystem::create_directory(folder_.path("var"));
    FileSink sink(path, environment_);
    {
        const FileSizeLimit limit(10);
        sink.write(record("torn"));
    }
    std::filesystem::rename(folder_.path("var"), folder_.path("away"));
    sink.write(record("lost"));
    std::filesystem::rename(folder_.path("away"), folder_.path("var"));
    sink.write(record("one"));
    EXPECT_EQ(readFile(path)[10], '\n');
    EXPECT_THAT(textsOf(readFile(path).substr(11)),
                ElementsAre("2 records were dropped: No such file or directory", "one"));
}

TEST_F(FileSinkFaultTest, WhatIsNoPlainFileIsRefused) {
    const std::string path = folder_.path("korva.log");
    const std::string victim = folder_.path("victim");
    writeFile(victim, "precious");
    const struct {
        std::function<void()> make;
        const char* reason;
    } rows[] = {
        {[&] { std::filesystem::create_symlink(victim, path); },
         "Too many levels of symbolic links"},
        {[&] { ASSERT_EQ(::mkfifo(path.c_str(), 0600), 0); }, "No such device or address"},
        {[&] { std::filesystem::create_directory(path); }, "Is a directory"},
    };
    for (const auto& row : rows) {
        row.make();
        FileSink sink(path, environment_);
        sink.write(record("one"));
        EXPECT_THAT(environment_.takeSystemLog(), ElementsAre(lossOf(path, row.reason)));
        std::filesystem::remove(path);
    }
    EXPECT_EQ(readFile(victim), "precious");
}

TEST_F(FileSinkFaultTest, FifoThatSomebodyReadsIsRefusedToo) {
    const std::string path = folder_.path("fifo");
    ASSERT_EQ(::mkfifo(path.c_str(), 0600), 0);
    const int reader = ::open(path.c_str(), O_RDONLY | O_NONBLOCK | O_CLOEXEC);
    const std::size_t before = openDescriptors();
    FileSink sink(path, environment_);
    for (int count = 0; count < 2; ++count) sink.write(record("one"));
    char byte = 0;
    EXPECT_EQ(::read(reader, &byte, 1), 0);
    EXPECT_EQ(openDescriptors(), before);
    EXPECT_THAT(environment_.takeSystemLog(), ElementsAre(lossOf(path, "Invalid argument")));
    ::close(reader);
}

}  // namespace
