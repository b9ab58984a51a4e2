#ifndef TESTS_FACADE_FACADE_FIXTURE_H
#define TESTS_FACADE_FACADE_FIXTURE_H

#include "host/broker/FaultPlan.h"
#include "library/LibraryFixture.h"

namespace facade {

using namespace cmpihost;

using Texts = std::vector<std::string>;

/// The file of the built facade, and how an object manager loads it.
extern const char* const file;
LoadOptions loadOptions();

/// The classes at the two ends of an installation.
inline const std::string cs = "KORVA_ComputerSystem";
inline const std::string os = "KORVA_OperatingSystem";

/// The three paths that there are on the fixture's host, as text.
inline constexpr const char* computerSystem =
    R"(root/cimv2:KORVA_ComputerSystem.CreationClassName="KORVA_ComputerSystem",Name="host1")";
inline constexpr const char* operatingSystem =
    R"(root/cimv2:KORVA_OperatingSystem.CSCreationClassName="KORVA_ComputerSystem",)"
    R"(CSName="host1",CreationClassName="KORVA_OperatingSystem",Name="Linux")";
inline constexpr const char* capabilities =
    R"(root/cimv2:KORVA_OperatingSystemCapabilities.InstanceID="Linux")";

/// The path of the fixture's operating system with some keys changed, or added at the end.
ObjectPathValue operatingSystemWith(const std::vector<KeyBinding>& changes);

Texts propertyNames(const InstanceValue& instance);

/// The built facade in front of the built provider, on the host of LibraryFixture.
class FacadeFixture : public LibraryFixture {
  protected:
    explicit FacadeFixture(BrokerOptions options = {});

    Outcome ask(const OperationRequest& request);
    Outcome ask(Operation operation, const ObjectPathValue& path,
                std::optional<Texts> properties = {});

    /// What a request delivers, as the text of its paths; checks that it is OK, done once, and free
    /// of records of the facade.
    Texts delivered(const OperationRequest& request);

    /// The up-calls that a request made.
    unsigned upcalls(const OperationRequest& request);

    /// Status and text of a refused request, as "4 text"; checks that it delivered nothing and left
    /// one record of the facade with that text, in both channels.
    std::string refusal(const OperationRequest& request);

    ProviderLibrary facade;
};

/// The four association operations.
inline constexpr Operation associationOperations[] = {
    Operation::AssociatorNames, Operation::Associators, Operation::ReferenceNames,
    Operation::References};

inline bool ofReferences(Operation operation) {
    return operation == Operation::ReferenceNames || operation == Operation::References;
}

/// A request from `source`; the association class stands where the operation has it.
OperationRequest associationRequest(Operation operation, const ObjectPathValue& source,
                                    const std::string& associationClass = "");

}  // namespace facade

#endif
