// The router is there before the one library is loaded: that one may make its first up-call while
// it is being loaded.
#include "host/cli/ProviderHost.h"

#include <utility>

namespace cmpihost {

ProviderHost::ProviderHost(HostSetup setup, const ClassCatalogue& catalogue)
    : broker_(&catalogue),
      router_(broker_, catalogue, std::move(setup.registrations), std::move(setup.libraryFolders)) {
    broker_.setMessageSink(std::move(setup.messageSink));
    if (setup.library.empty()) return;
    LoadOptions options;
    options.providerName = std::move(setup.miName);
    router_.answerWith(
        std::make_unique<ProviderLibrary>(setup.library, broker_, std::move(options)));
}

OperationResult ProviderHost::ask(const OperationRequest& request) {
    return router_.ask(request);
}

OperationResult ProviderHost::askAnyone(const OperationRequest& request) {
    return router_.askAnyone(request);
}

std::vector<std::string> ProviderHost::takeLoadErrors() {
    return router_.takeLoadErrors();
}

std::vector<std::string> ProviderHost::unload() {
    router_.unload();
    return broker_.takeViolations();
}

}  // namespace cmpihost
