// The requests by name. A new operation or class belongs here: it then meets every fault, leaves a
// sequence of records, and is measured.
#include "support/Requests.h"

#include <algorithm>
#include <utility>

#include "host/mof/Schema.h"

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
constexpr Kind references[] = {{Operation::ReferenceNames, "ReferenceNames"},
                               {Operation::References, "References"}};
constexpr Kind refusals[] = {
    {Operation::CreateInstance, "CreateInstance"}, {Operation::ModifyInstance, "ModifyInstance"},
    {Operation::DeleteInstance, "DeleteInstance"}, {Operation::ExecQuery, "ExecQuery"},
    {Operation::References, "References"},         {Operation::ReferenceNames, "ReferenceNames"}};

constexpr const char* installed = installedOS.className;
constexpr const char* running = runningOS.className;
constexpr const char* element = elementCapabilities.className;

constexpr const char* classes[] = {"KORVA_OperatingSystem", "KORVA_OperatingSystemCapabilities",
                                   installed, running, element};

// "RunningOS", as it stands in the name of a request.
std::string shortName(const std::string& className) {
    return className.substr(std::string("KORVA_").size());
}

class Table {
  public:
    NamedRequest& add(const Kind& kind, const std::string& suffix, const ObjectPathValue& asked,
                      const std::string& association = "", const std::string& message = "") {
        rows.push_back({kind.name + suffix, std::string("OperatingSystem_") + kind.name,
                        requestFor(kind.operation, asked, association), message});
        return rows.back();
    }

    void addPlain(const Kind& kind, const std::string& suffix, const ObjectPathValue& asked,
                  const std::string& association = "") {
        add(kind, suffix, asked, association).plain = true;
    }

    std::vector<NamedRequest> rows;
};

void append(std::vector<NamedRequest>& all, const std::vector<NamedRequest>& more) {
    all.insert(all.end(), more.begin(), more.end());
}

// What only the facade answers: references, associators through any class, property lists.
std::vector<NamedRequest> answeredByFacade(const HostNames& names) {
    const ObjectPathValue sources[] = {operatingSystemPath(names.computer, names.system),
                                       computerSystemPath(names.computer),
                                       capabilitiesPath(names.other)};
    Table table;
    for (const ObjectPathValue& source : sources) {
        const std::string from = "From" + shortName(source.className);
        for (const Kind& kind : walks) table.add(kind, from, source);
        for (const Kind& kind : references)
            for (const std::string association : {"", installed, running, element}) {
                NamedRequest& row = table.add(kind, from + association, source);
                if (!association.empty()) row.request.resultClass = association;
            }
    }
    for (const Kind& kind : {get, enumerations[1], walks[1], references[1]})
        table.add(kind, "WithAPropertyList", sources[0]).request.properties =
            std::vector<std::string>{"OSType", "InstanceID"};
    return std::move(table.rows);
}

}  // namespace

const ClassCatalogue& schemaCatalogue() {
    static const Schema schema = Schema::load(KORVA_SOURCE_DIR "/schema");
    static const SchemaCatalogue catalogue(schema);
    // It keeps what it is asked for; a test of leaks would take that for a provider's.
    static const bool filled = [] {
        for (const std::string& name : schema.classNames()) catalogue.find(name);
        return true;
    }();
    static_cast<void>(filled);
    return catalogue;
}

ObjectPathValue path(const std::string& className, std::vector<KeyBinding> keys) {
    return {"root/cimv2", className, std::move(keys)};
}

ObjectPathValue operatingSystemPath(const std::string& csName, const std::string& name) {
    return path("KORVA_OperatingSystem", {{"CSCreationClassName", "KORVA_ComputerSystem"},
                                          {"CSName", csName},
                                          {"CreationClassName", "KORVA_OperatingSystem"},
                                          {"Name", name}});
}

ObjectPathValue capabilitiesPath(const std::string& instanceId) {
    return path("KORVA_OperatingSystemCapabilities", {{"InstanceID", instanceId}});
}

ObjectPathValue computerSystemPath(const std::string& name) {
    return path("KORVA_ComputerSystem",
                {{"CreationClassName", "KORVA_ComputerSystem"}, {"Name", name}});
}

ObjectPathValue pairPath(const Association& association, const ObjectPathValue& first,
                         const ObjectPathValue& second) {
    return path(association.className, {{association.first, Value::fromReference(first)},
                                        {association.second, Value::fromReference(second)}});
}

OperationRequest requestFor(Operation operation, const ObjectPathValue& path,
                            const std::string& assocClass) {
    OperationRequest request;
    request.operation = operation;
    request.path = path;
    if (!assocClass.empty()) request.assocClass = assocClass;
    return request;
}

std::string describe(const OperationRequest& request) {
    return std::string(operationName(request.operation)) + " " + toString(request.path) +
           " through " + request.assocClass.value_or("no class");
}

std::ostream& operator<<(std::ostream& out, const NamedRequest& request) {
    return out << request.name;
}

std::vector<NamedRequest> servedRequests(const HostNames& names) {
    const ObjectPathValue system = operatingSystemPath(names.computer, names.system);
    const ObjectPathValue other = operatingSystemPath(names.computer, names.other);
    const ObjectPathValue abilities = capabilitiesPath(names.system);
    const ObjectPathValue computer = computerSystemPath(names.computer);
    Table table;
    for (const char* className : classes)
        for (const Kind& kind : enumerations)
            table.addPlain(kind, "Of" + shortName(className), path(className));
    table.addPlain(get, "OfOperatingSystem", other);
    table.addPlain(get, "OfOperatingSystemCapabilities", capabilitiesPath(names.other));
    table.addPlain(get, "OfInstalledOS", pairPath(installedOS, computer, system));
    table.addPlain(get, "OfRunningOS", pairPath(runningOS, system, computer));
    table.addPlain(get, "OfOSElementCapabilities",
                   pairPath(elementCapabilities, system, abilities));
    table.add(get, "OfUnknownName", operatingSystemPath(names.computer, "unknown"));
    table.add(get, "OfContradictingPair",
              pairPath(elementCapabilities, system, capabilitiesPath("linux")), "",
              "Object Not Found.");
    for (const Kind& kind : walks) {
        for (const char* association : {installed, running}) {
            const std::string through = "Through" + shortName(association);
            table.addPlain(kind, "OfComputer" + through, computer, association);
            table.addPlain(kind, "OfSystem" + through, system, association);
            table.add(kind, "OfSystemClass" + through, path("KORVA_OperatingSystem"), association);
            table.add(kind, "OfUnrelatedSource" + through, abilities, association);
            table.add(kind, "OfSourceWithoutItsKey" + through,
                      path("KORVA_ComputerSystem", {{"CreationClassName", "KORVA_ComputerSystem"}}),
                      association, "Could not find 'Name' Key in Moniker");
        }
        table.addPlain(kind, "OfSystemThroughOSElementCapabilities", system, element);
        table.addPlain(kind, "OfCapabilitiesThroughOSElementCapabilities", abilities, element);
        table.add(kind, "OfUnrelatedSourceThroughOSElementCapabilities", computer, element);
    }
    return std::move(table.rows);
}

std::vector<NamedRequest> refusedRequests() {
    Table table;
    for (const char* className : classes)
        for (const Kind& kind : refusals) {
            NamedRequest& row = table.add(kind, "Of" + shortName(className), path(className));
            row.request.instance.path = row.request.path;
            row.request.query = std::string("SELECT * FROM ") + className;
        }
    return std::move(table.rows);
}

std::vector<NamedRequest> unservedRequests(const HostNames& names) {
    Table table;
    const ObjectPathValue computer = computerSystemPath(names.computer);
    for (const Kind& kind : enumerations) table.add(kind, "OfComputerSystem", computer);
    table.add(get, "OfComputerSystem", computer);
    for (const Kind& kind : walks) {
        table.add(kind, "ThroughOperatingSystem", computer, "KORVA_OperatingSystem");
        table.add(kind, "ThroughNoClass", computer);
    }
    return std::move(table.rows);
}

std::vector<NamedRequest> facadeRequests(const HostNames& names) {
    std::vector<NamedRequest> all = answeredByFacade(names);
    append(all, servedRequests(names));
    append(all, refusedRequests());
    for (NamedRequest& row : all) {
        row.handler.replace(0, row.handler.find('_'), "OSStatusFacade");
        row.message.clear();
    }
    return all;
}

std::vector<std::string> handlersOf(const std::vector<NamedRequest>& requests) {
    std::vector<std::string> handlers;
    for (const NamedRequest& each : requests)
        if (std::find(handlers.begin(), handlers.end(), each.handler) == handlers.end())
            handlers.push_back(each.handler);
    return handlers;
}
