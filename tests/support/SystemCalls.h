#ifndef TESTS_SUPPORT_SYSTEM_CALLS_H
#define TESTS_SUPPORT_SYSTEM_CALLS_H

#include <functional>
#include <optional>
#include <vector>

/// The numbers of the system calls that `work` makes, but for those that move the end of the heap,
/// in order, in a child of this process that did `work` a few times before. Nothing where this
/// process may not trace a child, or the child fails.
std::optional<std::vector<long>> systemCallsOf(const std::function<void()>& work);

#endif
