#ifndef HOST_BROKER_PROVIDER_LIBRARY_H
#define HOST_BROKER_PROVIDER_LIBRARY_H

#include "host/broker/LibraryFile.h"
#include "host/broker/ManagementInterfaces.h"

#include <optional>
#include <string>

/// A CMPI library, loaded as an object manager loads it.
namespace cmpihost {

struct LoadOptions {
    /// The MI name that the factories carry; empty: the only one among the exported ones. A library
    /// that has nothing but generic factories gets its file's name between "lib" and ".so".
    std::string providerName{};
    /// Symbols go into the global scope, as real object managers do.
    bool global = true;
    /// Whether these interfaces are made where the library has them.
    bool instance = true;
    bool association = true;
    /// What the factories find in their context as sfcbProviderParameters; none: no such entry.
    std::optional<std::string> parameters{};
};

/// A loaded library and its management interfaces, of which one is enough. The factory
/// `_Generic_Create_<kind>MI` is looked up first, then `<MI name>_Create_<kind>MI`. What an object
/// manager might not forgive in the interfaces' tables is a violation. One thread loads and
/// unloads, while no other one uses the library; any threads may ask it in between.
class ProviderLibrary final : public UpcallService {
  public:
    /// Loads; throws LoadError. `broker` outlives the library.
    ProviderLibrary(std::string file, Broker& broker, LoadOptions options = {});
    /// unload(true).
    ~ProviderLibrary() override;
    ProviderLibrary(const ProviderLibrary&) = delete;
    ProviderLibrary& operator=(const ProviderLibrary&) = delete;

    const std::string& file() const noexcept { return file_; }
    /// The MI name, given or found.
    const std::string& providerName() const noexcept { return provider_; }
    bool loaded() const noexcept { return handle_ != nullptr; }
    ManagementInterfaces interfaces() const noexcept { return interfaces_; }
    CMPIInstanceMI* instanceMI() const noexcept { return interfaces_.instance; }
    CMPIAssociationMI* associationMI() const noexcept { return interfaces_.association; }

    /// Why an interface is missing, in a sentence that names the file, the interface and the
    /// factory that the library lacks.
    std::string whyMissing(Interface which) const;

    /// Calls cleanup of every interface, then closes the library. Not terminating: a provider that
    /// answers CMPI_RC_DO_NOT_UNLOAD or CMPI_RC_NEVER_UNLOAD stays loaded, and the result is false.
    bool unload(bool terminating = true);
    /// Loads again after unload(); throws LoadError. Does nothing while loaded.
    void load();

    /// Answers up-calls of other libraries, on the same thread and within the caller's request:
    /// what it delivers lives until the outermost request ends. An exception that leaves this
    /// library becomes a violation and CMPI_RC_ERR_FAILED.
    UpcallAnswer perform(Broker& broker, const OperationRequest& request) override;

    /// The address of an exported symbol, null if there is none or the library is not loaded.
    void* symbol(const char* name) const noexcept;

  private:
    std::string file_;
    Broker& broker_;
    LoadOptions options_;
    std::string provider_;
    void* handle_ = nullptr;
    ManagementInterfaces interfaces_;
};

}  // namespace cmpihost

#endif
