// The built program as a user runs it, with a stand-in library for the provider.
#include <gmock/gmock.h>

#include "host/cli/Cmpihost.h"

namespace {

using testing::HasSubstr;
using testing::StartsWith;

ProgramRun withStandIn(Words arguments, const Words& environment = {"TZ=UTC0"}) {
    arguments.insert(arguments.begin(), {"--provider", KORVA_STAND_IN});
    return cmpihost(arguments, environment);
}

const std::string moonPath =
    "root/cimv2:KORVA_OperatingSystem.CSCreationClassName=\"KORVA_ComputerSystem\",CSName=\"moon\","
    "CreationClassName=\"KORVA_OperatingSystem\",Name=\"Test \\\"OS\\\"\"";

const std::string moonTable = moonPath +
                              "\n"
                              "  CSName                  moon\n"
                              "  Name                    Test \"OS\"\n"
                              "  Version                 1\\x1b[31m\n"
                              "  OSType                  36 (LINUX)\n"
                              "  TotalVisibleMemorySize  8123456 (7.7 GiB)\n";

const std::string completed = "cmpihost: completed the path: " + moonPath + "\n";

struct Run {
    Words arguments;
    std::string out;
    std::string err;
};

void expectRuns(int status, const std::vector<Run>& rows) {
    for (const Run& row : rows) {
        const ProgramRun run = withStandIn(row.arguments);
        EXPECT_EQ(run.status, status) << testing::PrintToString(row.arguments);
        EXPECT_EQ(run.out, row.out) << testing::PrintToString(row.arguments);
        EXPECT_EQ(run.err, row.err) << testing::PrintToString(row.arguments);
    }
}

TEST(Program, PrintsWhatTheProviderReturnsAndExitsWithZero) {
    expectRuns(
        0, {{{"ei", "KORVA_OperatingSystem"}, moonTable, ""},
            {{"ein", "KORVA_OperatingSystem"}, moonPath + "\n", ""},
            {{"gi", moonPath}, moonTable, ""},
            {{"gi", "KORVA_OperatingSystem"}, moonTable, completed},
            {{"gi", "KORVA_OperatingSystem.CSName=\"moon\""}, moonTable, completed},
            {{"--format", "mof", "ei", "KORVA_OperatingSystem", "ostype"},
             "instance of KORVA_OperatingSystem {\n"
             "    CSName = \"moon\";\n"
             "    Name = \"Test \\\"OS\\\"\";\n"
             "    OSType = 36;\n"
             "};\n",
             ""},
            {{"--format", "json", "ain", moonPath},
             "[\n"
             "  {\n"
             "    \"class\": \"KORVA_OperatingSystem\",\n"
             "    \"path\": \"root/cimv2:KORVA_OperatingSystem.CSCreationClassName=\\\""
             "KORVA_ComputerSystem\\\",CSName=\\\"moon\\\",CreationClassName=\\\""
             "KORVA_OperatingSystem\\\",Name=\\\"Test \\\\\\\"OS\\\\\\\"\\\"\"\n"
             "  }\n"
             "]\n",
             ""},
            {{"rin", "X"}, "", "note: the schema has no class 'X'\n"},
            {{"--format", "json", "rin", "CIM_X"}, "[]\n", ""},
            {{"ei", "Unknown"}, "", ""},
            {{"gi", "X.CSName=\"sun\""},
             "",
             "note: no instance was returned; an object manager answers CIM_ERR_NOT_FOUND (6)\n"},
            {{"ei", "KORVA_OperatingSystem", "Versoin, Version", "--format", "mof"},
             "instance of KORVA_OperatingSystem {\n"
             "    CSName = \"moon\";\n"
             "    Name = \"Test \\\"OS\\\"\";\n"
             "    Version = \"1\\x001B[31m\";\n"
             "};\n",
             "note: the class KORVA_OperatingSystem declares no property 'Versoin'\n"},
            // Of what is created the path is printed, of what is changed or deleted nothing.
            {{"--format", "json", "ci", "Changeable", "A=1"},
             "[\n  {\n    \"class\": \"Changeable\",\n"
             "    \"path\": \"root/cimv2:Changeable\"\n  }\n]\n",
             "caught: path of Changeable, a class that is not declared\n"},
            {{"mi", "Changeable.A=1", "B=2"}, "", ""},
            {{"--format", "json", "mi", "Changeable.A=1", "B=2"}, "", ""},
            {{"di", "Changeable.A=1"}, "", ""},
            {{"--format", "json", "di", "Changeable.A=1"}, "", ""}});
}

TEST(Program, NamesTheStatusOfAFailureAndExitsWithOne) {
    expectRuns(
        1, {{{"di", "X.A=1"}, "", "cmpihost: CIM_ERR_NOT_SUPPORTED (7)\n"},
            {{"mi", "KORVA_OperatingSystem.Name=\"x\"", "Version=2", "OSType=36"},
             "",
             "cmpihost: CIM_ERR_NOT_SUPPORTED (7): properties Version,OSType\n"},
            {{"ci", "KORVA_OperatingSystem", "OSType=36"},
             "",
             "cmpihost: CMPI status 150: OSType 36\n"},
            {{"xq", "SELECT * FROM Thing", "--lang", "CQL", "--namespace", "interop"},
             "",
             "cmpihost: CIM_ERR_INVALID_QUERY (15): CQL|SELECT * FROM Thing|interop|Thing\n"},
            {{"ai", "X.A=1", "P", "--assoc-class", "a", "--result-class", "b", "--role", "c",
              "--result-role", "d"},
             "",
             "cmpihost: CIM_ERR_FAILED (1): a|b|c|d|P\n"},
            {{"ai", "X.A=1"}, "", "cmpihost: CIM_ERR_FAILED (1): -|-|-|-|all\n"},
            {{"ri", "X.A=1", "--result-class", "b", "--role", "c", "--properties", "P,Q"},
             "",
             "cmpihost: CIM_ERR_FAILED (1): b|c|P,Q\n"},
            // It returned an instance before it failed.
            {{"ei", "KORVA_OperatingSystemCapabilities"},
             "",
             "cmpihost: CIM_ERR_FAILED (1): properties all\\x1b[31m\n"},
            {{"ei", "KORVA_RunningOS"},
             "",
             "cmpihost: CIM_ERR_FAILED (1): an exception left the provider: the moon is down\n"},
            {{"ei", "KORVA_OSElementCapabilities"},
             "",
             "cmpihost: CIM_ERR_FAILED (1): an exception left the provider: of an unknown type\n"},
            // It cannot name the instances that a path without keys may mean.
            {{"gi", "KORVA_OSElementCapabilities"}, "", "cmpihost: CIM_ERR_ACCESS_DENIED (2)\n"}});
}

TEST(Program, RefusesWhatMakesNoSenseAndExitsWithTwo) {
    const std::string noName = "cmpihost: expected a name before '/' in the namespace\n";
    expectRuns(
        2, {{{"gi", "KORVA_OperatingSystem.CSName=\"sun\""},
             "",
             "cmpihost: the path lacks keys, and no instance of KORVA_OperatingSystem has those "
             "that it gives; the instances are:\n  " +
                 moonPath + "\n"},
            {{"gi", "KORVA_OperatingSystem.Name=x"},
             "",
             "cmpihost: expected the value of 'Name': a text in quotes, an integer, TRUE or FALSE "
             "(a shell keeps the quotes when the path stands in '...')\n"
             "  KORVA_OperatingSystem.Name=x\n"
             "                             ^\n"},
            {{"tree", "--namespace", "root//cimv2"}, "", noName + "  root//cimv2\n       ^\n"},
            {{"xq", "q", "--namespace=root//cimv2"}, "", noName + "  root//cimv2\n       ^\n"},
            {{"ci", "KORVA_OperatingSystem", "Colour=red"},
             "",
             "cmpihost: the class 'KORVA_OperatingSystem' has no property 'Colour'\n"},
            {{"--schema", "/nowhere", "ei", "X"},
             "",
             "cmpihost: the schema folder /nowhere cannot be read: No such file or directory\n"}});
    const ProgramRun several =
        withStandIn({"--computer-systems", "2", "ain", "KORVA_ComputerSystem"});
    EXPECT_EQ(several.status, 2);
    EXPECT_EQ(several.out, "");
    EXPECT_THAT(several.err, StartsWith("cmpihost: the path lacks keys, and 2 instances of "
                                        "KORVA_ComputerSystem have those that it gives:\n"
                                        "  root/cimv2:KORVA_ComputerSystem."));
    const ProgramRun nothing = cmpihost({});
    EXPECT_EQ(nothing.status, 2);
    EXPECT_EQ(nothing.err,
              "cmpihost: An operation is required\nRun cmpihost --help for more information.\n");
}

TEST(Program, TellsHowTheLibrariesCleanedUp) {
    const Words request = {"--companion", KORVA_STAND_IN, "ein", "KORVA_OperatingSystem"};
    const ProgramRun failing = withStandIn(request, {"STAND_IN_CLEANUP=fails"});
    EXPECT_EQ(failing.status, 0);
    EXPECT_EQ(failing.err,
              "caught: cleanup answered status 1\n"
              "caught: cleanup answered status 1\n"
              "caught: cleanup answered status 1\n");
    const ProgramRun throwing = withStandIn(request, {"STAND_IN_CLEANUP=throws"});
    EXPECT_EQ(throwing.status, 0);
    EXPECT_THAT(throwing.err, StartsWith("caught: an exception left cleanup\n"));
}

TEST(Program, ServesTheComputerSystemToTheProvidersUpCalls) {
    expectRuns(0, {{{"ein", "KORVA_ComputerSystem"},
                    "root/cimv2:KORVA_ComputerSystem.CreationClassName=\"KORVA_ComputerSystem\","
                    "Name=\"" +
                        nodeName() + "\"\n",
                    ""}});
}

TEST(Program, TellsWhatTheBrokerCaught) {
    const std::string thirtySix = moonPath +
                                  "\n"
                                  "  CSName                  moon\n"
                                  "  Name                    Test \"OS\"\n"
                                  "  OSType                  36 (thirty-six)\n"
                                  "  TotalVisibleMemorySize  8123456\n";
    expectRuns(0, {{{"ei", "KORVA_InstalledOS"},
                    "",
                    "caught: CMPIResultFT.returnInstance: null CMPIInstance\n"},
                   // A schema that knows less than the provider publishes.
                   {{"--schema", KORVA_TEST_DATA "/cli/othermof", "ei", "KORVA_OperatingSystem"},
                    thirtySix,
                    "caught: KORVA_OperatingSystem has no property Version\n"}});
}

TEST(Program, PrintsHelpAndVersionOnTheStandardOutput) {
    const ProgramRun help = cmpihost({"--help"});
    EXPECT_EQ(help.status, 0);
    EXPECT_THAT(help.out, HasSubstr("Usage: cmpihost [OPTIONS] OPERATION ARGUMENT..."));
    EXPECT_EQ(help.err, "");
    EXPECT_EQ(cmpihost({"--version"}).out, "cmpihost 1.0.0\n");
}

TEST(Program, SaysThatItCannotWrite) {
    const std::string text = "cmpihost: the text cannot be written\n";
    const struct {
        const char* command;
        int status;
        std::string err;
    } rows[] = {
        {"exec \"$0\" --provider \"$1\" ein KORVA_OperatingSystem > /dev/full", 1,
         "cmpihost: the results cannot be written\n"},
        {"exec \"$0\" --help > /dev/full", 1, text},
        {"exec \"$0\" --version > /dev/full", 1, text},
        {"exec \"$0\" --help >&-", 1, text},
        {"exec \"$0\" unknown 2> /dev/full", 2, ""},
        {"(trap '' XFSZ; ulimit -f 0; \"$0\" --provider \"$1\" --log ein X; echo \"status $?\") "
         "2>&1 | cat >&2",
         0, "cmpihost: the records cannot be shown: File too large\nstatus 2\n"},
    };
    for (const auto& row : rows) {
        const ProgramRun run =
            runProgram("/bin/sh", {"-c", row.command, KORVA_CMPIHOST, KORVA_STAND_IN});
        EXPECT_EQ(run.status, row.status) << row.command;
        EXPECT_EQ(run.err, row.err) << row.command;
    }
}

}  // namespace
