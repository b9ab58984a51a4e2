#ifndef PROVIDER_LINUX_ELEMENT_CAPABILITIES_H
#define PROVIDER_LINUX_ELEMENT_CAPABILITIES_H

#include "Moniker.h"

namespace VA::OSStatusProvider {

/// Maps the ends of KORVA_OSElementCapabilities onto each other: the capabilities' "InstanceID" is
/// the operating system's "Name". Stateless. Records name its file Linux/ElementCapabilities.cpp,
/// without the "OS" of the class: that name is fixed.
class OSElementCapabilities {
  public:
    OSElementCapabilities();
    ~OSElementCapabilities() noexcept(false);

    /// The far end's identity, with one key. The input is only read; its selected key changes.
    /// Throws VA::FrameworkException when it lacks the key.
    VA::Moniker getOperatingSystemMoniker(VA::Moniker& monikerCapabilities);
    VA::Moniker getOSCapabilitiesMoniker(VA::Moniker& monikerOS);
};

}  // namespace VA::OSStatusProvider

#endif
