#ifndef HOST_BROKER_PROVIDER_LIBRARY_H
#define HOST_BROKER_PROVIDER_LIBRARY_H

#include "host/broker/Broker.h"

#include <cmpi/cmpift.h>

#include <stdexcept>
#include <string>
#include <vector>

/// A CMPI library, loaded as an object manager loads it.
namespace cmpihost {

/// Why a library could not be loaded (no library of this process, an unresolved symbol, no factory,
/// one that failed); what() is one line that names the file.
class LoadError : public std::runtime_error {
  public:
    using std::runtime_error::runtime_error;
};

struct LoadOptions {
    std::string providerName = "OperatingSystemProvider";
    /// Symbols go into the global scope, as real object managers do.
    bool global = true;
    /// Which management interfaces the library must have.
    bool instance = true;
    bool association = true;
};

/// The two interfaces that the host drives; either may be null.
struct ManagementInterfaces {
    CMPIInstanceMI* instance = nullptr;
    CMPIAssociationMI* association = nullptr;
};

/// A loaded library and its management interfaces. The factory `_Generic_Create_<kind>MI` is looked
/// up first, then `<provider name>_Create_<kind>MI`. What an object manager might not forgive in
/// the interfaces' tables (a version below 100, an MI version above it, a null slot) is a
/// violation. One thread loads and unloads.
class ProviderLibrary final : public UpcallService {
  public:
    /// Loads; throws LoadError. `broker` outlives the library.
    ProviderLibrary(std::string file, Broker& broker, LoadOptions options = {});
    /// unload(true).
    ~ProviderLibrary() override;
    ProviderLibrary(const ProviderLibrary&) = delete;
    ProviderLibrary& operator=(const ProviderLibrary&) = delete;

    const std::string& file() const noexcept { return file_; }
    bool loaded() const noexcept { return handle_ != nullptr; }
    ManagementInterfaces interfaces() const noexcept { return interfaces_; }
    CMPIInstanceMI* instanceMI() const noexcept { return interfaces_.instance; }
    CMPIAssociationMI* associationMI() const noexcept { return interfaces_.association; }

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
    void* handle_ = nullptr;
    ManagementInterfaces interfaces_;
};

}  // namespace cmpihost

#endif
