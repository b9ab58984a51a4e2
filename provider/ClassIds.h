#ifndef PROVIDER_CLASS_IDS_H
#define PROVIDER_CLASS_IDS_H

namespace VA::OSStatusProvider {

/// The class ids, as VA::ProviderUtilities::getClassId gives them, of the classes that requests and
/// source paths may name.
constexpr unsigned short computerSystemId = 1;
constexpr unsigned short operatingSystemId = 55;
constexpr unsigned short operatingSystemCapabilitiesId = 56;
constexpr unsigned short installedOSId = 57;
constexpr unsigned short runningOSId = 64;
constexpr unsigned short elementCapabilitiesId = 65;

}  // namespace VA::OSStatusProvider

#endif
