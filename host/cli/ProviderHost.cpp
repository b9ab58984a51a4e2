// The router is there before the one library is loaded: that one may make its first up-call while
// it is being loaded.
#include "host/cli/ProviderHost.h"

#include <utility>

namespace cmpihost {

namespace {

std::vector<std::string> joined(std::vector<std::string> first, std::vector<std::string> second) {
    for (std::string& line : second) first.push_back(std::move(line));
    return first;
}

}  // namespace

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

OperationResult ProviderHost::askAside(const OperationRequest& request) {
    violations_ = joined(std::move(violations_), broker_.takeViolations());
    loadErrors_ = takeLoadErrors();
    OperationResult result;
    try {
        result = ask(request);
    } catch (const LoadError&) {
        result.rc = CMPI_RC_ERR_FAILED;
    }
    broker_.takeViolations();
    router_.takeLoadErrors();
    return result;
}

std::vector<std::string> ProviderHost::takeLoadErrors() {
    return joined(std::exchange(loadErrors_, {}), router_.takeLoadErrors());
}

std::vector<std::string> ProviderHost::unload() {
    router_.unload();
    return joined(std::exchange(violations_, {}), broker_.takeViolations());
}

}  // namespace cmpihost
