#ifndef HOST_SERVER_STANDARD_QUALIFIERS_H
#define HOST_SERVER_STANDARD_QUALIFIERS_H

#include <vector>

#include "host/mof/Schema.h"

namespace cmpihost::server {

/// The declarations of qualifiers that a client may ask for, in alphabetical order: those of the
/// schema, and of those that the CIM standard defines the ones that classes commonly use and that
/// the schema does not declare. Any thread may call it.
std::vector<mof::QualifierType> qualifierTypes(const Schema& schema);

}  // namespace cmpihost::server

#endif
