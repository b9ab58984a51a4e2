#ifndef TESTS_LOAD_SOAK_OPTIONS_H
#define TESTS_LOAD_SOAK_OPTIONS_H

namespace load {

struct SoakOptions {
    unsigned long requests = 200000;  ///< in all; rounded up to whole loads, more than `settle`
    unsigned long settle = 2000;      ///< of them before the first reading; rounded up as well
    unsigned long perLoad = 250;      ///< between loading and unloading
    unsigned long threads = 1;
    bool memory = true;  ///< whether resident memory is compared
    bool report = false;
};

/// Reads the command line; throws std::invalid_argument with the usage when it is wrong.
SoakOptions soakOptions(int count, const char* const* arguments);

}  // namespace load

#endif
