#ifndef HOST_BROKER_REGISTERED_LIBRARIES_H
#define HOST_BROKER_REGISTERED_LIBRARIES_H

#include "host/broker/ProviderLibrary.h"
#include "host/broker/Registrations.h"

#include <chrono>
#include <filesystem>
#include <map>
#include <memory>
#include <mutex>
#include <set>
#include <string>
#include <utility>
#include <vector>

namespace cmpihost {

/// The libraries of registered providers: each is loaded when it is first needed, once a provider
/// name. Any threads may ask at once; while one loads a library, others wait only if they need one
/// that is not loaded either. So a factory must not wait for another thread that does.
class RegisteredLibraries {
  public:
    /// Libraries are looked for in the folder of the registration file, in `folders`, and by the
    /// dynamic loader. The broker outlives the libraries.
    RegisteredLibraries(Broker& broker, std::vector<std::filesystem::path> folders);
    ~RegisteredLibraries() { unload(); }
    RegisteredLibraries(const RegisteredLibraries&) = delete;
    RegisteredLibraries& operator=(const RegisteredLibraries&) = delete;

    /// The library of the registration, with all interfaces that it promises; lives until unload().
    /// Throws LoadError for one that does not load, that lacks such a factory, that is needed while
    /// it is being loaded, or again in a cleanup after its own.
    ProviderLibrary& of(const Registration& registration);

    /// Unloads all, the last one first. Called while no request runs; what is needed later is
    /// loaded again.
    void unload() noexcept;

    /// How long loading took so far.
    std::chrono::nanoseconds loadTime() const;

  private:
    ProviderLibrary* loaded(const std::string& key) const;
    ProviderLibrary& loadOnce(const Registration& registration);
    std::unique_ptr<ProviderLibrary> load(const Registration& registration) const;

    Broker& broker_;
    const std::vector<std::filesystem::path> folders_;

    /// Held while a library is loaded; recursive, as a factory may make an up-call that needs
    /// another library.
    std::recursive_mutex loading_;
    std::set<std::string> beingLoaded_;
    /// Guards what follows, never while a provider is called.
    mutable std::mutex mutex_;
    std::map<std::string, ProviderLibrary*> libraries_;
    std::vector<std::pair<std::string, std::unique_ptr<ProviderLibrary>>> inOrder_;
    /// Those that an unload() under way is done with.
    std::set<std::string> gone_;
    std::chrono::nanoseconds loadTime_{};
};

/// Tells providers apart: two registrations with the same one share a library's interfaces.
std::string providerKey(const Registration& registration);

}  // namespace cmpihost

#endif
