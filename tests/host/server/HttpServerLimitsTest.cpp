#include <gmock/gmock.h>
#include <sys/resource.h>
#include <sys/socket.h>

#include <algorithm>
#include <array>
#include <deque>
#include <map>

#include "host/server/HttpTestServer.h"

namespace cmpihost::server {
namespace {

using namespace fixture;
using std::chrono::milliseconds;
using testing::ElementsAre;
using testing::EndsWith;
using testing::StartsWith;
using HttpTestClock = std::chrono::steady_clock;

/// A limit of the process, as long as this lives.
class DescriptorLimit {
  public:
    explicit DescriptorLimit(rlim_t number) {
        getrlimit(RLIMIT_NOFILE, &former_);
        const rlimit changed{std::min(number, former_.rlim_max), former_.rlim_max};
        setrlimit(RLIMIT_NOFILE, &changed);
    }
    ~DescriptorLimit() { setrlimit(RLIMIT_NOFILE, &former_); }
    DescriptorLimit(const DescriptorLimit&) = delete;
    DescriptorLimit& operator=(const DescriptorLimit&) = delete;

  private:
    rlimit former_{};
};

/// Whether a new client gets its answer, and within a second.
void expectAnswerWithinASecond(std::uint16_t port) {
    const auto start = HttpTestClock::now();
    HttpTestClient client(port);
    client.send(httpPost("/good"));
    EXPECT_THAT(client.receive(), EndsWith("\r\n\r\n/good 0"));
    EXPECT_LT(HttpTestClock::now() - start, std::chrono::seconds(1));
}

TEST(HttpServerLimits, CutWhoeverTakesTooLongHoweverBusyItLooks) {
    HttpLimits limits;
    limits.transfer = milliseconds(200);
    limits.idle = milliseconds(400);
    HttpTestServer tested(limits);
    const auto start = HttpTestClock::now();
    HttpTestClient silent(tested.port(), "127.0.0.2");
    HttpTestClient line(tested.port(), "127.0.0.3");
    HttpTestClient header(tested.port(), "127.0.0.4");
    header.send("POST / HTTP/1.1\r\nA: ");
    HttpTestClient body(tested.port(), "127.0.0.5");
    body.send("POST / HTTP/1.1\r\nHost: h\r\nContent-Length: 1000\r\n\r\n");
    HttpTestClient response(tested.port(), "127.0.0.6", 4096);
    response.send(httpPost("/big"));
    HttpTestClient kept(tested.port(), "127.0.0.7");
    kept.send(httpPost("/a"));
    kept.receive();

    const std::vector<HttpTestClient*> all = {&silent, &line, &header, &body, &kept};
    std::map<const HttpTestClient*, milliseconds> ended;
    while (ended.size() < all.size() && HttpTestClock::now() - start < std::chrono::seconds(3)) {
        for (HttpTestClient* client : {&line, &header, &body}) client->send("x");
        std::this_thread::sleep_for(milliseconds(10));
        const auto now = std::chrono::duration_cast<milliseconds>(HttpTestClock::now() - start);
        for (HttpTestClient* client : all) {
            if (client->hasEnded()) ended.emplace(client, now);
        }
    }
    expectAnswerWithinASecond(tested.port());
    ASSERT_EQ(ended.size(), all.size());
    for (const auto& [client, when] : ended) {
        EXPECT_GE(when, client == &kept ? limits.idle : limits.transfer);
        EXPECT_LT(when, milliseconds(1500));
    }
    EXPECT_THAT(tested.cuts(), ElementsAre("127.0.0.2: no request came in time",
                                           "127.0.0.3: no request came in time",
                                           "127.0.0.4: the header was not complete in time",
                                           "127.0.0.5: the body was not complete in time",
                                           "127.0.0.6: the response was not taken in time"));
}

TEST(HttpServerLimits, LetAHandlerTakeItsTime) {
    HttpLimits limits;
    limits.transfer = limits.idle = milliseconds(20);
    HttpTestServer tested(limits);
    HttpTestClient client(tested.port());
    client.send(httpPost("/wait"));
    tested.handler.await(1);
    std::this_thread::sleep_for(milliseconds(100));
    tested.handler.open();
    EXPECT_THAT(client.receive(), EndsWith("\r\n\r\n/wait 0"));
}

TEST(HttpServerLimits, GiveTheLastResponsesHalfOfTheirTime) {
    HttpLimits limits;
    limits.transfer = milliseconds(800);
    HttpTestServer tested(limits);
    HttpTestClient client(tested.port(), "127.0.0.1", 4096);
    client.send(httpPost("/big"));
    tested.handler.await(1);
    const auto start = HttpTestClock::now();
    tested.server.reset();
    EXPECT_LT(HttpTestClock::now() - start, limits.transfer);
}

TEST(HttpServerLimits, ReplaceTheConnectionThatHasWaitedLongest) {
    HttpLimits limits;
    limits.connections = 3;
    limits.connectionsOfAnAddress = 2;
    HttpTestServer tested(limits);
    std::size_t answered = 0;
    const auto begun = [&](HttpTestClient& client) {
        client.send(httpPost("/a"));
        ++answered;
        return soon([&] { return tested.answers().size() == answered; });
    };
    HttpTestClient first(tested.port());
    ASSERT_TRUE(begun(first));
    HttpTestClient second(tested.port());
    ASSERT_TRUE(begun(second));
    ASSERT_TRUE(begun(first));
    HttpTestClient third(tested.port());
    ASSERT_TRUE(begun(third));
    EXPECT_THAT(second.receiveAll(), EndsWith("\r\n\r\n/a 0"));
    first.receive();
    EXPECT_FALSE(first.hasEnded());
    HttpTestClient other(tested.port(), "127.0.0.2");
    ASSERT_TRUE(begun(other));
    HttpTestClient another(tested.port(), "127.0.0.3");
    ASSERT_TRUE(begun(another));
    EXPECT_THAT(first.receiveAll(), EndsWith("\r\n\r\n/a 0"));
    third.receive();
    EXPECT_FALSE(third.hasEnded());
    EXPECT_THAT(tested.cuts(), ElementsAre("127.0.0.1: a newer connection took its place",
                                           "127.0.0.1: a newer connection took its place"));
}

TEST(HttpServerLimits, DelayAResponse) {
    HttpTestServer tested;
    const auto start = HttpTestClock::now();
    HttpTestClient client(tested.port());
    client.send(httpPost("/delay"));
    EXPECT_THAT(client.receive(), EndsWith("\r\n\r\n/delay 0"));
    EXPECT_GE(HttpTestClock::now() - start, tested.handler.delay);
}

TEST(HttpServerLimits, LetDelayedResponsesHoldUpNobodyButTheirOwnAddress) {
    HttpLimits limits;
    limits.connections = 3;
    limits.connectionsOfAnAddress = 2;
    HttpTestServer tested(limits);
    tested.handler.delay = std::chrono::seconds(60);
    HttpTestClient kept(tested.port(), "127.0.0.3");
    kept.send(httpPost("/a"));
    kept.receive();
    HttpTestClient first(tested.port(), "127.0.0.2");
    HttpTestClient second(tested.port(), "127.0.0.2");
    for (HttpTestClient* client : {&first, &second}) client->send(httpPost("/delay"));
    tested.handler.await(3);
    // Neither more connections nor leaving early helps the address that has to wait.
    second.reset();
    for (int i = 0; i < 3; ++i) {
        HttpTestClient third(tested.port(), "127.0.0.2");
        EXPECT_THAT(third.receiveAll(), StartsWith("HTTP/1.1 503 "));
    }
    EXPECT_FALSE(first.hasEnded());
    EXPECT_TRUE(soon([&] {
        HttpTestClient other(tested.port(), "127.0.0.4");
        other.send(httpPost("/b"));
        return other.receive().substr(0, 12) == "HTTP/1.1 200";
    }));
    EXPECT_FALSE(kept.hasEnded());
    const auto start = HttpTestClock::now();
    tested.server.reset();
    EXPECT_LT(HttpTestClock::now() - start, std::chrono::seconds(1));
}

TEST(HttpServerLimits, RefuseConnectionsWhereAllHaveRequests) {
    HttpLimits limits;
    limits.connections = 3;
    limits.connectionsOfAnAddress = 2;
    HttpTestServer tested(limits);
    std::deque<HttpTestClient> busy;
    for (const char* source : {"127.0.0.1", "127.0.0.1", "127.0.0.2"}) {
        busy.emplace_back(tested.port(), source).send(httpPost("/wait"));
    }
    tested.handler.await(3);
    HttpTestClient sameAddress(tested.port());
    HttpTestClient otherAddress(tested.port(), "127.0.0.3");
    for (HttpTestClient* client : {&sameAddress, &otherAddress}) {
        EXPECT_EQ(client->receiveAll(),
                  "HTTP/1.1 503 Service Unavailable\r\nRetry-After: 1\r\nContent-Length: 0\r\n"
                  "Connection: close\r\n\r\n");
    }
    EXPECT_THAT(tested.cuts(),
                ElementsAre("127.0.0.1: too many connections", "127.0.0.3: too many connections"));
    tested.handler.open();
    for (HttpTestClient& client : busy) EXPECT_THAT(client.receive(), EndsWith("\r\n\r\n/wait 0"));
}

TEST(HttpServerLimits, LeaveRoomForAGoodClientAmongAThousandConnections) {
    const DescriptorLimit enough(4096);
    HttpTestServer tested;
    std::deque<HttpTestClient> crowd;
    for (int i = 0; i < 1000; ++i) {
        const std::string source = "127.0.0." + std::to_string(1 + i % 10);
        crowd.emplace_back(tested.port(), source.c_str());
        // Some say nothing, some begin a request, some wait after one.
        if (i % 3 == 1) crowd.back().send("POST / HT");
        if (i % 3 == 2) crowd.back().send(httpPost("/crowd"));
        if (i % 100 == 99) expectAnswerWithinASecond(tested.port());
    }
    expectAnswerWithinASecond(tested.port());
    EXPECT_LE(runningThreads(), 64U + 64U + 10U);
}

TEST(HttpServerLimits, SurviveClientsThatLeaveAtAnyByte) {
    const std::size_t threads = runningThreads();
    const std::size_t descriptors = openDescriptors();
    HttpTestServer tested;
    const std::string request = httpPost("/leaving", "0123456789");
    for (std::size_t bytes = 0; bytes <= request.size(); ++bytes) {
        HttpTestClient client(tested.port());
        client.send(request.substr(0, bytes));
        if (bytes % 2 == 0) client.reset();
    }
    HttpTestClient whole(tested.port());
    whole.send(request);
    const std::size_t answer = whole.receive().size();
    std::array<char, 1000> buffer{};
    for (std::size_t bytes = 1; bytes <= answer; ++bytes) {
        HttpTestClient client(tested.port());
        client.send(request + request);
        ::recv(client.socket(), buffer.data(), bytes, MSG_WAITALL);
        if (bytes % 2 == 0) client.reset();
    }
    expectAnswerWithinASecond(tested.port());
    tested.server.reset();
    EXPECT_EQ(runningThreads(), threads);
    EXPECT_EQ(openDescriptors(), descriptors + 1);
}

TEST(HttpServerLimits, WaitForADescriptorWhereNoneIsFree) {
    HttpTestServer tested;
    HttpTestClient busy(tested.port());
    busy.send(httpPost("/wait"));
    tested.handler.await(1);
    std::deque<HttpTestClient> unserved;
    {
        base::FileDescriptor next(::dup(busy.socket()));
        // The client has a descriptor, its connection gets none.
        const DescriptorLimit none(static_cast<rlim_t>(next.number()) + 1);
        next.reset();
        unserved.emplace_back(tested.port()).send(httpPost("/later"));
        EXPECT_TRUE(soon([&] { return !tested.cuts().empty(); }));
        std::this_thread::sleep_for(milliseconds(120));
        EXPECT_FALSE(unserved.back().hasEnded());
        tested.handler.open();
        EXPECT_THAT(busy.receive(), EndsWith("\r\n\r\n/wait 0"));
    }
    EXPECT_THAT(unserved.back().receive(), EndsWith("\r\n\r\n/later 0"));
    EXPECT_THAT(tested.cuts(), ElementsAre(": Too many open files"));
}

TEST(HttpServerLimits, ReplaceConnectionsWhereNoDescriptorIsFree) {
    HttpTestServer tested;
    HttpTestClient idle(tested.port());
    idle.send(httpPost("/a"));
    idle.receive();
    base::FileDescriptor next(::dup(idle.socket()));
    const DescriptorLimit none(static_cast<rlim_t>(next.number()) + 1);
    next.reset();
    HttpTestClient newer(tested.port());
    newer.send(httpPost("/b"));
    EXPECT_THAT(newer.receive(), EndsWith("\r\n\r\n/b 0"));
    EXPECT_TRUE(idle.hasEnded());
    EXPECT_THAT(tested.cuts(), ElementsAre("127.0.0.1: a newer connection took its place",
                                           ": Too many open files"));
}

}  // namespace
}  // namespace cmpihost::server
