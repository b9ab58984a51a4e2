#ifndef VA_FRAMEWORK_EXCEPTION_H
#define VA_FRAMEWORK_EXCEPTION_H

#include "TextException.h"

namespace VA {

/// An identity that cannot be mapped: a moniker lacks the key that the far end is named by.
class __attribute__((visibility("default"))) FrameworkException : public TextException {
  public:
    /// Copies `text`, which must not be null. Throws std::bad_alloc.
    explicit FrameworkException(const char* text) : TextException(text) {}
};

}  // namespace VA

#endif
