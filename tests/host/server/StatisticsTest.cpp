#include "host/server/Statistics.h"

#include <gtest/gtest.h>

namespace cmpihost::server {
namespace {

TEST(Statistics, CountOperationsAndTheirTime) {
    Statistics statistics;
    statistics.countOperation(std::chrono::nanoseconds(300), false);
    statistics.countOperation(std::chrono::nanoseconds(700), true);
    statistics.countRefusal();
    for (int count = 0; count < 3; ++count) statistics.countCut();
    EXPECT_EQ(statistics.operations(), 2U);
    EXPECT_EQ(statistics.failures(), 1U);
    EXPECT_EQ(statistics.refusals(), 1U);
    EXPECT_EQ(statistics.cuts(), 3U);
    EXPECT_EQ(statistics.busyTime(), std::chrono::nanoseconds(1000));
}

}  // namespace
}  // namespace cmpihost::server
