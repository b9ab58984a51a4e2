#ifndef PROVIDER_CMPI_ELEMENT_CAPABILITIES_H
#define PROVIDER_CMPI_ELEMENT_CAPABILITIES_H

#include <cmpi/cmpidt.h>
#include <cmpi/cmpift.h>

#include <string>

#include "CMPIOperatingSystem.h"
#include "CMPIOperatingSystemCapabilities.h"
#include "Linux/ElementCapabilities.h"

namespace VA::OSStatusProvider {

/// Serves KORVA_OSElementCapabilities: the capabilities of the operating systems. Records name its
/// file CMPIElementCapabilities.cpp, without the "OS" of the class: that name is fixed.
///
/// The class of the path that it is built from decides what it walks: the association itself, or
/// from one end to the other. Built from any other path it has no far end and never ends by itself;
/// who walks it stops at the first null.
///
/// One object serves one request on one thread; ownership as in ElementAdapter.
class CMPIOSElementCapabilities {
  public:
    /// Throws VA::InstrumentationException "Object Not Found." when a path of the association names
    /// no pair that belongs together, VA::FrameworkException when a path of an end has keys but not
    /// the one that the far end is named by.
    CMPIOSElementCapabilities(const CMPIBroker* _broker, const CMPIContext* _context,
                              const CMPIObjectPath* objectPath);
    ~CMPIOSElementCapabilities() noexcept(false);
    CMPIOSElementCapabilities(const CMPIOSElementCapabilities&) = delete;
    CMPIOSElementCapabilities& operator=(const CMPIOSElementCapabilities&) = delete;

    /// Applies a path of the association: without keys, all pairs; with keys, the one pair that
    /// they name. False when there is none.
    bool setObjectPath(const CMPIObjectPath* objectPath);

    /// The association's path or instance for the current pair, null when the broker makes none.
    /// The property list is not applied.
    CMPIObjectPath* getObjectPath();
    CMPIInstance* getCMPIInstance(const char** properties);

    /// The far end's path or instance, null when the adapter was built from no end.
    CMPIObjectPath* getAssociatorNames();
    CMPIInstance* getAssociator(const char** properties);

    /// The path of the far end that belongs to `objectPath`: its one key holds the value of the
    /// near end's; without keys there, none. Throws VA::FrameworkException when `objectPath` has
    /// keys but not the one needed.
    CMPIObjectPath* locateCapabilities(const CMPIObjectPath* objectPath);
    CMPIObjectPath* locateOperatingSystem(const CMPIObjectPath* objectPath);

    /// True after construction, whatever the walk found; from then on while the last advance found
    /// a further result.
    operator bool();

    /// Whether the adapter was built from a path of the association itself.
    bool enumerates() const;

    /// Moves to the next result.
    CMPIOSElementCapabilities& operator++();

  private:
    bool setKeyedObjectPath(const CMPIObjectPath* objectPath);
    void pairWithCurrentOperatingSystem();
    void advancePair();

    const CMPIBroker* broker;
    const CMPIContext* context;
    std::string nameSpace;
    unsigned short requestedClassId = {};
    CMPIOperatingSystemCapabilities capabilities;
    CMPIOperatingSystem operatingSystem;
    OSElementCapabilities elementCapabilities;
    bool hasCurrent = true;
    bool singleInstance = false;
};

}  // namespace VA::OSStatusProvider

#endif
