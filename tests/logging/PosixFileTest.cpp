#include "framework/logging/PosixFile.h"

#include <fcntl.h>
#include <gtest/gtest.h>
#include <unistd.h>

#include "tests/logging/LoggingSupport.h"

namespace {

using ZBLog::PosixFile;

TEST(PosixFile, HoldsNothingAtFirstAndAfterItWasClosed) {
    PosixFile file;
    EXPECT_FALSE(file.isOpen());
    EXPECT_EQ(file.open("/dev/null", O_RDONLY), 0);
    EXPECT_TRUE(file.isOpen());
    file.close();
    EXPECT_FALSE(file.isOpen());
    EXPECT_EQ(file.open("/dev/null/x", O_RDONLY), ENOTDIR);
    EXPECT_FALSE(file.isOpen());
}

TEST(PosixFile, HoldsOneFileAtATime) {
    const std::size_t before = logging_test::openDescriptors();
    {
        PosixFile file;
        for (const char* path : {"/dev/null", "/dev/zero", "/dev/null"}) {
            EXPECT_EQ(file.open(path, O_RDONLY), 0);
            EXPECT_EQ(logging_test::openDescriptors(), before + 1);
        }
    }
    EXPECT_EQ(logging_test::openDescriptors(), before);
}

TEST(PosixFile, IsNoneOfTheStandardStreams) {
    for (const int stream : {STDIN_FILENO, STDOUT_FILENO, STDERR_FILENO}) {
        const int status = logging_test::inChildProcess([stream] {
            ::close(stream);
            PosixFile file;
            if (file.open("/dev/null", O_RDONLY) != 0 || !file.isOpen()) return 1;
            return ::fcntl(stream, F_GETFD) == -1 ? 0 : 2;
        });
        EXPECT_EQ(status, 0) << stream;
    }
}

}  // namespace
