#ifndef HOST_BROKER_ROUTER_H
#define HOST_BROKER_ROUTER_H

#include "host/broker/Broker.h"
#include "host/broker/RegisteredLibraries.h"

#include <chrono>
#include <filesystem>
#include <memory>
#include <mutex>
#include <string>
#include <utility>
#include <vector>

/// Sends operations to the providers that are registered for them.
namespace cmpihost {

/// The class that a query selects from, by which it finds its provider: the word after FROM. Empty
/// where there is none; whether the query is one of its language is for the provider to say. Any
/// thread may call it.
std::string selectedClass(const std::string& query);

/// Several libraries behind one broker. Requests of clients and up-calls of providers take the same
/// way, by class and namespace:
/// - EnumerateInstances, EnumerateInstanceNames and ExecQuery go to the instance providers of the
///   class and of its subclasses, each asked for the class that it is registered for; the first
///   status other than OK is the answer.
/// - Association operations go to the association providers of the named association class and of
///   its subclasses (unless it stands for itself alone), or of the whole namespace where none is
///   named, each provider once; an instance or path that several give is answered once.
/// - Everything else goes to the provider of the very class.
/// Where nobody is registered the answer is CMPI_RC_ERR_INVALID_NAMESPACE for a namespace that no
/// registration names, CMPI_RC_ERR_INVALID_CLASS for an unknown class, else
/// CMPI_RC_ERR_NOT_SUPPORTED, each with a message.
///
/// Any threads may ask at once; RegisteredLibraries says when one waits for another.
class Router final : public UpcallService {
  public:
    /// Takes the broker's up-calls. Libraries are looked for in `folders` too. Broker and catalogue
    /// outlive the router.
    Router(Broker& broker, const ClassCatalogue& catalogue, Registrations registrations,
           std::vector<std::filesystem::path> folders);
    ~Router() override { unload(); }
    Router(const Router&) = delete;
    Router& operator=(const Router&) = delete;

    /// Until unload() this library answers all requests of clients, and the up-calls for classes
    /// that are not registered. Called while no request runs.
    void answerWith(std::unique_ptr<ProviderLibrary> library) noexcept {
        sole_ = std::move(library);
    }

    /// Answers a client. An exception that leaves a provider becomes CMPI_RC_ERR_FAILED with a
    /// message that says so. Throws LoadError for a library that is needed and does not load, or
    /// that lacks a factory which its registration promises.
    OperationResult ask(const OperationRequest& request);

    /// Answers as ask(), but where the one library of answerWith() has nothing or serves no such
    /// class, as who is registered for it.
    OperationResult askAnyone(const OperationRequest& request);

    /// Answers an up-call. A library that does not load becomes CMPI_RC_ERR_FAILED, and a line of
    /// takeLoadErrors().
    UpcallAnswer perform(Broker& broker, const OperationRequest& request) override;

    /// Why libraries that up-calls needed did not load, each once.
    std::vector<std::string> takeLoadErrors();

    /// Unloads the one library, then those of the registered providers. Called while no request
    /// runs.
    void unload() noexcept;

    /// How long loading registered libraries took so far.
    std::chrono::nanoseconds loadTime() const { return libraries_.loadTime(); }

    const Registrations& registrations() const noexcept { return registrations_; }

  private:
    /// Who is to be asked, and for which class.
    struct Target {
        const Registration* registration = nullptr;
        std::string className{};
    };

    std::vector<Target> targetsOf(const OperationRequest& request) const;
    std::vector<Target> polymorphicTargets(const ObjectPathValue& path) const;
    std::vector<Target> associationTargets(const OperationRequest& request) const;
    OperationResult askRegistered(const std::vector<Target>& targets,
                                  const OperationRequest& request);
    OperationResult refusal(const OperationRequest& request) const;
    bool knows(const std::string& className) const;
    template <class Call>
    OperationResult joined(const std::vector<Target>& targets, const OperationRequest& request,
                           const Call& call);

    Broker& broker_;
    const ClassCatalogue& catalogue_;
    const Registrations registrations_;
    RegisteredLibraries libraries_;
    std::unique_ptr<ProviderLibrary> sole_;
    /// Guards what follows.
    std::mutex mutex_;
    std::vector<std::string> loadErrors_;
};

}  // namespace cmpihost

#endif
