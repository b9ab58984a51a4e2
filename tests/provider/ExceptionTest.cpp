#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <type_traits>

#include "FrameworkException.h"
#include "InstrumentationException.h"
#include "ProviderException.h"

namespace {

template <class Exception>
class Exceptions : public testing::Test {};

using All =
    testing::Types<VA::FrameworkException, VA::ProviderException, VA::InstrumentationException>;
TYPED_TEST_SUITE(Exceptions, All, );

TYPED_TEST(Exceptions, WhatReturnsTheTextExactly) {
    const TypeParam exception("Object Not Found.");
    EXPECT_STREQ(exception.what(), "Object Not Found.");
}

TYPED_TEST(Exceptions, TextIsACopyThatLivesAsLongAsTheException) {
    auto text = std::make_unique<std::string>("Could not find 'Name' Key in Moniker");
    const TypeParam exception(text->c_str());
    text.reset();
    EXPECT_STREQ(exception.what(), "Could not find 'Name' Key in Moniker");
}

TYPED_TEST(Exceptions, CopyCarriesItsOwnText) {
    auto original = std::make_unique<TypeParam>("x");
    const TypeParam copy(*original);
    EXPECT_NE(copy.what(), original->what());
    original.reset();
    EXPECT_STREQ(copy.what(), "x");
}

TYPED_TEST(Exceptions, IsCaughtAsAStandardException) {
    try {
        throw TypeParam("thrown");
    } catch (const std::exception& caught) {
        EXPECT_STREQ(caught.what(), "thrown");
    }
}

TYPED_TEST(Exceptions, DerivesFromNoneOfTheOthers) {
    constexpr int bases = std::is_base_of_v<VA::FrameworkException, TypeParam> +
                          std::is_base_of_v<VA::ProviderException, TypeParam> +
                          std::is_base_of_v<VA::InstrumentationException, TypeParam>;
    EXPECT_EQ(bases, 1);
}

}  // namespace
