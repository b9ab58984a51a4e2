#ifndef PROVIDER_CMPI_OPERATING_SYSTEM_CAPABILITIES_H
#define PROVIDER_CMPI_OPERATING_SYSTEM_CAPABILITIES_H

#include <utility>

#include "ElementAdapter.h"
#include "Linux/OperatingSystemCapabilities.h"

namespace VA::OSStatusProvider {

extern template class ElementAdapter<OperatingSystemCapabilities>;

/// Serves KORVA_OperatingSystemCapabilities. The key of a path is handed to the element as a
/// filter, which the element does not apply: the adapter stands on the first element whatever key
/// was asked for.
class CMPIOperatingSystemCapabilities : public ElementAdapter<OperatingSystemCapabilities> {
  public:
    static const ElementTraits<OperatingSystemCapabilities> traits;

    CMPIOperatingSystemCapabilities(const CMPIBroker* _broker, const CMPIContext* _context,
                                    const CMPIObjectPath* objectPath)
        : ElementAdapter(traits, _broker, _context, objectPath) {}
    CMPIOperatingSystemCapabilities(const CMPIBroker* _broker, const CMPIContext* _context,
                                    std::string _nameSpace)
        : ElementAdapter(traits, _broker, _context, std::move(_nameSpace)) {}
};

}  // namespace VA::OSStatusProvider

#endif
