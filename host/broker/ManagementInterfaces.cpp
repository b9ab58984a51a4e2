// The four interfaces differ in their types only, so that each step is written once, as a template
// over the interface, and applied to the four members.
#include "host/broker/ManagementInterfaces.h"

#include "host/broker/BrokerCore.h"
#include "host/broker/LibraryFile.h"

#include <dlfcn.h>

#include <algorithm>
#include <initializer_list>
#include <type_traits>

namespace cmpihost {

namespace {

struct Slot {
    const char* name;
    bool filled;
};

/// One line for each thing in a table that an object manager might not forgive.
template <class Table>
std::vector<std::string> findings(const char* kind, const Table& table,
                                  std::initializer_list<Slot> slots) {
    const std::string who = std::string("table of the ") + kind + " MI: ";
    std::vector<std::string> result;
    if (table.ftVersion < 100) {
        result.push_back(who + "ftVersion " + std::to_string(table.ftVersion) + " is below 100");
    }
    if (table.miVersion > table.ftVersion) {
        result.push_back(who + "miVersion " + std::to_string(table.miVersion) +
                         " is above ftVersion " + std::to_string(table.ftVersion));
    }
    if (table.miName == nullptr) result.push_back(who + "miName is null");
    for (const Slot& slot : slots) {
        if (!slot.filled) result.push_back(who + slot.name + " is null");
    }
    return result;
}

std::vector<std::string> checkMiTable(const CMPIInstanceMIFT& table) {
    return findings("instance", table,
                    {{"cleanup", table.cleanup != nullptr},
                     {"enumerateInstanceNames", table.enumerateInstanceNames != nullptr},
                     {"enumerateInstances", table.enumerateInstances != nullptr},
                     {"getInstance", table.getInstance != nullptr},
                     {"createInstance", table.createInstance != nullptr},
                     {"modifyInstance", table.modifyInstance != nullptr},
                     {"deleteInstance", table.deleteInstance != nullptr},
                     {"execQuery", table.execQuery != nullptr}});
}

std::vector<std::string> checkMiTable(const CMPIAssociationMIFT& table) {
    return findings("association", table,
                    {{"cleanup", table.cleanup != nullptr},
                     {"associators", table.associators != nullptr},
                     {"associatorNames", table.associatorNames != nullptr},
                     {"references", table.references != nullptr},
                     {"referenceNames", table.referenceNames != nullptr}});
}

std::vector<std::string> checkMiTable(const CMPIMethodMIFT& table) {
    return findings(
        "method", table,
        {{"cleanup", table.cleanup != nullptr}, {"invokeMethod", table.invokeMethod != nullptr}});
}

/// The setter with an origin, which no stub fills, may be missing.
std::vector<std::string> checkMiTable(const CMPIPropertyMIFT& table) {
    return findings("property", table,
                    {{"cleanup", table.cleanup != nullptr},
                     {"setProperty", table.setProperty != nullptr},
                     {"getProperty", table.getProperty != nullptr}});
}

/// The message as the provider's own macros would read it: it may be no object of this broker.
std::string messageSuffix(const CMPIStatus& status) {
    if (status.msg == nullptr) return {};
    const char* const text = status.msg->ft->getCharPtr(status.msg, nullptr);
    return text == nullptr ? std::string() : std::string(": ") + text;
}

/// Makes one interface, if the library has a factory of its kind.
template <class MI>
MI* makeInterface(const ProviderSource& source, Interface which, Broker& broker,
                  const CMPIContext* context) {
    using Generic = MI* (*)(const CMPIBroker*, const CMPIContext*, const char*, CMPIStatus*);
    using Named = MI* (*)(const CMPIBroker*, const CMPIContext*, CMPIStatus*);
    const auto find = [&](const std::string& provider) {
        return dlsym(source.handle, factoryName(provider, which).c_str());
    };
    const auto generic = reinterpret_cast<Generic>(find("_Generic"));
    const auto named = reinterpret_cast<Named>(find(source.provider));
    if (generic == nullptr && named == nullptr) return nullptr;

    const std::string where = source.file + ": factory of the " + interfaceName(which) + " MI";
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    MI* made = nullptr;
    try {
        made = generic != nullptr
                   ? generic(broker.cmpi(), context, source.provider.c_str(), &status)
                   : named(broker.cmpi(), context, &status);
    } catch (const std::exception& exception) {
        throw LoadError(where + " threw: " + exception.what());
    }
    if (status.rc != CMPI_RC_OK) {
        throw LoadError(where + " answered status " + std::to_string(status.rc) +
                        messageSuffix(status));
    }
    if (made == nullptr) throw LoadError(where + " returned null");
    if (made->ft == nullptr) throw LoadError(where + " gave no table");
    for (const std::string& finding : checkMiTable(*made->ft)) broker.core().report(finding);
    return made;
}

/// Calls cleanup of one interface. False: the provider does not want to be unloaded.
template <class MI>
bool cleanUpOne(MI* interface, Broker& broker, const CMPIContext* context, bool terminating) {
    if (interface == nullptr || interface->ft->cleanup == nullptr) return true;
    const CMPIStatus status = interface->ft->cleanup(interface, context, terminating);
    const bool refuses = status.rc == CMPI_RC_DO_NOT_UNLOAD || status.rc == CMPI_RC_NEVER_UNLOAD;
    if (!refuses && status.rc != CMPI_RC_OK) {
        broker.core().report("cleanup answered status " + std::to_string(status.rc) +
                             messageSuffix(status));
    }
    return !refuses;
}

/// "Foo" of "Foo_Create_InstanceMI"; empty for a function that is no factory of an interface.
std::string nameInFactory(const std::string& function) {
    for (const Interface which : allInterfaces) {
        const std::string ending = factoryName("", which);
        if (function.size() <= ending.size()) continue;
        const std::size_t start = function.size() - ending.size();
        if (function.compare(start, ending.size(), ending) == 0) return function.substr(0, start);
    }
    return {};
}

std::string listed(const std::vector<std::string>& names) {
    std::string text;
    for (const std::string& name : names) text += (text.empty() ? "" : ", ") + name;
    return text;
}

/// The MI names of the factories among functions, each once.
std::vector<std::string> namesIn(const std::vector<std::string>& functions) {
    std::vector<std::string> names;
    for (const std::string& function : functions) {
        std::string name = nameInFactory(function);
        if (!name.empty() && name != "_Generic") names.push_back(std::move(name));
    }
    std::sort(names.begin(), names.end());
    names.erase(std::unique(names.begin(), names.end()), names.end());
    return names;
}

/// What was looked for in vain: both names of all factories.
std::string noFactory(const std::string& file, const std::string& provider) {
    const std::vector<std::string> others = namesIn(exportedFunctions(file));
    if (!others.empty())
        return file + ": there is no provider " + provider + " in it, but " + listed(others);
    std::vector<std::string> names;
    for (const Interface which : allInterfaces) names.push_back(factoryName(provider, which));
    for (const Interface which : allInterfaces) names.push_back(factoryName("_Generic", which));
    return file + ": not a CMPI provider: it exports none of " + listed(names);
}

}  // namespace

bool ManagementInterfaces::has(Interface which) const noexcept {
    const bool present[] = {instance != nullptr, association != nullptr, method != nullptr,
                            property != nullptr};
    return present[static_cast<unsigned>(which)];
}

std::string factoryName(const std::string& provider, Interface which) {
    return provider + "_Create_" + interfaceName(which) + "MI";
}

std::string providerName(const std::string& file, const std::vector<std::string>& functions,
                         const std::string& otherwise) {
    const std::vector<std::string> names = namesIn(functions);
    const bool generic = std::any_of(functions.begin(), functions.end(), [](const auto& each) {
        return nameInFactory(each) == "_Generic";
    });
    if (names.size() == 1) return names.front();
    if (names.empty() && generic) return otherwise;
    if (names.empty()) throw LoadError(noFactory(file, "NAME"));
    throw LoadError(file + ": several providers (" + listed(names) + "): choose with --name NAME");
}

ManagementInterfaces makeInterfaces(const ProviderSource& source, Broker& broker,
                                    const CMPIContext* context,
                                    const std::vector<Interface>& wanted) {
    ManagementInterfaces made;
    bool any = false;
    const auto make = [&](auto& member, Interface which) {
        using MI = std::remove_pointer_t<std::remove_reference_t<decltype(member)>>;
        if (std::find(wanted.begin(), wanted.end(), which) == wanted.end()) return;
        member = makeInterface<MI>(source, which, broker, context);
        any = any || member != nullptr;
    };
    make(made.instance, Interface::Instance);
    make(made.association, Interface::Association);
    make(made.method, Interface::Method);
    make(made.property, Interface::Property);
    if (!any) throw LoadError(noFactory(source.file, source.provider));
    return made;
}

bool cleanUp(const ManagementInterfaces& interfaces, Broker& broker, const CMPIContext* context,
             bool terminating) {
    bool goes = cleanUpOne(interfaces.instance, broker, context, terminating);
    goes = cleanUpOne(interfaces.association, broker, context, terminating) && goes;
    goes = cleanUpOne(interfaces.method, broker, context, terminating) && goes;
    return cleanUpOne(interfaces.property, broker, context, terminating) && goes;
}

}  // namespace cmpihost
