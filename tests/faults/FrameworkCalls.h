#ifndef TESTS_FAULTS_FRAMEWORK_CALLS_H
#define TESTS_FAULTS_FRAMEWORK_CALLS_H

#include <cstddef>
#include <functional>

/// Calls of the framework's functions, which are compiled into the program so that each tells when
/// it is entered. All for one thread.
namespace frameworkCalls {

/// From now on until release(), `raise` is called on entering the n-th function (from 1), and what
/// it throws leaves that function before it has done anything. Functions that promise not to throw
/// are not counted.
void throwFrom(std::size_t n, std::function<void()> raise);

/// Nothing is thrown any more. True when it was.
bool release();

}  // namespace frameworkCalls

#endif
