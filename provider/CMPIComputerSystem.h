#ifndef PROVIDER_CMPI_COMPUTER_SYSTEM_H
#define PROVIDER_CMPI_COMPUTER_SYSTEM_H

#include <cmpi/cmpidt.h>
#include <cmpi/cmpift.h>

#include <string>

namespace VA::OSStatusProvider {

/// The host's computer system, which another provider of the same object manager serves: asks the
/// broker for its instances, and hands out those and their paths. Records name its file
/// CMPIComputerSystem.cpp, without the "OS" of the class: that name is fixed.
///
/// One object serves one request on one thread. Enumeration and instances belong to the broker and
/// are never released here.
class CMPIOSComputerSystem {
  public:
    /// Stands on nothing; does not ask the broker yet.
    CMPIOSComputerSystem(const CMPIBroker* _broker, const CMPIContext* _context,
                         std::string _nameSpace);
    ~CMPIOSComputerSystem() noexcept(false);
    CMPIOSComputerSystem(const CMPIOSComputerSystem&) = delete;
    CMPIOSComputerSystem& operator=(const CMPIOSComputerSystem&) = delete;

    /// Asks the broker for the instances of the path's class and fetches the first. Throws
    /// VA::ProviderException when there is none; whatever enumeration the broker gave is kept even
    /// then. A null path asks nobody, changes nothing and throws.
    void setObjectPath(const CMPIObjectPath* objectPath);

    /// The path of the current instance, asked of the instance; null when there is none.
    CMPIObjectPath* getObjectPath();

    /// The current instance itself, as the broker delivered it, null when there is none. The
    /// property list is not applied.
    CMPIInstance* getCMPIInstance(const char** properties);

    /// The first time after setObjectPath true, for the instance that it fetched. From then on
    /// whether the broker has a further one to fetch: a walk reports the one computer system of a
    /// host once, and of n it leaves out the last.
    operator bool();

    /// Fetches the next instance; without one the adapter stands on nothing.
    CMPIOSComputerSystem& operator++();

  private:
    bool fetchFirst(const CMPIObjectPath* objectPath);

    CMPIInstance* instance = nullptr;
    CMPIEnumeration* enumeration = nullptr;
    bool firstPending = false;
    const CMPIBroker* broker;
    const CMPIContext* context;
    std::string nameSpace;
};

}  // namespace VA::OSStatusProvider

#endif
