#ifndef VA_INSTRUMENTATION_EXCEPTION_H
#define VA_INSTRUMENTATION_EXCEPTION_H

#include "TextException.h"

namespace VA {

/// A request names an element that the instrumentation does not have.
class __attribute__((visibility("default"))) InstrumentationException : public TextException {
  public:
    /// Copies `text`, which must not be null. Throws std::bad_alloc.
    explicit InstrumentationException(const char* text);
};

inline InstrumentationException::InstrumentationException(const char* text) : TextException(text) {}

}  // namespace VA

#endif
