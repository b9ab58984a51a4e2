#ifndef HOST_BROKER_ROUTER_H
#define HOST_BROKER_ROUTER_H

#include "host/broker/Broker.h"
#include "host/broker/ProviderLibrary.h"
#include "host/broker/Registrations.h"

#include <chrono>
#include <filesystem>
#include <map>
#include <memory>
#include <mutex>
#include <set>
#include <string>
#include <vector>

/// Sends operations to the providers that are registered for them.
namespace cmpihost {

/// Several libraries behind one broker. Requests of clients and up-calls of providers take the same
/// way, by class and namespace:
/// - EnumerateInstances, EnumerateInstanceNames and ExecQuery go to the instance providers of the
///   class and of its subclasses, each asked for the class that it is registered for; the first
///   status other than OK is the answer.
/// - Association operations go to the association providers of the named association class and of
///   its subclasses, or of the whole namespace where none is named, each provider once; an
///   instance or path that several give is answered once.
/// - Everything else goes to the provider of the very class.
/// Where nobody is registered the answer is CMPI_RC_ERR_INVALID_NAMESPACE for a namespace that no
/// registration names, CMPI_RC_ERR_INVALID_CLASS for an unknown class, else
/// CMPI_RC_ERR_NOT_SUPPORTED, each with a message.
///
/// A library is loaded when it is first needed, once a provider name. Any threads may ask at once;
/// while one loads a library, others wait only if they need one that is not loaded either.
class Router final : public UpcallService {
  public:
    /// Takes the broker's up-calls. Libraries are looked for in the folder of the registration
    /// file, in `folders`, and by the dynamic loader. Broker and catalogue outlive the router.
    Router(Broker& broker, const ClassCatalogue& catalogue, Registrations registrations,
           std::vector<std::filesystem::path> folders);
    ~Router() override { unload(); }
    Router(const Router&) = delete;
    Router& operator=(const Router&) = delete;

    /// From now on this library answers all requests of clients, and the up-calls for classes that
    /// are not registered. It outlives its use. Called while no request runs.
    void answerWith(ProviderLibrary& library) noexcept { sole_ = &library; }

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

    /// Unloads all libraries, the last one first. Called while no request runs; what is asked
    /// later loads them again.
    void unload() noexcept;

    /// How long loading libraries took so far.
    std::chrono::nanoseconds loadTime() const;

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
    ProviderLibrary& libraryFor(const Registration& registration);
    ProviderLibrary& loadOnce(const Registration& registration);
    ProviderLibrary* loaded(const std::string& key) const;
    std::unique_ptr<ProviderLibrary> load(const Registration& registration) const;

    Broker& broker_;
    const ClassCatalogue& catalogue_;
    const Registrations registrations_;
    const std::vector<std::filesystem::path> folders_;
    ProviderLibrary* sole_ = nullptr;

    /// Held while a library is loaded; recursive, as a factory may make an up-call that needs
    /// another library.
    std::recursive_mutex loading_;
    std::set<std::string> beingLoaded_;
    /// Guards what follows, never while a provider is called.
    mutable std::mutex mutex_;
    std::map<std::string, ProviderLibrary*> libraries_;
    std::vector<std::unique_ptr<ProviderLibrary>> inOrder_;
    std::vector<std::string> loadErrors_;
    std::chrono::nanoseconds loadTime_{};
};

}  // namespace cmpihost

#endif
