// The built program with the built facade and the provider behind it, on the machine that the tests
// run on.
#include <gmock/gmock.h>
#include <sys/utsname.h>

#include <nlohmann/json.hpp>

#include "support/ProgramRun.h"

namespace {

using nlohmann::json;
using testing::HasSubstr;
using testing::StartsWith;
using testing::UnorderedElementsAre;

/// A text in quotes, as MOF and paths write it.
std::string quoted(const std::string& text) {
    std::string result = "\"";
    for (const char character : text) {
        result += character == '"' || character == '\\' ? "\\" : "";
        result += character;
    }
    return result + "\"";
}

/// What the one operating system of this machine is tied to, and by which paths.
class ProgramWithFacade : public testing::Test {
  protected:
    static ProgramRun cmpihost(const std::vector<std::string>& arguments) {
        return runProgram(KORVA_CMPIHOST, arguments);
    }
    static std::string only(const std::vector<std::string>& arguments) {
        const std::vector<std::string> found = lines(cmpihost(arguments).out);
        EXPECT_EQ(found.size(), 1U) << arguments.back();
        return found.empty() ? std::string() : found.front();
    }
    static std::string nodeName() {
        utsname names{};
        uname(&names);
        return names.nodename;
    }
    /// The lines that an operation from the operating system prints.
    std::vector<std::string> from(std::vector<std::string> arguments) const {
        arguments.insert(arguments.begin() + 1, system_);
        const ProgramRun run = cmpihost(arguments);
        EXPECT_EQ(run.status, 0);
        EXPECT_EQ(run.err, "");
        return lines(run.out);
    }

    const std::string system_ = only({"--bare", "ein", "KORVA_OperatingSystem"});
    const std::string capabilities_ = only({"--bare", "ein", "KORVA_OperatingSystemCapabilities"});
    const std::string computer_ =
        "root/cimv2:KORVA_ComputerSystem.CreationClassName=\"KORVA_ComputerSystem\",Name=" +
        quoted(nodeName());
    const std::string running_ = "root/cimv2:KORVA_RunningOS.Antecedent=" + quoted(system_) +
                                 ",Dependent=" + quoted(computer_);
    const std::string installed_ =
        "root/cimv2:KORVA_InstalledOS.GroupComponent=" + quoted(computer_) +
        ",PartComponent=" + quoted(system_);
    const std::string element_ =
        "root/cimv2:KORVA_OSElementCapabilities.ManagedElement=" + quoted(system_) +
        ",Capabilities=" + quoted(capabilities_);
};

TEST_F(ProgramWithFacade, AsksAllAssociationsWhenNoneIsNamed) {
    EXPECT_THAT(from({"ain"}), UnorderedElementsAre(computer_, capabilities_));
    EXPECT_THAT(from({"rin"}), UnorderedElementsAre(running_, installed_, element_));
}

TEST_F(ProgramWithFacade, HandsEveryFilterOn) {
    const struct {
        std::vector<std::string> arguments;
        std::vector<std::string> answer;
    } rows[] = {{{"ain", "--assoc-class", "CIM_RunningOS"}, {computer_}},
                {{"ain", "--result-class", "KORVA_OperatingSystemCapabilities"}, {capabilities_}},
                {{"ain", "--role", "ManagedElement"}, {capabilities_}},
                {{"ain", "--result-role", "Dependent"}, {computer_}},
                {{"ain", "--result-role", "Antecedent"}, {}},
                {{"ain", "--assoc-class", "CIM_Elsewhere"}, {}},
                {{"rin", "--result-class", "KORVA_InstalledOS"}, {installed_}},
                {{"rin", "--role", "Antecedent"}, {running_}},
                {{"rin", "--role", "Dependent"}, {}}};
    for (const auto& row : rows) {
        EXPECT_EQ(from(row.arguments), row.answer) << row.arguments[1] << ' ' << row.arguments[2];
    }
}

TEST_F(ProgramWithFacade, PrintsReferencesAsATable) {
    EXPECT_EQ(cmpihost({"ri", system_, "--result-class", "KORVA_RunningOS"}).out,
              running_ + "\n  Antecedent  " + system_ + "\n  Dependent   " + computer_ + "\n");
    EXPECT_EQ(cmpihost({"rin", system_, "--result-class", "KORVA_RunningOS"}).out, running_ + "\n");
}

TEST_F(ProgramWithFacade, PrintsReferencesAsMof) {
    const std::string declaration =
        "instance of KORVA_RunningOS {\n    Antecedent = " + quoted(system_) +
        ";\n    Dependent = " + quoted(computer_) + ";\n};\n";
    for (const char* operation : {"ri", "rin"}) {
        EXPECT_EQ(cmpihost({"--format", "mof", operation, system_, "--role", "Antecedent"}).out,
                  declaration);
    }
}

TEST_F(ProgramWithFacade, PrintsReferencesAsJson) {
    json element = {{"class", "KORVA_RunningOS"}, {"path", running_}};
    EXPECT_EQ(json::parse(cmpihost({"--format", "json", "rin", system_, "--result-class",
                                    "KORVA_RunningOS"})
                              .out),
              json::array({element}));
    element["properties"] = {{"Antecedent", system_}, {"Dependent", computer_}};
    EXPECT_EQ(
        json::parse(
            cmpihost({"--format", "json", "ri", system_, "--result-class", "KORVA_RunningOS"}).out),
        json::array({element}));
}

TEST_F(ProgramWithFacade, PrintsTheListedPropertiesAndTheKeys) {
    const ProgramRun run = cmpihost({"ri", system_, "--role", "PartComponent", "--properties", ""});
    EXPECT_EQ(run.out, installed_ + "\n  GroupComponent  " + computer_ + "\n  PartComponent   " +
                           system_ + "\n");
}

TEST_F(ProgramWithFacade, NamesTheStatusForAnInstanceThatThereIsNot) {
    const std::string stranger =
        "KORVA_OperatingSystem.CSCreationClassName=\"KORVA_ComputerSystem\",CSName=" +
        quoted(nodeName()) + ",CreationClassName=\"KORVA_OperatingSystem\",Name=\"nothing\"";
    const ProgramRun run = cmpihost({"gi", stranger});
    EXPECT_EQ(run.status, 1);
    EXPECT_EQ(run.out, "");
    EXPECT_THAT(run.err, StartsWith("cmpihost: CIM_ERR_NOT_FOUND (6): "));
    const ProgramRun bare = cmpihost({"--bare", "gi", stranger});
    EXPECT_EQ(bare.status, 0);
    EXPECT_EQ(bare.out, "");
    EXPECT_EQ(bare.err,
              "note: no instance was returned; an object manager answers CIM_ERR_NOT_FOUND (6)\n");
}

TEST_F(ProgramWithFacade, CompletesThePathOfTheOperatingSystem) {
    // The keys alone: other values change between two requests.
    for (std::vector<std::string> request :
         {std::vector<std::string>{"gi", "KORVA_OperatingSystem", "--properties", ""},
          {"ai", "KORVA_OperatingSystem", "--properties", ""},
          {"ain", "KORVA_OperatingSystem"},
          {"ri", "KORVA_OperatingSystem", "--properties", ""},
          {"rin", "KORVA_OperatingSystem"}}) {
        const ProgramRun run = cmpihost(request);
        EXPECT_EQ(run.status, 0) << request[0];
        EXPECT_NE(run.out, "") << request[0];
        EXPECT_EQ(run.err, "cmpihost: completed the path: " + system_ + "\n") << request[0];
        request[1] = system_;
        EXPECT_EQ(cmpihost(request).out, run.out) << request[0];
    }
}

TEST_F(ProgramWithFacade, TellsAMisspeltKeyFromAMissingOne) {
    const ProgramRun run = cmpihost({"gi", "KORVA_OperatingSystem.Foo=\"x\""});
    EXPECT_EQ(run.status, 1);
    EXPECT_EQ(run.out, "");
    EXPECT_THAT(run.err, HasSubstr("has no key Foo"));
    EXPECT_EQ(cmpihost({"ain", "KORVA_OperatingSystem.Foo=\"x\""}).err,
              "note: the class KORVA_OperatingSystem declares no key 'Foo'\n");
}

TEST_F(ProgramWithFacade, NotesTheMisspeltNamesOfAnAssociationRequest) {
    const struct {
        std::vector<std::string> arguments;
        const char* note;
    } rows[] = {
        {{"ain", "KORVA_OperatingSytem"}, "the schema has no class 'KORVA_OperatingSytem'"},
        {{"ain", system_, "--assoc-class", "Foo"}, "the schema has no class 'Foo'"},
        {{"rin", system_, "--result-class", "Foo"}, "the schema has no class 'Foo'"},
        {{"ri", system_, "--role", "Foo"}, "no association of the schema has a role 'Foo'"},
        {{"ai", system_, "--result-role", "Foo"}, "no association of the schema has a role 'Foo'"},
    };
    for (const auto& row : rows) {
        const ProgramRun run = cmpihost(row.arguments);
        EXPECT_EQ(run.status, 0) << row.note;
        EXPECT_EQ(run.out, "") << row.note;
        EXPECT_EQ(run.err, "note: " + std::string(row.note) + "\n");
    }
}

TEST_F(ProgramWithFacade, AnswersNothingAboutObjectsOfOthers) {
    for (const char* operation : {"ai", "ain", "ri", "rin"}) {
        const ProgramRun run = cmpihost({operation, "CIM_Elsewhere.Name=\"x\""});
        EXPECT_EQ(run.status, 0) << operation;
        EXPECT_EQ(run.out, "") << operation;
        EXPECT_EQ(run.err, "") << operation;
    }
}

TEST_F(ProgramWithFacade, IsTheLibraryThatIsAskedWhenItsFileIsNamed) {
    const std::string facade = KORVA_BINARY_DIR "/lib/libkorvaosstatusfacade.so.1";
    const ProgramRun run = cmpihost({"--provider", facade, "rin", system_});
    EXPECT_EQ(run.status, 0);
    EXPECT_EQ(lines(run.out).size(), 3U);
}

}  // namespace
