#include <algorithm>
#include <cctype>
#include <sstream>

#include "facade/FacadeFixture.h"

// What the four association operations answer, from each class of source, with each filter. In the
// tables a letter stands for an association whose pair leads on: I installed, R running,
// C capabilities; a dot for none.

namespace {

using namespace facade;

const std::string installed =
    R"(root/cimv2:KORVA_InstalledOS.GroupComponent=")"
    R"(root/cimv2:KORVA_ComputerSystem.CreationClassName=\"KORVA_ComputerSystem\",Name=\"host1\"",)"
    R"(PartComponent="root/cimv2:KORVA_OperatingSystem.CSCreationClassName=\"KORVA_ComputerSystem\",)"
    R"(CSName=\"host1\",CreationClassName=\"KORVA_OperatingSystem\",Name=\"Linux\"")";
const std::string running =
    R"(root/cimv2:KORVA_RunningOS.Antecedent=")"
    R"(root/cimv2:KORVA_OperatingSystem.CSCreationClassName=\"KORVA_ComputerSystem\",)"
    R"(CSName=\"host1\",CreationClassName=\"KORVA_OperatingSystem\",Name=\"Linux\"",)"
    R"(Dependent="root/cimv2:KORVA_ComputerSystem.CreationClassName=\"KORVA_ComputerSystem\",)"
    R"(Name=\"host1\"")";
const std::string elementCapabilities =
    R"(root/cimv2:KORVA_OSElementCapabilities.ManagedElement=")"
    R"(root/cimv2:KORVA_OperatingSystem.CSCreationClassName=\"KORVA_ComputerSystem\",)"
    R"(CSName=\"host1\",CreationClassName=\"KORVA_OperatingSystem\",Name=\"Linux\"",)"
    R"(Capabilities="root/cimv2:KORVA_OperatingSystemCapabilities.InstanceID=\"Linux\"")";

/// A class whose instance is a source, and what letters stand for from there.
struct Source {
    const char* name;
    ObjectPathValue path;
    std::string farOfInstalledOrRunning;
    std::string farOfCapabilities;
};

const Source fromOperatingSystem = {"the operating system", operatingSystemPath("host1", "Linux"),
                                    computerSystem, capabilities};
const Source fromComputerSystem = {"the computer system", computerSystemPath("host1"),
                                   operatingSystem, ""};
const Source fromCapabilities = {"the capabilities", capabilitiesPath("Linux"), "",
                                 operatingSystem};

Texts words(const std::string& text) {
    std::istringstream stream(text);
    Texts result;
    for (std::string word; stream >> word;) result.push_back(word);
    return result;
}

// "-" stands for a filter that is not given.
std::optional<std::string> given(const std::string& word) {
    return word == "-" ? std::nullopt : std::optional(word);
}

using LetterCase = int (*)(int);

std::string inCase(std::string text, LetterCase letterCase) {
    std::transform(text.begin(), text.end(), text.begin(), [letterCase](char letter) {
        return static_cast<char>(letterCase(static_cast<unsigned char>(letter)));
    });
    return text;
}

/// The filters of one request; each may be "-".
struct Filters {
    std::string associationClass;
    std::string role = "-";
    std::string farRole = "-";
    std::string farClass = "-";
};

class AssociationMatrix : public FacadeFixture {
  protected:
    // Asks with the filters as they are, in capitals and in small letters.
    void expectAnswer(const Source& source, const Filters& filters, const std::string& letters) {
        SCOPED_TRACE(std::string("from ") + source.name + ": " + filters.associationClass + " " +
                     filters.role + " " + filters.farRole + " " + filters.farClass);
        expectAnswerOfAll(source, filters, letters);
        for (const LetterCase letterCase : {&::toupper, &::tolower}) {
            const auto changed = [letterCase](const std::string& text) {
                return inCase(text, letterCase);
            };
            expectAnswerOfAll(source,
                              {changed(filters.associationClass), changed(filters.role),
                               changed(filters.farRole), changed(filters.farClass)},
                              letters);
        }
    }

    void expectAnswerOfAll(const Source& source, const Filters& filters,
                           const std::string& letters) {
        for (const Operation operation : associationOperations) {
            const bool references = ofReferences(operation);
            if (references && (filters.farRole != "-" || filters.farClass != "-")) continue;
            OperationRequest request = associationRequest(operation, source.path);
            (references ? request.resultClass : request.assocClass) =
                given(filters.associationClass);
            request.role = given(filters.role);
            request.resultRole = given(filters.farRole);
            if (!references) request.resultClass = given(filters.farClass);
            EXPECT_EQ(delivered(request), references ? pairs(letters) : farEnds(source, letters))
                << operationName(operation);
        }
    }

    static Texts pairs(const std::string& letters) {
        Texts result;
        for (const char letter : letters) {
            if (letter == 'I') result.push_back(installed);
            if (letter == 'R') result.push_back(running);
            if (letter == 'C') result.push_back(elementCapabilities);
        }
        return result;
    }

    // Two associations may lead to the same end: it comes once.
    static Texts farEnds(const Source& source, const std::string& letters) {
        Texts result;
        if (letters.find_first_of("IR") != std::string::npos)
            result.push_back(source.farOfInstalledOrRunning);
        if (letters.find('C') != std::string::npos) result.push_back(source.farOfCapabilities);
        return result;
    }
};

/// One line of a table: association classes that give the same, and the letters for each value of
/// the other filter.
struct Line {
    const char* associationClasses;
    const char* letters;
};

const char* const roles =
    "-                 GroupComponent PartComponent Antecedent Dependent ManagedElement "
    "Capabilities Element ";
const char* const installedClasses =
    "KORVA_InstalledOS CIM_InstalledOS CIM_SystemComponent CIM_Component";
const char* const runningClasses = "KORVA_RunningOS CIM_RunningOS CIM_Dependency";
const char* const capabilitiesClasses = "KORVA_OSElementCapabilities CIM_ElementCapabilities";
// A class of others, ends, and names that are parts of the right ones.
const char* const foreignClasses =
    "CIM_HostedService KORVA_OperatingSystem CIM_ManagedElement KORVA_Installed CIM_DependencyX";

/// A table: which filter its columns are, and from where.
struct Table {
    const Source& source;
    std::string Filters::*column;
    const char* values;
    std::vector<Line> lines;
};

// The classes of far ends: each end with its ancestors, the class that all have, a foreign one.
const char* const farClasses =
    "- CIM_ManagedElement KORVA_ComputerSystem CIM_ComputerSystem CIM_System "
    "CIM_EnabledLogicalElement CIM_LogicalElement CIM_ManagedSystemElement KORVA_OperatingSystem "
    "CIM_OperatingSystem KORVA_OperatingSystemCapabilities CIM_OperatingSystemCapabilities "
    "CIM_EnabledLogicalElementCapabilities CIM_Capabilities CIM_Service KORVA_RunningOS";

// clang-format off
const Table tables[] = {
    // Columns:               -  Group Part Antec Depen Manag Capab Element
    {fromOperatingSystem, &Filters::role, roles, {
        {"-",                "IRC  .    I    R     .     C     .     ."},
        {installedClasses,   "I    .    I    .     .     .     .     ."},
        {runningClasses,     "R    .    .    R     .     .     .     ."},
        {capabilitiesClasses,"C    .    .    .     .     C     .     ."},
        {foreignClasses,     ".    .    .    .     .     .     .     ."}}},
    {fromOperatingSystem, &Filters::farRole, roles, {
        {"-",                "IRC  I    .    .     R     .     C     ."},
        {installedClasses,   "I    I    .    .     .     .     .     ."},
        {runningClasses,     "R    .    .    .     R     .     .     ."},
        {capabilitiesClasses,"C    .    .    .     .     .     C     ."},
        {foreignClasses,     ".    .    .    .     .     .     .     ."}}},
    {fromComputerSystem, &Filters::role, roles, {
        {"-",                "IR   I    .    .     R     .     .     ."},
        {installedClasses,   "I    I    .    .     .     .     .     ."},
        {runningClasses,     "R    .    .    .     R     .     .     ."},
        {capabilitiesClasses,".    .    .    .     .     .     .     ."},
        {foreignClasses,     ".    .    .    .     .     .     .     ."}}},
    {fromComputerSystem, &Filters::farRole, roles, {
        {"-",                "IR   .    I    R     .     .     .     ."},
        {installedClasses,   "I    .    I    .     .     .     .     ."},
        {runningClasses,     "R    .    .    R     .     .     .     ."},
        {capabilitiesClasses,".    .    .    .     .     .     .     ."},
        {foreignClasses,     ".    .    .    .     .     .     .     ."}}},
    {fromCapabilities, &Filters::role, roles, {
        {"-",                "C    .    .    .     .     .     C     ."},
        {installedClasses,   ".    .    .    .     .     .     .     ."},
        {runningClasses,     ".    .    .    .     .     .     .     ."},
        {capabilitiesClasses,"C    .    .    .     .     .     C     ."},
        {foreignClasses,     ".    .    .    .     .     .     .     ."}}},
    {fromCapabilities, &Filters::farRole, roles, {
        {"-",                "C    .    .    .     .     C     .     ."},
        {installedClasses,   ".    .    .    .     .     .     .     ."},
        {runningClasses,     ".    .    .    .     .     .     .     ."},
        {capabilitiesClasses,"C    .    .    .     .     C     .     ."},
        {foreignClasses,     ".    .    .    .     .     .     .     ."}}},

    // Columns:               -   ME  K_CS CS Sys ELE LE  MSE K_OS OS K_Cap OSC ELEC Cap Serv K_ROS
    {fromOperatingSystem, &Filters::farClass, farClasses, {
        {"-",                "IRC IRC IR   IR IR  IR  IR  IR  .    .  C     C   C    C   .    ."},
        {installedClasses,   "I   I   I    I  I   I   I   I   .    .  .     .   .    .   .    ."},
        {runningClasses,     "R   R   R    R  R   R   R   R   .    .  .     .   .    .   .    ."},
        {capabilitiesClasses,"C   C   .    .  .   .   .   .   .    .  C     C   C    C   .    ."},
        {foreignClasses,     ".   .   .    .  .   .   .   .   .    .  .     .   .    .   .    ."}}},
    {fromComputerSystem, &Filters::farClass, farClasses, {
        {"-",                "IR  IR  .    .  .   IR  IR  IR  IR   IR .     .   .    .   .    ."},
        {installedClasses,   "I   I   .    .  .   I   I   I   I    I  .     .   .    .   .    ."},
        {runningClasses,     "R   R   .    .  .   R   R   R   R    R  .     .   .    .   .    ."},
        {capabilitiesClasses,".   .   .    .  .   .   .   .   .    .  .     .   .    .   .    ."},
        {foreignClasses,     ".   .   .    .  .   .   .   .   .    .  .     .   .    .   .    ."}}},
    {fromCapabilities, &Filters::farClass, farClasses, {
        {"-",                "C   C   .    .  .   C   C   C   C    C  .     .   .    .   .    ."},
        {installedClasses,   ".   .   .    .  .   .   .   .   .    .  .     .   .    .   .    ."},
        {runningClasses,     ".   .   .    .  .   .   .   .   .    .  .     .   .    .   .    ."},
        {capabilitiesClasses,"C   C   .    .  .   C   C   C   C    C  .     .   .    .   .    ."},
        {foreignClasses,     ".   .   .    .  .   .   .   .   .    .  .     .   .    .   .    ."}}},
};
// clang-format on

TEST_F(AssociationMatrix, IsAnsweredAsTheTablesSay) {
    for (const Table& table : tables)
        for (const Line& line : table.lines) {
            const Texts values = words(table.values);
            const Texts letters = words(line.letters);
            ASSERT_EQ(letters.size(), values.size());
            for (const std::string& associationClass : words(line.associationClasses))
                for (std::size_t column = 0; column < values.size(); ++column) {
                    Filters filters;
                    filters.associationClass = associationClass;
                    filters.*table.column = values[column];
                    expectAnswer(table.source, filters, letters[column]);
                }
        }
}

TEST_F(AssociationMatrix, FiltersTogetherMustAllAdmit) {
    struct Row {
        const Source& source;
        Filters filters;
        const char* letters;
    };
    const Row rows[] = {
        {fromOperatingSystem, {"-", "PartComponent", "GroupComponent", "CIM_System"}, "I"},
        {fromOperatingSystem, {"-", "PartComponent", "Dependent", "-"}, "."},
        {fromOperatingSystem, {"-", "Antecedent", "Dependent", "CIM_ComputerSystem"}, "R"},
        {fromOperatingSystem, {"-", "Antecedent", "Dependent", "CIM_OperatingSystem"}, "."},
        {fromOperatingSystem, {"-", "Dependent", "Antecedent", "-"}, "."},
        {fromOperatingSystem, {"CIM_Component", "-", "GroupComponent", "CIM_System"}, "I"},
        {fromOperatingSystem, {"CIM_Component", "Antecedent", "-", "-"}, "."},
        {fromOperatingSystem, {"-", "ManagedElement", "Capabilities", "CIM_Capabilities"}, "C"},
        {fromOperatingSystem, {"-", "ManagedElement", "-", "CIM_System"}, "."},
        {fromOperatingSystem, {"-", "PartComponent", "-", "CIM_ManagedElement"}, "I"},
        {fromComputerSystem, {"-", "Dependent", "Antecedent", "CIM_ManagedElement"}, "R"},
        {fromComputerSystem, {"-", "Antecedent", "Dependent", "-"}, "."},
        {fromComputerSystem, {"CIM_InstalledOS", "GroupComponent", "PartComponent", "-"}, "I"},
        {fromComputerSystem, {"CIM_InstalledOS", "GroupComponent", "GroupComponent", "-"}, "."},
        {fromCapabilities,
         {"CIM_ElementCapabilities", "Capabilities", "ManagedElement", "CIM_OperatingSystem"},
         "C"},
        {fromCapabilities, {"CIM_ElementCapabilities", "Capabilities", "Capabilities", "-"}, "."},
        {fromCapabilities, {"CIM_Dependency", "Capabilities", "ManagedElement", "-"}, "."},
    };
    for (const Row& row : rows) expectAnswer(row.source, row.filters, row.letters);
}

TEST_F(AssociationMatrix, SourcesOfOtherClassesHaveNoneAndNobodyIsAsked) {
    const std::vector<KeyBinding> operatingSystemKeys = operatingSystemPath("host1", "Linux").keys;
    const ObjectPathValue sources[] = {
        path("KORVA_InstalledOS",
             {{"GroupComponent", Value::fromReference(computerSystemPath("host1"))},
              {"PartComponent", Value::fromReference(operatingSystemPath("host1", "Linux"))}}),
        path("KORVA_RunningOS",
             {{"Antecedent", Value::fromReference(operatingSystemPath("host1", "Linux"))},
              {"Dependent", Value::fromReference(computerSystemPath("host1"))}}),
        path("KORVA_OSElementCapabilities",
             {{"ManagedElement", Value::fromReference(operatingSystemPath("host1", "Linux"))},
              {"Capabilities", Value::fromReference(capabilitiesPath("Linux"))}}),
        path("Other_OperatingSystem", operatingSystemKeys),  // might be a subclass
        path("CIM_OperatingSystem", operatingSystemKeys),
        path("CIM_ComputerSystem", computerSystemPath("host1").keys),
        path("TEST_Nothing", {{"Name", "Linux"}}),
        path("", operatingSystemKeys),
    };
    for (const ObjectPathValue& source : sources)
        for (const std::string& associationClass :
             words(std::string("- ") + installedClasses + " " + runningClasses + " " +
                   capabilitiesClasses + " " + foreignClasses)) {
            const Source nowhere = {source.className.c_str(), source, "", ""};
            expectAnswer(nowhere, {associationClass}, ".");
            expectAnswer(nowhere, {associationClass, "Antecedent"}, ".");
            for (const Operation operation : associationOperations) {
                const std::string name = associationClass == "-" ? "" : associationClass;
                EXPECT_EQ(upcalls(associationRequest(operation, source, name)), 0U);
            }
        }
}

}  // namespace
