// The built program as a user runs it: with a stand-in library for the provider, and with the
// libraries that ship on a host that is the same everywhere. What whole runs print stands in runs/.
#include <gmock/gmock.h>

#include <algorithm>
#include <nlohmann/json.hpp>

#include "host/cli/Cmpihost.h"
#include "host/cli/OutputForm.h"
#include "support/GoldenFile.h"
#include "support/PseudoTerminal.h"

namespace {

using testing::HasSubstr;
using testing::Not;
using testing::StartsWith;

std::string replaced(std::string text, const std::string& part, const std::string& by) {
    for (std::size_t at = text.find(part); at != std::string::npos; at = text.find(part, at))
        text.replace(at, part.size(), by);
    return text;
}

/// The form of what a command prints as JSON, by the word that tells it; empty: it prints none.
std::string jsonForm(const Words& arguments) {
    const std::pair<const char*, const char*> rows[] = {
        {"ei", "instances"},
        {"gi", "instances"},
        {"ai", "instances"},
        {"ri", "instances"},
        {"classes", "classes"},
        {"namespaces", "namespaces"},
        {"KORVA_InstalledOS", "describedClass"},
        {"KORVA_OperatingSystem.FreePhysicalMemory", "describedProperty"},
        {"Disk.RequestState", "describedMethod"},
        {"ein", "paths"},
        {"ain", "paths"},
        {"rin", "paths"},
        {"ci", "paths"},
        {"tree", "tree"},
        {"im", "methodResult"}};
    const bool json = std::find(arguments.begin(), arguments.end(), "json") != arguments.end();
    for (const auto& [command, form] : rows) {
        const auto found = std::find(arguments.begin(), arguments.end(), command);
        if (json && found != arguments.end()) return form;
    }
    return {};
}

/// The command lines as one types them, each with what it printed. What differs from machine to
/// machine has a name of its own.
std::string transcript(const std::vector<Words>& runs, const Words& environment) {
    std::string text;
    for (const Words& arguments : runs) {
        const ProgramRun run = cmpihost(arguments, environment);
        text += "$ cmpihost";
        for (const std::string& word : arguments) {
            const bool plain = word.find_first_of(" \"*{}") == std::string::npos && !word.empty();
            text += plain ? " " + word : " '" + word + "'";
        }
        text += "\n" + run.out;
        const std::string form = run.status == 0 ? jsonForm(arguments) : "";
        if (run.status == 0 && std::count(arguments.begin(), arguments.end(), "mof") > 0) {
            EXPECT_EQ(complaintOnMof(run.out), "") << text;
        }
        if (!form.empty()) {
            EXPECT_EQ(complaintOnJson(run.out, form), "") << text;
        }
        for (const std::string& line : lines(run.err)) text += "! " + line + "\n";
        text += "exit " + std::to_string(run.status) + "\n\n";
    }
    text = replaced(std::move(text), KORVA_STAND_IN, "STAND-IN");
    text = replaced(std::move(text), KORVA_TEST_DATA, "TESTS");
    text = replaced(std::move(text), KORVA_BINARY_DIR, "BUILD");
    return replaced(std::move(text), "Name=\"" + nodeName(), "Name=\"NODE");
}

Words withStandIn(Words arguments) {
    arguments.insert(arguments.begin(),
                     {"--provider", KORVA_STAND_IN, "--name", "OperatingSystemProvider"});
    return arguments;
}

TEST(Program, PrintsWhatAStandInAnswers) {
    const std::string moon =
        "root/cimv2:KORVA_OperatingSystem.CSCreationClassName=\"KORVA_ComputerSystem\","
        "CSName=\"moon\",CreationClassName=\"KORVA_OperatingSystem\",Name=\"Test \\\"OS\\\"\"";
    const char* const other = KORVA_TEST_DATA "/cli/othermof";
    const std::string disk = "Disk.Id=\"1\"";
    std::vector<Words> runs = {
        {"ei", "KORVA_OperatingSystem"},
        {"ein", "KORVA_OperatingSystem"},
        {"gi", moon},
        {"gi", "KORVA_OperatingSystem"},
        {"gi", "KORVA_OperatingSystem.CSName=\"moon\""},
        {"--format", "mof", "ei", "KORVA_OperatingSystem", "ostype"},
        {"--format", "json", "ain", moon},
        {"ei", "KORVA_OperatingSystem", "Versoin, Version"},
        {"rin", "X"},
        {"--format", "json", "rin", "CIM_X.A=1"},
        {"ei", "Unknown"},
        {"gi", "X.CSName=\"sun\""},
        {"ein", "KORVA_ComputerSystem"},
        // Of what is created the path is printed, of what is changed or deleted nothing.
        {"--format", "json", "ci", "Changeable", "A=1"},
        {"mi", "Changeable.A=1", "B=2"},
        {"--format", "json", "mi", "Changeable.A=1", "B=2"},
        {"di", "Changeable.A=1"},
        {"--format", "json", "di", "Changeable.A=1"},
        // What the broker caught, once of a provider that publishes more than the schema knows.
        {"ei", "KORVA_InstalledOS"},
        {"--schema", other, "ei", "KORVA_OperatingSystem"},
        // A method: what it returned and what came out.
        {"--schema", other, "im", disk, "requeststate", "State=2"},
        {"--schema", other, "--format", "json", "im", disk, "RequestState", "state=1"},
        {"--schema", other, "im", disk, "RequestState", "State=1", "--value", "When"},
        {"--schema", other, "im", disk, "RequestState", "State=1", "--value", "State"},
        {"--schema", other, "im", disk, "RequestState", "State=on"},
        {"--schema", other, "im", disk, "RequestState", "States=1"},
        {"--schema", other, "im", disk, "RequestState", "State=1", "state=2"},
        {"--schema", other, "im", disk, "RequestStat", "Anything=1"},
        {"--schema", other, "--format", "mof", "im", disk, "RequestState"},
        // Failures tell what was asked.
        {"di", "X.A=1"},
        {"mi", "KORVA_OperatingSystem.Name=\"x\"", "Version=2", "OSType=36"},
        {"ci", "KORVA_OperatingSystem", "OSType=36"},
        {"xq", "SELECT * FROM Thing", "--lang", "CQL", "--namespace", "interop"},
        {"ai", "X.A=1", "P", "--assoc-class", "a", "--result-class", "b", "--role", "c",
         "--result-role", "d"},
        {"ai", "X.A=1"},
        {"ri", "X.A=1", "--result-class", "b", "--role", "c", "--properties", "P,Q"},
        // A failure after an instance, two exceptions, names that cannot be had.
        {"ei", "KORVA_OperatingSystemCapabilities"},
        {"ei", "KORVA_RunningOS"},
        {"ei", "KORVA_OSElementCapabilities"},
        {"gi", "KORVA_OSElementCapabilities"},
        // Wrong usage.
        {"gi", "KORVA_OperatingSystem.CSName=\"sun\""},
        {"gi", "KORVA_OperatingSystem.Name=x"},
        {"tree", "--namespace", "root//cimv2"},
        {"xq", "q", "--namespace=root//cimv2"},
        {"ci", "KORVA_OperatingSystem", "Colour=red"},
        {"--schema", "/nowhere", "ei", "X"},
    };
    for (Words& run : runs) run = withStandIn(run);
    runs.insert(runs.end(), {{}, {"--version"}, {"--registration", "/nonexistent.reg", "tree"}});
    expectGolden(KORVA_TEST_DATA "/cli/runs/StandIn.txt", transcript(runs, {"TZ=UTC0"}));
}

TEST(Program, PrintsWhatTheShippedLibrariesAnswer) {
    const std::string system =
        "root/cimv2:KORVA_OperatingSystem.CSCreationClassName=\"KORVA_ComputerSystem\","
        "CSName=\"fixture.example\",CreationClassName=\"KORVA_OperatingSystem\","
        "Name=\"Fixture Linux\"";
    const std::string stranger = replaced(system, "Fixture Linux", "nothing");
    const std::string other = "CIM_Elsewhere.Name=\"x\"";
    const std::string runningOS = "KORVA_RunningOS";
    const std::string wrong = "KORVA_OperatingSystem.Name=\"x\"";
    const std::vector<Words> runs = {
        // Every property in every form, every class, and every path that is named.
        {"ei", "KORVA_OperatingSystem"},
        {"--format", "mof", "ei", "KORVA_OperatingSystem"},
        {"--format", "json", "ei", "KORVA_OperatingSystem"},
        {"tree"},
        {"ein", "KORVA_OperatingSystem"},
        {"ein", "KORVA_OperatingSystemCapabilities"},
        {"ein", "KORVA_InstalledOS"},
        {"ein", "KORVA_RunningOS"},
        {"ein", "KORVA_OSElementCapabilities"},
        {"gi", system, "OSType", "EnabledState"},
        {"gi", "KORVA_OperatingSystemCapabilities.InstanceID=\"Fixture Linux\""},
        {"gi", "KORVA_InstalledOS"},
        {"gi", "KORVA_RunningOS"},
        {"gi", "KORVA_OSElementCapabilities"},
        {"gi", stranger},
        {"--bare", "gi", stranger},
        // Associations, all of them or as the filters say.
        {"ain", system},
        {"rin", system},
        {"--provider", KORVA_BINARY_DIR "/lib/libkorvaosstatusfacade.so.1", "rin", system},
        {"ain", system, "--assoc-class", "CIM_RunningOS"},
        {"ain", system, "--assoc-class", "KORVA_RunningOS"},
        {"ain", system, "--result-class", "KORVA_OperatingSystemCapabilities"},
        {"ain", system, "--role", "ManagedElement"},
        {"ain", system, "--result-role", "Dependent"},
        {"ain", system, "--result-role", "Antecedent"},
        {"ain", system, "--assoc-class", "CIM_Elsewhere"},
        {"rin", system, "--result-class", "KORVA_InstalledOS"},
        {"rin", system, "--role", "Antecedent"},
        {"rin", system, "--role", "Dependent"},
        {"ri", system, "--result-class", runningOS},
        {"--format", "mof", "ri", system, "--result-class", runningOS},
        {"--format", "mof", "rin", system, "--result-class", runningOS},
        {"--format", "json", "ri", system, "--result-class", runningOS},
        {"--format", "json", "rin", system, "--result-class", runningOS},
        {"ri", system, "--role", "PartComponent", "--properties", ""},
        {"ai", system, "--result-class", "KORVA_OperatingSystemCapabilities"},
        {"--format", "mof", "ai", system, "--role", "ManagedElement"},
        {"--format", "json", "ai", system, "--role", "ManagedElement"},
        {"--format", "json", "ain", system, "--role", "ManagedElement"},
        {"--format", "mof", "ein", "KORVA_OperatingSystemCapabilities"},
        // Bare values.
        {"ei", "KORVA_OperatingSystem", "--value", "operationalstatus"},
        {"gi", "KORVA_OperatingSystem", "--value", "LastBootUpTime"},
        {"ai", "KORVA_OperatingSystem", "--value", "InstanceID"},
        {"ri", system, "--result-class", runningOS, "--value", "Dependent"},
        {"ein", "KORVA_OperatingSystem", "--value", "CSName"},
        {"ein", "KORVA_OperatingSystem", "--value", "Version"},
        {"ei", "KORVA_OperatingSystem", "--value", "NumberOfUser"},
        // Paths that lack keys.
        {"gi", "KORVA_OperatingSystem", "--properties", ""},
        {"ai", "KORVA_OperatingSystem", "--properties", ""},
        {"ain", "KORVA_OperatingSystem"},
        {"ri", "KORVA_OperatingSystem", "--properties", ""},
        {"rin", "KORVA_OperatingSystem"},
        {"ai", "KORVA_OperatingSystem", "--assoc-class", "KORVA_InstalledOS"},
        {"ain", "KORVA_ComputerSystem", "--assoc-class", "KORVA_RunningOS"},
        {"--bare", "gi", "KORVA_OperatingSystem", "--properties", ""},
        {"--bare", "ain", "KORVA_OperatingSystem", "--assoc-class", "KORVA_RunningOS"},
        // Names that are misspelt, objects of others.
        {"gi", "KORVA_OperatingSystem.Foo=\"x\""},
        {"ain", "KORVA_OperatingSystem.Foo=\"x\""},
        {"ain", "KORVA_OperatingSytem"},
        {"ain", system, "--assoc-class", "Foo"},
        {"rin", system, "--result-class", "Foo"},
        {"ri", system, "--role", "Foo"},
        {"ai", system, "--result-role", "Foo"},
        {"ai", other},
        {"ain", other},
        {"ri", other},
        {"rin", other},
        // What the provider by itself needs to be told.
        {"--bare", "ei", "KORVA_Unknown"},
        {"--bare", "ai", "KORVA_OperatingSystem"},
        {"--bare", "ain", "KORVA_OperatingSystem"},
        {"--bare", "ain", "KORVA_OperatingSystem", "--assoc-class", "CIM_RunningOS"},
        {"--bare", "ain", "KORVA_OperatingSystem", "--assoc-class", "KORVA_RunninOS"},
        // What is not supported.
        {"ci", "KORVA_OperatingSystem", "Name=x"},
        {"mi", wrong, "Version=1"},
        {"di", wrong},
        {"xq", "SELECT * FROM KORVA_OperatingSystem"},
        {"--bare", "ci", "KORVA_OperatingSystem", "Name=x"},
        {"--bare", "mi", wrong, "Version=1"},
        {"--bare", "di", wrong},
        {"--bare", "xq", "SELECT * FROM KORVA_OperatingSystem"},
        {"--bare", "ri", wrong},
        {"--bare", "rin", wrong},
        {"--bare", "tree"},
    };
    expectGolden(
        KORVA_TEST_DATA "/cli/runs/Shipped.txt",
        transcript(runs, {"LD_LIBRARY_PATH=" KORVA_BINARY_DIR "/fixture-host", "TZ=UTC0"}));
}

TEST(Program, GivesTheTreeToProgramsWithTheElementsOfItsNodes) {
    const ProgramRun run = cmpihost({"--format", "json", "tree"},
                                    {"LD_LIBRARY_PATH=" KORVA_BINARY_DIR "/fixture-host"});
    ASSERT_EQ(run.status, 0) << run.err;
    EXPECT_EQ(complaintOnJson(run.out, "tree"), "");
    const nlohmann::json computer = nlohmann::json::parse(run.out)[0];
    EXPECT_EQ(computer["element"]["keys"]["Name"], "fixture.example");
    EXPECT_FALSE(computer.contains("association"));
    const nlohmann::json installed = computer["branches"][0];
    EXPECT_EQ(installed["association"], "KORVA_InstalledOS");
    EXPECT_EQ(installed["branches"][0]["association"], "KORVA_OSElementCapabilities");
    const nlohmann::json running = computer["branches"][1];
    EXPECT_EQ(running["association"], "KORVA_RunningOS");
    EXPECT_EQ(running["element"]["times"]["LastBootUpTime"], "2023-11-14T22:13:20Z");
    EXPECT_EQ(running["branches"], nlohmann::json::array());
}

TEST(Program, DescribesWhatTheSchemaDeclares) {
    const char* const other = KORVA_TEST_DATA "/cli/othermof";
    const std::vector<Words> runs = {
        {"classes"},
        {"describe", "KORVA_OperatingSystemCapabilities"},
        {"describe", "korva_operatingsystem.ENABLEDSTATE"},
        {"describe", "KORVA_OperatingSystem.FreePhysicalMemory"},
        {"describe", "KORVA_RunningOS"},
        {"describe", "KORVA_RunningOS.Dependent"},
        {"--schema", other, "classes"},
        {"--schema", other, "describe", "Device"},
        {"--schema", other, "describe", "Disk"},
        {"--schema", other, "describe", "Attached"},
        {"--schema", other, "describe", "Alarm"},
        {"--schema", other, "describe", "Disk.Id"},
        {"--schema", other, "describe", "Disk.State"},
        {"--schema", other, "describe", "Disk.Capacity"},
        {"--schema", other, "describe", "Disk.Partitions"},
        {"--schema", other, "describe", "Disk.Size"},
        {"--schema", other, "describe", "Disk.Kind"},
        {"--schema", other, "describe", "Disk.Weight"},
        {"--schema", other, "describe", "Disk.Count"},
        {"--schema", other, "describe", "Disk.RequestState"},
        // For programs.
        {"--format", "json", "classes"},
        {"--format", "json", "describe", "KORVA_InstalledOS"},
        {"--format", "json", "describe", "KORVA_OperatingSystem.FreePhysicalMemory"},
        {"--schema", other, "--format", "json", "describe", "Disk.RequestState"},
        // A file of a schema, and several of them.
        {"--schema", KORVA_TEST_DATA "/cli/othermof/Other.mof", "classes"},
        {"--schema", KORVA_SOURCE_DIR "/schema/KORVA_RunningOS.mof", "--schema", other, "classes"},
        {"--schema", KORVA_SOURCE_DIR "/schema", "--schema", other, "classes"},
        // Names that are no names of the schema.
        {"describe", "OperatingSystem"},
        {"describe", "KORVA_OperatingSystem.OSTyp"},
        {"describe", "KORVA_OperatingSystem."},
        {"describe", "Unknown"},
        {"--schema", other, "describe", "Disk.RequestStat"},
        {"describe"},
        {"namespaces"},
        {"--format", "json", "namespaces"},
        {"--registration", "/missing.reg", "namespaces"},
    };
    expectGolden(KORVA_TEST_DATA "/cli/runs/Schema.txt",
                 replaced(transcript(runs, {"TZ=UTC0"}), KORVA_SOURCE_DIR, "SOURCE"));
}

TEST(Program, BreaksLinesForATerminalAndDrawsWithAsciiWhereItHasNoUtf8) {
    const PseudoTerminal terminal;
    terminal.setColumns(45);
    const auto shown = [&](const std::string& arguments, const char* locale) {
        const ProgramRun run = runProgram(
            "/bin/sh",
            {"-c", "exec \"$0\" " + arguments + " >\"$1\"", KORVA_CMPIHOST, terminal.name()},
            {locale, "TZ=UTC0", "LD_LIBRARY_PATH=" KORVA_BINARY_DIR "/fixture-host"});
        EXPECT_EQ(run.status, 0) << run.err;
        return replaced(terminal.read(), "\r\n", "\n");
    };
    EXPECT_EQ(shown("tree", "LC_ALL=C"), R"(fixture.example (KORVA_ComputerSystem)
|-- KORVA_InstalledOS
|   `-- Fixture Linux 12.5
|       |   (KORVA_OperatingSystem):
|       |   installed 2022-04-15 05:20:00
|       |   +00:00
|       `-- KORVA_OSElementCapabilities
|           `-- Fixture Linux
|               (KORVA_OperatingSystemCapabilities):
|               name fixed, shutdown of the
|               host: No effect
`-- KORVA_RunningOS
    `-- Fixture Linux 12.5
        (KORVA_OperatingSystem): Enabled,
        health OK, up since 2023-11-14
        22:13:20 +00:00
)");
    EXPECT_THAT(shown("tree", "LC_ALL=C.UTF-8"), HasSubstr("\n├── KORVA_InstalledOS\n"));
    EXPECT_EQ(shown("ei KORVA_OperatingSystem InstallDate Status OperationalStatus", "LC_ALL=C"),
              "root/cimv2:KORVA_OperatingSystem.CSCreationClassName=\"KORVA_ComputerSystem\","
              "CSName=\"fixture.example\",CreationClassName=\"KORVA_OperatingSystem\","
              "Name=\"Fixture Linux\"\n"
              "  CSCreationClassName  KORVA_ComputerSystem\n"
              "  CSName               fixture.example\n"
              "  CreationClassName    KORVA_OperatingSystem\n"
              "  Name                 Fixture Linux\n"
              "  InstallDate          20220415052000.000000+000 (2022-04-15 05:20:00 +00:00)\n"
              "  OperationalStatus    2 (OK), 11 (In\n"
              "                       Service)\n"
              "  Status               OK\n");
}

TEST(Program, TellsHowTheLibrariesCleanedUp) {
    const Words request = withStandIn({"ein", "KORVA_OperatingSystem"});
    const ProgramRun failing = cmpihost(request, {"STAND_IN_CLEANUP=fails"});
    EXPECT_EQ(failing.status, 5);
    EXPECT_EQ(failing.err,
              "caught: cleanup answered status 1\n"
              "caught: cleanup answered status 1\n");
    const ProgramRun throwing = cmpihost(request, {"STAND_IN_CLEANUP=throws"});
    EXPECT_EQ(throwing.status, 5);
    EXPECT_EQ(throwing.err, "caught: an exception left cleanup of " KORVA_STAND_IN "\n");
}

TEST(Program, SaysThatItCannotWrite) {
    const std::string text = "cmpihost: the text cannot be written\n";
    const struct {
        const char* command;
        int status;
        std::string err;
    } rows[] = {
        {"exec \"$0\" --provider \"$1\" --name OSStatusFacade ein KORVA_OperatingSystem > "
         "/dev/full",
         1, "cmpihost: the results cannot be written\n"},
        {"exec \"$0\" --help > /dev/full", 1, text},
        {"exec \"$0\" --version > /dev/full", 1, text},
        {"exec \"$0\" --help >&-", 1, text},
        {"exec \"$0\" unknown 2> /dev/full", 2, ""},
        {"(trap '' XFSZ; ulimit -f 0; \"$0\" --provider \"$1\" --name OSStatusFacade --log ein X; "
         "echo \"status $?\") "
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

TEST(Program, ShowsTheRecordsOnlyWhenAskedTo) {
    EXPECT_EQ(cmpihost({"ei", "KORVA_OperatingSystem"}).err, "");
    const ProgramRun run = cmpihost({"--log", "ein", "KORVA_OperatingSystem"});
    EXPECT_EQ(run.status, 0);
    EXPECT_THAT(run.out, StartsWith("root/cimv2:KORVA_OperatingSystem."));
    EXPECT_THAT(run.err, HasSubstr("ENTERING: OperatingSystem_EnumInstanceNames() in "));
    EXPECT_THAT(run.err, HasSubstr("EXITING: OperatingSystem_EnumInstanceNames() in "));
    EXPECT_THAT(run.err, HasSubstr("VARIABLE: 'classId' has Value '55'"));
}

}  // namespace
