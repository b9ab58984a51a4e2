#include "host/cli/CommandLine.h"

#include <gmock/gmock.h>

namespace {

using namespace cmpihost;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

ParsedCommandLine parsedLine(std::vector<const char*> words) {
    words.insert(words.begin(), "cmpihost");
    return parseCommandLine(static_cast<int>(words.size()), words.data());
}

CommandLine accepted(const std::vector<const char*>& words) {
    const ParsedCommandLine result = parsedLine(words);
    EXPECT_TRUE(result.commandLine.has_value()) << result.text;
    return result.commandLine.value_or(CommandLine());
}

TEST(CommandLine, KnowsEveryOperation) {
    const struct {
        const char* word;
        Operation operation;
    } rows[] = {{"ei", Operation::EnumerateInstances}, {"ein", Operation::EnumerateInstanceNames},
                {"gi", Operation::GetInstance},        {"ci", Operation::CreateInstance},
                {"mi", Operation::ModifyInstance},     {"di", Operation::DeleteInstance},
                {"ai", Operation::Associators},        {"ain", Operation::AssociatorNames},
                {"ri", Operation::References},         {"rin", Operation::ReferenceNames}};
    for (const auto& row : rows) {
        const CommandLine line = accepted({row.word, "ns:Class"});
        EXPECT_EQ(line.operation, row.operation) << row.word;
        EXPECT_EQ(line.path, "ns:Class");
        EXPECT_FALSE(line.properties.has_value());
        EXPECT_EQ(line.provider + line.miName, "");
        EXPECT_TRUE(line.schemas.empty() && line.registrations.empty());
        EXPECT_EQ(line.format, Format::Table);
        EXPECT_EQ(line.command, Command::Operation);
        EXPECT_FALSE(line.log || line.bare || line.time || line.value) << row.word;
    }
}

TEST(CommandLine, HandsWhatStandsBehindServeOnAsItIs) {
    const CommandLine line =
        accepted({"serve", "--listen=", "--help", "--log", "-x", "--", "ei", ""});
    EXPECT_EQ(line.command, Command::Serve);
    EXPECT_THAT(line.serverArguments,
                ElementsAre("--listen=", "--help", "--log", "-x", "--", "ei", ""));
    EXPECT_THAT(accepted({"serve"}).serverArguments, IsEmpty());
    for (const auto& words : std::vector<std::vector<const char*>>{
             {"--time", "serve"}, {"--schema=d", "serve", "--help"}, {"--time", "serve", "-x"}}) {
        const ParsedCommandLine refused = parsedLine(words);
        EXPECT_EQ(refused.status, exitUsage);
        EXPECT_EQ(refused.text,
                  "cmpihost: serve goes first: its options stand behind it\n"
                  "cmpihost: note: cmpihost serve --help tells more\n");
    }
}

TEST(CommandLine, TakesOptionsBeforeAndAfterTheOperation) {
    for (const auto& words : std::vector<std::vector<const char*>>{
             {"--provider", "p.so", "--format", "json", "--log", "--schema=d", "ei", "X"},
             {"ei", "X", "--format=json", "--log", "--schema", "d", "--provider", "p.so"}}) {
        const CommandLine line = accepted(words);
        EXPECT_EQ(line.provider, "p.so");
        EXPECT_EQ(line.format, Format::Json);
        EXPECT_TRUE(line.log);
        EXPECT_THAT(line.schemas, ElementsAre("d"));
    }
    EXPECT_TRUE(accepted({"--bare", "ei", "X"}).bare);
    EXPECT_TRUE(accepted({"ei", "X", "--bare"}).bare);
    EXPECT_EQ(accepted({"--format", "mof", "ei", "X"}).format, Format::Mof);
    EXPECT_EQ(accepted({"--format", "table", "ei", "X"}).format, Format::Table);
    EXPECT_EQ(accepted({"tree", "--time", "--name=N", "--provider=p"}).miName, "N");
    EXPECT_TRUE(accepted({"--time", "tree"}).time);
    EXPECT_EQ(accepted({"--value", "A", "ei", "X"}).value, "A");
    EXPECT_THAT(accepted({"--schema", "a", "--schema", "b", "ei", "X"}).schemas,
                ElementsAre("a", "b"));
    EXPECT_THAT(accepted({"ei", "--registration=a", "X", "--registration", "b"}).registrations,
                ElementsAre("a", "b"));
}

TEST(CommandLine, KnowsTheCommandsThatAskNoSingleProvider) {
    EXPECT_EQ(accepted({"tree", "--format", "json"}).command, Command::Tree);
    EXPECT_EQ(accepted({"classes"}).command, Command::Classes);
    EXPECT_EQ(accepted({"namespaces"}).command, Command::Namespaces);
    const CommandLine line = accepted({"describe", "X.P"});
    EXPECT_EQ(line.command, Command::Describe);
    EXPECT_EQ(line.subject, "X.P");
}

TEST(CommandLine, TakesAMethodWithItsParameters) {
    const CommandLine line = accepted({"im", "X", "Stop", "How=1", "When="});
    EXPECT_EQ(line.operation, Operation::InvokeMethod);
    EXPECT_EQ(line.path + line.method, "XStop");
    EXPECT_THAT(line.assignments, ElementsAre("How=1", "When="));
}

TEST(CommandLine, TakesALevelAndAChannelOfTheLogOrNone) {
    const struct {
        const char* word;
        LogLevel level;
        std::optional<LogChannel> channel;
    } rows[] = {{"--log", LogLevel::Everything, std::nullopt},
                {"--log=failures", LogLevel::Failures, std::nullopt},
                {"--log=3000", LogLevel::Calls, std::nullopt},
                {"--log=4000,log", LogLevel::Everything, LogChannel::Log},
                {"--log=3000,trace", LogLevel::Calls, LogChannel::Trace},
                {"--log=failures,cmpi", LogLevel::Failures, LogChannel::Cmpi}};
    for (const auto& row : rows) {
        const CommandLine line = accepted({row.word, "ei", "X"});
        EXPECT_EQ(line.log->level, row.level) << row.word;
        EXPECT_EQ(line.log->channel, row.channel) << row.word;
    }
}

TEST(CommandLine, GathersThePropertyList) {
    EXPECT_THAT(*accepted({"ei", "X", "A", "B,C"}).properties, ElementsAre("A", "B", "C"));
    EXPECT_THAT(*accepted({"gi", "X", "--properties", "A,B"}).properties, ElementsAre("A", "B"));
    EXPECT_THAT(*accepted({"ai", "X", "A", "--properties", "B"}).properties, ElementsAre("A", "B"));
    EXPECT_THAT(*accepted({"ri", "X", "--properties", ""}).properties, IsEmpty());
    EXPECT_THAT(*accepted({"ei", "X", "A , B", " ,C\t"}).properties, ElementsAre("A", "B", "C"));
    EXPECT_THAT(*accepted({"ri", "X", "--properties", " A, ,B "}).properties,
                ElementsAre("A", "B"));
    EXPECT_THAT(*accepted({"ei", "X", "gi"}).properties, ElementsAre("gi"));
}

TEST(CommandLine, TakesAssignmentsThatBeginLikeOptionsOrLists) {
    const CommandLine line = accepted({"mi", "X.A=\"b\"", "Level=-5", "States={2, 11}", "Text="});
    EXPECT_THAT(line.assignments, ElementsAre("Level=-5", "States={2, 11}", "Text="));
    EXPECT_EQ(line.path, "X.A=\"b\"");
    EXPECT_THAT(accepted({"ci", "X", "--", "--a="}).assignments, ElementsAre("--a="));
}

/// The complaint about words that are refused, without the note on the help.
std::string refusal(const std::vector<const char*>& words) {
    const ParsedCommandLine result = parsedLine(words);
    EXPECT_FALSE(result.commandLine.has_value()) << result.text;
    EXPECT_EQ(result.status, exitUsage) << result.text;
    EXPECT_THAT(result.text, testing::StartsWith("cmpihost: "));
    EXPECT_THAT(result.text, testing::EndsWith("--help tells more\n"));
    return result.text.substr(10, result.text.find('\n') - 10);
}

TEST(CommandLine, RefusesWhatItDoesNotKnow) {
    const struct {
        std::vector<const char*> words;
        const char* complaint;
    } rows[] = {
        {{}, "a command is required"},
        {{"--log"}, "a command is required"},
        {{"zz"}, "there is no command 'zz'"},
        {{"describ", "X"}, "there is no command 'describ'; did you mean describe?"},
        {{"\x1b[31m"}, "there is no command '\\x1b[31m'"},
        {{"ei"}, "PATH is required"},
        {{"xq"}, "QUERY is required"},
        {{"ein", "X", "Name"}, "ein takes no argument 'Name'"},
        {{"di", "X", "Y"}, "di takes no argument 'Y'"},
        {{"ei", "X", "--role", "r"}, "ei has no option '--role'"},
        {{"ri", "X", "--assoc-class=A"}, "ri has no option '--assoc-class'"},
        {{"rin", "X", "--result-role", "A"}, "rin has no option '--result-role'"},
        {{"ain", "X", "--asoc-class", "A"},
         "ain has no option '--asoc-class'; did you mean --assoc-class?"},
        {{"--format", "xml", "ei", "X"}, "--format: expected table, mof or json, found 'xml'"},
        {{"--format", "jsno", "ei", "X"},
         "--format: expected table, mof or json, found 'jsno'; did you mean json?"},
        {{"--format", "mof", "--format", "json", "ei", "X"}, "--format stands more than once"},
        {{"--format"}, "--format: the value is missing"},
        {{"ai", "X", "--role"}, "--role: the value is missing"},
        {{"--format", "mof", "tree"}, "--format: tree has the forms table and json"},
        {{"classes", "--format", "mof"}, "--format: classes has the forms table and json"},
        {{"tree", "--value", "Name"}, "--value: tree prints no values"},
        {{"di", "X.A=1", "--value", "A"}, "--value: di prints no values"},
        {{"ei", "X", "--value", "A", "--format", "json"}, "--format excludes --value"},
        {{"--log", "3000,cmpi", "tree"},
         "tree takes no argument '3000,cmpi'; did you mean --log=3000,cmpi?"},
        {{"tree", "3000"}, "tree takes no argument '3000'"},
        {{"--name", "N", "ei", "X"}, "--name requires --provider"},
        {{"im", "X"}, "METHOD is required"},
        {{"describe"}, "CLASS[.PROPERTY] is required"},
        {{"--log=2", "tree"}, "--log: expected failures, 3000 or 4000, found '2'"},
        {{"--log=3000,", "tree"}, "--log: expected log, trace or cmpi, found ''"},
        {{"--colour", "ei", "X"}, "ei has no option '--colour'"},
        {{"--vlaue", "Name"}, "there is no option '--vlaue'; did you mean --value?"},
        {{"--provider", "p.so", "--bare", "ei", "X"}, "--provider excludes --bare"},
        {{"--companion", "tree"}, "tree has no option '--companion'"},
    };
    for (const auto& row : rows) EXPECT_EQ(refusal(row.words), row.complaint);
}

TEST(CommandLine, RefusesAnEmptyValueHoweverItIsWritten) {
    const std::vector<std::pair<const char*, std::vector<const char*>>> rows = {
        {"--provider", {"ei", "X"}},     {"--schema", {"ei", "X"}},
        {"--assoc-class", {"ai", "X"}},  {"--result-class", {"ri", "X"}},
        {"--role", {"rin", "X"}},        {"--result-role", {"ain", "X"}},
        {"--lang", {"xq", "q"}},         {"--namespace", {"xq", "q"}},
        {"--namespace", {"tree"}},       {"--name", {"ei", "X"}},
        {"--registration", {"ei", "X"}}, {"--value", {"ei", "X"}},
    };
    for (const auto& [option, operation] : rows) {
        const std::string sign = std::string(option) + "=";
        for (const std::vector<const char*>& value :
             {std::vector<const char*>{option, ""}, {sign.c_str()}}) {
            std::vector<const char*> words = operation;
            words.insert(words.end(), value.begin(), value.end());
            EXPECT_EQ(refusal(words), std::string(option) + ": the value is empty");
        }
    }
    EXPECT_EQ(refusal({"xq", ""}), "QUERY: the value is empty");
    for (const char* option : {"--format=", "--log="}) refusal({option, "ei", "X"});
}

TEST(CommandLine, TakesAnEmptyListOfPropertiesBehindASignOfEquality) {
    const CommandLine line = accepted({"ei", "X", "--properties=", "--log"});
    EXPECT_THAT(*line.properties, IsEmpty());
    EXPECT_TRUE(line.log);
    EXPECT_THAT(*accepted({"gi", "X", "--properties=", "A"}).properties, ElementsAre("A"));
    EXPECT_THAT(*accepted({"gi", "X", "--properties=A="}).properties, ElementsAre("A="));
}

TEST(CommandLine, DescribesEverythingInItsHelp) {
    const ParsedCommandLine result = parsedLine({"--help"});
    EXPECT_FALSE(result.commandLine.has_value());
    EXPECT_EQ(result.status, exitDone);
    for (const char* line :
         {"Usage: cmpihost [OPTIONS] COMMAND ARGUMENT...\n", "\n  --provider FILE   ",
          "\n  --name NAME  ", "\n  --registration PATH  ", "\n  --schema PATH  ", "\n  --bare   ",
          "\n  --format FORMAT  ", "\n  --value PROPERTY  ", "\n  --log[=LEVEL[,CHANNEL]]  ",
          "\n  --time  ", "\n  --version  ", "\nOperations:\n", "\nOverviews:\n", "\nPaths:\n",
          "\nExit status:\n"}) {
        EXPECT_THAT(result.text, HasSubstr(line));
    }
    for (const char* command : {"ei", "ein", "gi", "ci", "mi", "di", "ai", "ain", "ri", "rin", "im",
                                "xq", "tree", "classes", "describe", "namespaces"}) {
        EXPECT_THAT(result.text, HasSubstr("\n  " + std::string(command) + "   "));
        EXPECT_THAT(parsedLine({command, "--help"}).text,
                    testing::ContainsRegex("\nExample[^:]*:\n  cmpihost " + std::string(command)));
    }
}

TEST(CommandLine, DescribesOneOperation) {
    const ParsedCommandLine result = parsedLine({"ai", "--help"});
    EXPECT_EQ(result.status, exitDone);
    EXPECT_THAT(result.text, HasSubstr("Usage: cmpihost ai [OPTIONS] PATH [PROPERTY...]"));
    EXPECT_THAT(result.text, HasSubstr("--assoc-class CLASS"));
    EXPECT_THAT(result.text, HasSubstr("\nPaths:\n"));
    EXPECT_THAT(result.text, testing::Not(HasSubstr("--lang")));
    EXPECT_THAT(parsedLine({"xq", "--help"}).text, HasSubstr("--lang NAME=WQL"));
    for (const char* word : {"xq", "tree"}) {
        EXPECT_THAT(parsedLine({word, "--help"}).text, HasSubstr("--namespace NAME=root/cimv2"));
    }
}

}  // namespace
