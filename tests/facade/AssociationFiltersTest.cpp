#include <algorithm>
#include <cctype>
#include <sstream>

#include "facade/FacadeFixture.h"

// What the four association operations answer, from each class of source, with each filter. In the
// tables a letter stands for an association whose pair leads on: I installed, R running,
// C capabilities; a dot for none.

namespace {

using namespace facade;

const ObjectPathValue system = operatingSystemPath("host1", "Linux");
const ObjectPathValue computer = computerSystemPath("host1");
const std::string installed = toString(pairPath(installedOS, computer, system));
const std::string running = toString(pairPath(runningOS, system, computer));
const std::string ofCapabilities =
    toString(pairPath(elementCapabilities, system, capabilitiesPath("Linux")));

/// A class whose instance is a source, and what letters stand for from there.
struct Source {
    const char* name;
    ObjectPathValue path;
    std::string farOfInstalledOrRunning;
    std::string farOfCapabilities;
};

const Source fromOperatingSystem = {"the operating system", system, computerSystem, capabilities};
const Source fromComputerSystem = {"the computer system", computer, operatingSystem, ""};
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

class AssociationFilters : public FacadeFixture {
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
            if (letter == 'C') result.push_back(ofCapabilities);
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

const char* const roles =
    "- GroupComponent PartComponent Antecedent Dependent ManagedElement Capabilities Element";
// The classes of far ends: each end with its ancestors, the class that all have, a foreign one.
const char* const farClasses =
    "- CIM_ManagedElement KORVA_ComputerSystem CIM_ComputerSystem CIM_System "
    "CIM_EnabledLogicalElement CIM_LogicalElement CIM_ManagedSystemElement KORVA_OperatingSystem "
    "CIM_OperatingSystem KORVA_OperatingSystemCapabilities CIM_OperatingSystemCapabilities "
    "CIM_EnabledLogicalElementCapabilities CIM_Capabilities CIM_Service KORVA_RunningOS";

/// Association classes, and the associations that each of them admits.
const std::pair<const char*, const char*> associationClasses[] = {
    {"-", "IRC"},
    {"KORVA_InstalledOS CIM_InstalledOS CIM_SystemComponent CIM_Component", "I"},
    {"KORVA_RunningOS CIM_RunningOS CIM_Dependency", "R"},
    {"KORVA_OSElementCapabilities CIM_ElementCapabilities", "C"},
    // A class of others, ends, and names that are parts of the right ones.
    {"CIM_HostedService KORVA_OperatingSystem CIM_ManagedElement KORVA_Installed CIM_DependencyX",
     ""},
};

/// Where from, which other filter, its values, and what each of them admits.
struct Line {
    const Source& source;
    std::string Filters::*filter;
    const char* values;
    const char* letters;
};

// clang-format off
const Line lines[] = {
    //                                             -   Group Part Antec Depen Manag Capab Element
    {fromOperatingSystem, &Filters::role,    roles, "IRC .     I    R     .     C     .     ."},
    {fromOperatingSystem, &Filters::farRole, roles, "IRC I     .    .     R     .     C     ."},
    {fromComputerSystem,  &Filters::role,    roles, "IR  I     .    .     R     .     .     ."},
    {fromComputerSystem,  &Filters::farRole, roles, "IR  .     I    R     .     .     .     ."},
    {fromCapabilities,    &Filters::role,    roles, "C   .     .    .     .     .     C     ."},
    {fromCapabilities,    &Filters::farRole, roles, "C   .     .    .     .     C     .     ."},
    //   -   ME  K_CS CS  Sys ELE LE  MSE K_OS OS  K_Cap OSC ELEC Cap Serv K_ROS
    {fromOperatingSystem, &Filters::farClass, farClasses,
        "IRC IRC IR   IR  IR  IR  IR  IR  .    .   C     C   C    C   .    ."},
    {fromComputerSystem, &Filters::farClass, farClasses,
        "IR  IR  .    .   .   IR  IR  IR  IR   IR  .     .   .    .   .    ."},
    {fromCapabilities, &Filters::farClass, farClasses,
        "C   C   .    .   .   C   C   C   C    C   .     .   .    .   .    ."},
};
// clang-format on

// The letters that both have.
std::string common(const std::string& left, const std::string& right) {
    std::string result;
    for (const char letter : left)
        if (right.find(letter) != std::string::npos) result += letter;
    return result;
}

TEST_F(AssociationFilters, AdmitWhatTheTablesSay) {
    for (const Line& line : lines) {
        const Texts values = words(line.values);
        const Texts letters = words(line.letters);
        ASSERT_EQ(letters.size(), values.size());
        for (const auto& [classes, admitted] : associationClasses)
            for (const std::string& associationClass : words(classes))
                for (std::size_t column = 0; column < values.size(); ++column) {
                    Filters filters;
                    filters.associationClass = associationClass;
                    filters.*line.filter = values[column];
                    expectAnswer(line.source, filters, common(letters[column], admitted));
                }
    }
}

TEST_F(AssociationFilters, MustAllAdmit) {
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

TEST_F(AssociationFilters, AdmitNothingFromOtherClassesAndNobodyIsAsked) {
    const ObjectPathValue sources[] = {
        pairPath(installedOS, computer, system),
        pairPath(runningOS, system, computer),
        pairPath(elementCapabilities, system, capabilitiesPath("Linux")),
        path("Other_OperatingSystem", system.keys),  // might be a subclass
        path("CIM_OperatingSystem", system.keys),
        path("CIM_ComputerSystem", computer.keys),
        path("TEST_Nothing", {{"Name", "Linux"}}),
        path("", system.keys),
    };
    for (const ObjectPathValue& source : sources)
        for (const auto& row : associationClasses)
            for (const std::string& associationClass : words(row.first)) {
                const Source nowhere = {source.className.c_str(), source, "", ""};
                expectAnswer(nowhere, {associationClass}, ".");
                expectAnswer(nowhere, {associationClass, "Antecedent"}, ".");
                for (const Operation operation : associationOperations) {
                    const std::string name = associationClass == "-" ? "" : associationClass;
                    EXPECT_EQ(upcalls(associationRequest(operation, source, name)), 0U);
                }
            }
}

// A question to the object manager for computer systems is the expensive part.
TEST_F(AssociationFilters, CostOneUpcallForAnAssociationWithComputersAndOneForTheirInstances) {
    struct Row {
        ObjectPathValue source;
        const char* associationClass;
        unsigned associatorNames, associators, referenceNames, references;
    };
    const Row rows[] = {
        {system, "KORVA_InstalledOS", 1, 2, 1, 1},
        {system, "CIM_Dependency", 1, 2, 1, 1},
        {system, "KORVA_OSElementCapabilities", 0, 0, 0, 0},
        {system, "", 2, 3, 2, 2},
        {computer, "KORVA_RunningOS", 1, 1, 1, 1},
        {computer, "", 2, 2, 2, 2},
        {computer, "KORVA_OSElementCapabilities", 0, 0, 0, 0},
        {capabilitiesPath("Linux"), "", 0, 0, 0, 0},
        {system, "CIM_HostedService", 0, 0, 0, 0},
        {operatingSystemPath("host1", "unknown"), "KORVA_RunningOS", 1, 1, 1, 1},
        {path("KORVA_OperatingSystem", {{"Name", "Linux"}}), "", 0, 0, 0, 0},
        {path("TEST_Thing", {{"Name", "x"}}), "", 0, 0, 0, 0},
    };
    for (const Row& row : rows) {
        const auto made = [&](Operation operation) {
            return upcalls(associationRequest(operation, row.source, row.associationClass));
        };
        SCOPED_TRACE(toString(row.source) + " " + row.associationClass);
        EXPECT_EQ(made(Operation::AssociatorNames), row.associatorNames);
        EXPECT_EQ(made(Operation::Associators), row.associators);
        EXPECT_EQ(made(Operation::ReferenceNames), row.referenceNames);
        EXPECT_EQ(made(Operation::References), row.references);
    }
}

}  // namespace
