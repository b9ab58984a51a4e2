#ifndef HOST_SERVER_ELEMENT_WRITER_H
#define HOST_SERVER_ELEMENT_WRITER_H

#include <string>
#include <string_view>
#include <vector>

#include "host/broker/Value.h"
#include "host/server/XmlText.h"

/// Writes the elements of responses, in the form that the weakest clients read: each function
/// appends to `xml`. Any threads may call these.
namespace cmpihost::server {

/// Where paths are: what HOST says, and the namespace of those that have none of their own.
struct Site {
    std::string hostName{};
    std::string nameSpace{};
};

/// VALUE, VALUE.ARRAY, VALUE.REFERENCE or VALUE.REFARRAY; nothing for null. An embedded instance is
/// a text. An element of an array that is null becomes an empty text among texts, and is left out
/// of any other array.
void writeValue(std::string& xml, const Value& value, const Site& site);

/// INSTANCENAME, and that in an INSTANCEPATH: with the host and the namespace of the path, else
/// those of the site.
void writeInstanceName(std::string& xml, const ObjectPathValue& path, const Site& site);
void writeInstancePath(std::string& xml, const ObjectPathValue& path, const Site& site);

/// CLASSPATH.
void writeClassPath(std::string& xml, const std::string& className, const Site& site);

/// INSTANCE. Properties that are null are left out, for that is what NULL looks like to all
/// clients; `classOrigin` writes CLASSORIGIN where the provider told one.
void writeInstance(std::string& xml, const InstanceValue& instance, const Site& site,
                   bool classOrigin = false);

/// A parameter that comes out of an operation or method: PARAMVALUE.
void writeParameter(std::string& xml, std::string_view name, const Value& value, const Site& site);

/// What a method returns: RETURNVALUE; nothing for null. Methods return no arrays.
void writeReturnValue(std::string& xml, const Value& value, const Site& site);

/// Writes each element of a list in one of the forms that operations answer.
void writeNamedInstances(std::string& xml, const std::vector<InstanceValue>& instances,
                         const Site& site, bool classOrigin);
void writeObjectsWithPath(std::string& xml, const std::vector<InstanceValue>& instances,
                          const Site& site, bool classOrigin);
void writeInstanceNames(std::string& xml, const std::vector<ObjectPathValue>& paths,
                        const Site& site);
void writeObjectPaths(std::string& xml, const std::vector<ObjectPathValue>& paths,
                      const Site& site);

}  // namespace cmpihost::server

#endif
