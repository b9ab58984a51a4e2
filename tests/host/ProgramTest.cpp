// The built program as a user runs it, with stand-in libraries for the provider.
#include <gmock/gmock.h>
#include <sys/utsname.h>

#include "support/ProgramRun.h"

namespace {

using testing::HasSubstr;
using testing::StartsWith;

ProgramRun cmpihost(const std::vector<std::string>& arguments) {
    return runProgram(KORVA_CMPIHOST, arguments, {"TZ=UTC0"});
}

ProgramRun withStandIn(std::vector<std::string> arguments) {
    arguments.insert(arguments.begin(), {"--provider", KORVA_STAND_IN});
    return cmpihost(arguments);
}

constexpr const char* moonPath =
    "root/cimv2:KORVA_OperatingSystem.CSCreationClassName=\"KORVA_ComputerSystem\",CSName=\"moon\","
    "CreationClassName=\"KORVA_OperatingSystem\",Name=\"Test \\\"OS\\\"\"";

TEST(Program, EnumeratesInstances) {
    const ProgramRun run = withStandIn({"ei", "KORVA_OperatingSystem"});
    EXPECT_EQ(run.status, 0);
    EXPECT_EQ(run.out, std::string(moonPath) +
                           "\n"
                           "  CSName                  moon\n"
                           "  Name                    Test \"OS\"\n"
                           "  Version                 1\\x1b[31m\n"
                           "  OSType                  36 (LINUX)\n"
                           "  TotalVisibleMemorySize  8123456 (7.7 GiB)\n");
    EXPECT_EQ(run.err, "");
}

TEST(Program, PrintsNamesThatItTakesBack) {
    const ProgramRun names = withStandIn({"ein", "KORVA_OperatingSystem"});
    EXPECT_EQ(names.status, 0);
    EXPECT_EQ(names.out, std::string(moonPath) + "\n");
    const ProgramRun instance = withStandIn({"gi", names.out.substr(0, names.out.size() - 1)});
    EXPECT_EQ(instance.status, 0);
    EXPECT_THAT(instance.out, StartsWith(moonPath));
    EXPECT_EQ(instance.err, "");
}

TEST(Program, PrintsTheListedPropertiesOnly) {
    const ProgramRun run =
        withStandIn({"--format", "mof", "ei", "KORVA_OperatingSystem", "ostype"});
    EXPECT_EQ(run.out,
              "instance of KORVA_OperatingSystem {\n"
              "    CSName = \"moon\";\n"
              "    Name = \"Test \\\"OS\\\"\";\n"
              "    OSType = 36;\n"
              "};\n");
}

TEST(Program, PrintsJson) {
    const ProgramRun run = withStandIn({"--format", "json", "ain", moonPath});
    EXPECT_EQ(run.status, 0);
    EXPECT_EQ(run.out,
              "[\n"
              "  {\n"
              "    \"class\": \"KORVA_OperatingSystem\",\n"
              "    \"path\": \"root/cimv2:KORVA_OperatingSystem.CSCreationClassName=\\\""
              "KORVA_ComputerSystem\\\",CSName=\\\"moon\\\",CreationClassName=\\\""
              "KORVA_OperatingSystem\\\",Name=\\\"Test \\\\\\\"OS\\\\\\\"\\\"\"\n"
              "  }\n"
              "]\n");
}

TEST(Program, PrintsAnEmptyResult) {
    EXPECT_EQ(withStandIn({"rin", "X"}).out, "");
    EXPECT_EQ(withStandIn({"--format", "json", "rin", "X"}).out, "[]\n");
    EXPECT_EQ(withStandIn({"ei", "Unknown"}).status, 0);
}

TEST(Program, CompletesAPathThatOneInstanceFits) {
    for (const char* given : {"KORVA_OperatingSystem", "KORVA_OperatingSystem.CSName=\"moon\""}) {
        const ProgramRun run = withStandIn({"gi", given});
        EXPECT_EQ(run.status, 0);
        EXPECT_THAT(run.out, StartsWith(moonPath));
        EXPECT_EQ(run.err, "cmpihost: completed the path: " + std::string(moonPath) + "\n");
    }
}

TEST(Program, CompletesNoPathThatNoneOrSeveralInstancesFit) {
    const ProgramRun none = withStandIn({"gi", "KORVA_OperatingSystem.CSName=\"sun\""});
    EXPECT_EQ(none.status, 2);
    EXPECT_EQ(none.out, "");
    EXPECT_EQ(none.err,
              "cmpihost: the path lacks keys, and no instance of KORVA_OperatingSystem has those "
              "that it gives; the instances are:\n  " +
                  std::string(moonPath) + "\n");
    const ProgramRun several =
        withStandIn({"--computer-systems", "2", "ain", "KORVA_ComputerSystem"});
    EXPECT_EQ(several.status, 2);
    EXPECT_EQ(several.out, "");
    EXPECT_THAT(several.err, StartsWith("cmpihost: the path lacks keys, and 2 instances of "
                                        "KORVA_ComputerSystem have those that it gives:\n"
                                        "  root/cimv2:KORVA_ComputerSystem."));
}

TEST(Program, ThatCannotLookForKeysTellsWhy) {
    const ProgramRun run = withStandIn({"gi", "KORVA_OSElementCapabilities"});
    EXPECT_EQ(run.status, 1);
    EXPECT_EQ(run.err, "cmpihost: CIM_ERR_ACCESS_DENIED (2)\n");
}

TEST(Program, NotesThatNoInstanceWasReturned) {
    const ProgramRun run = withStandIn({"gi", "X.CSName=\"sun\""});
    EXPECT_EQ(run.status, 0);
    EXPECT_EQ(run.out, "");
    EXPECT_EQ(run.err,
              "note: no instance was returned; an object manager answers CIM_ERR_NOT_FOUND (6)\n");
}

struct Failure {
    const char* name;
    std::vector<std::string> arguments;
    const char* err;
};

const Failure failures[] = {
    {"DeleteInstance", {"di", "X.A=1"}, "cmpihost: CIM_ERR_NOT_SUPPORTED (7)\n"},
    {"ModifyInstance",
     {"mi", "KORVA_OperatingSystem.Name=\"x\"", "Version=2", "OSType=36"},
     "cmpihost: CIM_ERR_NOT_SUPPORTED (7): properties Version,OSType\n"},
    {"CreateInstance",
     {"ci", "KORVA_OperatingSystem", "OSType=36"},
     "cmpihost: CMPI status 150: OSType 36\n"},
    {"ExecQuery",
     {"xq", "SELECT * FROM Thing", "--lang", "CQL", "--namespace", "interop"},
     "cmpihost: CIM_ERR_INVALID_QUERY (15): CQL|SELECT * FROM Thing|interop|Thing\n"},
    {"Associators",
     {"ai", "X.A=1", "P", "--assoc-class", "a", "--result-class", "b", "--role", "c",
      "--result-role", "d"},
     "cmpihost: CIM_ERR_FAILED (1): a|b|c|d|P\n"},
    {"AssociatorsWithoutFilters", {"ai", "X.A=1"}, "cmpihost: CIM_ERR_FAILED (1): -|-|-|-|all\n"},
    {"References",
     {"ri", "X.A=1", "--result-class", "b", "--role", "c", "--properties", "P,Q"},
     "cmpihost: CIM_ERR_FAILED (1): b|c|P,Q\n"},
    {"ResultsBeforeAFailureAreDropped",
     {"ei", "KORVA_OperatingSystemCapabilities"},
     "cmpihost: CIM_ERR_FAILED (1): properties all\\x1b[31m\n"},
    {"Exception",
     {"ei", "KORVA_RunningOS"},
     "cmpihost: CIM_ERR_FAILED (1): an exception left the provider: the moon is down\n"},
    {"ExceptionOfAnyType",
     {"ei", "KORVA_OSElementCapabilities"},
     "cmpihost: CIM_ERR_FAILED (1): an exception left the provider: of an unknown type\n"},
};

class ProgramFailure : public testing::TestWithParam<Failure> {};

TEST_P(ProgramFailure, NamesTheStatusAndExitsWithOne) {
    const ProgramRun run = withStandIn(GetParam().arguments);
    EXPECT_EQ(run.status, 1);
    EXPECT_EQ(run.out, "");
    EXPECT_EQ(run.err, GetParam().err);
}

INSTANTIATE_TEST_SUITE_P(Program, ProgramFailure, testing::ValuesIn(failures),
                         [](const auto& row) { return std::string(row.param.name); });

TEST(Program, PrintsThePathOfWhatItCreated) {
    const ProgramRun run = withStandIn({"--format", "json", "ci", "Changeable", "A=1"});
    EXPECT_EQ(run.status, 0);
    EXPECT_EQ(run.out,
              "[\n  {\n    \"class\": \"Changeable\",\n"
              "    \"path\": \"root/cimv2:Changeable\"\n  }\n]\n");
}

TEST(Program, PrintsNothingOfWhatItChanged) {
    for (const std::vector<std::string>& change :
         {std::vector<std::string>{"mi", "Changeable.A=1", "B=2"}, {"di", "Changeable.A=1"}}) {
        const ProgramRun run = withStandIn(change);
        EXPECT_EQ(run.status, 0);
        EXPECT_EQ(run.out, "");
        EXPECT_EQ(withStandIn({"--format", "json", change[0], change[1]}).out, "");
    }
}

TEST(Program, TellsHowTheLibrariesCleanedUp) {
    const std::vector<std::string> request = {"--provider",  KORVA_STAND_IN,
                                              "--companion", KORVA_STAND_IN,
                                              "ein",         "KORVA_OperatingSystem"};
    const ProgramRun failing = runProgram(KORVA_CMPIHOST, request, {"STAND_IN_CLEANUP=fails"});
    EXPECT_EQ(failing.status, 0);
    EXPECT_EQ(failing.err,
              "caught: cleanup answered status 1\n"
              "caught: cleanup answered status 1\n"
              "caught: cleanup answered status 1\n");
    const ProgramRun throwing = runProgram(KORVA_CMPIHOST, request, {"STAND_IN_CLEANUP=throws"});
    EXPECT_EQ(throwing.status, 0);
    EXPECT_THAT(throwing.err, StartsWith("caught: an exception left cleanup\n"));
}

TEST(Program, SaysWhyRecordsCannotBeShown) {
    const ProgramRun run =
        runProgram("/bin/sh", {"-c",
                               "(trap '' XFSZ; ulimit -f 0; \"$0\" --provider \"$1\" --log ein X; "
                               "echo \"status $?\") 2>&1 | cat",
                               KORVA_CMPIHOST, KORVA_STAND_IN});
    EXPECT_EQ(run.out, "cmpihost: the records cannot be shown: File too large\nstatus 2\n");
}

TEST(Program, ServesTheComputerSystemToTheProvidersUpCalls) {
    utsname names{};
    ASSERT_EQ(uname(&names), 0);
    const ProgramRun run = withStandIn({"ein", "KORVA_ComputerSystem"});
    EXPECT_EQ(run.status, 0);
    EXPECT_THAT(run.out, StartsWith("root/cimv2:KORVA_ComputerSystem."));
    EXPECT_THAT(run.out, HasSubstr("Name=\"" + std::string(names.nodename) + "\""));
    EXPECT_EQ(run.err, "");
}

TEST(Program, TellsWhatTheBrokerCaught) {
    const ProgramRun run = withStandIn({"ei", "KORVA_InstalledOS"});
    EXPECT_EQ(run.status, 0);
    EXPECT_EQ(run.out, "");
    EXPECT_THAT(run.err, StartsWith("caught: "));
}

TEST(Program, ShowsAMalformedPathWithACaret) {
    const ProgramRun run = withStandIn({"gi", "KORVA_OperatingSystem.Name=x"});
    EXPECT_EQ(run.status, 2);
    EXPECT_THAT(run.err, HasSubstr("\n  KORVA_OperatingSystem.Name=x\n"
                                   "                             ^\n"));
}

TEST(Program, ShowsAMalformedNamespaceWithACaret) {
    for (const auto& words : std::vector<std::vector<std::string>>{
             {"tree", "--namespace", "root//cimv2"}, {"xq", "q", "--namespace=root//cimv2"}}) {
        const ProgramRun run = withStandIn(words);
        EXPECT_EQ(run.status, 2);
        EXPECT_EQ(run.out, "");
        EXPECT_EQ(
            run.err,
            "cmpihost: expected a name before '/' in the namespace\n  root//cimv2\n       ^\n");
    }
}

TEST(Program, RefusesWrongUsage) {
    EXPECT_EQ(cmpihost({}).status, 2);
    EXPECT_EQ(cmpihost({}).err,
              "cmpihost: An operation is required\nRun cmpihost --help for more information.\n");
    const ProgramRun unknown = withStandIn({"ci", "KORVA_OperatingSystem", "Colour=red"});
    EXPECT_EQ(unknown.status, 2);
    EXPECT_EQ(unknown.err,
              "cmpihost: the class 'KORVA_OperatingSystem' has no property 'Colour'\n");
}

TEST(Program, RefusesASchemaFolderWithoutClasses) {
    const ProgramRun run = withStandIn({"--schema", "/nowhere", "ei", "X"});
    EXPECT_EQ(run.status, 2);
    EXPECT_EQ(run.err,
              "cmpihost: the schema folder /nowhere cannot be read: No such file or directory\n");
}

TEST(Program, TakesAnotherSchemaFolder) {
    const ProgramRun run =
        withStandIn({"--schema", KORVA_TEST_DATA "/othermof", "ei", "KORVA_OperatingSystem"});
    EXPECT_EQ(run.status, 0);
    EXPECT_THAT(run.out, HasSubstr("  OSType                  36 (thirty-six)\n"));
    EXPECT_THAT(run.err, HasSubstr("caught: "));
}

TEST(Program, PrintsHelpAndVersionOnTheStandardOutput) {
    const ProgramRun help = cmpihost({"--help"});
    EXPECT_EQ(help.status, 0);
    EXPECT_THAT(help.out, HasSubstr("Usage: cmpihost [OPTIONS] OPERATION ARGUMENT..."));
    EXPECT_EQ(help.err, "");
    EXPECT_EQ(cmpihost({"--version"}).out, "cmpihost 1.0.0\n");
}

TEST(Program, SaysThatResultsCannotBeWritten) {
    const ProgramRun run = runProgram(
        "/bin/sh", {"-c", "exec \"$0\" --provider \"$1\" ein KORVA_OperatingSystem > /dev/full",
                    KORVA_CMPIHOST, KORVA_STAND_IN});
    EXPECT_EQ(run.status, 1);
    EXPECT_EQ(run.err, "cmpihost: the results cannot be written\n");
}

TEST(Program, SaysThatHelpAndVersionCannotBeWritten) {
    for (const char* redirection : {"--help > /dev/full", "--version > /dev/full", "--help >&-"}) {
        const ProgramRun run = runProgram(
            "/bin/sh", {"-c", std::string("exec \"$0\" ") + redirection, KORVA_CMPIHOST});
        EXPECT_EQ(run.status, 1) << redirection;
        EXPECT_EQ(run.err, "cmpihost: the text cannot be written\n") << redirection;
    }
    EXPECT_EQ(
        runProgram("/bin/sh", {"-c", "exec \"$0\" unknown 2> /dev/full", KORVA_CMPIHOST}).status,
        2);
}

TEST(Program, NotesListedNamesThatTheClassDoesNotDeclare) {
    const ProgramRun run = withStandIn({"ei", "KORVA_OperatingSystem", "Versoin, Version"});
    EXPECT_EQ(run.status, 0);
    EXPECT_THAT(run.out, HasSubstr("\n  Version  "));
    EXPECT_EQ(run.err, "note: the class KORVA_OperatingSystem declares no property 'Versoin'\n");
}

}  // namespace
