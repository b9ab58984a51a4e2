#ifndef VA_PROVIDER_EXCEPTION_H
#define VA_PROVIDER_EXCEPTION_H

#include "TextException.h"

namespace VA {

/// Another provider, asked through the broker, did not deliver what a request needs.
class __attribute__((visibility("default"))) ProviderException : public TextException {
  public:
    /// Copies `text`, which must not be null. Throws std::bad_alloc.
    explicit ProviderException(const char* text) : TextException(text) {}
};

}  // namespace VA

#endif
