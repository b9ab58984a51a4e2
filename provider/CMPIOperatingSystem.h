#ifndef OSSTATUS_CMPI_OPERATING_SYSTEM_H
#define OSSTATUS_CMPI_OPERATING_SYSTEM_H

#include "ElementAdapter.h"
#include "Linux/OperatingSystem.h"
#include "PropertyTable.h"

namespace VA::OSStatusProvider {

class UnitLog;

/// What is KORVA_OperatingSystem's own: four keys, 43 properties, and the keys "CSName" and "Name"
/// as filters. The creation class names of a path are not looked at.
struct OperatingSystemDesign {
    using Element = OperatingSystem;

    static constexpr const char* className = "KORVA_OperatingSystem";
    static constexpr const char* constructor = "CMPIOperatingSystem";
    static constexpr const char* destructor = "~CMPIOperatingSystem";
    static constexpr KeyFilter<Element> filters[] = {
        {"CSName", "CSName", OperatingSystem::CSNameFilter},
        {"Name", "Name", OperatingSystem::NameFilter},
    };
    /// One value of each type serves all rows, in order: "Description", whose getter writes
    /// nothing, is published empty because no text was written before it.
    static constexpr bool valuesAreShared = true;

    static const UnitLog& records();
    static Rows<Key<Element>> keys();
    static Rows<Property<Element>> properties();
};

extern template class ElementAdapter<OperatingSystemDesign>;

/// Serves KORVA_OperatingSystem.
class CMPIOperatingSystem : public ElementAdapter<OperatingSystemDesign> {
  public:
    using ElementAdapter::ElementAdapter;
};

}  // namespace VA::OSStatusProvider

#endif
