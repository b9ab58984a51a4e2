#include "framework/logging/ConfigurationFile.h"

#include <gmock/gmock.h>
#include <sys/mman.h>
#include <sys/stat.h>
#include <unistd.h>

#include <chrono>
#include <filesystem>
#include <thread>

#include "tests/logging/LoggingSupport.h"

namespace {

using namespace ZBLog;
using namespace logging_test;

/// What reading brings: the log's level, and the errors.
std::string readingOf(ConfigurationFile& file) {
    const auto read = file.readIfChanged();
    if (!read) return "unchanged";
    std::string text = std::to_string(read->configuration.of(Channel::log).level);
    for (const auto& error : read->errors) {
        text += " [" + std::to_string(error.line) + ": " + error.message + "]";
    }
    return text;
}

class ConfigurationFileTest : public testing::Test {
  protected:
    /// Writes the file as if that had been long ago.
    void writeLongAgo(const std::string& content) {
        writeFile(path_, content);
        environment_.setAhead(60);
    }

    TemporaryDirectory folder_;
    FakeEnvironment environment_;
    const std::string path_ = folder_.path("zblog.conf");
    ConfigurationFile file_{{path_, true}, environment_};
};

/// "log.level = 1" in a mapped file, where a store changes the content and nothing that stat tells.
class UnnoticedChanges {
  public:
    UnnoticedChanges() : memory_(::memfd_create("zblog.conf", MFD_CLOEXEC)) {
        constexpr char content[] = "log.level = 1";
        constexpr std::size_t size = sizeof content - 1;
        EXPECT_EQ(::pwrite(memory_, content, size, 0), static_cast<ssize_t>(size));
        content_ = static_cast<char*>(
            ::mmap(nullptr, size, PROT_READ | PROT_WRITE, MAP_SHARED, memory_, 0));
        EXPECT_NE(content_, MAP_FAILED);
        setLevel('1');  // only the first store into a page is noticed
    }
    ~UnnoticedChanges() {
        ::munmap(content_, 1);
        ::close(memory_);
    }
    UnnoticedChanges(const UnnoticedChanges&) = delete;
    UnnoticedChanges& operator=(const UnnoticedChanges&) = delete;

    void setLevel(char digit) { content_[12] = digit; }
    std::string path() const { return "/proc/self/fd/" + std::to_string(memory_); }
    time_t changedAt() const {
        struct stat status {};
        EXPECT_EQ(::fstat(memory_, &status), 0);
        return status.st_ctim.tv_sec;
    }

  private:
    int memory_;
    char* content_ = nullptr;
};

TEST_F(ConfigurationFileTest, IsReadOnceAndAgainWhenItsContentChanges) {
    writeLongAgo("log.level = 1\n");
    EXPECT_EQ(readingOf(file_), "1");
    EXPECT_EQ(readingOf(file_), "unchanged");
    writeFile(path_, "log.level = 22\n");
    EXPECT_EQ(readingOf(file_), "22");
    EXPECT_EQ(readingOf(file_), "unchanged");
}

TEST_F(ConfigurationFileTest, IsUnchangedWhenItWasOnlyTouchedOrReplacedByTheSame) {
    writeLongAgo("log.level = x\n");
    EXPECT_EQ(readingOf(file_), "3000 [1: log.level must be a number from 0 to 999999, not \"x\"]");
    std::filesystem::last_write_time(path_, std::filesystem::file_time_type::clock::now());
    EXPECT_EQ(readingOf(file_), "unchanged");
    writeFile(path_ + ".new", "log.level = x\n");
    std::filesystem::rename(path_ + ".new", path_);
    EXPECT_EQ(readingOf(file_), "unchanged");
}

TEST_F(ConfigurationFileTest, IsReadWhenAnotherFileTakesItsPlace) {
    writeLongAgo("log.level = 1\n");
    EXPECT_EQ(readingOf(file_), "1");
    writeFile(path_ + ".new", "log.level = 2\n");
    std::filesystem::rename(path_ + ".new", path_);
    EXPECT_EQ(readingOf(file_), "2");
}

TEST_F(ConfigurationFileTest, SeesAChangeThatKeepsItsSizeAndItsTimeOfModification) {
    writeLongAgo("log.level = 1\n");
    EXPECT_EQ(readingOf(file_), "1");
    const auto modified = std::filesystem::last_write_time(path_);
    std::this_thread::sleep_for(std::chrono::milliseconds(20));  // file times advance in steps
    writeFile(path_, "log.level = 2\n");
    std::filesystem::last_write_time(path_, modified);
    EXPECT_EQ(readingOf(file_), "2");
}

TEST_F(ConfigurationFileTest, SeesASecondChangeInTheSameMoment) {
    UnnoticedChanges changes;
    for (const time_t age : {0, 2}) {
        changes.setLevel('1');
        ConfigurationFile file({changes.path(), true}, environment_);
        environment_.stopUtcAt(changes.changedAt() + age);
        EXPECT_EQ(readingOf(file), "1");
        changes.setLevel('2');
        EXPECT_EQ(readingOf(file), "2") << age;
        EXPECT_EQ(readingOf(file), "unchanged");
    }
}

TEST_F(ConfigurationFileTest, IsNotReadWhileItRests) {
    UnnoticedChanges changes;
    for (const time_t age : {3, -1}) {
        changes.setLevel('1');
        ConfigurationFile file({changes.path(), true}, environment_);
        environment_.stopUtcAt(changes.changedAt() + age);
        EXPECT_EQ(readingOf(file), "1");
        changes.setLevel('2');
        EXPECT_EQ(readingOf(file), "unchanged") << age;
    }
}

TEST_F(ConfigurationFileTest, TellsAnotherReasonWhyItCannotBeRead) {
    EXPECT_EQ(readingOf(file_), "3000 [0: cannot be read: No such file or directory]");
    std::filesystem::create_symlink(path_, path_);
    EXPECT_EQ(readingOf(file_), "3000 [0: cannot be read: Too many levels of symbolic links]");
}

TEST_F(ConfigurationFileTest, TellsOnceWhyThereIsNothingToRead) {
    const std::string missing = folder_.path("missing"), link = folder_.path("link"),
                      fifo = folder_.path("fifo"), tooLong = folder_.path("long");
    std::filesystem::create_symlink(link, link);
    ASSERT_EQ(::mkfifo(fifo.c_str(), 0600), 0);
    writeFile(tooLong, std::string(100000, '\n'));
    environment_.setAhead(60);
    const struct {
        std::string path;
        bool required;
        const char* reading;
    } rows[] = {
        {"", true, "3000"},
        {missing, true, "3000 [0: cannot be read: No such file or directory]"},
        {missing, false, "3000"},
        {"/etc/passwd/zblog.conf", false, "3000"},
        {link, false, "3000 [0: cannot be read: Too many levels of symbolic links]"},
        {tooLong, false, "3000 [0: longer than 65536 bytes]"},
        {folder_.path(), false, "3000 [0: not a regular file]"},
        {fifo, false, "3000 [0: not a regular file]"},
        {"/dev/zero", false, "3000 [0: not a regular file]"},
        // Its first page is never mapped.
        {"/proc/self/mem", false, "3000 [0: cannot be read: Input/output error]"},
    };
    for (const auto& row : rows) {
        ConfigurationFile file({row.path, row.required}, environment_);
        EXPECT_EQ(readingOf(file), row.reading) << row.path;
        EXPECT_EQ(readingOf(file), "unchanged") << row.path;
    }
}

TEST_F(ConfigurationFileTest, ComesAndGoes) {
    ConfigurationFile file({path_, false}, environment_);
    EXPECT_EQ(readingOf(file), "3000");
    writeLongAgo("log.level = 1\n");
    EXPECT_EQ(readingOf(file), "1");
    std::filesystem::remove(path_);
    EXPECT_EQ(readingOf(file), "3000");
    EXPECT_EQ(readingOf(file), "unchanged");
    writeLongAgo("log.level = 1\n");
    EXPECT_EQ(readingOf(file), "1");
}

}  // namespace
