#ifndef HOST_SERVER_OBJECT_MANAGER_H
#define HOST_SERVER_OBJECT_MANAGER_H

#include <filesystem>
#include <memory>
#include <string>
#include <vector>

#include "host/broker/Broker.h"
#include "host/broker/Router.h"
#include "host/mof/Schema.h"
#include "host/server/Interop.h"
#include "host/server/OpenEnumerations.h"
#include "host/server/Statistics.h"

/// The object manager behind the endpoint: its namespaces, their classes, and who answers.
namespace cmpihost::server {

/// What an object manager works with.
struct ObjectManagerSetup {
    Schema schema{};
    Registrations registrations{};
    /// Where the libraries of the registrations are looked for, beside their own folders.
    std::vector<std::filesystem::path> libraryFolders{};
    /// Takes what providers log through their broker.
    MessageSink messageSink{};
    /// What paths name as their host; never empty.
    std::string hostName{};
};

/// Any threads may ask at once.
class ObjectManager {
  public:
    explicit ObjectManager(ObjectManagerSetup setup);
    ~ObjectManager();
    ObjectManager(const ObjectManager&) = delete;
    ObjectManager& operator=(const ObjectManager&) = delete;

    /// The name of a namespace as it is spelled here; throws CimError with cimInvalidNamespace.
    std::string nameSpace(const std::string& name) const;
    /// All of them, the interop namespace included.
    std::vector<std::string> nameSpaces() const;

    /// The classes of a namespace.
    const Schema& schema(const std::string& nameSpace) const;
    const ClassCatalogue& catalogue(const std::string& nameSpace) const;
    /// Whether the class is declared there, registered there, or an ancestor of one that is.
    bool knowsClass(const std::string& nameSpace, const std::string& className) const;
    /// The class as the schema spells it, else as it is given.
    std::string spelling(const std::string& nameSpace, const std::string& className) const;
    /// Whether the class is the other one or below it.
    bool isA(const std::string& nameSpace, const std::string& className,
             const std::string& ancestor) const;

    /// Asks the providers, or the classes of the interop namespace, and gives what they answer,
    /// each result with its namespace and with the schema's spelling of its class. A status other
    /// than OK, a library that does not load and an answer that breaks off become a CimError that
    /// has a description.
    OperationResult ask(const OperationRequest& request);

    const std::string& hostName() const noexcept { return hostName_; }
    const Registrations& registrations() const noexcept { return router_.registrations(); }
    OpenEnumerations& openEnumerations() noexcept { return openEnumerations_; }
    Statistics& statistics() noexcept { return statistics_; }

    /// What the broker caught the providers at, and why libraries did not load, since the last
    /// call: one line each.
    std::vector<std::string> takeComplaints();

  private:
    const std::string hostName_;
    const Schema schema_;
    const SchemaCatalogue catalogue_;
    Broker broker_;
    Router router_;
    Statistics statistics_;
    Interop interop_;
    OpenEnumerations openEnumerations_;
};

}  // namespace cmpihost::server

#endif
