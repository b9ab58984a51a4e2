#ifndef HOST_SERVER_REQUEST_PATH_H
#define HOST_SERVER_REQUEST_PATH_H

#include <memory>
#include <string>
#include <vector>

#include "host/broker/ClassCatalogue.h"
#include "host/broker/Value.h"
#include "host/server/XmlTree.h"

/// Object paths as clients send them, and what they stand for.
namespace cmpihost::server {

struct RequestPath;

/// A key as it was sent: its type is what the schema says, not what the client says.
struct RequestKey {
    enum class Kind { String, Boolean, Numeric, Reference };

    /// Empty for the one key that stands without a name.
    std::string name{};
    Kind kind = Kind::String;
    std::string text{};
    /// Set for Kind::Reference only.
    std::shared_ptr<const RequestPath> reference{};
};

struct RequestPath {
    /// Empty: that of the request.
    std::string nameSpace{};
    std::string className{};
    /// None: a class, or an instance whose keys were not given.
    std::vector<RequestKey> keys{};
    /// Sent as an instance (INSTANCENAME), not as a class.
    bool instance = false;
};

/// Reads a CLASSNAME, INSTANCENAME, LOCALCLASSPATH, LOCALINSTANCEPATH, CLASSPATH or INSTANCEPATH
/// of a message, also in a VALUE.REFERENCE. Its structure has been checked. HOST is left out.
RequestPath readPath(const XmlElement& element);

/// The namespace that a LOCALNAMESPACEPATH of a message names: "root/cimv2", without slashes at its
/// ends or double ones, however it is spread over NAMESPACE elements.
std::string readNameSpace(const XmlElement& element);

/// The path of an instance as a provider is entitled to get it: the schema's spelling, types and
/// order of keys, all keys there; `nameSpace` where the path has none. Of a class that the
/// catalogue does not declare the keys are taken as they were sent. Throws CimError:
/// cimInvalidParameter for a key that is missing, doubled, unknown or not of its type.
ObjectPathValue typedPath(const RequestPath& path, const ClassCatalogue& catalogue,
                          const std::string& nameSpace);

}  // namespace cmpihost::server

#endif
