#ifndef TESTS_HOST_SERVER_RESPONSE_GRAMMAR_H
#define TESTS_HOST_SERVER_RESPONSE_GRAMMAR_H

#include <string>
#include <string_view>

#include "host/server/ResponseXml.h"

/// The elements of responses.
namespace cmpihost::server::validator {

/// Whether the children of an element are as a content model has them: names in their order, each
/// with * for any number, + for at least one, ? for at most one; | between names that may stand for
/// each other; " / " between models of which one has to fit.
bool fitsContent(const Element& element, std::string_view model);

/// Complains about an element and all in it: unknown elements, attributes that are missing, unknown
/// or have no such value, children out of place, texts that are no value of their type.
void checkElement(const Element& element, const std::string& place, Complaints& complaints);

}  // namespace cmpihost::server::validator

#endif
