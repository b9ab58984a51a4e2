#ifndef PROVIDER_COMPUTER_SYSTEM_ASSOCIATION_H
#define PROVIDER_COMPUTER_SYSTEM_ASSOCIATION_H

#include <cmpi/cmpidt.h>
#include <cmpi/cmpift.h>

#include <string>

#include "CMPIComputerSystem.h"
#include "CMPIOperatingSystem.h"
#include "Moniker.h"

namespace VA::OSStatusProvider {

/// The two ends of an association between a computer system and its operating system.
enum class End { computerSystem, operatingSystem };

/// A reference of an association: its name, and the end that it refers to.
struct Role {
    const char* name;
    End end;
};

/// What one of these associations has of its own.
struct AssociationTraits {
    const char* className;
    unsigned short classId;
    const char* constructor;  ///< as records name it, and the destructor
    const char* destructor;
    Role roles[2];  ///< in the order in which paths and instances carry them
    /// The identity of one end, derived from the other's. Throw VA::FrameworkException when that
    /// lacks the key.
    VA::Moniker (*computerSystemOf)(VA::Moniker& operatingSystem);
    VA::Moniker (*operatingSystemOf)(VA::Moniker& computerSystem);
    void (*setOwnProperties)(CMPIInstance* instance);  ///< beside the references; null: none
    const UnitLog& log;
};

/// An adapter of an association between the computer system and its operating systems; the base of
/// CMPIInstalledOS and CMPIRunningOS.
///
/// The class of the path that it is built from decides what it walks. Built from a path of the
/// association, it pairs operating systems and computer systems in step, until either runs out.
/// Built from a path of one end, it walks the other. Built from any other path, it is empty.
///
/// One object serves one request on one thread; ownership as in ElementAdapter.
class ComputerSystemAssociation {
  public:
    ~ComputerSystemAssociation() noexcept(false);
    ComputerSystemAssociation(const ComputerSystemAssociation&) = delete;
    ComputerSystemAssociation& operator=(const ComputerSystemAssociation&) = delete;

    /// True while there is a current result. Asking a computer system has a side effect: see
    /// CMPIOSComputerSystem.
    operator bool();

    /// Whether the adapter was built from a path of the association itself.
    bool enumerates() const;

    /// Moves to the next result.
    ComputerSystemAssociation& operator++();

    /// The association's path or instance for the current pair, null when the broker makes none.
    /// The property list is not applied.
    CMPIObjectPath* getObjectPath();
    CMPIInstance* getCMPIInstance(const char** properties);

    /// The far end's path or instance, null when the adapter was built from no end.
    CMPIObjectPath* getAssociatorNames();
    CMPIInstance* getAssociator(const char** properties);

    /// The path of the far end that belongs to `objectPath`, with the one key that is known of it,
    /// or without keys when `objectPath` has none. Throws VA::FrameworkException when it has keys
    /// but not the one needed.
    CMPIObjectPath* locateOperatingSystem(const CMPIObjectPath* objectPath);
    CMPIObjectPath* locateComputerSystem(const CMPIObjectPath* objectPath);

  protected:
    /// Throws VA::FrameworkException when the path has keys but not the one that the far end is
    /// named by, VA::ProviderException when the broker has no computer system. The references of a
    /// path of the association are not read: every pair is walked. The traits outlive the adapter.
    ComputerSystemAssociation(const AssociationTraits& _traits, const CMPIBroker* _broker,
                              const CMPIContext* _context, const CMPIObjectPath* objectPath);

  private:
    CMPIObjectPath* pathOf(End end);

    const AssociationTraits& traits;
    const CMPIBroker* broker;
    const CMPIContext* context;
    std::string nameSpace;
    unsigned short requestedClassId = {};
    CMPIOperatingSystem operatingSystem;
    CMPIOSComputerSystem computerSystem;
};

}  // namespace VA::OSStatusProvider

#endif
