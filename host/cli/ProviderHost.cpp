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
#include "host/broker/ComputerSystemService.h"
#include "host/broker/LibraryService.h"

namespace cmpihost {

class ComputerSystems {
  public:
    virtual ~ComputerSystems() = default;
    virtual UpcallService& service() = 0;
    virtual OperationResult run(Broker& broker, const OperationRequest& request) = 0;
    virtual void unload() {}

  protected:
    ComputerSystems() = default;
    ComputerSystems(const ComputerSystems&) = default;
    ComputerSystems& operator=(const ComputerSystems&) = default;
};

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

/// The host answers for the computer systems itself.
class OwnComputerSystems final : public ComputerSystems {
  public:
    explicit OwnComputerSystems(unsigned count) : service_(computerNames(count)) {}

    UpcallService& service() override { return service_; }
    OperationResult run(Broker& broker, const OperationRequest& request) override {
        return service_.perform(broker, request);
    }

  private:
    ComputerSystemService service_;
};

LoadOptions loadOptions(const std::string& providerName) {
    LoadOptions options;
    options.providerName = providerName;
    return options;
}

LoadOptions companionOptions() {
    LoadOptions options = loadOptions("ComputerSystemProvider");
    options.association = false;
    return options;
}

/// A library answers for it.
class CompanionComputerSystems final : public ComputerSystems {
  public:
    CompanionComputerSystems(const std::string& file, Broker& broker)
        : library_(file, broker, companionOptions()), service_(library_) {}

    UpcallService& service() override { return service_; }
    OperationResult run(Broker& broker, const OperationRequest& request) override {
        return invoke(library_, broker, request);
    }
    void unload() override { library_.unload(); }

  private:
    ProviderLibrary library_;
    LibraryService service_;
};

/// The computer system's provider with its route set, before the other provider can ask for it.
std::unique_ptr<ComputerSystems> routed(const ComputerSystemSource& source, Broker& broker) {
    std::unique_ptr<ComputerSystems> systems;
    if (source.library.empty()) {
        systems = std::make_unique<OwnComputerSystems>(source.count);
    } else {
        systems = std::make_unique<CompanionComputerSystems>(source.library, broker);
    }
    broker.route(ComputerSystemService::className, systems->service());
    return systems;
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
      computerSystems_(routed(computerSystems, broker_)),
      library_(provider.library, broker_, loadOptions(provider.name)) {}

ProviderHost::~ProviderHost() = default;

OperationResult ProviderHost::run(const OperationRequest& request) {
    return guarded([&]() -> OperationResult { return invoke(library_, broker_, request); });
}

OperationResult ProviderHost::ask(const OperationRequest& request) {
    if (request.assocClass ||
        !base::equalsIgnoreCase(request.path.className, ComputerSystemService::className)) {
        return run(request);
    }
    return guarded([&] { return computerSystems_->run(broker_, request); });
}

std::vector<std::string> ProviderHost::unload() {
    bool escapes = false;
    try {
        library_.unload();
        computerSystems_->unload();
    } catch (...) {
        escapes = true;
    }
    std::vector<std::string> caught = broker_.takeViolations();
    if (escapes) caught.push_back("an exception left cleanup");
    return caught;
}

}  // namespace cmpihost
