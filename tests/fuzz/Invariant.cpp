// A broken invariant must look to libFuzzer like a crash, with a text that tells it from another.
#include "fuzz/Invariant.h"

#include <cstdio>
#include <cstdlib>

namespace fuzz {

void broken(const std::string& invariant) {
    std::fprintf(stderr, "Broken invariant: %s\n", invariant.c_str());
    std::abort();
}

}  // namespace fuzz
