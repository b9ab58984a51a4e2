#ifndef VA_TEXT_EXCEPTION_H
#define VA_TEXT_EXCEPTION_H

#include <exception>
#include <string>

namespace VA {

/// What the framework's exceptions have in common: a text, and nothing else.
///
/// The exception owns a copy of the text; a copied exception owns a copy of its own.
class __attribute__((visibility("default"))) TextException : public std::exception {
  public:
    /// The text, NUL-terminated; valid while this exception object lives. Never null.
    const char* what() const noexcept override { return message_.c_str(); }

  protected:
    /// Copies `text`, which must not be null. Throws std::bad_alloc.
    explicit TextException(const char* text) : message_(text) {}

  private:
    std::string message_;
};

}  // namespace VA

#endif
