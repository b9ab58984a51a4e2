#ifndef PROVIDER_CMPI_OPERATING_SYSTEM_H
#define PROVIDER_CMPI_OPERATING_SYSTEM_H

#include <utility>

#include "ElementAdapter.h"
#include "Linux/OperatingSystem.h"

namespace VA::OSStatusProvider {

extern template class ElementAdapter<OperatingSystem>;

/// Serves KORVA_OperatingSystem. The keys "CSName" and "Name" of a path narrow the walk; its
/// creation class names are not looked at.
class CMPIOperatingSystem : public ElementAdapter<OperatingSystem> {
  public:
    static const ElementTraits<OperatingSystem> traits;

    CMPIOperatingSystem(const CMPIBroker* _broker, const CMPIContext* _context,
                        const CMPIObjectPath* objectPath)
        : ElementAdapter(traits, _broker, _context, objectPath) {}
    CMPIOperatingSystem(const CMPIBroker* _broker, const CMPIContext* _context,
                        std::string _nameSpace)
        : ElementAdapter(traits, _broker, _context, std::move(_nameSpace)) {}
};

}  // namespace VA::OSStatusProvider

#endif
