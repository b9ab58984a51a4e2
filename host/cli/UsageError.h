#pragma once

#include <stdexcept>

namespace cmpihost {

/// What the user asked for makes no sense; what() says why, safe to print on a terminal.
class UsageError : public std::runtime_error {
  public:
    using std::runtime_error::runtime_error;
};

}  // namespace cmpihost
