#ifndef FACADE_CLIENT_REQUEST_H
#define FACADE_CLIENT_REQUEST_H

#include <cmpi/cmpidt.h>
#include <cmpi/cmpift.h>

#include <atomic>
#include <string>
#include <vector>

#include "Classes.h"
#include "ObjectPath.h"

namespace VA::OSStatusFacade {

/// What the factories leave for the requests. An object manager may call a factory again, for
/// another class, while threads serve requests.
struct Provider {
    std::atomic<const CMPIBroker*> broker = nullptr;
    std::atomic<CMPIInstanceMI*> instances = nullptr;
    std::atomic<CMPIAssociationMI*> associations = nullptr;
};

/// What the provider returned to one question. The elements belong to the broker, as all that a
/// provider returns.
class ResultCollector {
  public:
    /// Calls `ask` with a CMPIResult that gathers here; `ask` returns the provider's status. Throws
    /// std::bad_alloc when something that was returned found no room, and what `ask` throws.
    template <class Ask>
    explicit ResultCollector(Ask ask) : status_(ask(&result_)) {
        requireRoom();
    }
    ResultCollector(const ResultCollector&) = delete;
    ResultCollector& operator=(const ResultCollector&) = delete;

    CMPIrc rc() const { return status_.rc; }

    /// Nulls are left out.
    const std::vector<const CMPIObjectPath*>& paths() const { return paths_; }
    const std::vector<const CMPIInstance*>& instances() const { return instances_; }
    bool isEmpty() const { return paths_.empty() && instances_.empty(); }

    /// Whether the provider said that it is done. It does not when its walk broke off, and the
    /// status is OK all the same.
    bool isDone() const { return done_; }

  private:
    struct Table;
    static const CMPIResultFT table;

    void requireRoom() const;

    // CMPI has no const here; nobody writes the table.
    CMPIResult result_ = {this, const_cast<CMPIResultFT*>(&table)};
    std::vector<const CMPIObjectPath*> paths_;
    std::vector<const CMPIInstance*> instances_;
    bool done_ = false;
    bool full_ = false;
    CMPIStatus status_;
};

/// One request of a client, and what it may ask the provider. What the client's result says to
/// what it is given is ignored.
class ClientRequest {
  public:
    /// The arguments outlive the request.
    ClientRequest(const Provider& provider, const CMPIContext* context, const CMPIResult* result,
                  const CMPIObjectPath* path);

    const CMPIBroker* broker() const { return provider_.broker; }
    const CMPIContext* context() const { return context_; }
    const CMPIObjectPath* path() const { return path_; }
    /// The class as the client wrote it, and what is known of it: null for an unknown one.
    const std::string& className() const { return className_; }
    const Class* knownClass() const { return class_; }

    /// What a path stands for; where it has no namespace, it is in that of the request.
    CanonicalPath canonicalPathOf(const CMPIObjectPath* path) const;

    /// A new path in the namespace of the request. Throws CimError when the broker makes none.
    CMPIObjectPath* newPath(const char* className) const;

    /// Each asks the provider one question, as an object manager would. No property list goes with
    /// it: the list is applied to what is returned, and until then all keys are there to compare.
    ResultCollector enumerateInstanceNames(const CMPIObjectPath* path) const;
    ResultCollector enumerateInstances(const CMPIObjectPath* path) const;
    ResultCollector getInstance(const CMPIObjectPath* path) const;

    /// Give the results to the client and say that this is all. The property list is applied; null
    /// stands for all properties.
    void returnPaths(const std::vector<const CMPIObjectPath*>& paths) const;
    void returnInstances(const std::vector<const CMPIInstance*>& instances,
                         const char** properties) const;

  private:
    const Provider& provider_;
    const CMPIContext* context_;
    const CMPIResult* result_;
    const CMPIObjectPath* path_;
    std::string className_;
    const Class* class_;
    std::string nameSpace_;
};

/// Throws CimError unless the provider serves the class.
void requireServed(const ResultCollector& answer, const std::string& className);

/// The same, unless the answer is whole. One without a returnDone was broken off: of
/// associations whose ends are nowhere that is how the provider says that there are none, anything
/// else would look complete and is not.
void requireWhole(const ResultCollector& answer, const std::string& className);

}  // namespace VA::OSStatusFacade

#endif
