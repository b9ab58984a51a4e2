#include <gtest/gtest.h>

#include "framework/logging/Configuration.h"

namespace {

using ZBLog::CategoryFilter;

CategoryFilter filterOf(std::initializer_list<const char*> patterns) {
    CategoryFilter filter;
    for (const char* pattern : patterns) filter.add(pattern);
    return filter;
}

TEST(CategoryFilter, LetsEverythingPassWithoutPatterns) {
    EXPECT_TRUE(CategoryFilter().passes("Zumbrel.OSStatusProvider"));
    EXPECT_TRUE(CategoryFilter().passes(""));
}

TEST(CategoryFilter, ComparesWholeNamesAndLetterCase) {
    const CategoryFilter filter = filterOf({"Zumbrel.OSStatusProvider"});
    EXPECT_TRUE(filter.passes("Zumbrel.OSStatusProvider"));
    EXPECT_FALSE(filter.passes("Zumbrel.OSStatusProvider2"));
    EXPECT_FALSE(filter.passes("Zumbrel.OSStatus"));
    EXPECT_FALSE(filter.passes("zumbrel.osstatusprovider"));
    EXPECT_FALSE(filter.passes(""));
}

TEST(CategoryFilter, TakesAStarForAnyContinuation) {
    const CategoryFilter filter = filterOf({"Zumbrel.*"});
    EXPECT_TRUE(filter.passes("Zumbrel.OperatingSystemProvider"));
    EXPECT_TRUE(filter.passes("Zumbrel."));
    EXPECT_FALSE(filter.passes("Zumbrel"));
    EXPECT_FALSE(filter.passes("Other.Zumbrel."));
}

TEST(CategoryFilter, LetsPassWhatOneOfSeveralPatternsMatches) {
    const CategoryFilter filter = filterOf({"A", "B*"});
    EXPECT_TRUE(filter.passes("A"));
    EXPECT_TRUE(filter.passes("Bee"));
    EXPECT_FALSE(filter.passes("C"));
}

TEST(CategoryFilter, LetsEverythingPassForAStarAlone) {
    EXPECT_TRUE(filterOf({"*"}).passes("Zumbrel.OSStatusProvider"));
    EXPECT_TRUE(filterOf({"*"}).passes(""));
}

}  // namespace
