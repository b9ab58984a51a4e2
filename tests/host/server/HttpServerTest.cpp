#include "host/server/HttpServer.h"

#include <arpa/inet.h>
#include <gmock/gmock.h>
#include <netinet/in.h>
#include <sys/socket.h>
#include <sys/un.h>

#include <algorithm>
#include <array>
#include <chrono>
#include <future>
#include <ostream>

#include "host/server/HttpTestServer.h"
#include "support/TemporaryDirectory.h"

namespace cmpihost::server {
namespace {

using namespace fixture;
using testing::AllOf;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::StartsWith;

TEST(HttpServer, AnswersOneRequestAfterTheOtherOnAConnectionThatIsKept) {
    HttpTestServer tested;
    HttpTestClient client(tested.port());
    for (const char* target : {"/a", "/b", "/c"}) {
        client.send(httpPost(target, "12345"));
        EXPECT_THAT(client.receive(),
                    AllOf(StartsWith("HTTP/1.1 200 OK\r\n"), HasSubstr("\r\nContent-Length: 4\r\n"),
                          HasSubstr("\r\nContent-Type: text/plain\r\n"),
                          testing::EndsWith(std::string("\r\n\r\n") + target + " 5")));
    }
    EXPECT_FALSE(client.hasEnded());
}

TEST(HttpServer, AnswersRequestsThatComeTogetherInTheirOrder) {
    HttpTestServer tested;
    HttpTestClient client(tested.port());
    client.send(httpPost("/1", "a") + httpPost("/2") + httpPost("/3", "abc"));
    for (const char* body : {"\r\n\r\n/1 1", "\r\n\r\n/2 0", "\r\n\r\n/3 3"}) {
        EXPECT_THAT(client.receive(), testing::EndsWith(body));
    }
}

TEST(HttpServer, HandsTheWholeRequestOver) {
    HttpTestServer tested;
    HttpTestClient client(tested.port());
    client.send(
        "POST /path?and=query HTTP/1.1\r\nHost: h:1\r\nA: 1 \r\na:2\r\nContent-Length: 2\r\n"
        "\r\nxy");
    client.receive();
    const HttpRequest request = tested.handler.lastRequest();
    EXPECT_EQ(request.method, "POST");
    EXPECT_EQ(request.version, "HTTP/1.1");
    EXPECT_EQ(request.target, "/path?and=query");
    EXPECT_EQ(request.peer, "127.0.0.1");
    EXPECT_EQ(request.body, "xy");
    EXPECT_THAT(request.headers,
                ElementsAre(testing::Pair("Host", "h:1"), testing::Pair("A", "1"),
                            testing::Pair("a", "2"), testing::Pair("Content-Length", "2")));
}

TEST(HttpServer, SendsHeaderAndBodyTogether) {
    HttpTestServer tested;
    HttpTestClient client(tested.port());
    client.send(httpPost("/a"));
    std::array<char, 1000> buffer{};
    const ssize_t got = ::recv(client.socket(), buffer.data(), buffer.size(), 0);
    EXPECT_THAT(std::string(buffer.data(), static_cast<std::size_t>(std::max<ssize_t>(got, 0))),
                testing::EndsWith("\r\n\r\n/a 0"));
}

/// What a client sends, how the answer begins, and whether the connection ends then.
struct HttpRow {
    std::string bytes;
    const char* answer;
    bool ends = true;
};

constexpr const char* ok = "HTTP/1.1 200 OK\r\n";
constexpr const char* malformed = "HTTP/1.1 400 Bad Request\r\n";
constexpr const char* notImplemented = "HTTP/1.1 501 Not Implemented\r\n";
constexpr const char* tooLong = "HTTP/1.1 413 Content Too Large\r\n";
constexpr const char* tooLarge = "HTTP/1.1 431 Request Header Fields Too Large\r\n";

/// Each row has a connection of its own, and `start` before its bytes.
void expectAnswers(const std::string& start, const std::vector<HttpRow>& rows) {
    HttpTestServer tested;
    for (const HttpRow& row : rows) {
        SCOPED_TRACE(testing::PrintToString(row.bytes.substr(0, 100)));
        HttpTestClient client(tested.port());
        client.send(start + row.bytes);
        if (row.ends) {
            const std::string answer = client.receiveAll();
            EXPECT_THAT(answer, StartsWith(row.answer));
            EXPECT_THAT(answer, testing::Not(testing::EndsWith("(open)")));
        } else {
            EXPECT_THAT(client.receive(), StartsWith(row.answer));
            client.send(httpPost("/next"));
            EXPECT_THAT(client.receive(), testing::EndsWith("\r\n\r\n/next 0"));
        }
    }
}

TEST(HttpServer, RefusesLengthsThatCanBeReadInTwoWays) {
    const std::string chunks = "\r\n\r\n3\r\nabc\r\n0\r\n\r\n";
    expectAnswers(
        "POST / HTTP/1.1\r\nHost: h\r\n",
        {{"Content-Length: 3\r\n\r\nabc", ok, false},
         {"Content-Length: 0\r\n\r\n", ok, false},
         {"\r\n", ok, false},
         {"Content-Length: 3\r\nContent-Length: 3\r\n\r\nabc", malformed},
         {"Content-Length: 3\r\nContent-Length: 4\r\n\r\nabcd", malformed},
         {"content-length: 4\r\nContent-Length: 3\r\n\r\nabcd", malformed},
         {"Content-Length: 3\r\nTransfer-Encoding: chunked" + chunks, malformed},
         {"Transfer-Encoding: chunked\r\nContent-Length: 3" + chunks, malformed},
         {"Transfer-Encoding: chunked\r\nTransfer-Encoding: identity" + chunks, malformed},
         {"Transfer-Encoding: gzip, chunked" + chunks, notImplemented},
         {"Transfer-Encoding: identity" + chunks, notImplemented},
         {"Transfer-Encoding: xchunked" + chunks, notImplemented},
         {"Transfer-Encoding: \x0b"
          "chunked" +
              chunks,
          malformed},
         {"Content-Length: -1\r\n\r\nabc", malformed},
         {"Content-Length: +3\r\n\r\nabc", malformed},
         {"Content-Length: 0x3\r\n\r\nabc", malformed},
         {"Content-Length: 3, 3\r\n\r\nabc", malformed},
         {"Content-Length: 3 4\r\n\r\nabc", malformed},
         {"Content-Length:\r\n\r\nabc", malformed},
         {"Content-Length : 3\r\n\r\nabc", malformed},
         {"Content-Length:\r\n 3\r\n\r\nabc", malformed},
         {"Content-Length: 18446744073709551615\r\n\r\nabc", tooLong},
         {"Content-Length: 18446744073709551619\r\n\r\nabc", tooLong},
         {"Content-Length: 99999999999999999999999\r\n\r\nabc", tooLong}});
}

TEST(HttpServer, ReadsChunksAndEndsTheConnectionAfterThem) {
    expectAnswers("POST /c HTTP/1.1\r\nHost: h\r\nTransfer-Encoding: chunked\r\n\r\n",
                  {{"3\r\nabc\r\nA\r\n0123456789\r\n0\r\n\r\n" + httpPost("/smuggled"), ok},
                   {"3;a=b\r\nabc\r\n0\r\nTrailer: a\r\n\r\n", ok},
                   {"-1\r\nabc\r\n0\r\n\r\n", malformed},
                   {"3\r\nabcd\r\n0\r\n\r\n", malformed},
                   {"FFFFFFFFFFFFFFFFF\r\nabc\r\n0\r\n\r\n", tooLong}});
    HttpTestServer tested;
    HttpTestClient client(tested.port());
    client.send(
        "POST /c HTTP/1.1\r\nHost: h\r\nTransfer-Encoding: chunked\r\n\r\n"
        "3\r\nabc\r\nA\r\n0123456789\r\n0\r\n\r\n" +
        httpPost("/smuggled"));
    EXPECT_THAT(client.receiveAll(), testing::EndsWith("\r\n\r\n/c 13"));
    EXPECT_EQ(tested.handler.requests(), 1U);
}

TEST(HttpServer, RefusesHeadersThatCanBeReadInTwoWays) {
    const std::string rest = "\r\nContent-Length: 3\r\n\r\nabc";
    expectAnswers("POST / HTTP/1.1\r\nHost: h\r\n", {{"A: a" + rest, ok, false},
                                                     {"A:" + rest, ok, false},
                                                     {"A:a\t" + rest, ok, false},
                                                     {"A: \t a" + rest, ok, false},
                                                     {"A: \xC3\xA4" + rest, ok, false},
                                                     {"A: a\r\n b" + rest, malformed},
                                                     {"A: a\r\n\tb" + rest, malformed},
                                                     {"A: a\nB: b" + rest, malformed},
                                                     {"A: a\rB: b" + rest, malformed},
                                                     {std::string("A: a\0b", 6) + rest, malformed},
                                                     {std::string("A\0B: b", 6) + rest, malformed},
                                                     {"A: a\x01" + rest, malformed},
                                                     {"A: a\x7F" + rest, malformed},
                                                     {"A" + rest, malformed},
                                                     {"A b: a" + rest, malformed},
                                                     {"A(: a" + rest, malformed},
                                                     {": a" + rest, malformed},
                                                     {"Host: h" + rest, malformed}});
}

TEST(HttpServer, RefusesMalformedRequestLinesAndHosts) {
    expectAnswers(
        "", {{"\r\n\r\n" + httpPost("/"), ok, false},
             {"GET / HTTP/1.1\r\nHost: [::1]:5988\r\n\r\n", ok, false},
             {"GET / HTTP/1.1\r\n\r\n", malformed},
             {"GET / HTTP/1.1\r\nHost: a/b\r\n\r\n", malformed},
             {"GET / HTTP/1.1\r\nHost: .a\r\n\r\n", malformed},
             {"GET / HTTP/1.1\r\nHost: a b\r\n\r\n", malformed},
             {"GET /\r\n\r\n", malformed},
             {"GET /a b HTTP/1.1\r\nHost: h\r\n\r\n", malformed},
             {"GET  /  HTTP/1.1\r\nHost: h\r\n\r\n", malformed},
             {"GET / http/1.1\r\nHost: h\r\n\r\n", malformed},
             {"POST / HTTP/1.1\nHost: h\nContent-Length: 0\n\n", malformed},
             {"POST / HTTP/1.1\r\n A: a\r\nHost: h\r\nContent-Length: 0\r\n\r\n", malformed},
             {"GET / HTTP/2.0\r\nHost: h\r\n\r\n", "HTTP/1.1 505 HTTP Version Not Supported\r\n"},
             {"\x16\x03\x01\x02 hello\r\n\r\n", ""}});
}

TEST(HttpServer, EndsConnectionsAsClientsAsk) {
    const std::string length = "Content-Length: 0\r\n\r\n";
    expectAnswers("",
                  {{"POST / HTTP/1.0\r\n" + length, ok},
                   {"POST / HTTP/1.0\r\nHost: h\r\nConnection: keep-alive\r\n" + length, ok, false},
                   {"POST / HTTP/1.0\r\nTransfer-Encoding: chunked\r\n\r\n0\r\n\r\n", malformed}});
    expectAnswers("POST / HTTP/1.1\r\nHost: h\r\n",
                  {{"Connection: close\r\n" + length, ok},
                   {"Connection: TE, Close\r\n" + length, ok},
                   {"Connection: TE\r\nConnection: close\r\n" + length, ok},
                   {"Connection: Keep-Alive, TE\r\n" + length, ok, false}});
}

TEST(HttpServer, BoundsTheHeader) {
    std::string fields;
    for (int i = 0; i < 62; ++i) fields += "A: a\r\n";
    expectAnswers("POST / HTTP/1.1\r\nHost: h\r\nContent-Length: 0\r\n",
                  {{"A: " + std::string(8100, 'a') + "\r\n\r\n", ok, false},
                   {"A: " + std::string(8200, 'a') + "\r\n\r\n", tooLarge},
                   {"A: " + std::string(100000, 'a') + "\r\n\r\n", tooLarge},
                   {fields + "\r\n", ok, false},
                   {fields + "A: a\r\n\r\n", tooLarge}});
    expectAnswers("",
                  {{"GET /" + std::string(9000, 'a') + " HTTP/1.1\r\nHost: h\r\n\r\n", tooLarge},
                   {"GET /" + std::string(100000, 'a'), "HTTP/1.1 414 URI Too Long\r\n"}});
}

TEST(HttpServer, BoundsTheBody) {
    const std::size_t most = std::size_t{1} << 20U;
    HttpTestServer tested;
    HttpTestClient client(tested.port());
    client.send(httpPost("/most", std::string(most, 'x')));
    EXPECT_THAT(client.receive(), testing::EndsWith("\r\n\r\n/most 1048576"));
    // Its length alone is enough.
    client.send("POST / HTTP/1.1\r\nHost: h\r\nContent-Length: 1048577\r\n\r\n");
    EXPECT_THAT(client.receiveAll(), AllOf(StartsWith(tooLong), HasSubstr("Connection: close\r\n"),
                                           HasSubstr("Content-Length: 0\r\n")));

    const std::string chunked = "POST /c HTTP/1.1\r\nHost: h\r\nTransfer-Encoding: chunked\r\n\r\n";
    const std::string chunk = "100000\r\n" + std::string(most, 'x') + "\r\n";
    HttpTestClient inChunks(tested.port());
    inChunks.send(chunked + chunk + "0\r\n\r\n");
    EXPECT_THAT(inChunks.receiveAll(), testing::EndsWith("\r\n\r\n/c 1048576"));
    HttpTestClient beyond(tested.port());
    beyond.send(chunked + chunk + "1\r\nx\r\n0\r\n\r\n");
    EXPECT_EQ(beyond.receiveAll(), "");
    EXPECT_EQ(tested.handler.requests(), 2U);
    EXPECT_THAT(tested.cuts(), ElementsAre("127.0.0.1: the body was too long"));
}

TEST(HttpServer, TellsClientsThatWaitToGoOn) {
    HttpTestServer tested;
    HttpTestClient client(tested.port());
    client.send("POST /e HTTP/1.1\r\nHost: h\r\nExpect: 100-Continue\r\nContent-Length: 3\r\n\r\n");
    EXPECT_EQ(client.receive(), "HTTP/1.1 100 Continue\r\n\r\n");
    client.send("abc");
    EXPECT_THAT(client.receive(), testing::EndsWith("\r\n\r\n/e 3"));
    expectAnswers("POST / HTTP/1.1\r\nHost: h\r\nContent-Length: ",
                  {{"3000000\r\nExpect: 100-continue\r\n\r\n", tooLong},
                   {"3\r\nExpect: more\r\n\r\n", "HTTP/1.1 417 Expectation Failed\r\n"},
                   {"3\r\nExpect: 100-continue\r\nExpect: 100-continue\r\n\r\n",
                    "HTTP/1.1 417 Expectation Failed\r\n"}});
}

TEST(HttpServer, AnswersAnExceptionOfTheHandler) {
    HttpTestServer tested;
    HttpTestClient client(tested.port());
    client.send(httpPost("/throw"));
    EXPECT_THAT(client.receiveAll(), StartsWith("HTTP/1.1 500 Internal Server Error\r\n"));
    EXPECT_TRUE(soon([&] { return !tested.answers().empty(); }));
    EXPECT_THAT(tested.answers(), ElementsAre("127.0.0.1 /throw 500"));
}

TEST(HttpServer, TellsOfRequestsAndOfConnectionsThatWereCut) {
    HttpTestServer tested;
    HttpTestClient client(tested.port());
    client.send(httpPost("/a"));
    client.receive();
    client.send("POST / HTTP/1.1\r\nHost: a/b\r\n\r\n");
    client.receiveAll();
    HttpTestClient(tested.port(), "127.0.0.2").send("POST / HTTP/1.1\r\n");
    EXPECT_TRUE(soon([&] { return tested.answers().size() == 2 && !tested.cuts().empty(); }));
    EXPECT_THAT(tested.answers(), ElementsAre("127.0.0.1 / 400", "127.0.0.1 /a 200"));
    EXPECT_THAT(tested.cuts(), ElementsAre("127.0.0.2: the request was incomplete or malformed"));
}

TEST(HttpServer, EndsAfterTheRequestsThatRun) {
    const std::size_t descriptors = openDescriptors();
    const std::size_t threads = runningThreads();
    HttpTestServer tested;
    HttpTestClient idle(tested.port());
    idle.send(httpPost("/a"));
    idle.receive();
    HttpTestClient silent(tested.port());
    HttpTestClient reading(tested.port());
    reading.send("POST / HTTP/1.1\r\nHost: h\r\nContent-Length: 3\r\n\r\n");
    HttpTestClient running(tested.port());
    running.send(httpPost("/wait"));
    tested.handler.await(2);

    auto ended = std::async(std::launch::async, [&] { tested.server.reset(); });
    EXPECT_EQ(idle.receiveAll(), "");
    EXPECT_EQ(silent.receiveAll(), "");
    EXPECT_EQ(reading.receiveAll(), "");
    EXPECT_EQ(ended.wait_for(std::chrono::milliseconds(30)), std::future_status::timeout);
    tested.handler.open();
    EXPECT_THAT(running.receiveAll(), AllOf(StartsWith(ok), HasSubstr("\r\nConnection: close\r\n"),
                                            testing::EndsWith("\r\n\r\n/wait 0")));
    ended.get();
    EXPECT_EQ(openDescriptors(), descriptors + 4);
    EXPECT_EQ(runningThreads(), threads);
}

TEST(HttpServer, GivesItsListeningSocketToAnother) {
    HttpTestServer first;
    HttpTestClient kept(first.port());
    kept.send(httpPost("/1"));
    kept.receive();
    HttpTestServer second(first.server->stopListening());
    HttpTestClient client(first.port());
    client.send(httpPost("/2"));
    EXPECT_THAT(client.receive(), testing::EndsWith("\r\n\r\n/2 0"));
    kept.send(httpPost("/3"));
    EXPECT_THAT(kept.receive(), testing::EndsWith("\r\n\r\n/3 0"));
    EXPECT_EQ(first.handler.requests(), 2U);
    EXPECT_EQ(second.handler.requests(), 1U);
}

TEST(HttpServer, ListensOnIpv6AndUnixSockets) {
    base::FileDescriptor v6(::socket(AF_INET6, SOCK_STREAM, 0));
    sockaddr_in6 address{};
    address.sin6_family = AF_INET6;
    address.sin6_addr = in6addr_loopback;
    socklen_t length = sizeof address;
    ASSERT_EQ(::bind(v6.number(), reinterpret_cast<sockaddr*>(&address), length), 0);
    ASSERT_EQ(::listen(v6.number(), 8), 0);
    getsockname(v6.number(), reinterpret_cast<sockaddr*>(&address), &length);

    const TemporaryDirectory folder;
    sockaddr_un path{};
    path.sun_family = AF_UNIX;
    folder.path("s").copy(path.sun_path, sizeof path.sun_path - 1);
    base::FileDescriptor local(::socket(AF_UNIX, SOCK_STREAM, 0));
    ASSERT_EQ(::bind(local.number(), reinterpret_cast<sockaddr*>(&path), sizeof path), 0);
    ASSERT_EQ(::listen(local.number(), 8), 0);

    HttpTestServer overV6(std::move(v6));
    HttpTestServer overUnix(std::move(local));
    base::FileDescriptor toV6(::socket(AF_INET6, SOCK_STREAM, 0));
    base::FileDescriptor toUnix(::socket(AF_UNIX, SOCK_STREAM, 0));
    ASSERT_EQ(::connect(toV6.number(), reinterpret_cast<sockaddr*>(&address), length), 0);
    ASSERT_EQ(::connect(toUnix.number(), reinterpret_cast<sockaddr*>(&path), sizeof path), 0);
    HttpTestClient v6Client(std::move(toV6));
    HttpTestClient unixClient(std::move(toUnix));
    v6Client.send(httpPost("/6"));
    EXPECT_THAT(v6Client.receive(), testing::EndsWith("\r\n\r\n/6 0"));
    EXPECT_EQ(overV6.handler.lastRequest().peer, "::1");
    unixClient.send(httpPost("/u"));
    EXPECT_THAT(unixClient.receive(), testing::EndsWith("\r\n\r\n/u 0"));
    EXPECT_EQ(overUnix.handler.lastRequest().peer, "unix");
}

}  // namespace
}  // namespace cmpihost::server
