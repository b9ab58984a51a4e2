#include "host/mof/ValueMap.h"

#include <gmock/gmock.h>

#include "host/mof/MofParser.h"

namespace {

using cmpihost::ValueMap;

ValueMap mapOf(const std::string& qualifiers, const std::string& type = "uint16") {
    const auto document =
        cmpihost::mof::parse("class A { [" + qualifiers + "] " + type + " P; };", "x.mof");
    return ValueMap::of(document.classes.at(0).properties.at(0));
}

std::string nameOf(const ValueMap& map, std::int64_t number) {
    const std::string* name = map.find(number);
    return name == nullptr ? "(none)" : *name;
}

TEST(ValueMap, NamesTheListedNumbersOnly) {
    const ValueMap map = mapOf(R"(ValueMap{"0","5","0x10"}, Values{"zero","five","sixteen"})");
    EXPECT_EQ(nameOf(map, 0), "zero");
    EXPECT_EQ(nameOf(map, 5), "five");
    EXPECT_EQ(nameOf(map, 16), "sixteen");
    EXPECT_EQ(nameOf(map, 1), "(none)");
}

TEST(ValueMap, CountsFromZeroWithoutAValueMap) {
    const ValueMap map = mapOf(R"(Values{"a","b"})");
    EXPECT_EQ(nameOf(map, 1), "b");
    EXPECT_EQ(nameOf(map, 2), "(none)");
}

TEST(ValueMap, PrefersTheNarrowerRange) {
    const ValueMap map =
        mapOf(R"(ValueMap{"..","0x8000..","2","10..20"}, Values{"rest","vendor","two","tens"})");
    EXPECT_EQ(nameOf(map, 2), "two");
    EXPECT_EQ(nameOf(map, 10), "tens");
    EXPECT_EQ(nameOf(map, 20), "tens");
    EXPECT_EQ(nameOf(map, 21), "rest");
    EXPECT_EQ(nameOf(map, 0x7FFF), "rest");
    EXPECT_EQ(nameOf(map, 0x8000), "vendor");
    EXPECT_EQ(nameOf(mapOf(R"(ValueMap{"1","1"}, Values{"first","second"})"), 1), "first");
}

TEST(ValueMap, PrefersTheFirstOfTwoEqualRanges) {
    EXPECT_EQ(nameOf(mapOf(R"(ValueMap{"1..2","2..3"}, Values{"first","second"})"), 2), "first");
}

TEST(ValueMap, IsForIntegersOfEverySize) {
    for (const char* type :
         {"uint8", "sint8", "uint16", "sint16", "uint32", "sint32", "uint64", "sint64"}) {
        EXPECT_EQ(nameOf(mapOf(R"(Values{"zero"})", type), 0), "zero") << type;
    }
    for (const char* type : {"boolean", "char16", "datetime", "real32", "real64"}) {
        EXPECT_TRUE(mapOf(R"(Values{"zero"})", type).empty()) << type;
    }
}

TEST(ValueMap, TakesNumbersUpToTheLargestSignedOne) {
    const ValueMap map = mapOf(R"(ValueMap{"9223372036854775807"}, Values{"most"})", "uint64");
    EXPECT_EQ(nameOf(map, INT64_MAX), "most");
    EXPECT_THROW(mapOf(R"(ValueMap{"9223372036854775808"}, Values{"more"})", "uint64"),
                 std::runtime_error);
}

TEST(ValueMap, TakesNegativeNumbersAndRangesWithoutABeginning) {
    const ValueMap map = mapOf(R"(ValueMap{"..-5","-1"}, Values{"low","minus one"})", "sint16");
    EXPECT_EQ(nameOf(map, -6), "low");
    EXPECT_EQ(nameOf(map, -1), "minus one");
    EXPECT_EQ(nameOf(map, 0), "(none)");
}

TEST(ValueMap, IsEmptyForTextsAndForPropertiesWithoutValues) {
    EXPECT_TRUE(mapOf(R"(ValueMap{"OK"}, Values{"fine"})", "string").empty());
    EXPECT_TRUE(mapOf(R"(ValueMap{"1"})").empty());
    EXPECT_TRUE(mapOf("Key").empty());
    for (const char* integer : {"uint8", "sint8", "uint64", "sint64"})
        EXPECT_FALSE(mapOf(R"(Values{"a"})", integer).empty()) << integer;
    for (const char* other : {"boolean", "datetime", "char16", "real32", "real64"})
        EXPECT_TRUE(mapOf(R"(Values{"a"})", other).empty()) << other;
}

TEST(ValueMap, RefusesListsOfDifferentLength) {
    try {
        mapOf(R"(ValueMap{"1","2"}, Values{"a"})");
        FAIL() << "no error";
    } catch (const std::runtime_error& error) {
        EXPECT_STREQ(error.what(), "ValueMap lists 2 entries and Values 1");
    }
}

TEST(ValueMap, RefusesEntriesThatAreNoIntegers) {
    for (const char* entry : {"x", "1.5", "1..y", "", "99999999999999999999"}) {
        EXPECT_THROW(mapOf(std::string("ValueMap{\"") + entry + "\"}, Values{\"a\"}"),
                     std::runtime_error)
            << entry;
    }
}

}  // namespace
