// Up-calls answered by another loaded provider library.
#pragma once

#include "host/broker/UpcallService.h"

namespace cmpihost {

class ProviderLibrary;

/// Passes up-calls on to the management interfaces of a loaded library, on the same thread and
/// within the caller's request: what it delivers lives until the outermost request ends. An
/// exception that leaves the library becomes CMPI_RC_ERR_FAILED.
class LibraryService final : public UpcallService {
  public:
    /// `library` outlives the service.
    explicit LibraryService(ProviderLibrary& library);

    UpcallAnswer perform(Broker& broker, const OperationRequest& request) override;

  private:
    ProviderLibrary& library_;
};

}  // namespace cmpihost
