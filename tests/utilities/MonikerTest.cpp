#include "Moniker.h"

#include <gtest/gtest.h>

#include <string>
#include <utility>

namespace {

TEST(Moniker, IsEmptyAtFirstAndSelectsNothing) {
    VA::Moniker moniker;
    EXPECT_EQ(moniker.getKeyCount(), 0U);
    EXPECT_FALSE(moniker.selectKey(0));
    std::string text = "untouched";
    moniker.getName(text);
    moniker.getValue(text);
    EXPECT_EQ(text, "untouched");
}

TEST(Moniker, KeepsItsKeysInOrder) {
    VA::Moniker moniker;
    moniker.addKey("b", "1");
    moniker.addKey("a", "2");
    moniker.addKey("b", "3");
    ASSERT_EQ(moniker.getKeyCount(), 3U);
    std::string keys;
    for (unsigned int index = 0; index < 3; ++index) {
        EXPECT_TRUE(moniker.selectKey(index));
        std::string name;
        std::string value;
        moniker.getName(name);
        moniker.getValue(value);
        keys += name + "=" + value + ";";
    }
    EXPECT_EQ(keys, "b=1;a=2;b=3;");
}

TEST(Moniker, SelectionIsKeptByAnIndexPastTheEndAndByMoreKeys) {
    VA::Moniker moniker;
    moniker.addKey("a", "1");
    EXPECT_TRUE(moniker.selectKey(0));
    EXPECT_FALSE(moniker.selectKey(moniker.getKeyCount()));
    EXPECT_FALSE(moniker.selectKey(4294967295U));
    for (int count = 0; count < 100; ++count) moniker.addKey("more", "x");
    std::string name;
    moniker.getName(name);
    EXPECT_EQ(name, "a");
}

TEST(Moniker, CopiesAreIndependent) {
    VA::Moniker original;
    original.addKey("a", "1");
    VA::Moniker copy(original);
    copy.addKey("b", "2");
    EXPECT_EQ(original.getKeyCount(), 1U);
    original = copy;
    EXPECT_EQ(original.getKeyCount(), 2U);
    copy.selectKey(0);
    const VA::Moniker moved(std::move(copy));
    EXPECT_EQ(moved.getKeyCount(), 2U);
    std::string text = "untouched";
    copy.getName(text);
    copy.getValue(text);
    EXPECT_EQ(text, "untouched");
}

}  // namespace
