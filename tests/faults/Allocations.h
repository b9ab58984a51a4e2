#ifndef TESTS_FAULTS_ALLOCATIONS_H
#define TESTS_FAULTS_ALLOCATIONS_H

#include <cstddef>

/// The program's own operator new: lets allocations fail, or measures them, that the facade, the
/// provider or one of the framework's libraries asks for, in its own code or through the C++
/// library. Those that the broker, the log of the test and the test itself ask for, never fail and
/// are not measured. All for one thread, and either of the two at a time.
namespace allocations {

/// From now on until release(), the n-th allocation (from 1) of the libraries throws
/// std::bad_alloc, and with `andLater` each one after it. The libraries are loaded.
void failFrom(std::size_t n, bool andLater);

/// Nothing fails any more. Says how many did.
std::size_t release();

/// What the libraries asked for while they were measured.
struct Usage {
    std::size_t allocations = 0;  ///< in all
    std::size_t peak = 0;         ///< most bytes that were in use at once
    std::size_t left = 0;         ///< bytes that were still in use at the end
};

/// Measures from now on until measured(). What is in use already does not count. The libraries are
/// loaded.
void measure();
Usage measured();

/// How many blocks of operator new are in use, whoever asked for them.
std::size_t blocksInUse();

}  // namespace allocations

#endif
