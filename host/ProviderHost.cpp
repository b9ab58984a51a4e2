#include "host/ProviderHost.h"

#include <sys/utsname.h>

namespace cmpihost {

namespace {

std::string nodeName() {
    utsname names{};
    return ::uname(&names) == 0 ? names.nodename : "localhost";
}

OperationResult escaped(const std::string& what) {
    OperationResult result;
    result.rc = CMPI_RC_ERR_FAILED;
    result.message = "an exception left the provider: " + what;
    return result;
}

/// The broker with its routes set, before any provider can call it.
ProviderLibrary loaded(const std::string& file, Broker& broker, UpcallService& computerSystem) {
    broker.route(ComputerSystemService::className, computerSystem);
    return ProviderLibrary(file, broker);
}

}  // namespace

ProviderHost::ProviderHost(const std::string& file, const ClassCatalogue& catalogue)
    : broker_(&catalogue),
      computerSystem_(nodeName()),
      library_(loaded(file, broker_, computerSystem_)) {}

OperationResult ProviderHost::run(const OperationRequest& request) {
    try {
        return invoke(library_, broker_, request);
    } catch (const std::exception& error) {
        return escaped(error.what());
    } catch (...) {
        return escaped("of an unknown type");
    }
}

std::vector<std::string> ProviderHost::unload() {
    bool escapes = false;
    try {
        library_.unload();
    } catch (...) {
        escapes = true;
    }
    std::vector<std::string> caught = broker_.takeViolations();
    if (escapes) {
        caught.push_back("an exception left cleanup");
    }
    return caught;
}

}  // namespace cmpihost
