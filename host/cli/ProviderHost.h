#ifndef HOST_CLI_PROVIDER_HOST_H
#define HOST_CLI_PROVIDER_HOST_H

#include <memory>
#include <string>
#include <vector>

#include "host/broker/Broker.h"
#include "host/broker/ComputerSystemService.h"
#include "host/broker/Invoke.h"
#include "host/broker/ProviderLibrary.h"

namespace cmpihost {

/// The provider that is asked.
struct ProviderSource {
    std::string library;
    /// The provider's name, which the library's factories carry.
    std::string name;
};

/// Who serves the computer system, beside the provider.
struct ComputerSystemSource {
    /// The library of its provider; empty: the host serves it itself.
    std::string library{};
    /// How many the host serves itself.
    unsigned count = 1;
};

/// One provider library in a broker, beside the provider of the computer system, which answers its
/// up-calls. One thread uses it.
class ProviderHost {
  public:
    /// Loads the libraries; throws LoadError. `catalogue` outlives the host.
    ProviderHost(const ProviderSource& provider, const ClassCatalogue& catalogue,
                 const ComputerSystemSource& computerSystems = {});

    /// Runs one operation of the provider. An exception that leaves the provider becomes
    /// CMPI_RC_ERR_FAILED with a message that says so.
    OperationResult run(const OperationRequest& request);

    /// The same, but requests for the computer system's class go to its provider.
    OperationResult ask(const OperationRequest& request);

    /// Unloads the library and hands out all that the broker caught since it was loaded.
    std::vector<std::string> unload();

  private:
    Broker broker_;
    /// The library that serves the computer system; null: the host does.
    std::unique_ptr<ProviderLibrary> companion_;
    ComputerSystemService computerSystems_;
    ProviderLibrary library_;
};

}  // namespace cmpihost

#endif
