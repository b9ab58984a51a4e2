#include "host/server/ClassWriter.h"

namespace cmpihost::server {

void writeClass(std::string&, const ResolvedClass&, const ClassView&) {}
void writeQualifierDeclaration(std::string&, const mof::QualifierType&) {}

}  // namespace cmpihost::server
