#include "host/server/ServeCommandLine.h"

#include <gmock/gmock.h>

#include <sstream>

namespace {

using namespace cmpihost::server;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::StartsWith;

ParsedServeCommandLine serveLine(std::vector<const char*> words) {
    words.insert(words.begin(), "cmpihost-serve");
    return parseServeCommandLine(static_cast<int>(words.size()), words.data());
}

TEST(ServeCommandLine, ServesOnLoopbackWithoutAnyOption) {
    const ParsedServeCommandLine line = serveLine({});
    ASSERT_TRUE(line.options);
    EXPECT_THAT(line.options->listen, IsEmpty());
    EXPECT_THAT(line.options->registrations, IsEmpty());
    EXPECT_EQ(line.options->certificate + line.options->key + line.options->users, "");
    EXPECT_EQ(line.options->limits.connections, 64U);
    EXPECT_EQ(line.options->limits.connectionsOfAnAddress, 16U);
    EXPECT_EQ(line.options->logLevel, LogLevel::Failures);
}

TEST(ServeCommandLine, TakesEveryOption) {
    const ParsedServeCommandLine line = serveLine({"--listen",
                                                   "[::1]:5988",
                                                   "--listen=unix:/run/x",
                                                   "--registration",
                                                   "a.reg",
                                                   "--schema",
                                                   "one",
                                                   "--schema",
                                                   "two",
                                                   "--tls-cert",
                                                   "c",
                                                   "--tls-key",
                                                   "k",
                                                   "--users",
                                                   "u",
                                                   "--host-name",
                                                   "vm.example",
                                                   "--connections",
                                                   "7",
                                                   "--connections-per-address",
                                                   "3",
                                                   "--log",
                                                   "requests"});
    ASSERT_TRUE(line.options) << line.text;
    const ServiceOptions& options = *line.options;
    EXPECT_THAT(options.listen, ElementsAre("[::1]:5988", "unix:/run/x"));
    EXPECT_THAT(options.registrations, ElementsAre("a.reg"));
    EXPECT_THAT(options.schemas, ElementsAre("one", "two"));
    EXPECT_THAT(options.hostNames, ElementsAre("vm.example"));
    EXPECT_EQ(options.certificate + options.key + options.users, "cku");
    EXPECT_EQ(options.limits.connections, 7U);
    EXPECT_EQ(options.limits.connectionsOfAnAddress, 3U);
    EXPECT_EQ(options.logLevel, LogLevel::Requests);
    EXPECT_EQ(serveLine({"--log=none"}).options->logLevel, LogLevel::None);
}

TEST(ServeCommandLine, RefusesWhatItDoesNotUnderstand) {
    const struct {
        std::vector<const char*> words;
        const char* complaint;
    } rows[] = {
        {{"--lisen", "x"}, "cmpihost-serve: there is no option '--lisen'\n"},
        {{"now"}, "cmpihost-serve: there is no argument 'now'\n"},
        {{"--listen"}, "cmpihost-serve: --listen: the value is missing\n"},
        {{"--listen", ""}, "cmpihost-serve: --listen: the value is empty\n"},
        {{"--users", "a", "--users", "b"}, "cmpihost-serve: --users stands more than once\n"},
        {{"--tls-cert", "c"}, "cmpihost-serve: --tls-cert requires --tls-key\n"},
        {{"--tls-key", "k"}, "cmpihost-serve: --tls-key requires --tls-cert\n"},
        {{"--log", "all"},
         "cmpihost-serve: --log: expected none, failures or requests, found 'all'\n"},
        {{"--host-name", "vm:5989"},
         "cmpihost-serve: --host-name: expected a name, without a port, found 'vm:5989'\n"},
        {{"--connections", "0"},
         "cmpihost-serve: --connections: expected a number from 1 to 10000, found '0'\n"},
        {{"--connections", "many"},
         "cmpihost-serve: --connections: expected a number from 1 to 10000, found 'many'\n"},
    };
    for (const auto& row : rows) {
        const ParsedServeCommandLine line = serveLine(row.words);
        EXPECT_FALSE(line.options);
        EXPECT_EQ(line.status, serviceRefused);
        EXPECT_EQ(line.text, std::string(row.complaint) +
                                 "cmpihost-serve: note: cmpihost-serve --help tells more\n");
    }
}

TEST(ServeCommandLine, HasAHelpThatFitsATerminalAndAVersion) {
    const ParsedServeCommandLine help = serveLine({"--help"});
    EXPECT_EQ(help.status, serviceEnded);
    std::istringstream lines(help.text);
    for (std::string line; std::getline(lines, line);) EXPECT_LE(line.size(), 80U) << line;
    EXPECT_THAT(help.text, HasSubstr("\n  --listen ADDRESS:PORT     Listen there: "));
    const ParsedServeCommandLine version = serveLine({"--version"});
    EXPECT_EQ(version.status, serviceEnded);
    EXPECT_THAT(version.text, StartsWith("cmpihost-serve 1."));
}

}  // namespace
