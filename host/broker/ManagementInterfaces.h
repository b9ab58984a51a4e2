#ifndef HOST_BROKER_MANAGEMENT_INTERFACES_H
#define HOST_BROKER_MANAGEMENT_INTERFACES_H

#include "host/broker/Broker.h"

#include <cmpi/cmpift.h>

#include <string>
#include <vector>

/// The management interfaces of a provider: how they are found in a library, made and given up.
namespace cmpihost {

/// What a library offers; each may be null.
struct ManagementInterfaces {
    CMPIInstanceMI* instance = nullptr;
    CMPIAssociationMI* association = nullptr;
    CMPIMethodMI* method = nullptr;
    CMPIPropertyMI* property = nullptr;

    bool has(Interface which) const noexcept;
};

/// An open library and the provider that is wanted of it.
struct ProviderSource {
    /// As dlopen gave it.
    void* handle = nullptr;
    std::string file{};
    /// The MI name that the factories carry.
    std::string provider{};
};

/// The MI name of the factories among exported functions: of those with a name of their own
/// (`NAME_Create_InstanceMI` and so on) the one name, or `otherwise` when there is only
/// `_Generic_Create_..MI`. Throws LoadError, naming the file, when there are several names or no
/// factory.
std::string providerName(const std::string& file, const std::vector<std::string>& functions,
                         const std::string& otherwise);

/// "Foo_Create_InstanceMI", the function that makes an interface.
std::string factoryName(const std::string& provider, Interface which);

/// Calls the factories that the library has for the provider, those of `wanted` only: of each
/// interface `_Generic_Create_<kind>MI` comes first, as it alone learns which provider is meant.
/// What an object manager might not forgive in a table (a version below 100, an MI version above
/// it, a null slot) is a violation. Throws LoadError when there is no factory at all, and for one
/// that fails. A request is open.
ManagementInterfaces makeInterfaces(const ProviderSource& source, Broker& broker,
                                    const CMPIContext* context,
                                    const std::vector<Interface>& wanted);

/// Calls cleanup of every interface. False: the provider does not want to be unloaded. Any other
/// status than OK is a violation. A request is open.
bool cleanUp(const ManagementInterfaces& interfaces, Broker& broker, const CMPIContext* context,
             bool terminating);

}  // namespace cmpihost

#endif
