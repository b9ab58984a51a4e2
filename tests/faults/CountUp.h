#ifndef TESTS_FAULTS_COUNT_UP_H
#define TESTS_FAULTS_COUNT_UP_H

#include <gtest/gtest.h>

#include <cstddef>

#include "faults/Allocations.h"

/// Calls `trial` with 1, 2, 3 and so on until it returns false: with that number nothing failed any
/// more. Returns the number. A fatal failure ends it too.
template <class Trial>
std::size_t countUp(const char* what, Trial trial) {
    constexpr std::size_t most = 20000;  // no request has so many calls or allocations
    for (std::size_t n = 1; n < most; ++n) {
        SCOPED_TRACE(testing::Message() << what << ' ' << n);
        if (!trial(n) || testing::Test::HasFatalFailure()) return n;
    }
    ADD_FAILURE() << what << ": something fails without end";
    return most;
}

/// The same for allocations; checks that no trial leaves a block behind. The first failure may have
/// made the log keep one buffer more.
template <class Trial>
std::size_t countAllocationsUp(Trial trial) {
    std::size_t before = 0;
    return countUp("allocation", [&](std::size_t n) {
        const bool failed = trial(n);
        const std::size_t after = allocations::blocksInUse();
        if (n > 1) {
            EXPECT_EQ(after, before);
        }
        before = after;
        return failed;
    });
}

#endif
