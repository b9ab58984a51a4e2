#ifndef TESTS_FAULTS_EXCEPTION_KINDS_H
#define TESTS_FAULTS_EXCEPTION_KINDS_H

#include <exception>
#include <new>
#include <ostream>
#include <stdexcept>
#include <string>

#include "FrameworkException.h"
#include "InstrumentationException.h"
#include "ProviderException.h"

struct OwnException : std::exception {
    const char* what() const noexcept override { return "own"; }
};
struct ForeignType {
    std::string text = "a text that has to be given back to the heap";
};

/// What is thrown, and the text of the message that it leaves; no text: it is of a foreign type.
struct ExceptionKind {
    const char* name;
    void (*raise)();
    const char* text;
};

inline std::ostream& operator<<(std::ostream& out, const ExceptionKind& kind) {
    return out << kind.name;
}

inline const ExceptionKind exceptionKinds[] = {
    {"FrameworkException", [] { throw VA::FrameworkException("framework"); }, "framework"},
    {"ProviderException", [] { throw VA::ProviderException("provider"); }, "provider"},
    {"InstrumentationException", [] { throw VA::InstrumentationException("host"); }, "host"},
    {"RuntimeError", [] { throw std::runtime_error("runtime"); }, "runtime"},
    {"BadAlloc", [] { throw std::bad_alloc(); }, "std::bad_alloc"},
    {"OwnException", [] { throw OwnException(); }, "own"},
    {"Integer", [] { throw 42; }, nullptr},
    {"Structure", [] { throw ForeignType(); }, nullptr},
    {"Characters", [] { throw "characters"; }, nullptr},
};

#endif
