// Turns bytes into what a client, a broker or a host may say. Every input has a meaning; where it
// ends, the plainest choice is taken.
#ifndef TESTS_FUZZ_DECODER_H
#define TESTS_FUZZ_DECODER_H

#include <fuzzer/FuzzedDataProvider.h>

#include <cstdint>
#include <optional>
#include <string>

#include "host/broker/Value.h"

namespace fuzz {

class Decoder {
  public:
    Decoder(const std::uint8_t* data, std::size_t size) : input_(data, size) {}

    bool flag() { return input_.ConsumeBool(); }
    std::uint64_t number() { return input_.ConsumeIntegral<std::uint64_t>(); }
    std::uint64_t numberUpTo(std::uint64_t most) {
        return input_.ConsumeIntegralInRange<std::uint64_t>(0, most);
    }
    std::string text(std::size_t most = 4096) { return input_.ConsumeRandomLengthString(most); }

    template <class T, std::size_t size>
    const T& pick(const T (&choices)[size]) {
        return choices[numberUpTo(size - 1)];
    }

    /// One of the choices, or any text.
    template <std::size_t size>
    std::string textLike(const char* const (&choices)[size]) {
        const auto choice = numberUpTo(size);
        return choice < size ? choices[choice] : text();
    }

    /// The name of a class that the provider knows, of one that it does not, or any text.
    std::string className();
    /// Any text or none, with a name of a class as the likely one.
    std::optional<std::string> optionalClassName();
    std::optional<std::string> optionalText();

    CMPIrc status();

    /// A value of any type that a key or a property can have; references and arrays nest `depth`
    /// times at most.
    cmpihost::Value value(unsigned depth = 2);

    /// A path of any class with any keys, or one that the provider gives out, changed at will.
    cmpihost::ObjectPathValue path(unsigned depth = 2);
    cmpihost::InstanceValue instance(unsigned depth = 2);

  private:
    cmpihost::Value scalar(CMPIType type);
    cmpihost::Value array(unsigned depth);
    cmpihost::ObjectPathValue knownPath();

    FuzzedDataProvider input_;
};

}  // namespace fuzz

#endif
