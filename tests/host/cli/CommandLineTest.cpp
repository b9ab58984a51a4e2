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
        EXPECT_EQ(line.provider + line.schema + line.companion, "");
        EXPECT_EQ(line.format, Format::Table);
        EXPECT_FALSE(line.log || line.bare || line.tree) << row.word;
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
        EXPECT_EQ(line.schema, "d");
    }
    EXPECT_TRUE(accepted({"--bare", "ei", "X"}).bare);
    EXPECT_TRUE(accepted({"ei", "X", "--bare"}).bare);
    EXPECT_EQ(accepted({"--format", "mof", "ei", "X"}).format, Format::Mof);
    EXPECT_EQ(accepted({"--format", "table", "ei", "X"}).format, Format::Table);
    EXPECT_TRUE(accepted({"--format", "table", "tree"}).tree);
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

/// The complaint about words that are refused, without the hint at the help.
std::string refusal(const std::vector<const char*>& words) {
    const ParsedCommandLine result = parsedLine(words);
    EXPECT_FALSE(result.commandLine.has_value()) << result.text;
    EXPECT_EQ(result.status, exitUsage) << result.text;
    EXPECT_THAT(result.text, testing::StartsWith("cmpihost: "));
    EXPECT_THAT(result.text, testing::EndsWith("\nRun cmpihost --help for more information.\n"));
    return result.text.substr(10, result.text.find('\n') - 10);
}

TEST(CommandLine, RefusesWhatItDoesNotKnow) {
    const char* const otherForm = "--format: tree draws a picture, it has no other form";
    const struct {
        std::vector<const char*> words;
        const char* complaint;
    } rows[] = {
        {{}, "An operation is required"},
        {{"--log"}, "An operation is required"},
        {{"zz"}, "There is no operation 'zz'"},
        {{"\x1b[31m"}, "There is no operation '\\x1b[31m'"},
        {{"ei"}, "PATH is required"},
        {{"xq"}, "QUERY is required"},
        {{"ein", "X", "Name"}, "The following argument was not expected: Name"},
        {{"di", "X", "Y"}, "The following argument was not expected: Y"},
        {{"ei", "X", "--role", "r"}, "The following argument was not expected: --role"},
        {{"ri", "X", "--assoc-class", "A"},
         "The following argument was not expected: --assoc-class"},
        {{"rin", "X", "--result-role", "A"},
         "The following arguments were not expected: A --result-role"},
        {{"--format", "xml", "ei", "X"}, "--format: expected table, mof or json, found 'xml'"},
        {{"--format", "mof", "--format", "json", "ei", "X"},
         "--format: At Most 1 required but received 2"},
        {{"--format", "json", "tree"}, otherForm},
        {{"tree", "--format", "json"}, otherForm},
        {{"--format", "mof", "tree"}, otherForm},
        {{"tree", "--format", "mof"}, otherForm},
        {{"--colour", "ei", "X"}, "The following argument was not expected: --colour"},
        {{"--provider", "p.so", "--bare", "ei", "X"}, "--provider excludes --bare"},
        {{"--companion", "c.so", "--computer-systems", "2", "tree"},
         "--companion excludes --computer-systems"},
    };
    for (const auto& row : rows) EXPECT_EQ(refusal(row.words), row.complaint);
    for (const char* number : {"-1", "1001", "x"}) refusal({"--computer-systems", number, "tree"});
}

TEST(CommandLine, RefusesAnEmptyValueHoweverItIsWritten) {
    const std::vector<std::pair<const char*, std::vector<const char*>>> rows = {
        {"--provider", {"ei", "X"}},     {"--schema", {"ei", "X"}},
        {"--companion", {"ei", "X"}},    {"--assoc-class", {"ai", "X"}},
        {"--result-class", {"ri", "X"}}, {"--role", {"rin", "X"}},
        {"--result-role", {"ain", "X"}}, {"--lang", {"xq", "q"}},
        {"--namespace", {"xq", "q"}},    {"--namespace", {"tree"}},
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
    for (const char* option : {"--format=", "--computer-systems=", "--log="})
        refusal({option, "ei", "X"});
}

TEST(CommandLine, TakesAnEmptyListOfPropertiesBehindASignOfEquality) {
    const CommandLine line = accepted({"ei", "X", "--properties=", "--log"});
    EXPECT_THAT(*line.properties, IsEmpty());
    EXPECT_TRUE(line.log);
    EXPECT_THAT(*accepted({"gi", "X", "--properties=", "A"}).properties, ElementsAre("A"));
    EXPECT_THAT(*accepted({"gi", "X", "--properties=A="}).properties, ElementsAre("A="));
}

TEST(CommandLine, TakesANumberOfComputerSystemsFromNoneToAThousand) {
    EXPECT_EQ(accepted({"--computer-systems", "0", "tree"}).computerSystems, 0U);
    EXPECT_EQ(accepted({"tree", "--computer-systems", "1000"}).computerSystems, 1000U);
    EXPECT_EQ(accepted({"tree"}).computerSystems, std::nullopt);
}

TEST(CommandLine, DescribesEverythingInItsHelp) {
    const ParsedCommandLine result = parsedLine({"--help"});
    EXPECT_FALSE(result.commandLine.has_value());
    EXPECT_EQ(result.status, exitDone);
    for (const char* word :
         {"Usage: cmpihost [OPTIONS] OPERATION ARGUMENT...", "--provider FILE", "--format FORMAT",
          "--log", "--bare", "\n  --schema DIR                    Folder of", "--version",
          "--assoc-class", "--result-class", "--role", "--result-role", "--properties", "--lang",
          "--namespace", "Exit status:"}) {
        EXPECT_THAT(result.text, HasSubstr(word));
    }
    for (const char* line : {"Operations:", "Pictures:", "Paths:", "ei", "ein", "gi", "ci", "mi",
                             "di", "xq", "ai", "ain", "ri", "rin", "tree"}) {
        EXPECT_THAT(result.text, HasSubstr(std::string("\n") + line + "\n"));
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
