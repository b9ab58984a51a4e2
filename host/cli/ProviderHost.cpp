// The provider of the computer system is loaded and routed before the provider that is asked: that
// one may make its first up-call while it is being loaded.
#include "host/cli/ProviderHost.h"

#include <sys/utsname.h>

#include <exception>

#include "base/Ascii.h"

namespace cmpihost {

namespace {

std::string nodeName() {
    utsname names{};
    return ::uname(&names) == 0 ? names.nodename : "localhost";
}

std::vector<std::string> computerNames(unsigned count) {
    std::vector<std::string> names;
    for (unsigned number = 1; number <= count; ++number) {
        names.push_back(number == 1 ? nodeName() : nodeName() + "-" + std::to_string(number));
    }
    return names;
}

LoadOptions loadOptions(const std::string& providerName) {
    LoadOptions options;
    options.providerName = providerName;
    return options;
}

/// Null when the source names no library.
std::unique_ptr<ProviderLibrary> loadCompanion(const ComputerSystemSource& source, Broker& broker) {
    if (source.library.empty()) return nullptr;
    LoadOptions options = loadOptions("ComputerSystemProvider");
    options.association = false;
    return std::make_unique<ProviderLibrary>(source.library, broker, options);
}

/// The broker with its route to the computer systems.
Broker& routed(Broker& broker, ProviderLibrary* companion, ComputerSystemService& own) {
    UpcallService& service = companion != nullptr ? static_cast<UpcallService&>(*companion) : own;
    broker.route(ComputerSystemService::className, service);
    return broker;
}

OperationResult failureOf(const std::string& what) {
    OperationResult result;
    result.rc = CMPI_RC_ERR_FAILED;
    result.message = "an exception left the provider: " + what;
    return result;
}

/// Calls a provider. An exception that leaves it must not end the host: in an object manager it
/// would end the process for everybody, and a person who looks into that wants to read what was
/// thrown.
template <class Call>
OperationResult resultOrFailure(Call call) {
    try {
        return call();
    } catch (const std::exception& error) {
        return failureOf(error.what());
    } catch (...) {
        return failureOf("of an unknown type");
    }
}

}  // namespace

ProviderHost::ProviderHost(const ProviderSource& provider, const ClassCatalogue& catalogue,
                           const ComputerSystemSource& computerSystems)
    : broker_(&catalogue),
      companion_(loadCompanion(computerSystems, broker_)),
      computerSystems_(computerNames(computerSystems.count)),
      library_(provider.library, routed(broker_, companion_.get(), computerSystems_),
               loadOptions(provider.name)) {}

OperationResult ProviderHost::run(const OperationRequest& request) {
    return resultOrFailure([&]() -> OperationResult { return invoke(library_, broker_, request); });
}

OperationResult ProviderHost::ask(const OperationRequest& request) {
    // Associations of the computer system are the provider's.
    if (request.assocClass ||
        !base::equalsIgnoreCase(request.path.className, ComputerSystemService::className)) {
        return run(request);
    }
    return resultOrFailure([&]() -> OperationResult {
        if (companion_ != nullptr) return invoke(*companion_, broker_, request);
        return computerSystems_.perform(broker_, request);
    });
}

std::vector<std::string> ProviderHost::unload() {
    // A library that throws in cleanup must not hide what was caught before.
    bool escapes = false;
    try {
        library_.unload();
        if (companion_ != nullptr) companion_->unload();
    } catch (...) {
        escapes = true;
    }
    std::vector<std::string> caught = broker_.takeViolations();
    if (escapes) caught.emplace_back("an exception left cleanup");
    return caught;
}

}  // namespace cmpihost
