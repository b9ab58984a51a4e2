#include "host/cli/ProviderHost.h"

#include <sys/utsname.h>

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
        !equalNames(request.path.className, ComputerSystemService::className)) {
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
    if (escapes) {
        caught.push_back("an exception left cleanup");
    }
    return caught;
}

}  // namespace cmpihost
