// The binary interface of CMPI 2.0. A provider and an object manager that were compiled apart agree
// on it or crash, so each record, slot and constant is written down once more (Records.inc,
// Constants.inc), with scalars resolved: the order and the exact types of the members give every
// offset, and the sizes of the records in both word sizes are held against that.
#include <cmpi/cmpidt.h>
#include <cmpi/cmpift.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <cstddef>
#include <fstream>
#include <initializer_list>
#include <sstream>
#include <string>
#include <string_view>
#include <type_traits>
#include <utility>

#ifndef KORVA_CMPI_CMPIDT_H
#error "These tests are about the headers in include/cmpi"
#endif

// Level100.c, compiled at that level: what its headers and stubs state of themselves.
extern "C" int level100Version(void);
extern "C" int level100StubVersion(void);

namespace {

using Uint = unsigned int;
using Ushort = unsigned short;
using Uchar = unsigned char;
using Text = const char*;
using Texts = const char**;
using StringOut = CMPIString**;
using Rc = CMPIStatus*;
using Broker = const CMPIBroker*;
using Context = const CMPIContext*;
using Result = const CMPIResult*;
using Path = const CMPIObjectPath*;
using Instance = const CMPIInstance*;
using Value = const CMPIValue*;

// A const on a member itself does not count: it changes neither layout nor calls, and these headers
// leave it out so that tables can be assigned.
template <class Actual, class Expected>
constexpr bool isMember = std::is_same_v<std::remove_const_t<Actual>, std::decay_t<Expected>>;

template <class Enumeration>
constexpr bool areConsecutive(int first, std::initializer_list<Enumeration> enumerators) {
    for (const Enumeration each : enumerators)
        if (static_cast<int>(each) != first++) return false;
    return true;
}

constexpr std::size_t here(std::size_t in32, std::size_t in64) {
    return sizeof(void*) == 4 ? in32 : in64;
}

// The compiler checks what is of one type or of one value.
#define RECORD(type, size32, size64)                     \
    static_assert(std::is_same_v<type, _##type>, #type); \
    static_assert(sizeof(type) == here(size32, size64) && alignof(type) == sizeof(void*), #type);
#define UNION(type, size32, size64) RECORD(type, size32, size64)
#define MEMBER(type, member, ...)                                \
    static_assert(isMember<decltype(type::member), __VA_ARGS__>, \
                  #type "." #member " is not " #__VA_ARGS__);
#include "Records.inc"
#undef RECORD
#undef UNION
#undef MEMBER

#define ALIAS(type, ...) \
    static_assert(std::is_same_v<type, __VA_ARGS__>, #type " is not " #__VA_ARGS__);
#define ENUMERATION(type)                                                            \
    static_assert(std::is_same_v<type, _##type> &&                                   \
                      std::is_same_v<std::underlying_type_t<_##type>, unsigned int>, \
                  #type);
#define CONSECUTIVE(tag, first, ...) static_assert(areConsecutive<tag>(first, {__VA_ARGS__}), #tag);
#define CONSTANT(macro, value) static_assert((macro) == (value), #macro);
#define TYPE(macro, value) CONSTANT(macro, value) CONSTANT(macro##A, (value) + 8192)
#define TEXT(macro, value) static_assert(std::string_view(macro) == value, #macro);
#include "Constants.inc"

/// What a row of Records.inc says of a member, or of a record when there is no member.
struct Row {
    std::string record;
    const char* member;
    std::size_t offset;
    std::size_t size;
    std::size_t alignment;
};

const Row rows[] = {
#define RECORD(type, ...) {#type, nullptr, 0, sizeof(type), alignof(type)},
#define UNION(type, ...) RECORD(type, __VA_ARGS__)
#define MEMBER(type, member, ...) \
    {#type, #member, offsetof(type, member), sizeof(type::member), alignof(decltype(type::member))},
#include "Records.inc"
#undef RECORD
#undef UNION
#undef MEMBER
};

std::size_t roundedUp(std::size_t size, std::size_t alignment) {
    return (size + alignment - 1) / alignment * alignment;
}

TEST(CmpiLayout, EachMemberFollowsTheOneBeforeItAndTheLastOneEndsTheRecord) {
    const Row* record = nullptr;
    std::size_t end = 0;
    const auto expectFilled = [&] {
        if (record != nullptr) {
            EXPECT_EQ(roundedUp(end, record->alignment), record->size) << record->record;
        }
    };
    for (const Row& row : rows) {
        if (row.member == nullptr) {
            expectFilled();
            record = &row;
            end = 0;
            continue;
        }
        ASSERT_EQ(row.record, record->record);
        const bool ofUnion = row.record == "CMPIValue";
        EXPECT_EQ(row.offset, ofUnion ? 0 : roundedUp(end, row.alignment))
            << row.record << '.' << row.member;
        end = ofUnion ? std::max(end, row.size) : row.offset + row.size;
    }
    expectFilled();
}

// Stands for a value of any type in an initialiser.
struct Anything {
    template <class T>
    operator T() const;
};

template <class Record, class Void, class... Members>
struct CanStartWith : std::false_type {};
template <class Record, class... Members>
struct CanStartWith<Record, std::void_t<decltype(Record{std::declval<Members>()...})>, Members...>
    : std::true_type {};

// Number of members of an aggregate of scalars and records. A union counts as one.
template <class Record, class... Members>
constexpr long memberCount() {
    if constexpr (CanStartWith<Record, void, Members..., Anything>::value)
        return memberCount<Record, Members..., Anything>();
    else
        return sizeof...(Members);
}

long rowsOf(const std::string& record) {
    return std::count_if(std::begin(rows), std::end(rows), [&](const Row& row) {
        return row.record == record && row.member != nullptr;
    });
}

// Text between the braces of a definition in cmpidt.h.
std::string bodyOf(const std::string& definition) {
    std::ifstream header(KORVA_SOURCE_DIR "/include/cmpi/cmpidt.h");
    std::ostringstream text;
    text << header.rdbuf();
    const std::size_t start = text.str().find(definition + " {");
    return start == std::string::npos
               ? std::string()
               : text.str().substr(start, text.str().find('}', start) - start);
}

TEST(CmpiLayout, NoMemberIsWithoutARow) {
#define RECORD(type, ...) EXPECT_EQ(rowsOf(#type), memberCount<type>()) << #type;
// No expression counts the members of a union: the header itself is read.
#define UNION(type, ...)                                                     \
    {                                                                        \
        static_assert(std::is_union_v<type>);                                \
        const std::string body = bodyOf("union _" #type);                    \
        EXPECT_EQ(std::count(body.begin(), body.end(), ';'), rowsOf(#type)); \
    }
#define MEMBER(...)
#include "Records.inc"
#undef RECORD
#undef UNION
#undef MEMBER
}

TEST(CmpiLayout, ABareInitialiserOfAValueSetsItsLongestInteger) {
    const CMPIValue value = {0xFEDCBA9876543210ULL};
    EXPECT_EQ(value.uint64, 0xFEDCBA9876543210ULL);
}

// Values that pass by value must be plain data, or C++ would pass them differently from C.
static_assert(std::is_trivially_copyable_v<CMPIStatus> && std::is_standard_layout_v<CMPIStatus>);
static_assert(std::is_trivially_copyable_v<CMPIData> && std::is_standard_layout_v<CMPIData>);

// Tables can be constants of the compiler and can be assigned.
constexpr CMPIMethodMIFT constantTable = {CMPICurrentVersion, CMPICurrentVersion, "constant",
                                          nullptr, nullptr};
static_assert(constantTable.miVersion == 200);
static_assert(std::is_copy_assignable_v<CMPIAssociationMIFT>);
static_assert(std::is_copy_assignable_v<CMPISelectCondFT>);
static_assert(std::is_copy_assignable_v<CMPIBrokerMemFT>);

TEST(CmpiLevel100, HeadersAndStubsStateLevel100) {
    EXPECT_EQ(level100Version(), 100);
    EXPECT_EQ(level100StubVersion(), 100);
}

}  // namespace
