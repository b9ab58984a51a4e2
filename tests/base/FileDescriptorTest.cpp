#include "base/FileDescriptor.h"

#include <fcntl.h>
#include <gtest/gtest.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <utility>

namespace {

using base::FileDescriptor;

FileDescriptor openNull() {
    return FileDescriptor::open("/dev/null", O_RDONLY);
}

bool isOpen(int number) {
    return ::fcntl(number, F_GETFD) != -1;
}

TEST(FileDescriptor, HoldsNothingAtFirst) {
    const FileDescriptor descriptor;
    EXPECT_FALSE(descriptor.isOpen());
    EXPECT_LT(descriptor.number(), 0);
}

TEST(FileDescriptor, ClosesWhatItOpened) {
    int number = -1;
    {
        const FileDescriptor descriptor = openNull();
        ASSERT_TRUE(descriptor.isOpen());
        number = descriptor.number();
        EXPECT_TRUE(isOpen(number));
    }
    EXPECT_FALSE(isOpen(number));
}

TEST(FileDescriptor, TellsWhyAFileCannotBeOpened) {
    EXPECT_FALSE(FileDescriptor::open("/dev/null/x", O_RDONLY).isOpen());
    EXPECT_EQ(errno, ENOTDIR);
}

TEST(FileDescriptor, IsNotInheritedAndWaitsForNobody) {
    const FileDescriptor descriptor = openNull();
    EXPECT_EQ(::fcntl(descriptor.number(), F_GETFD), FD_CLOEXEC);
    EXPECT_NE(::fcntl(descriptor.number(), F_GETFL) & O_NONBLOCK, 0);
}

TEST(FileDescriptor, CreatesAFileWithTheModeThatIsAskedFor) {
    const FileDescriptor descriptor = FileDescriptor::open("/tmp", O_TMPFILE | O_RDWR, 0600);
    ASSERT_TRUE(descriptor.isOpen());
    struct stat status {};
    ASSERT_EQ(::fstat(descriptor.number(), &status), 0);
    EXPECT_EQ(status.st_mode & 0777, 0600U);
}

TEST(FileDescriptor, MovesItsFile) {
    FileDescriptor first = openNull();
    const int number = first.number();
    FileDescriptor second(std::move(first));
    EXPECT_EQ(second.number(), number);

    FileDescriptor third = openNull();
    const int closed = third.number();
    third = std::move(second);
    EXPECT_EQ(third.number(), number);
    EXPECT_FALSE(isOpen(closed));
    EXPECT_TRUE(isOpen(number));
}

TEST(FileDescriptor, LetsGoWithoutClosing) {
    FileDescriptor descriptor = openNull();
    const int number = descriptor.release();
    EXPECT_FALSE(descriptor.isOpen());
    EXPECT_TRUE(isOpen(number));
    descriptor.reset(number);
    EXPECT_EQ(descriptor.number(), number);
    descriptor.reset();
    EXPECT_FALSE(isOpen(number));
}

TEST(FileDescriptor, LeavesErrnoAloneWhenItCloses) {
    FileDescriptor descriptor(1000000);  // close fails
    errno = EDOM;
    descriptor.reset();
    EXPECT_EQ(errno, EDOM);
}

// A process without standard input opens files as number 0.
TEST(FileDescriptor, ClosesTheFileNumberedZero) {
    const int standardInput = ::dup(STDIN_FILENO);
    ::close(STDIN_FILENO);
    {
        const FileDescriptor descriptor = openNull();
        EXPECT_EQ(descriptor.number(), 0);
        EXPECT_TRUE(descriptor.isOpen());
    }
    EXPECT_FALSE(isOpen(0));
    ::dup2(standardInput, STDIN_FILENO);
    ::close(standardInput);
}

}  // namespace
