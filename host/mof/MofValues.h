#pragma once

#include "host/mof/MofTokens.h"

namespace cmpihost::mof {

/// Reads constants: NULL, TRUE, FALSE, numbers, characters, strings (those side by side are
/// joined) and lists of them in braces. Throws MofError.
class Values {
  public:
    /// tokens must outlive the reader.
    explicit Values(Tokens& tokens) : tokens_(tokens) {}

    /// A list in braces (or NULL) when array is true, one constant otherwise.
    Value value(bool array);

    /// One constant, or the list that some writers put in parentheses.
    Value scalarValue();

    /// What an instance gives to a property: a constant, a list or an alias ($name, read as text).
    Value anyValue();

  private:
    Scalar scalar();
    Value list();

    Tokens& tokens_;
};

}  // namespace cmpihost::mof
