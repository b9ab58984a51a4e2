#ifndef OSSTATUS_CMPI_OPERATING_SYSTEM_CAPABILITIES_H
#define OSSTATUS_CMPI_OPERATING_SYSTEM_CAPABILITIES_H

#include "ElementAdapter.h"
#include "Linux/OperatingSystemCapabilities.h"

namespace VA::OSStatusProvider {

class UnitLog;

/// What is KORVA_OperatingSystemCapabilities' own: one key and six properties. The key is handed to
/// the element as a filter, which the element does not apply: the adapter stands on the first
/// element whatever key was asked for.
struct OperatingSystemCapabilitiesDesign {
    using Element = OperatingSystemCapabilities;

    static constexpr const char* className = "KORVA_OperatingSystemCapabilities";
    static constexpr const char* constructor = "CMPIOperatingSystemCapabilities";
    static constexpr const char* destructor = "~CMPIOperatingSystemCapabilities";
    static constexpr KeyFilter<Element> filters[] = {
        {"InstanceID", "instanceId", OperatingSystemCapabilities::InstanceIDFilter},
    };

    static const UnitLog& records();
    static void setKeys(Element& element, CMPIObjectPath* path);
    static void setProperties(Element& element, const CMPIBroker* broker, CMPIInstance* instance);
};

/// Serves KORVA_OperatingSystemCapabilities.
using CMPIOperatingSystemCapabilities = ElementAdapter<OperatingSystemCapabilitiesDesign>;

extern template class ElementAdapter<OperatingSystemCapabilitiesDesign>;

}  // namespace VA::OSStatusProvider

#endif
