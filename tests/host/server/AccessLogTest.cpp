#include "host/server/AccessLog.h"

#include <fcntl.h>
#include <gmock/gmock.h>
#include <unistd.h>

#include <array>
#include <cerrno>
#include <thread>

#include "base/FileDescriptor.h"

namespace {

using namespace cmpihost::server;
using testing::EndsWith;
using testing::HasSubstr;
using testing::StartsWith;

/// The two ends of a pipe of four pages.
class LogPipe {
  public:
    LogPipe() {
        std::array<int, 2> ends{};
        EXPECT_EQ(pipe2(ends.data(), O_CLOEXEC), 0);
        reader_.reset(ends[0]);
        writer_.reset(ends[1]);
        EXPECT_GT(fcntl(writer_.number(), F_SETPIPE_SZ, 16384), 0);
        fcntl(reader_.number(), F_SETFL, O_NONBLOCK);
    }
    int writer() const { return writer_.number(); }
    std::string read() const {
        std::string text(65536, '\0');
        const ssize_t count = ::read(reader_.number(), text.data(), text.size());
        return text.substr(0, count > 0 ? static_cast<std::size_t>(count) : 0);
    }

  private:
    base::FileDescriptor reader_;
    base::FileDescriptor writer_;
};

std::vector<std::string> noComplaints() {
    return {};
}

/// The line of a request, at a level.
std::string line(LogLevel level, unsigned status, unsigned cimStatus,
                 const std::string& operation = "GetInstance", const std::string& user = "") {
    const LogPipe pipe;
    Log log(pipe.writer(), level, false);
    AccessLog access(log, &noComplaints);
    HttpRequest request;
    request.peer = "::1";
    HttpResponse response;
    response.status = status;
    response.cimStatus = cimStatus;
    response.operation = operation;
    response.user = user;
    access.answered(request, response, std::chrono::microseconds(412));
    return pipe.read();
}

TEST(AccessLog, TellsRequestsAsFarAsTheLevelGoes) {
    const std::string done = "cmpihost-serve: ::1 - GetInstance 200 0 412us\n";
    const std::string failed = "cmpihost-serve: ::1 - GetInstance 200 6 412us\n";
    const struct {
        LogLevel level;
        std::string done;
        std::string failed;
        std::string refused;
    } rows[] = {{LogLevel::None, "", "", ""},
                {LogLevel::Failures, "", failed, "cmpihost-serve: ::1 - - 401 0 412us\n"},
                {LogLevel::Requests, done, failed, "cmpihost-serve: ::1 - - 401 0 412us\n"}};
    for (const auto& row : rows) {
        EXPECT_EQ(line(row.level, 200, 0), row.done);
        EXPECT_EQ(line(row.level, 200, 6), row.failed);
        EXPECT_EQ(line(row.level, 401, 0, ""), row.refused);
    }
}

TEST(AccessLog, KeepsWhatClientsSendInItsField) {
    EXPECT_EQ(line(LogLevel::Requests, 200, 0, "Get\n<0>x y\x1b", "j\\oe"),
              "cmpihost-serve: ::1 j\\\\oe Get\\x0A<0>x\\x20y\\x1B 200 0 412us\n");
    EXPECT_EQ(line(LogLevel::Requests, 200, 0, std::string(500, 'x')),
              "cmpihost-serve: ::1 - " + std::string(128, 'x') + "... 200 0 412us\n");
}

TEST(AccessLog, TellsComplaintsAndConnectionsThatWereCut) {
    const LogPipe pipe;
    Log log(pipe.writer(), LogLevel::Failures, true);
    std::vector<std::string> complaints = {"one", "two\nlines"};
    AccessLog access(log, [&] { return std::exchange(complaints, {}); });
    access.answered({}, {}, std::chrono::nanoseconds(1));
    access.cut("192.0.2.1", "header too slow");
    access.cut("", "no descriptor");
    EXPECT_EQ(pipe.read(),
              "<4>cmpihost-serve: caught: one\n<4>cmpihost-serve: caught: two\\x0Alines\n"
              "<5>cmpihost-serve: 192.0.2.1 cut: header too slow\n"
              "<5>cmpihost-serve: - cut: no descriptor\n");
    complaints.assign(100, "many");
    access.logComplaints();
    EXPECT_THAT(pipe.read(), EndsWith("many\n<4>cmpihost-serve: caught: 84 more\n"));
}

TEST(AccessLog, SumsUpConnectionsThatWereCutInAFlood) {
    const LogPipe pipe;
    Log log(pipe.writer(), LogLevel::Failures, false);
    AccessLog access(log, &noComplaints, std::chrono::milliseconds(200));
    for (int count = 0; count < 30; ++count) access.cut("::1", "late");
    std::this_thread::sleep_for(std::chrono::milliseconds(210));
    access.answered({}, {}, std::chrono::nanoseconds(1));
    access.cut("::1", "later");
    std::string expected;
    for (int count = 0; count < 10; ++count) expected += "cmpihost-serve: ::1 cut: late\n";
    EXPECT_EQ(pipe.read(), expected +
                               "cmpihost-serve: 20 more connections cut\n"
                               "cmpihost-serve: ::1 cut: later\n");
}

TEST(Log, CutsALongText) {
    const LogPipe pipe;
    Log log(pipe.writer(), LogLevel::None, false);
    log.write(Priority::Error, std::string(5000, '\n'));
    const std::string text = pipe.read();
    EXPECT_EQ(text.size(), std::string("cmpihost-serve: ...\n").size() + 4000);
    EXPECT_THAT(text, EndsWith("\\x0A\\x0A...\n"));
}

TEST(Log, LosesLinesRatherThanWaitForAReader) {
    const LogPipe pipe;
    Log log(pipe.writer(), LogLevel::None, false);
    for (int count = 0; count < 100; ++count) log.write(Priority::Info, std::string(400, 'x'));
    EXPECT_GE(log.lost(), 50U);
    EXPECT_THAT(pipe.read(), StartsWith("cmpihost-serve: xxx"));
    const std::uint64_t lost = log.lost();
    log.write(Priority::Info, "again");
    EXPECT_EQ(pipe.read(), "cmpihost-serve: " + std::to_string(lost) +
                               " lines of this log were lost: nobody read them in time\n"
                               "cmpihost-serve: again\n");
    EXPECT_EQ(log.lost(), lost);
}

}  // namespace
