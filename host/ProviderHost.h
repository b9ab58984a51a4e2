#pragma once

#include <string>
#include <vector>

#include "host/broker/Broker.h"
#include "host/broker/ComputerSystemService.h"
#include "host/broker/Invoke.h"
#include "host/broker/ProviderLibrary.h"

namespace cmpihost {

/// One provider library in a broker, among the other providers of this host: those that answer its
/// up-calls. One thread uses it.
class ProviderHost {
  public:
    /// Loads the library; throws LoadError. `catalogue` outlives the host.
    ProviderHost(const std::string& file, const ClassCatalogue& catalogue);

    /// Runs one operation. An exception that leaves the provider becomes CMPI_RC_ERR_FAILED with a
    /// message that says so.
    OperationResult run(const OperationRequest& request);

    /// Unloads the library and hands out all that the broker caught since it was loaded.
    std::vector<std::string> unload();

  private:
    Broker broker_;
    ComputerSystemService computerSystem_;
    ProviderLibrary library_;
};

}  // namespace cmpihost
