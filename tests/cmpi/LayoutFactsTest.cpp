// The binary interface of CMPI 2.0, fact by fact: sizes, alignments, offsets, members, constants.
// The *Facts.inc tables hold the numbers of both word sizes. The compiler checks the facts; the
// tests check that none is missing from the tables.
#include <cmpi/cmpidt.h>
#include <cmpi/cmpift.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <cstddef>
#include <fstream>
#include <iostream>
#include <map>
#include <set>
#include <sstream>
#include <string>
#include <string_view>
#include <type_traits>

#include "FieldCount.h"

#ifndef KORVA_CMPI_CMPIDT_H
#error "These tests are about the headers in include/cmpi"
#endif

namespace {

using cmpi_test::fieldCount;

struct Fact {
    const char* kind;
    const char* name;
    long long value;
};

// Where the fact does not hold this is no constant, and the compiler points at the fact's row.
constexpr Fact checked(const char* kind, const char* name, long long actual, long long expected) {
    return actual == expected ? Fact{kind, name, actual} : throw "the fact does not hold";
}

constexpr long long here(long long in32, long long in64) {
    return sizeof(void*) == 4 ? in32 : in64;
}

template <class T>
constexpr long long number(T value) {
    return static_cast<long long>(value);
}

constexpr Fact facts[] = {
#define TYPE(type, size32, size64, align32, align64)                      \
    checked("sizeof", #type, number(sizeof(type)), here(size32, size64)), \
        checked("alignof", #type, number(alignof(type)), here(align32, align64)),
#define SIGNED(kind, tag, type, isSigned) checked(kind, #tag, std::is_signed_v<type>, isSigned),
#define ENUM(tag, size32, size64, align32, align64, isSigned) \
    TYPE(tag, size32, size64, align32, align64)               \
    SIGNED("enumsigned", tag, std::underlying_type_t<tag>, isSigned)
#define ARITHMETIC(type, isFloat, isSigned)                           \
    checked("float", #type, std::is_floating_point_v<type>, isFloat), \
        SIGNED("signed", type, type, isSigned)
#include "TypeFacts.inc"
#define UNION(tag, isUnion, members) checked("isunion", #tag, std::is_union_v<tag>, isUnion),
#define RECORD(tag, isUnion, members) \
    UNION(tag, isUnion, members)      \
    checked("nfields", #tag, number(fieldCount<tag>()), members),
#include "RecordFacts.inc"
#undef UNION
#undef RECORD
#define FIELD(tag, member, offset32, offset64, size32, size64)           \
    checked("offsetof", #tag "." #member, number(offsetof(tag, member)), \
            here(offset32, offset64)),                                   \
        checked("sizeof", #tag "." #member, number(sizeof(tag::member)), here(size32, size64)),
#include "FieldFacts.inc"
#define CONSTANT(macro, value) checked("const", #macro, macro, value),
#define TEXT(macro, value) checked("str", #macro, std::string_view(macro) == value, true),
#include "ConstantFacts.inc"
#define ENUMERATOR(tag, name, value) checked("enum", #tag "." #name, number(tag::name), value),
#include "EnumeratorFacts.inc"
};

// Text between the braces of a definition in a header of include/cmpi.
std::string bodyOf(const std::string& header, const std::string& definition) {
    std::ifstream in(KORVA_SOURCE_DIR "/include/cmpi/" + header);
    std::ostringstream text;
    text << in.rdbuf();
    const std::size_t start = text.str().find(definition + " {");
    const std::size_t end = text.str().find('}', start);
    return start == std::string::npos ? std::string() : text.str().substr(start, end - start);
}

// No expression counts the members of a union: the header itself is read for this one fact.
TEST(CmpiLayout, TheUnionHasTheMembersOfTheBinaryInterface) {
    int unions = 0;
#define RECORD(tag, isUnion, members)
#define UNION(tag, isUnion, members)                                           \
    {                                                                          \
        const std::string body = bodyOf("cmpidt.h", "union " #tag);            \
        EXPECT_EQ(std::count(body.begin(), body.end(), ';'), members) << #tag; \
        ++unions;                                                              \
    }
#include "RecordFacts.inc"
    EXPECT_EQ(unions, 1);
    std::cout << "checked facts: " << unions << " in the text of the header\n";
}

TEST(CmpiLayout, NoFactIsMissingOrCountedTwice) {
    std::map<std::string, int> count;
    std::set<std::string> names;
    for (const Fact& fact : facts) {
        ++count[fact.kind];
        names.insert(std::string(fact.kind) + "." + fact.name);
    }
    const std::map<std::string, int> expected = {
        {"alignof", 87}, {"const", 111},  {"enum", 197},   {"enumsigned", 9},
        {"float", 17},   {"isunion", 47}, {"nfields", 46}, {"offsetof", 324},
        {"signed", 17},  {"sizeof", 411}, {"str", 6}};
    EXPECT_EQ(count, expected);
    EXPECT_EQ(names.size(), 1272u);
    std::cout << "checked facts: " << names.size() << " in " << 8 * sizeof(void*) << "-bit\n";
}

TEST(CmpiLayout, EveryMemberOfARecordHasItsFacts) {
    std::map<std::string, long long> rows;
    for (const Fact& fact : facts) {
        const std::string name = fact.name;
        if (fact.kind == std::string("offsetof")) {
            ++rows[name.substr(0, name.find('.'))];
        }
    }
    for (const Fact& fact : facts) {
        if (fact.kind == std::string("nfields")) {
            EXPECT_EQ(rows[fact.name], fact.value) << fact.name;
        }
    }
    EXPECT_EQ(rows["_CMPIValue"], 28);
}

TEST(CmpiLayout, ABareInitialiserOfAValueSetsItsLongestInteger) {
    const CMPIValue value = {0xFEDCBA9876543210ULL};
    EXPECT_EQ(value.uint64, 0xFEDCBA9876543210ULL);
}

// Values that pass by value must be plain data, or C++ would pass them differently from C.
static_assert(std::is_trivially_copyable_v<CMPIStatus> && std::is_standard_layout_v<CMPIStatus>);
static_assert(std::is_trivially_copyable_v<CMPIData> && std::is_standard_layout_v<CMPIData>);

// Tables can be constants of the compiler and can be assigned.
constexpr CMPIAssociationMIFT constantTable = {CMPICurrentVersion,
                                               CMPICurrentVersion,
                                               "constant",
                                               nullptr,
                                               nullptr,
                                               nullptr,
                                               nullptr,
                                               nullptr};
static_assert(constantTable.miVersion == 200);
static_assert(std::is_copy_assignable_v<CMPIAssociationMIFT>);
static_assert(std::is_copy_assignable_v<CMPISelectCondFT>);
static_assert(std::is_copy_assignable_v<CMPIBrokerMemFT>);

}  // namespace
