#include "framework/instrumentation/Linux/Files.h"

#include <fcntl.h>
#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <signal.h>
#include <sys/inotify.h>
#include <sys/stat.h>
#include <sys/sysmacros.h>
#include <sys/wait.h>
#include <unistd.h>

#include <functional>

#include "support/FixtureTree.h"

namespace {

using testing::UnorderedElementsAre;
using VA::Linux::FileState;
using VA::Linux::HostFiles;

struct HostFilesTest : testing::Test {
    FixtureTree tree;
    HostFiles files{tree.root()};

    std::optional<std::vector<std::string>> namesIn(const std::string& folder) const {
        std::vector<std::string> names;
        const auto listed =
            files.forEachName(folder, [&](std::string_view name) { names.emplace_back(name); });
        if (!listed) return std::nullopt;
        EXPECT_TRUE(listed == files.state(folder));
        return names;
    }
};

TEST_F(HostFilesTest, TextIsTheWholeContentByteForByte) {
    std::string content;
    for (int i = 0; i < 300000; ++i) content += static_cast<char>(i * 7);
    tree.write("some/file", content);
    EXPECT_EQ(files.text("some/file"), content);
    tree.write("empty", "");
    EXPECT_EQ(files.text("empty"), "");
}

TEST_F(HostFilesTest, FileOfAMegabyteIsReadAndOneThatIsLargerOrUnreadableIsToldFromAMissingOne) {
    tree.write("largest", std::string(1024 * 1024, 'x'));
    EXPECT_EQ(files.text("largest").value_or("").size(), 1024u * 1024u);
    tree.write("larger", std::string(1024 * 1024 + 1, 'x'));
    tree.makeLink("unreadable", "/proc/self/mem");  // its first page is never mapped
    for (const char* name : {"larger", "unreadable"}) {
        const auto content = files.read(name);
        ASSERT_TRUE(content) << name;
        EXPECT_FALSE(content->whole) << name;
        EXPECT_EQ(content->text, "") << name;
        EXPECT_EQ(files.text(name), std::nullopt) << name;
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

TEST_F(HostFilesTest, FifoInPlaceOfASourceIsNotEvenOpened) {
    tree.makeFifo("fifo");
    tree.write("file", "x");
    const int watch = ::inotify_init1(IN_NONBLOCK | IN_CLOEXEC);
    const auto opened = [&] {
        struct inotify_event event;
        return ::read(watch, &event, sizeof event) == sizeof event;
    };
    ASSERT_GE(::inotify_add_watch(watch, tree.path("fifo").c_str(), IN_OPEN), 0);
    ASSERT_GE(::inotify_add_watch(watch, tree.path("file").c_str(), IN_OPEN), 0);
    VA::Linux::TrackedFiles sources(files, 0);
    EXPECT_FALSE(sources.read("fifo"));
    EXPECT_FALSE(opened());
    EXPECT_TRUE(sources.read("file"));
    EXPECT_TRUE(opened());
    ::close(watch);
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
    const auto closed = namesIn("closed");
    if (user == 0) {
        ASSERT_EQ(::seteuid(0), 0);
    }
    ASSERT_EQ(::chmod(tree.path("closed").c_str(), 0755), 0);
    EXPECT_EQ(secret, std::nullopt);
    EXPECT_EQ(closed, std::nullopt);
}

TEST_F(HostFilesTest, NamesAreThoseInAFolder) {
    tree.write("folder/b", "");
    tree.makeFolder("folder/a b)");
    tree.makeFifo("folder/.hidden");
    tree.makeLink("link", "folder");
    tree.makeFolder("empty");
    const auto names = namesIn("folder");
    ASSERT_TRUE(names);
    EXPECT_THAT(*names, UnorderedElementsAre("b", "a b)", ".hidden"));
    EXPECT_TRUE(namesIn("link"));
    EXPECT_EQ(namesIn("empty"), std::vector<std::string>());
}

TEST_F(HostFilesTest, WhatIsNoFolderHasNoNames) {
    tree.write("file", "");
    tree.makeFifo("fifo");
    tree.makeLink("loop", "loop");
    for (const char* name : {"missing", "file", "fifo", "loop"}) {
        EXPECT_EQ(namesIn(name), std::nullopt) << name;
    }
}

TEST_F(HostFilesTest, FilesOfProcAreReadToTheirEndThoughTheirSizeIsZero) {
    EXPECT_THAT(HostFiles("/").text("proc/self/status").value_or(""), testing::StartsWith("Name:"));
    const std::string longName(100000, 'x');
    const pid_t child = ::fork();
    if (child == 0) {
        ::execl("/bin/sh", "sh", "-c", "kill -STOP $$", longName.c_str(), nullptr);
        ::_exit(1);
    }
    int status = 0;
    ASSERT_EQ(::waitpid(child, &status, WUNTRACED), child);
    const auto text = HostFiles("/").text("proc/" + std::to_string(child) + "/cmdline");
    ::kill(child, SIGKILL);
    ::waitpid(child, nullptr, 0);
    ASSERT_TRUE(WIFSTOPPED(status));
    EXPECT_EQ(text, std::string("sh\0-c\0kill -STOP $$\0", 20) + longName + '\0');
}

TEST_F(HostFilesTest, StateIsThatOfTheInode) {
    tree.write("file", "four");
    tree.makeLink("link", "file");
    // An old modification date does not make the inode older.
    const struct timespec old[2] = {{1000000000, 1}, {1000000000, 23}};
    ASSERT_EQ(::utimensat(AT_FDCWD, tree.path("file").c_str(), old, 0), 0);
    struct stat info;
    ASSERT_EQ(::stat(tree.path("file").c_str(), &info), 0);
    struct statx more;
    ASSERT_EQ(::statx(AT_FDCWD, tree.path("file").c_str(), 0, STATX_BTIME, &more), 0);
    const auto birth =
        more.stx_mask & STATX_BTIME ? std::optional(more.stx_btime.tv_sec) : std::nullopt;
    const auto content = files.read("file");
    ASSERT_TRUE(content);
    for (const auto& state : {files.state("file"), files.state("link"), {content->state}}) {
        ASSERT_TRUE(state);
        EXPECT_EQ(state->kind, FileState::Kind::Regular);
        EXPECT_EQ(state->device >> 32, major(info.st_dev));
        EXPECT_EQ(state->device & 0xffffffff, minor(info.st_dev));
        EXPECT_EQ(state->inode, info.st_ino);
        EXPECT_EQ(state->size, 4u);
        EXPECT_EQ(state->modified.seconds, 1000000000);
        EXPECT_EQ(state->modified.nanoseconds, 23u);
        EXPECT_EQ(state->changed.seconds, info.st_ctim.tv_sec);
        EXPECT_EQ(state->changed.nanoseconds, info.st_ctim.tv_nsec);
        EXPECT_EQ(state->birth, birth);
    }
}

TEST_F(HostFilesTest, StateTellsFilesFromFoldersAndFromOthers) {
    tree.makeFifo("fifo");
    EXPECT_EQ(files.state("")->kind, FileState::Kind::Directory);
    EXPECT_EQ(files.state("fifo")->kind, FileState::Kind::Other);
    EXPECT_EQ(files.state("missing"), std::nullopt);
}

TEST(FileStates, AreEqualWhereEverythingIsThatAChangeWouldChange) {
    FileState state;
    EXPECT_TRUE(state == FileState());
    state.birth = 1;
    EXPECT_TRUE(state == FileState());
    const std::function<void(FileState&)> changes[] = {
        [](FileState& each) { each.kind = FileState::Kind::Directory; },
        [](FileState& each) { each.device = 1; },
        [](FileState& each) { each.inode = 1; },
        [](FileState& each) { each.size = 1; },
        [](FileState& each) { each.modified.seconds = 1; },
        [](FileState& each) { each.modified.nanoseconds = 1; },
        [](FileState& each) { each.changed.seconds = 1; },
        [](FileState& each) { each.changed.nanoseconds = 1; },
    };
    for (const auto& change : changes) {
        FileState altered;
        change(altered);
        EXPECT_FALSE(state == altered) << &change - changes;
    }
}

TEST(HostFilesRoot, MayBeWrittenWithAndWithoutSlashes) {
    EXPECT_EQ(HostFiles("/").absolute("proc/stat"), "/proc/stat");
    EXPECT_EQ(HostFiles("").absolute("proc/stat"), "/proc/stat");
    EXPECT_EQ(HostFiles("/tmp/root").absolute("proc/stat"), "/tmp/root/proc/stat");
    EXPECT_EQ(HostFiles("/tmp/root//").absolute("proc/stat"), "/tmp/root/proc/stat");
    EXPECT_EQ(HostFiles("/tmp").absolute(""), "/tmp/");
}

}  // namespace
