#include <gtest/gtest.h>

#include "Level100.h"

namespace {

TEST(CmpiLevel100, TablesEndWhereLevel200Begins) {
    std::size_t count = 0;
    const Level100Fact* facts = level100Facts(&count);
    EXPECT_EQ(count, 29u);
    for (std::size_t i = 0; i < count; ++i) {
        EXPECT_EQ(facts[i].actual, sizeof(void*) == 4 ? facts[i].in32 : facts[i].in64)
            << facts[i].name;
    }
}

TEST(CmpiLevel100, CurrentVersionIs100) {
    EXPECT_EQ(level100Version(), 100);
}

TEST(CmpiLevel100, AStubStatesLevel100) {
    EXPECT_EQ(level100StubVersion(), 100);
}

}  // namespace
