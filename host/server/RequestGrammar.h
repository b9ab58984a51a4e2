#ifndef HOST_SERVER_REQUEST_GRAMMAR_H
#define HOST_SERVER_REQUEST_GRAMMAR_H

#include <optional>
#include <string>

#include "host/server/XmlTree.h"

/// Which elements a request message has, and what is in them.
namespace cmpihost::server {

/// What is wrong with an element and all that is in it, in ASCII; none: nothing. Attributes that
/// are not known do not count. Any thread may call it.
std::optional<std::string> structuralError(const XmlElement& element);

}  // namespace cmpihost::server

#endif
