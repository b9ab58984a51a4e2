#ifndef HOST_BROKER_INVOKE_H
#define HOST_BROKER_INVOKE_H

#include "host/broker/Operation.h"
#include "host/broker/ProviderLibrary.h"

#include <functional>
#include <string>
#include <vector>

/// Runs one operation of a provider, as an object manager does for a client.
namespace cmpihost {

class ResultCollector;

/// What an operation left behind.
struct Outcome : OperationResult {
    /// Calls of returnDone.
    unsigned doneCount = 0;
    /// Objects whose return call was made to fail by a collector's setting.
    std::vector<ObjectPathValue> refusedPaths{};
    std::vector<InstanceValue> refusedInstances{};
    /// What the broker caught during the operation.
    std::vector<std::string> violations{};
};

/// Prepares the collector before the provider is called, for example with its failure settings.
using CollectorSetup = std::function<void(ResultCollector&)>;

/// Opens a request, builds context and path, calls the slot of the operation and ends the request.
/// An interface or slot that is missing answers CMPI_RC_ERR_NOT_SUPPORTED; of an interface that a
/// library lacks the message says so. An exception that leaves
/// the provider goes on to the caller once the request has ended. Several threads may invoke at
/// once.
Outcome invoke(const ManagementInterfaces& interfaces, Broker& broker,
               const OperationRequest& request, const CollectorSetup& setup = {});
Outcome invoke(const ProviderLibrary& library, Broker& broker, const OperationRequest& request,
               const CollectorSetup& setup = {});

}  // namespace cmpihost

#endif
