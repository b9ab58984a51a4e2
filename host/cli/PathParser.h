#ifndef HOST_CLI_PATH_PARSER_H
#define HOST_CLI_PATH_PARSER_H

#include <stdexcept>
#include <string>

#include "host/broker/ClassCatalogue.h"
#include "host/broker/Value.h"

namespace cmpihost {

/// The namespace of a path that names none.
constexpr const char* defaultNamespace = "root/cimv2";

/// What the user asked for makes no sense; what() says why, safe to print on a terminal.
class UsageError : public std::runtime_error {
  public:
    using std::runtime_error::runtime_error;
};

/// A text that is no object path. what() is three lines: the complaint, the text, and a caret under
/// the character that the complaint is about.
class PathError : public UsageError {
  public:
    /// `offset` is the byte of `text` that is meant; the size of the text means its end.
    PathError(const std::string& text, std::size_t offset, const std::string& complaint);

    std::size_t offset() const noexcept { return offset_; }
    /// The complaint alone.
    const std::string& complaint() const noexcept { return complaint_; }

  private:
    std::size_t offset_;
    std::string complaint_;
};

/// Reads a path as WBEM clients write it: `[//host/][namespace:]Class[.Key=value,...]`. A value is
/// a text in quotes (with \" and \\ for these two), an integer, TRUE or FALSE. A key that the
/// catalogue declares as a reference takes a path in quotes, one that it declares as a datetime
/// gives a datetime; a null catalogue declares nothing. Integers are CMPI_uint64, or CMPI_sint64
/// when negative, whatever the class declares: that is what clients' requests carry. A reference
/// that names no namespace is in the one of the outer path. Throws PathError.
ObjectPathValue parsePath(const std::string& text, const ClassCatalogue* catalogue);

/// The name of a namespace, as it stands in a path: names of letters, digits, '_' and '-' with '/'
/// between them. Throws PathError for any other text.
std::string parseNamespace(const std::string& text);

}  // namespace cmpihost

#endif
