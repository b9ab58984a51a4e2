#ifndef HOST_SERVER_INTEROP_H
#define HOST_SERVER_INTEROP_H

#include <string>
#include <vector>

#include "host/broker/Operation.h"
#include "host/mof/Schema.h"
#include "host/server/Statistics.h"

namespace cmpihost::server {

/// The interop namespace, "root/interop": the classes by which clients find out what a server has
/// (CIM_ObjectManager, CIM_Namespace, __Namespace). Any threads may ask.
class Interop {
  public:
    static constexpr const char* nameSpace = "root/interop";

    /// `nameSpaces` are all that the server has, this one too. `others` are classes of providers
    /// that are registered here; of those that bear the name of one of the above, the one above
    /// counts. `statistics` outlives this object.
    Interop(std::string hostName, std::vector<std::string> nameSpaces, const Statistics& statistics,
            mof::Document others = {});

    /// The classes that are served here, and the others.
    const Schema& schema() const noexcept { return schema_; }
    const ClassCatalogue& catalogue() const noexcept { return catalogue_; }

    /// Whether this object has instances of the class, or of one below it.
    bool serves(const std::string& className) const;

    /// Answers as a provider of these classes does: enumerations with the instances of the class
    /// and of those below it, all with all their properties; what it does not serve, and all
    /// writing, with a status and a message.
    OperationResult ask(const OperationRequest& request) const;

  private:
    std::vector<InstanceValue> instances() const;
    InstanceValue objectManager() const;
    InstanceValue nameSpaceInstance(const std::string& name) const;
    InstanceValue instanceOf(const char* className, std::vector<PropertyValue> properties) const;

    const std::string hostName_;
    const std::vector<std::string> nameSpaces_;
    const Statistics& statistics_;
    const Schema schema_;
    const SchemaCatalogue catalogue_;
};

}  // namespace cmpihost::server

#endif
