#ifndef OSSTATUS_FACADE_REQUEST_H
#define OSSTATUS_FACADE_REQUEST_H

#include <cmpi/cmpidt.h>

#include <string>
#include <vector>

#include "Answer.h"
#include "Classes.h"
#include "ObjectPath.h"
#include "Provider.h"

namespace VA::OSStatusFacade {

/// One request of a client, and what it may ask the provider. What the client's result says to
/// what it is given is ignored.
class Request {
  public:
    /// The arguments outlive the request.
    Request(const Provider& provider, const CMPIContext* context, const CMPIResult* result,
            const CMPIObjectPath* path);

    const CMPIBroker* broker() const { return provider_.broker; }
    const CMPIContext* context() const { return context_; }
    const CMPIResult* result() const { return result_; }
    const CMPIObjectPath* path() const { return path_; }
    /// The class as the client wrote it, and what is known of it: null for an unknown one.
    const std::string& className() const { return className_; }
    const Class* knownClass() const { return class_; }

    Identity identityOf(const CMPIObjectPath* path) const;

    /// A new path in the namespace of the request. Throws Refusal when the broker makes none.
    CMPIObjectPath* newPath(const char* className) const;

    Answer enumerateInstanceNames(const CMPIObjectPath* path) const;
    Answer enumerateInstances(const CMPIObjectPath* path) const;
    Answer getInstance(const CMPIObjectPath* path) const;

    /// Hands over what there is and says that it is done. The property list is applied; null stands
    /// for all properties.
    void deliver(const std::vector<const CMPIObjectPath*>& paths) const;
    void deliver(const std::vector<const CMPIInstance*>& instances, const char** properties) const;

  private:
    const Provider& provider_;
    const CMPIContext* context_;
    const CMPIResult* result_;
    const CMPIObjectPath* path_;
    std::string className_;
    const Class* class_;
    std::string nameSpace_;
};

/// Throws Refusal unless the provider serves the class.
void requireServed(const Answer& answer, const std::string& className);

/// The same, unless the answer is whole. One without a returnDone was broken off: of
/// associations whose ends are nowhere that is how the provider says that there are none, anything
/// else would look complete and is not.
void requireWhole(const Answer& answer, const std::string& className);

}  // namespace VA::OSStatusFacade

#endif
