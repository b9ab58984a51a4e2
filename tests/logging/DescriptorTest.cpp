#include "framework/logging/Descriptor.h"

#include <fcntl.h>
#include <gtest/gtest.h>
#include <unistd.h>

#include "tests/logging/LoggingSupport.h"

namespace {

using ZBLog::Descriptor;

TEST(Descriptor, HoldsNothingAtFirstAndAfterItWasClosed) {
    Descriptor descriptor;
    EXPECT_FALSE(descriptor.isOpen());
    EXPECT_EQ(descriptor.open("/dev/null", O_RDONLY), 0);
    EXPECT_TRUE(descriptor.isOpen());
    descriptor.close();
    EXPECT_FALSE(descriptor.isOpen());
    EXPECT_EQ(descriptor.open("/dev/null/x", O_RDONLY), ENOTDIR);
    EXPECT_FALSE(descriptor.isOpen());
}

TEST(Descriptor, HoldsOneFileAtATime) {
    const std::size_t before = logging_test::openDescriptors();
    {
        Descriptor descriptor;
        for (const char* path : {"/dev/null", "/dev/zero", "/dev/null"}) {
            EXPECT_EQ(descriptor.open(path, O_RDONLY), 0);
            EXPECT_EQ(logging_test::openDescriptors(), before + 1);
        }
    }
    EXPECT_EQ(logging_test::openDescriptors(), before);
}

TEST(Descriptor, IsNoneOfTheStandardStreams) {
    for (const int stream : {STDIN_FILENO, STDOUT_FILENO, STDERR_FILENO}) {
        const int status = logging_test::inChildProcess([stream] {
            ::close(stream);
            Descriptor descriptor;
            if (descriptor.open("/dev/null", O_RDONLY) != 0 || !descriptor.isOpen()) return 1;
            return ::fcntl(stream, F_GETFD) == -1 ? 0 : 2;
        });
        EXPECT_EQ(status, 0) << stream;
    }
}

}  // namespace
