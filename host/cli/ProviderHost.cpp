// The provider of the computer system is loaded and routed before the provider that is asked: that
// one may make its first up-call while it is being loaded.
#include "host/cli/ProviderHost.h"

#include <sys/mman.h>
#include <sys/utsname.h>
#include <unistd.h>

#include <cerrno>
#include <cstdlib>
#include <system_error>

#include "base/Ascii.h"

namespace cmpihost {

namespace {

constexpr const char* logVariable = "ZBLOG_CONF";

/// The log channel alone: the trace channel carries the same records once more.
constexpr std::string_view logConfiguration =
    "log.sink = stderr\n"
    "log.level = 4000\n"
    "log.records = all\n"
    "trace.sink = off\n";

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

OperationResult escaped(const std::string& what) {
    OperationResult result;
    result.rc = CMPI_RC_ERR_FAILED;
    result.message = "an exception left the provider: " + what;
    return result;
}

/// Runs what calls a provider, whose exceptions must not end the host.
template <class Call>
OperationResult guarded(Call call) {
    try {
        return call();
    } catch (const std::exception& error) {
        return escaped(error.what());
    } catch (...) {
        return escaped("of an unknown type");
    }
}

}  // namespace

ScopedStderrLog::ScopedStderrLog() : configuration_(::memfd_create("cmpihost-log", MFD_CLOEXEC)) {
    const int file = configuration_.number();
    const bool written = configuration_.isOpen() &&
                         ::write(file, logConfiguration.data(), logConfiguration.size()) ==
                             static_cast<ssize_t>(logConfiguration.size());
    const std::string name = "/proc/self/fd/" + std::to_string(file);
    if (!written || ::setenv(logVariable, name.c_str(), 1) != 0) {
        throw std::system_error(errno, std::generic_category(), "the records cannot be shown");
    }
}

ScopedStderrLog::~ScopedStderrLog() {
    ::unsetenv(logVariable);
}

ProviderHost::ProviderHost(const ProviderSource& provider, const ClassCatalogue& catalogue,
                           const ComputerSystemSource& computerSystems)
    : broker_(&catalogue),
      companion_(loadCompanion(computerSystems, broker_)),
      computerSystems_(computerNames(computerSystems.count)),
      library_(provider.library, routed(broker_, companion_.get(), computerSystems_),
               loadOptions(provider.name)) {}

OperationResult ProviderHost::run(const OperationRequest& request) {
    return guarded([&]() -> OperationResult { return invoke(library_, broker_, request); });
}

OperationResult ProviderHost::ask(const OperationRequest& request) {
    // Associations of the computer system are the provider's.
    if (request.assocClass ||
        !base::equalsIgnoreCase(request.path.className, ComputerSystemService::className)) {
        return run(request);
    }
    return guarded([&]() -> OperationResult {
        if (companion_ != nullptr) return invoke(*companion_, broker_, request);
        return computerSystems_.perform(broker_, request);
    });
}

std::vector<std::string> ProviderHost::unload() {
    // What was caught so far is told even when a library throws while it cleans up.
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
