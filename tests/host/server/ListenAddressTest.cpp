#include "host/server/ListenAddress.h"

#include <gmock/gmock.h>
#include <sys/stat.h>

#include <stdexcept>
#include <system_error>

#include "support/TemporaryDirectory.h"

namespace {

using namespace cmpihost::server;

TEST(ListenAddress, IsReadFromText) {
    const struct {
        const char* text;
        const char* shown;
        bool local;
        bool plain;
    } rows[] = {
        {"127.0.0.1:5988", "127.0.0.1:5988", true, false},
        {"127.9.9.9:1", "127.9.9.9:1", true, false},
        {"plain:127.0.0.1:80", "127.0.0.1:80", true, true},
        {"[::1]:5988", "[::1]:5988", true, false},
        {"[::ffff:127.0.0.1]:5988", "[::ffff:127.0.0.1]:5988", true, false},
        {"0.0.0.0:5989", "0.0.0.0:5989", false, false},
        {"192.0.2.1:65535", "192.0.2.1:65535", false, false},
        {"[::]:5989", "[::]:5989", false, false},
        {"[2001:db8::1]:5989", "[2001:db8::1]:5989", false, false},
        {"[::ffff:192.0.2.1]:5989", "[::ffff:192.0.2.1]:5989", false, false},
        {"plain:[::]:5989", "[::]:5989", false, true},
        {"unix:/run/cim socket", "unix:/run/cim socket", true, true},
    };
    for (const auto& row : rows) {
        const std::vector<ListenAddress> read = ListenAddress::read(row.text);
        ASSERT_EQ(read.size(), 1U) << row.text;
        EXPECT_EQ(read.front().text(), row.shown);
        EXPECT_EQ(read.front().isLocal(), row.local) << row.text;
        EXPECT_EQ(read.front().isPlain(), row.plain) << row.text;
        EXPECT_FALSE(read.front().isOptional());
    }
}

TEST(ListenAddress, OfLocalhostAreTwoOfWhichTheSecondMayBeMissing) {
    const std::vector<ListenAddress> both = ListenAddress::read("localhost:5988");
    ASSERT_EQ(both.size(), 2U);
    EXPECT_EQ(both[0].text() + " " + both[1].text(), "127.0.0.1:5988 [::1]:5988");
    EXPECT_FALSE(both[0].isOptional());
    EXPECT_TRUE(both[1].isOptional());
}

TEST(ListenAddress, IsRefusedWhereItIsNone) {
    for (const char* text :
         {"", ":", "5988", "127.0.0.1", "127.0.0.1:", ":5988", "127.0.0.1:65536", "127.0.0.1:-1",
          "127.0.0.1:5988x", "example.org:5988", "::1:5988", "[::1]", "[]:1", "[::1:5988",
          "plain:", "plain:unix:/x", "unix:", "unix:relative", "http://127.0.0.1:5988"})
        EXPECT_THROW(ListenAddress::read(text), std::invalid_argument) << text;
    EXPECT_THROW(ListenAddress::read("unix:/" + std::string(107, 'x')), std::invalid_argument);
}

TEST(ListenAddress, IsListenedOnAndTellsItsPort) {
    const ListenAddress any = ListenAddress::read("127.0.0.1:0").front();
    const base::FileDescriptor socket = any.listen();
    const ListenAddress bound = any.at(socket.number());
    EXPECT_NE(bound.text(), "127.0.0.1:0");
    EXPECT_THROW(bound.listen(), std::system_error) << "taken";
}

TEST(ListenAddress, OfAFileReplacesOnlyASocketThatNobodyListensOn) {
    const TemporaryDirectory directory;
    const ListenAddress address = ListenAddress::read("unix:" + directory.path("s")).front();
    {
        const base::FileDescriptor first = address.listen();
        EXPECT_THROW(address.listen(), std::system_error);
    }
    const base::FileDescriptor second = address.listen();
    address.removeFile();
    EXPECT_FALSE(std::filesystem::exists(directory.path("s")));
    directory.write("s", "no socket");
    EXPECT_THROW(address.listen(), std::system_error);
    EXPECT_TRUE(std::filesystem::exists(directory.path("s")));
}

}  // namespace
