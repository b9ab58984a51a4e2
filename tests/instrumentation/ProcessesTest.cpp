#include "framework/instrumentation/Linux/Processes.h"

#include <gtest/gtest.h>

namespace {

using VA::Linux::Processes;

TEST(Processes, AreTheAllDigitNames) {
    const auto processes = Processes::among(
        {"1", "self", "thread-self", "20", "meminfo", "4a", "a4", "-7", " 9", "9 ", "300", ""});
    ASSERT_TRUE(processes);
    EXPECT_EQ(processes->count(), 3u);
    EXPECT_TRUE(processes->contains(1));
    EXPECT_TRUE(processes->contains(20));
    EXPECT_TRUE(processes->contains(300));
    EXPECT_FALSE(processes->contains(4));
    EXPECT_FALSE(processes->contains(7));
    EXPECT_FALSE(processes->contains(9));
}

TEST(Processes, AreNotKnownWhereNoneIsListed) {
    EXPECT_FALSE(Processes::among({}));
    EXPECT_FALSE(Processes::among({"self", "meminfo", "stat"}));
}

TEST(Processes, MayBeMillions) {
    std::vector<std::string> names;
    for (int pid = 4194304; pid > 0; pid -= 4) names.push_back(std::to_string(pid));
    const auto processes = Processes::among(names);
    ASSERT_TRUE(processes);
    EXPECT_EQ(processes->count(), 1048576u);
    EXPECT_TRUE(processes->contains(4));
    EXPECT_FALSE(processes->contains(5));
}

}  // namespace
