#include "host/server/ElementWriter.h"

namespace cmpihost::server {

void writeText(std::string&, std::string_view) {}
void writeAttributeText(std::string&, std::string_view) {}
void writeValue(std::string&, const Value&, const Site&) {}
void writeInstanceName(std::string&, const ObjectPathValue&, const Site&) {}
void writeInstancePath(std::string&, const ObjectPathValue&, const Site&) {}
void writeClassPath(std::string&, const std::string&, const Site&) {}
void writeInstance(std::string&, const InstanceValue&, const Site&, bool) {}
void writeParameter(std::string&, std::string_view, const Value&, const Site&) {}
void writeNamedInstances(std::string&, const std::vector<InstanceValue>&, const Site&, bool) {}
void writeObjectsWithPath(std::string&, const std::vector<InstanceValue>&, const Site&, bool) {}
void writeInstancesWithPath(std::string&, const std::vector<InstanceValue>&, const Site&, bool) {}
void writeInstanceNames(std::string&, const std::vector<ObjectPathValue>&, const Site&) {}
void writeInstancePaths(std::string&, const std::vector<ObjectPathValue>&, const Site&) {}
void writeObjectPaths(std::string&, const std::vector<ObjectPathValue>&, const Site&) {}

}  // namespace cmpihost::server
