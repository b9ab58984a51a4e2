#ifndef OSSTATUS_CMPI_OPERATING_SYSTEM_CAPABILITIES_H
#define OSSTATUS_CMPI_OPERATING_SYSTEM_CAPABILITIES_H

#include "ElementAdapter.h"
#include "Linux/OperatingSystemCapabilities.h"
#include "PropertyTable.h"

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
    /// Each row starts with fresh values.
    static constexpr bool valuesAreShared = false;

    static const UnitLog& records();
    static Rows<Key<Element>> keys();
    static Rows<Property<Element>> properties();
};

extern template class ElementAdapter<OperatingSystemCapabilitiesDesign>;

/// Serves KORVA_OperatingSystemCapabilities.
class CMPIOperatingSystemCapabilities : public ElementAdapter<OperatingSystemCapabilitiesDesign> {
  public:
    using ElementAdapter::ElementAdapter;
};

}  // namespace VA::OSStatusProvider

#endif
