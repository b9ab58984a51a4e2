// The type of every typedef, member and function slot. The *Signatures.inc tables resolve typedefs
// of scalars, so that a change of one shows too. A const on a member itself does not count: it
// changes neither layout nor calls, and these headers leave it out so that tables can be assigned.
#include <cmpi/cmpidt.h>
#include <cmpi/cmpift.h>
#include <gtest/gtest.h>

#include <iostream>
#include <set>
#include <string>
#include <type_traits>

namespace {

template <class Actual, class Expected>
constexpr bool same = std::is_same_v<std::remove_const_t<Actual>, std::remove_const_t<Expected>>;

#define ALIAS(type, ...) static_assert(same<type, __VA_ARGS__>, #type " is not " #__VA_ARGS__);
#define MEMBER(type, member, ...)                            \
    static_assert(same<decltype(type::member), __VA_ARGS__>, \
                  #type "." #member " is not " #__VA_ARGS__);
#include "BrokerSignatures.inc"
#include "MiSignatures.inc"
#include "ObjectSignatures.inc"
#include "TypeSignatures.inc"
#undef ALIAS
#undef MEMBER

constexpr const char* checkedTypes[] = {
#define ALIAS(type, ...) #type,
#define MEMBER(type, member, ...) #type "." #member,
#include "BrokerSignatures.inc"
#include "MiSignatures.inc"
#include "ObjectSignatures.inc"
#include "TypeSignatures.inc"
};

TEST(CmpiSignatures, NoTypeIsMissingOrCountedTwice) {
    const std::set<std::string> names(std::begin(checkedTypes), std::end(checkedTypes));
    EXPECT_EQ(std::size(checkedTypes), 404u);
    EXPECT_EQ(names.size(), 404u);
    std::cout << "checked types: " << std::size(checkedTypes) << "\n";
}

TEST(CmpiSignatures, EveryMemberWithAnOffsetHasAType) {
    const std::set<std::string> names(std::begin(checkedTypes), std::end(checkedTypes));
    const char* const members[] = {
#define FIELD(tag, member, ...) #tag "." #member,
#include "FieldFacts.inc"
    };
    for (const std::string member : members) {
        EXPECT_EQ(names.count(member.substr(1)), 1u) << member;
    }
}

}  // namespace
