// The built program with the built facade, provider and companion, on the machine that the tests
// run on.
#include <gmock/gmock.h>

#include <nlohmann/json.hpp>

#include "host/cli/Cmpihost.h"

namespace {

using nlohmann::json;
using testing::EndsWith;
using testing::HasSubstr;
using testing::Not;
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

std::size_t count(const std::string& part, const std::string& text) {
    std::size_t found = 0;
    for (std::size_t at = text.find(part); at != std::string::npos; at = text.find(part, at + 1))
        ++found;
    return found;
}

std::string only(const Words& arguments) {
    const std::vector<std::string> found = lines(cmpihost(arguments).out);
    EXPECT_EQ(found.size(), 1U) << arguments.back();
    return found.empty() ? std::string() : found.front();
}

std::string computerPath(const std::string& name) {
    return "root/cimv2:KORVA_ComputerSystem.CreationClassName=\"KORVA_ComputerSystem\",Name=" +
           quoted(name);
}

/// The one operating system of this machine, what it is tied to, and by which paths.
class ProgramWithProvider : public testing::Test {
  protected:
    /// The lines that an operation from the operating system prints.
    std::vector<std::string> from(Words arguments) const {
        arguments.insert(arguments.begin() + 1, system_);
        const ProgramRun run = cmpihost(arguments);
        EXPECT_EQ(run.status, 0);
        EXPECT_EQ(run.err, "");
        return lines(run.out);
    }

    const std::string system_ = only({"--bare", "ein", "KORVA_OperatingSystem"});
    const std::string capabilities_ = only({"--bare", "ein", "KORVA_OperatingSystemCapabilities"});
    const std::string computer_ = computerPath(nodeName());
    const std::string running_ = "root/cimv2:KORVA_RunningOS.Antecedent=" + quoted(system_) +
                                 ",Dependent=" + quoted(computer_);
    const std::string installed_ =
        "root/cimv2:KORVA_InstalledOS.GroupComponent=" + quoted(computer_) +
        ",PartComponent=" + quoted(system_);
    const std::string element_ =
        "root/cimv2:KORVA_OSElementCapabilities.ManagedElement=" + quoted(system_) +
        ",Capabilities=" + quoted(capabilities_);
};

TEST_F(ProgramWithProvider, GetsEveryInstanceThatItNames) {
    EXPECT_THAT(system_, StartsWith("root/cimv2:KORVA_OperatingSystem.CSCreationClassName="
                                    "\"KORVA_ComputerSystem\",CSName=" +
                                    quoted(nodeName()) + ","));
    const std::pair<const char*, std::string> rows[] = {
        {"KORVA_OperatingSystem", system_},
        {"KORVA_OperatingSystemCapabilities", capabilities_},
        {"KORVA_InstalledOS", installed_},
        {"KORVA_RunningOS", running_},
        {"KORVA_OSElementCapabilities", element_}};
    for (const auto& [name, path] : rows) {
        const ProgramRun names = cmpihost({"ein", name});
        EXPECT_EQ(names.status, 0) << name;
        EXPECT_EQ(names.out, path + "\n");
        EXPECT_EQ(names.err, "") << name;
        const ProgramRun instance = cmpihost({"gi", path});
        EXPECT_EQ(instance.status, 0) << path;
        EXPECT_THAT(instance.out, StartsWith(path + "\n  "));
        EXPECT_EQ(instance.err, "") << path;
    }
}

TEST_F(ProgramWithProvider, AsksAllAssociationsWhenNoneIsNamed) {
    EXPECT_THAT(from({"ain"}), UnorderedElementsAre(computer_, capabilities_));
    EXPECT_THAT(from({"rin"}), UnorderedElementsAre(running_, installed_, element_));
    const std::string facade = KORVA_BINARY_DIR "/lib/libkorvaosstatusfacade.so.1";
    EXPECT_EQ(lines(cmpihost({"--provider", facade, "rin", system_}).out).size(), 3U);
}

TEST_F(ProgramWithProvider, HandsEveryFilterOn) {
    const struct {
        Words arguments;
        std::vector<std::string> answer;
    } rows[] = {{{"ain", "--assoc-class", "CIM_RunningOS"}, {computer_}},
                {{"ain", "--assoc-class", "KORVA_RunningOS"}, {computer_}},
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

TEST_F(ProgramWithProvider, PrintsReferencesInEveryFormat) {
    const Words filter = {system_, "--result-class", "KORVA_RunningOS"};
    const auto printed = [&](Words arguments) {
        arguments.insert(arguments.end(), filter.begin(), filter.end());
        return cmpihost(arguments).out;
    };
    EXPECT_EQ(printed({"ri"}),
              running_ + "\n  Antecedent  " + system_ + "\n  Dependent   " + computer_ + "\n");
    EXPECT_EQ(printed({"rin"}), running_ + "\n");
    for (const char* operation : {"ri", "rin"}) {
        EXPECT_EQ(printed({"--format", "mof", operation}),
                  "instance of KORVA_RunningOS {\n    Antecedent = " + quoted(system_) +
                      ";\n    Dependent = " + quoted(computer_) + ";\n};\n");
    }
    json element = {{"class", "KORVA_RunningOS"}, {"path", running_}};
    EXPECT_EQ(json::parse(printed({"--format", "json", "rin"})), json::array({element}));
    element["properties"] = {{"Antecedent", system_}, {"Dependent", computer_}};
    EXPECT_EQ(json::parse(printed({"--format", "json", "ri"})), json::array({element}));
    EXPECT_EQ(
        cmpihost({"ri", system_, "--role", "PartComponent", "--properties", ""}).out,
        installed_ + "\n  GroupComponent  " + computer_ + "\n  PartComponent   " + system_ + "\n");
}

TEST_F(ProgramWithProvider, NamesTheStatusForAnInstanceThatThereIsNot) {
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

TEST_F(ProgramWithProvider, CompletesThePathOfTheOperatingSystem) {
    // The keys alone: other values change between two requests.
    for (Words request : {Words{"gi", "KORVA_OperatingSystem", "--properties", ""},
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

TEST_F(ProgramWithProvider, NotesMisspeltNamesAndAnswersNothingAboutObjectsOfOthers) {
    const ProgramRun key = cmpihost({"gi", "KORVA_OperatingSystem.Foo=\"x\""});
    EXPECT_EQ(key.status, 1);
    EXPECT_EQ(key.out, "");
    EXPECT_THAT(key.err, HasSubstr("has no key Foo"));
    const std::string other = "CIM_Elsewhere.Name=\"x\"";
    const std::string noClass = "note: the schema has no class 'Foo'\n";
    const std::string noRole = "note: no association of the schema has a role 'Foo'\n";
    const std::pair<Words, std::string> rows[] = {
        {{"ain", "KORVA_OperatingSystem.Foo=\"x\""},
         "note: the class KORVA_OperatingSystem declares no key 'Foo'\n"},
        {{"ain", "Foo"}, noClass},
        {{"ain", system_, "--assoc-class", "Foo"}, noClass},
        {{"rin", system_, "--result-class", "Foo"}, noClass},
        {{"ri", system_, "--role", "Foo"}, noRole},
        {{"ai", system_, "--result-role", "Foo"}, noRole},
        {{"ai", other}, ""},
        {{"ain", other}, ""},
        {{"ri", other}, ""},
        {{"rin", other}, ""},
    };
    for (const auto& [arguments, note] : rows) {
        const ProgramRun run = cmpihost(arguments);
        EXPECT_EQ(run.status, 0) << note;
        EXPECT_EQ(run.out, "") << note;
        EXPECT_EQ(run.err, note);
    }
}

TEST_F(ProgramWithProvider, LeavesRefusalsAndPathsToTheBareProviderAsTheyAre) {
    const std::string hint =
        "cmpihost: CIM_ERR_INVALID_CLASS (5)\n"
        "hint: name the association with --assoc-class, one of KORVA_InstalledOS, "
        "KORVA_OSElementCapabilities, KORVA_RunningOS\n";
    const std::pair<Words, std::string> rows[] = {
        {{"ei", "KORVA_Unknown"}, "cmpihost: CIM_ERR_INVALID_CLASS (5)\n"},
        {{"ai", "KORVA_OperatingSystem"}, hint},
        {{"ain", "KORVA_OperatingSystem"}, hint},
        {{"ain", "KORVA_OperatingSystem", "--assoc-class", "CIM_RunningOS"},
         "cmpihost: CIM_ERR_INVALID_CLASS (5)\n"},
        {{"ain", "KORVA_OperatingSystem", "--assoc-class", "KORVA_RunninOS"},
         "cmpihost: CIM_ERR_INVALID_CLASS (5)\nhint: the schema has no class 'KORVA_RunninOS'\n"},
    };
    for (Words words : {Words{"gi", "KORVA_OperatingSystem"},
                        {"ain", "KORVA_OperatingSystem", "--assoc-class", "KORVA_RunningOS"}}) {
        words.insert(words.begin(), "--bare");
        const ProgramRun run = cmpihost(words);
        EXPECT_EQ(run.status, 0);
        EXPECT_NE(run.out, "");
        EXPECT_EQ(run.err, "");
    }
    for (auto [arguments, err] : rows) {
        arguments.insert(arguments.begin(), "--bare");
        const ProgramRun run = cmpihost(arguments);
        EXPECT_EQ(run.status, 1) << err;
        EXPECT_EQ(run.err, err);
    }
}

TEST_F(ProgramWithProvider, NamesOperationsThatItDoesNotSupport) {
    const std::string instance = "KORVA_OperatingSystem.Name=\"x\"";
    for (const Words& arguments : {Words{"ci", "KORVA_OperatingSystem", "Name=x"},
                                   {"mi", instance, "Version=1"},
                                   {"di", instance},
                                   {"xq", "SELECT * FROM KORVA_OperatingSystem"},
                                   {"--bare", "ci", "KORVA_OperatingSystem", "Name=x"},
                                   {"--bare", "mi", instance, "Version=1"},
                                   {"--bare", "di", instance},
                                   {"--bare", "xq", "SELECT * FROM KORVA_OperatingSystem"},
                                   {"--bare", "ri", instance},
                                   {"--bare", "rin", instance}}) {
        const ProgramRun run = cmpihost(arguments);
        EXPECT_EQ(run.status, 1) << testing::PrintToString(arguments);
        EXPECT_THAT(run.err, StartsWith("cmpihost: CIM_ERR_NOT_SUPPORTED (7)"));
        EXPECT_EQ(run.out, "");
    }
}

TEST_F(ProgramWithProvider, ShowsTheRecordsOnlyWhenAskedTo) {
    EXPECT_EQ(cmpihost({"ei", "KORVA_OperatingSystem"}).err, "");
    const ProgramRun run = cmpihost({"--log", "ei", "KORVA_OperatingSystem"});
    EXPECT_EQ(run.status, 0);
    EXPECT_THAT(run.out, StartsWith(system_ + "\n"));
    EXPECT_THAT(run.err, HasSubstr("ENTERING: OperatingSystem_EnumInstances() in "));
    EXPECT_THAT(run.err, HasSubstr("EXITING: OperatingSystem_EnumInstances() in "));
    EXPECT_THAT(run.err, HasSubstr("VARIABLE: 'classId' has Value '55'"));
}

TEST(ProgramWithCompanion, DrawsTheHost) {
    const ProgramRun run = cmpihost({"tree"});
    EXPECT_EQ(run.status, 0);
    EXPECT_EQ(run.err, "");
    EXPECT_THAT(run.out, StartsWith(nodeName() + " (KORVA_ComputerSystem)\n├── KORVA_InstalledOS\n"
                                                 "│   └── "));
    EXPECT_THAT(run.out, HasSubstr("\n│       └── KORVA_OSElementCapabilities\n│           └── "));
    EXPECT_THAT(run.out, HasSubstr("\n└── KORVA_RunningOS\n    └── "));
    for (const char* number : {"0", "1", "3"}) {
        const ProgramRun several = cmpihost({"--computer-systems", number, "tree"});
        EXPECT_EQ(several.status, 0);
        EXPECT_EQ(several.out, cmpihost({"--bare", "--computer-systems", number, "tree"}).out);
        EXPECT_EQ(count(" (KORVA_ComputerSystem)\n", several.out), std::stoul(number));
    }
    EXPECT_THAT(cmpihost({"--computer-systems", "0", "tree"}).out,
                StartsWith("no KORVA_ComputerSystem, so nothing is associated\n"));
}

TEST(ProgramWithCompanion, AnswersUpCallsWithTheComputerSystemUnlessTheHostDoes) {
    Words request = {"ai", "KORVA_OperatingSystem", "--assoc-class", "KORVA_InstalledOS"};
    const ProgramRun companion = cmpihost(request);
    EXPECT_EQ(companion.status, 0);
    EXPECT_THAT(companion.out, HasSubstr("  Name               " + nodeName() + "\n"));
    EXPECT_THAT(companion.out, HasSubstr("  NameFormat         Other\n"));
    request.insert(request.begin(), {"--computer-systems", "1"});
    const ProgramRun host = cmpihost(request);
    EXPECT_EQ(host.status, 0);
    EXPECT_THAT(host.out, HasSubstr("Name               " + nodeName() + "\n"));
    EXPECT_THAT(host.out, Not(HasSubstr("NameFormat")));
}

TEST(ProgramWithCompanion, FindsTheComputerSystemsOfTheOperatingSystemAmongSeveral) {
    const std::string first = computerPath(nodeName()) + "\n";
    const std::string second = computerPath(nodeName() + "-2") + "\n";
    const struct {
        Words arguments;
        std::string out;
    } rows[] = {
        {{"--computer-systems", "0", "ein", "KORVA_RunningOS"}, ""},
        {{"--computer-systems", "0", "ain", "KORVA_OperatingSystem", "--assoc-class",
          "KORVA_InstalledOS"},
         ""},
        // The facade reports the paired one, the provider all but the last.
        {{"--computer-systems", "3", "ain", "KORVA_OperatingSystem", "--assoc-class",
          "KORVA_RunningOS"},
         first},
        {{"--bare", "--computer-systems", "3", "ain", "KORVA_OperatingSystem", "--assoc-class",
          "KORVA_RunningOS"},
         first + second},
    };
    for (const auto& row : rows) {
        const ProgramRun run = cmpihost(row.arguments);
        EXPECT_EQ(run.status, 0);
        EXPECT_EQ(run.out, row.out);
    }
}

TEST(ProgramWithCompanion, CompletesThePathOfAComputerSystemFromTheCompanionsNames) {
    const ProgramRun run =
        cmpihost({"ain", "KORVA_ComputerSystem", "--assoc-class", "KORVA_RunningOS"});
    EXPECT_EQ(run.status, 0);
    EXPECT_THAT(run.out, StartsWith("root/cimv2:KORVA_OperatingSystem."));
    EXPECT_EQ(run.err, "cmpihost: completed the path: " + computerPath(nodeName()) + "\n");
    const ProgramRun several =
        cmpihost({"--computer-systems", "12", "ain", "KORVA_ComputerSystem"});
    EXPECT_EQ(several.status, 2);
    EXPECT_EQ(several.out, "");
    EXPECT_THAT(several.err, HasSubstr("and 12 instances of KORVA_ComputerSystem have those"));
    EXPECT_THAT(several.err, EndsWith("\n  and 2 more\n"));
}

TEST(ProgramWithCompanion, ThatDoesNotLoadExitsWithThree) {
    const ProgramRun run = cmpihost({"--companion", "/nonexistent.so", "tree"});
    EXPECT_EQ(run.status, 3);
    EXPECT_THAT(run.err, HasSubstr("/nonexistent.so"));
}

}  // namespace
