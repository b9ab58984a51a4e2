#ifndef HOST_CLI_PROVIDER_HOST_H
#define HOST_CLI_PROVIDER_HOST_H

#include <chrono>
#include <filesystem>
#include <string>
#include <vector>

#include "host/broker/Broker.h"
#include "host/broker/ProviderLibrary.h"
#include "host/broker/Registrations.h"
#include "host/broker/Router.h"

namespace cmpihost {

/// Who answers in a host.
struct HostSetup {
    Registrations registrations{};
    /// Where the libraries of the registrations are looked for, beside their own folders.
    std::vector<std::filesystem::path> libraryFolders{};
    /// The one library that is asked for everything; empty: who is registered.
    std::string library{};
    /// Its MI name; empty: the one that it exports.
    std::string miName{};
    /// Takes what providers log through their broker.
    MessageSink messageSink{};
};

/// A broker with its provider libraries. One thread uses it.
class ProviderHost {
  public:
    /// Loads the one library, if there is one; throws LoadError. `catalogue` outlives the host.
    ProviderHost(HostSetup setup, const ClassCatalogue& catalogue);

    /// Runs one operation. An exception that leaves a provider becomes CMPI_RC_ERR_FAILED with a
    /// message that says so. Throws LoadError.
    OperationResult ask(const OperationRequest& request);

    /// The same, but what the one library does not have is asked of who is registered: the source
    /// of an association may be another provider's.
    OperationResult askAnyone(const OperationRequest& request);

    /// Asks as ask() for an explanation of another answer: what the broker catches meanwhile, and a
    /// library that does not load, are kept to itself. The latter is answered CMPI_RC_ERR_FAILED.
    OperationResult askAside(const OperationRequest& request);

    /// Why libraries that providers needed did not load.
    std::vector<std::string> takeLoadErrors();

    /// How long loading libraries took while requests ran: each when it was first needed.
    std::chrono::nanoseconds loadTime() const { return router_.loadTime(); }

    /// Unloads all libraries and hands out all that the broker caught since it was made.
    std::vector<std::string> unload();

  private:
    Broker broker_;
    Router router_;
    /// What was there to be told before a question that nobody is to be told of.
    std::vector<std::string> violations_;
    std::vector<std::string> loadErrors_;
};

}  // namespace cmpihost

#endif
