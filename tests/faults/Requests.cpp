#include "faults/Requests.h"

#include "library/LibraryFixture.h"

using namespace cmpihost;

namespace {

struct Kind {
    Operation operation;
    const char* name;
};

constexpr Kind enumerations[] = {{Operation::EnumerateInstanceNames, "EnumInstanceNames"},
                                 {Operation::EnumerateInstances, "EnumInstances"}};
constexpr Kind get = {Operation::GetInstance, "GetInstance"};
constexpr Kind walks[] = {{Operation::AssociatorNames, "AssociatorNames"},
                          {Operation::Associators, "Associators"}};
constexpr Kind refusals[] = {
    {Operation::CreateInstance, "CreateInstance"}, {Operation::ModifyInstance, "ModifyInstance"},
    {Operation::DeleteInstance, "DeleteInstance"}, {Operation::ExecQuery, "ExecQuery"},
    {Operation::References, "References"},         {Operation::ReferenceNames, "ReferenceNames"}};

constexpr const char* installed = "KORVA_InstalledOS";
constexpr const char* running = "KORVA_RunningOS";
constexpr const char* element = "KORVA_OSElementCapabilities";

// "KORVA_RunningOS" as it stands in the name of a request.
std::string shortName(const std::string& className) {
    return className.substr(std::string("KORVA_").size());
}

ObjectPathValue pair(const char* association, const char* first, const ObjectPathValue& firstEnd,
                     const char* second, const ObjectPathValue& secondEnd) {
    return path(association, {{first, Value::fromReference(firstEnd)},
                              {second, Value::fromReference(secondEnd)}});
}

class Table {
  public:
    void add(const Kind& kind, const std::string& suffix, const ObjectPathValue& asked,
             const char* association = nullptr, const std::string& message = "") {
        OperationRequest request;
        request.operation = kind.operation;
        request.path = asked;
        if (association != nullptr) request.assocClass = association;
        rows.push_back(
            {kind.name + suffix, std::string("OperatingSystem_") + kind.name, request, message});
    }

    std::vector<NamedRequest> rows;
};

const char* const classes[] = {"KORVA_OperatingSystem", "KORVA_OperatingSystemCapabilities",
                               installed, running, element};

std::vector<NamedRequest> served() {
    const ObjectPathValue system = operatingSystemPath("host1", "Linux");
    const ObjectPathValue other = operatingSystemPath("host1", "other");
    const ObjectPathValue computer = computerSystemPath("host1");
    Table table;
    for (const Kind& kind : enumerations)
        for (const char* className : classes)
            table.add(kind, "Of" + shortName(className), path(className));
    table.add(get, "OfOperatingSystem", other);
    table.add(get, "OfUnknownName", operatingSystemPath("host1", "unknown"));
    table.add(get, "OfOperatingSystemCapabilities", capabilitiesPath("other"));
    table.add(get, "OfInstalledOS",
              pair(installed, "GroupComponent", computer, "PartComponent", system));
    table.add(get, "OfRunningOS", pair(running, "Antecedent", system, "Dependent", computer));
    table.add(get, "OfOSElementCapabilities",
              pair(element, "ManagedElement", system, "Capabilities", capabilitiesPath("Linux")));
    table.add(get, "OfContradictingPair",
              pair(element, "ManagedElement", system, "Capabilities", capabilitiesPath("other")),
              nullptr, "Object Not Found.");
    for (const Kind& kind : walks) {
        for (const char* association : {installed, running}) {
            const std::string through = "Through" + shortName(association);
            table.add(kind, "OfComputer" + through, computer, association);
            table.add(kind, "OfSystem" + through, system, association);
            table.add(kind, "OfSystemClass" + through, path("KORVA_OperatingSystem"), association);
            table.add(kind, "OfUnrelatedSource" + through, capabilitiesPath("Linux"), association);
            table.add(kind, "OfSourceWithoutItsKey" + through,
                      path("KORVA_ComputerSystem", {{"CreationClassName", "KORVA_ComputerSystem"}}),
                      association, "Could not find 'Name' Key in Moniker");
        }
        table.add(kind, "OfSystemThroughOSElementCapabilities", system, element);
        table.add(kind, "OfCapabilitiesThroughOSElementCapabilities", capabilitiesPath("Linux"),
                  element);
        table.add(kind, "OfUnrelatedSourceThroughOSElementCapabilities", computer, element);
    }
    return std::move(table.rows);
}

std::vector<NamedRequest> refused() {
    Table table;
    for (const Kind& kind : refusals)
        for (const char* className : classes)
            table.add(kind, "Of" + shortName(className), path(className));
    for (NamedRequest& row : table.rows) {
        row.request.instance.path = row.request.path;
        row.request.query = "SELECT * FROM " + row.request.path.className;
    }
    return std::move(table.rows);
}

constexpr Kind references[] = {{Operation::ReferenceNames, "ReferenceNames"},
                               {Operation::References, "References"}};

// What only the facade answers: references, associators through any class, property lists.
std::vector<NamedRequest> answeredByFacade() {
    const ObjectPathValue sources[] = {operatingSystemPath("host1", "Linux"),
                                       computerSystemPath("host1"), capabilitiesPath("other")};
    Table table;
    for (const ObjectPathValue& source : sources) {
        const std::string from = "From" + shortName(source.className);
        for (const Kind& kind : walks) table.add(kind, from, source);
        for (const Kind& kind : references)
            for (const char* association : {"", installed, running, element}) {
                table.add(kind, from + association, source);
                if (*association != '\0') table.rows.back().request.resultClass = association;
            }
    }
    for (const Kind& kind : {get, enumerations[1], walks[1], references[1]}) {
        const ObjectPathValue& source = sources[0];
        table.add(kind, "WithAPropertyList", source);
        table.rows.back().request.properties = std::vector<std::string>{"OSType", "InstanceID"};
    }
    return std::move(table.rows);
}

std::vector<NamedRequest> ofFacade() {
    std::vector<NamedRequest> all = answeredByFacade();
    for (const auto* rows : {&servedRequests(), &refusedRequests()})
        all.insert(all.end(), rows->begin(), rows->end());
    for (NamedRequest& row : all) {
        row.handler.replace(0, row.handler.find('_'), "OSStatusFacade");
        row.message.clear();
    }
    return all;
}

std::vector<NamedRequest> strange() {
    Table table;
    const ObjectPathValue computer = computerSystemPath("host1");
    for (const Kind& kind : enumerations) table.add(kind, "OfComputerSystem", computer);
    table.add(get, "OfComputerSystem", computer);
    for (const Kind& kind : walks) {
        table.add(kind, "ThroughOperatingSystem", computer, "KORVA_OperatingSystem");
        table.add(kind, "ThroughNoClass", computer);
    }
    return std::move(table.rows);
}

}  // namespace

std::ostream& operator<<(std::ostream& out, const NamedRequest& request) {
    return out << request.name;
}

const std::vector<NamedRequest>& servedRequests() {
    static const std::vector<NamedRequest> all = served();
    return all;
}

const std::vector<std::string>& servingHandlers() {
    static const std::vector<std::string> all = {
        "OperatingSystem_EnumInstanceNames", "OperatingSystem_EnumInstances",
        "OperatingSystem_GetInstance", "OperatingSystem_AssociatorNames",
        "OperatingSystem_Associators"};
    return all;
}

const std::vector<NamedRequest>& refusedRequests() {
    static const std::vector<NamedRequest> all = refused();
    return all;
}

const std::vector<NamedRequest>& strangeRequests() {
    static const std::vector<NamedRequest> all = strange();
    return all;
}

const std::vector<NamedRequest>& facadeRequests() {
    static const std::vector<NamedRequest> all = ofFacade();
    return all;
}

const std::vector<std::string>& facadeHandlers() {
    static const std::vector<std::string> all = {
        "OSStatusFacade_EnumInstanceNames", "OSStatusFacade_EnumInstances",
        "OSStatusFacade_GetInstance",       "OSStatusFacade_AssociatorNames",
        "OSStatusFacade_Associators",       "OSStatusFacade_ReferenceNames",
        "OSStatusFacade_References",        "OSStatusFacade_CreateInstance",
        "OSStatusFacade_ModifyInstance",    "OSStatusFacade_DeleteInstance",
        "OSStatusFacade_ExecQuery"};
    return all;
}

std::vector<NamedRequest> requestsOf(const std::string& handler) {
    std::vector<NamedRequest> found;
    for (const auto* rows : {&servedRequests(), &facadeRequests()})
        for (const NamedRequest& row : *rows)
            if (row.handler == handler) found.push_back(row);
    return found;
}
