#include "framework/instrumentation/Linux/HostFiles.h"

#include <fcntl.h>
#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sys/inotify.h>
#include <sys/resource.h>
#include <sys/stat.h>
#include <unistd.h>

#include <ctime>

#include "tests/instrumentation/FixtureTree.h"

namespace {

using testing::UnorderedElementsAre;
using VA::Linux::HostFiles;

struct HostFilesTest : testing::Test {
    FixtureTree tree;
    HostFiles files{tree.root()};
};

TEST_F(HostFilesTest, TextIsTheWholeContentByteForByte) {
    std::string content;
    for (int i = 0; i < 300000; ++i) content += static_cast<char>(i * 7);
    tree.write("some/file", content);
    EXPECT_EQ(files.text("some/file"), content);
    tree.write("empty", "");
    EXPECT_EQ(files.text("empty"), "");
}

TEST_F(HostFilesTest, FileOfOneMegabyteIsReadAndALargerOneIsNot) {
    tree.write("largest", std::string(1024 * 1024, 'x'));
    tree.write("larger", std::string(1024 * 1024 + 1, 'x'));
    EXPECT_EQ(files.text("largest").value_or("").size(), 1024u * 1024u);
    EXPECT_EQ(files.text("larger"), std::nullopt);
}

TEST_F(HostFilesTest, FileThatOpensAndCannotBeReadIsToldFromOneThatIsMissing) {
    tree.write("larger", std::string(1024 * 1024 + 1, 'x'));
    tree.makeLink("unreadable", "/proc/self/mem");
    for (const char* name : {"larger", "unreadable"}) {
        const auto content = files.read(name);
        ASSERT_TRUE(content) << name;
        EXPECT_FALSE(content->whole) << name;
        EXPECT_EQ(content->text, "") << name;
    }
    EXPECT_FALSE(files.read("missing"));
}

TEST_F(HostFilesTest, WhatIsNoRegularFileHasNoTextAndDoesNotBlock) {
    tree.makeFolder("folder");
    tree.makeFifo("fifo");
    tree.makeLink("loop", "loop");
    tree.makeLink("dangling", "nowhere");
    tree.makeLink("device", "/dev/zero");
    for (const char* name : {"missing", "folder", "fifo", "loop", "dangling", "device",
                             "fifo/below", "missing/below"}) {
        EXPECT_EQ(files.text(name), std::nullopt) << name;
    }
}

TEST_F(HostFilesTest, FifoIsNotEvenOpened) {
    tree.makeFifo("fifo");
    tree.write("file", "x");
    const int watch = ::inotify_init1(IN_NONBLOCK | IN_CLOEXEC);
    const auto opened = [&] {
        struct inotify_event event;
        return ::read(watch, &event, sizeof event) == sizeof event;
    };
    ASSERT_GE(::inotify_add_watch(watch, tree.path("fifo").c_str(), IN_OPEN), 0);
    ASSERT_GE(::inotify_add_watch(watch, tree.path("file").c_str(), IN_OPEN), 0);
    EXPECT_EQ(files.text("fifo"), std::nullopt);
    EXPECT_FALSE(opened());
    EXPECT_EQ(files.text("file"), "x");
    EXPECT_TRUE(opened());
    ::close(watch);
}

TEST_F(HostFilesTest, LinksAreFollowed) {
    tree.write("usr/lib/os-release", "NAME=x\n");
    tree.makeLink("etc/os-release", "../usr/lib/os-release");
    EXPECT_EQ(files.text("etc/os-release"), "NAME=x\n");
}

TEST_F(HostFilesTest, FileWhoseReadFailsHasNoText) {
    tree.makeLink("unreadable", "/proc/self/mem");  // its first page is never mapped
    EXPECT_EQ(files.text("unreadable"), std::nullopt);
}

TEST_F(HostFilesTest, FilesOfProcAreReadThoughTheirSizeIsZero) {
    const auto text = HostFiles("/").text("proc/self/status");
    ASSERT_TRUE(text);
    EXPECT_THAT(*text, testing::StartsWith("Name:"));
}

TEST_F(HostFilesTest, FileWithoutReadPermissionHasNoText) {
    tree.write("secret", "x");
    tree.write("closed/file", "x");
    ASSERT_EQ(::chmod(tree.path("secret").c_str(), 0), 0);
    ASSERT_EQ(::chmod(tree.path("closed").c_str(), 0), 0);
    const uid_t user = ::geteuid();
    if (user == 0) {
        ASSERT_EQ(::seteuid(65534), 0);
    }
    const auto secret = files.text("secret");
    const auto closed = files.names("closed");
    if (user == 0) {
        ASSERT_EQ(::seteuid(0), 0);
    }
    ASSERT_EQ(::chmod(tree.path("closed").c_str(), 0755), 0);
    EXPECT_EQ(secret, std::nullopt);
    EXPECT_EQ(closed, std::nullopt);
}

TEST_F(HostFilesTest, ProcessWithoutFreeDescriptorsReadsNothing) {
    tree.write("file", "x");
    struct rlimit before;
    ASSERT_EQ(::getrlimit(RLIMIT_NOFILE, &before), 0);
    struct rlimit none = before;
    none.rlim_cur = 0;
    ASSERT_EQ(::setrlimit(RLIMIT_NOFILE, &none), 0);
    const auto text = files.text("file");
    const auto names = files.names("");
    ASSERT_EQ(::setrlimit(RLIMIT_NOFILE, &before), 0);
    EXPECT_EQ(text, std::nullopt);
    EXPECT_EQ(names, std::nullopt);
    EXPECT_EQ(files.text("file"), "x");
}

TEST_F(HostFilesTest, NamesAreThoseInAFolder) {
    tree.write("folder/b", "");
    tree.makeFolder("folder/a b)");
    tree.makeFifo("folder/.hidden");
    tree.makeLink("link", "folder");
    tree.makeFolder("empty");
    const auto names = files.names("folder");
    ASSERT_TRUE(names);
    EXPECT_THAT(*names, UnorderedElementsAre("b", "a b)", ".hidden"));
    EXPECT_TRUE(files.names("link"));
    EXPECT_EQ(files.names("empty"), std::vector<std::string>());
}

TEST_F(HostFilesTest, WhatIsNoFolderHasNoNames) {
    tree.write("file", "");
    tree.makeFifo("fifo");
    tree.makeLink("loop", "loop");
    for (const char* name : {"missing", "file", "fifo", "loop"}) {
        EXPECT_EQ(files.names(name), std::nullopt) << name;
        EXPECT_FALSE(files.isFolder(name)) << name;
    }
    EXPECT_TRUE(files.isFolder(""));
}

TEST_F(HostFilesTest, DatesAreThoseOfTheInode) {
    const std::time_t before = std::time(nullptr) - 1;
    tree.write("file", "x");
    // An old modification date does not make the inode older.
    const struct timespec old[2] = {{1000000000, 0}, {1000000000, 0}};
    ASSERT_EQ(::utimensat(AT_FDCWD, tree.path("file").c_str(), old, 0), 0);
    const auto dates = files.dates("file");
    ASSERT_TRUE(dates);
    EXPECT_GE(dates->change, before);
    EXPECT_LE(dates->change, std::time(nullptr));
    EXPECT_TRUE(files.dates(""));
    EXPECT_EQ(files.dates("missing"), std::nullopt);
}

TEST(HostFilesRoot, MayBeWrittenWithAndWithoutSlashes) {
    EXPECT_EQ(HostFiles("/").absolute("proc/stat"), "/proc/stat");
    EXPECT_EQ(HostFiles("").absolute("proc/stat"), "/proc/stat");
    EXPECT_EQ(HostFiles("/tmp/root").absolute("proc/stat"), "/tmp/root/proc/stat");
    EXPECT_EQ(HostFiles("/tmp/root//").absolute("proc/stat"), "/tmp/root/proc/stat");
    EXPECT_EQ(HostFiles("/tmp").absolute(""), "/tmp/");
}

}  // namespace
