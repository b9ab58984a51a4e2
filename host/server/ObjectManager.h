#ifndef HOST_SERVER_OBJECT_MANAGER_H
#define HOST_SERVER_OBJECT_MANAGER_H

#include <cstddef>
#include <filesystem>
#include <memory>
#include <mutex>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

#include "host/broker/Broker.h"
#include "host/broker/Router.h"
#include "host/mof/Schema.h"
#include "host/server/Interop.h"
#include "host/server/OpenEnumerations.h"
#include "host/server/Statistics.h"

/// The object manager behind the endpoint: its namespaces, their classes, and who answers.
namespace cmpihost::server {

/// Whether the values of a key of that name are names of classes: "CreationClassName" is one, and
/// names that end so are others.
bool namesClass(std::string_view key);

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

/// Its namespaces are those that registrations name (root/cimv2 where they name none) and the
/// interop namespace. A class of the schema is known in each of them, but in the last one only
/// where it is registered there, or above one that is; a class that is registered and in no schema
/// is known where it is registered. Names of namespaces and classes compare without case. Any
/// threads may ask at once.
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

    /// The classes of a namespace; it is one of nameSpaces().
    const Schema& schema(const std::string& nameSpace) const;
    const ClassCatalogue& catalogue(const std::string& nameSpace) const;
    /// Whether the class is declared there, registered there, or an ancestor of one that is.
    bool knowsClass(const std::string& nameSpace, const std::string& className) const;
    /// The class as the schema spells it, else as it is given.
    std::string spelling(const std::string& nameSpace, const std::string& className) const;
    /// The same for a class that the client named; throws CimError with cimInvalidClass for one
    /// that is not known.
    std::string knownClass(const std::string& nameSpace, const std::string& className) const;
    /// Whether the class is the other one or below it.
    bool isA(const std::string& nameSpace, const std::string& className,
             const std::string& ancestor) const;

    /// Whether a provider of instances is registered for the class or for one below it.
    bool hasInstanceProvider(const std::string& nameSpace, const std::string& className) const;

    /// Asks the providers, or the classes of the interop namespace, and gives what they answer,
    /// each result with its namespace and with the schema's spelling of its class. An enumeration
    /// or GetInstance of a known class that nobody serves has no result. A status other than OK, a
    /// library that does not load and a list of results that breaks off become a CimError that has
    /// a description. Classes that keys name reach the providers as the schema spells them, too.
    OperationResult ask(OperationRequest request);

    const std::string& hostName() const noexcept { return hostName_; }
    const Registrations& registrations() const noexcept { return router_.registrations(); }
    OpenEnumerations& openEnumerations() noexcept { return openEnumerations_; }
    Statistics& statistics() noexcept { return statistics_; }

    /// Ends the providers, while no request runs; what they are caught at then is for
    /// takeComplaints(), too.
    void unload() noexcept { router_.unload(); }

    /// Keeps a line for takeComplaints().
    void complain(const std::string& line);
    /// What the broker caught the providers at, why libraries did not load, and what complain()
    /// was given since the last call: one line each, of which the first `mostComplaints` are kept,
    /// and of each so many bytes.
    std::vector<std::string> takeComplaints();
    static constexpr std::size_t mostComplaints = 200;
    static constexpr std::size_t longestComplaint = 1000;

  private:
    struct NameSpace {
        std::string name;
        /// All that are known there as they are spelled, by their names in lower case.
        std::unordered_map<std::string, std::string> classes;
    };

    std::vector<NameSpace> readNameSpaces() const;
    void addLine(NameSpace& space, const std::string& className) const;
    const NameSpace* find(const std::string& name) const;
    void spellClassKeys(ObjectPathValue& path) const;
    bool isServed(const OperationRequest& request) const;
    OperationResult answerOf(const OperationRequest& request);
    OperationResult askProviders(const OperationRequest& request);
    OperationResult askInterop(const OperationRequest& request);
    void finish(const OperationRequest& request, OperationResult& result) const;
    void finish(const OperationRequest& request, ObjectPathValue& path) const;
    void gatherComplaints();

    const std::string hostName_;
    const Schema schema_;
    const SchemaCatalogue catalogue_;
    Broker broker_;
    Router router_;
    Statistics statistics_;
    Interop interop_;
    const std::vector<NameSpace> nameSpaces_;
    OpenEnumerations openEnumerations_;
    /// Guards what follows.
    std::mutex complaintMutex_;
    std::vector<std::string> complaints_;
    std::size_t complaintsLeftOut_ = 0;
};

}  // namespace cmpihost::server

#endif
