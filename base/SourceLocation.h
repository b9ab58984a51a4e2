#ifndef BASE_SOURCE_LOCATION_H
#define BASE_SOURCE_LOCATION_H

namespace base {

/// A place in the source: the unqualified name of a function, and a line.
struct SourceLocation {
    const char* function;
    unsigned int line;

    /// As a default argument: where the function that has it is called.
    static constexpr SourceLocation current(const char* function = __builtin_FUNCTION(),
                                            unsigned int line = __builtin_LINE()) {
        return {function, line};
    }

    /// The caller's line under another name, for code that stands in for several functions.
    static constexpr SourceLocation named(const char* function,
                                          unsigned int line = __builtin_LINE()) {
        return {function, line};
    }
};

}  // namespace base

#endif
