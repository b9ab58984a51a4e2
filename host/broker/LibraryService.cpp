#include "host/broker/LibraryService.h"

#include "host/broker/BrokerCore.h"
#include "host/broker/Invoke.h"

namespace cmpihost {

LibraryService::LibraryService(ProviderLibrary& library) : library_(library) {}

UpcallAnswer LibraryService::perform(Broker& broker, const OperationRequest& request) {
    UpcallAnswer answer;
    try {
        static_cast<OperationResult&>(answer) = invoke(library_, broker, request);
    } catch (...) {
        broker.core().report(std::string("an exception left ") + operationName(request.operation) +
                             " of " + library_.file());
        answer.rc = CMPI_RC_ERR_FAILED;
    }
    return answer;
}

}  // namespace cmpihost
