#ifndef HOST_SERVER_CLASS_WRITER_H
#define HOST_SERVER_CLASS_WRITER_H

#include <cstddef>
#include <optional>
#include <string>
#include <vector>

#include "host/mof/ResolvedClass.h"

/// Writes classes and qualifiers of responses; each function appends to `xml`. Any threads may call
/// these.
namespace cmpihost::server {

/// What of a class a client wants to see.
struct ClassView {
    /// Only what the class itself declares or overrides.
    bool localOnly = false;
    bool qualifiers = true;
    bool classOrigin = false;
    /// Names without case; absent: all properties.
    std::optional<std::vector<std::string>> properties{};
};

/// CLASS. `types` are those of the schema of the class.
void writeClass(std::string& xml, const ResolvedClass& described, const QualifierTypes& types,
                const ClassView& view);

/// Throws CimError with cimServerLimitsExceeded for an answer with so many bytes of classes that
/// nobody can use it, as a whole CIM schema makes it; `instead` is what a client may ask for.
void checkClassBytes(std::size_t bytes, const std::string& instead);

/// QUALIFIER.DECLARATION.
void writeQualifierDeclaration(std::string& xml, const mof::QualifierType& type);

}  // namespace cmpihost::server

#endif
