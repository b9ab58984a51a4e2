// Every class of source through every association class, whatever the filters of the request say: a
// client may ask from any object, and the provider answers by its class alone.
#include "library/AssociationsFixture.h"

namespace {

using namespace associations;

/// The far ends of one source through each of the three associations, and the message that the
/// capabilities' association leaves in their place.
struct Row {
    ObjectPathValue source;
    Texts ofInstalled;
    Texts ofRunning;
    Texts ofCapabilities;
    std::string message = "";
};

Value ref(const ObjectPathValue& path) {
    return Value::fromReference(path);
}

std::vector<Row> rows() {
    const Value computer = ref(computerSystemPath("host1"));
    const Value system = ref(operatingSystemPath("host1", "os2"));
    const Value abilities = ref(capabilitiesPath("os2"));
    const char* const element = "KORVA_OSElementCapabilities";
    const Texts systems = {"os1", "os2", "os3"};
    return {
        {path("KORVA_ComputerSystem"), systems, systems, {}},
        {computerSystemPath("host1"), systems, systems, {}},
        {computerSystemPath("host2"), {}, {}, {}},
        {path("KORVA_OperatingSystem"), {"cs1"}, {"cs1"}, systems},
        {operatingSystemPath("host1", "os2"), {"cs1"}, {"cs1"}, systems},
        {path("KORVA_OperatingSystemCapabilities"), {}, {}, systems},
        {capabilitiesPath("os2"), {}, {}, {"os2"}},
        {path("KORVA_InstalledOS"), {}, {}, {}},
        {path("KORVA_InstalledOS", {{"GroupComponent", computer}, {"PartComponent", system}}),
         {},
         {},
         {}},
        {path("KORVA_RunningOS"), {}, {}, {}},
        {path("KORVA_RunningOS", {{"Antecedent", system}, {"Dependent", computer}}), {}, {}, {}},
        {path(element), {}, {}, {}},
        {path(element, {{"ManagedElement", system}, {"Capabilities", abilities}}), {}, {}, {}},
        {path(element, {{"ManagedElement", system}, {"Capabilities", ref(capabilitiesPath("x"))}}),
         {},
         {},
         {},
         "Object Not Found."},
        {path(element, {{"Name", "x"}}), {}, {}, {}, "Object Not Found."},
        {path("KORVA_Unknown"), {}, {}, {}},
        {path("CIM_OperatingSystem", {{"Name", "x"}}), {}, {}, {}},
        {path("", {{"Name", "x"}}), {}, {}, {}},
        {path("KORVA_Unknown", {{"Name", "host1"}, {"InstanceID", "os2"}}), {}, {}, {}},
    };
}

/// Filters of a request; none: null.
struct Filters {
    std::optional<std::string> resultClass;
    std::optional<std::string> role;
    std::optional<std::string> resultRole;
};

class Sources : public Associations {
  protected:
    Sources() { populate(3, 1); }

    Texts farEndsFiltered(Operation operation, const Row& row, const Association& association,
                          const Filters& filters, const std::string& message) {
        OperationRequest request = requestFor(operation, row.source, association.className);
        request.resultClass = filters.resultClass;
        request.role = filters.role;
        request.resultRole = filters.resultRole;
        recording::clear();
        const Outcome outcome = invoke(request);
        expectEnd(outcome, message);
        Texts result = briefs(outcome.paths);
        for (const std::string& each : briefs(outcome.instances)) result.push_back(each);
        return result;
    }
};

TEST_F(Sources, OfEveryClassHaveTheirFarEndsWhateverResultClassAndRolesSay) {
    const Filters none = {};
    const Filters wrong = {"KORVA_Contradicting", "NoSuchRole", "NoSuchRole"};
    const Filters reversed = {"KORVA_RunningOS", "Dependent", "Antecedent"};
    const Filters empty = {"", "", ""};
    for (const Row& row : rows()) {
        for (const Filters& filters : {none, wrong, reversed, empty}) {
            for (const Operation operation : {Operation::AssociatorNames, Operation::Associators}) {
                EXPECT_EQ(farEndsFiltered(operation, row, installed, filters, ""), row.ofInstalled)
                    << toString(row.source);
                EXPECT_EQ(farEndsFiltered(operation, row, running, filters, ""), row.ofRunning)
                    << toString(row.source);
                EXPECT_EQ(farEndsFiltered(operation, row, capabilities, filters, row.message),
                          row.ofCapabilities)
                    << toString(row.source);
            }
        }
    }
}

}  // namespace
