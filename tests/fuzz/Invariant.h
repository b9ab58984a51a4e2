// What a fuzz target expects beyond not crashing.
#ifndef TESTS_FUZZ_INVARIANT_H
#define TESTS_FUZZ_INVARIANT_H

#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <string>
#include <string_view>

namespace fuzz {

/// Prints the text and ends the program, which libFuzzer counts as a finding.
[[noreturn]] inline void broken(const std::string& invariant) {
    std::fprintf(stderr, "Broken invariant: %s\n", invariant.c_str());
    std::abort();
}

/// `invariant` is a sentence that holds.
inline void expect(bool holds, const char* invariant) {
    if (!holds) broken(invariant);
}

/// The input as text.
inline std::string_view textOf(const std::uint8_t* data, std::size_t size) {
    return {reinterpret_cast<const char*>(data), size};
}

}  // namespace fuzz

#endif
