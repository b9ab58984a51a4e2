#ifndef TESTS_HOST_SERVER_RESPONSE_XML_H
#define TESTS_HOST_SERVER_RESPONSE_XML_H

#include <optional>
#include <string>
#include <utility>
#include <vector>

/// The XML of a response: its bytes and its tree.
namespace cmpihost::server::validator {

using Complaints = std::vector<std::string>;

struct Element {
    std::string name{};
    std::vector<std::pair<std::string, std::string>> attributes{};
    std::vector<Element> children{};
    std::string text{};

    /// The value of an attribute, null for none.
    const std::string* attribute(const std::string& attributeName) const;
};

/// The tree of a document; none, and a complaint, where it is no well-formed UTF-8 XML.
std::optional<Element> readTree(const std::string& document, Complaints& complaints);

/// Complains about what parsers allow but some clients do not read: no declaration at the very
/// beginning, self-closing tags, comments and the like, references to characters, attributes in
/// single quotes, bare white space that a parser changes.
void checkBytes(const std::string& document, Complaints& complaints);

}  // namespace cmpihost::server::validator

#endif
