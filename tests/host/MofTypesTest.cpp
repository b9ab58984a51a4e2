#include "host/mof/MofAst.h"

#include <gtest/gtest.h>

namespace {

using namespace cmpihost::mof;

TEST(MofTypes, IntegersFitFromTheLeastToTheLargestOfTheirType) {
    const struct {
        Type type;
        std::int64_t least;
        std::uint64_t largest;
    } rows[] = {{Type::UInt8, 0, UINT8_MAX},   {Type::SInt8, INT8_MIN, INT8_MAX},
                {Type::UInt16, 0, UINT16_MAX}, {Type::SInt16, INT16_MIN, INT16_MAX},
                {Type::UInt32, 0, UINT32_MAX}, {Type::SInt32, INT32_MIN, INT32_MAX},
                {Type::UInt64, 0, UINT64_MAX}, {Type::SInt64, INT64_MIN, INT64_MAX}};
    for (const auto& row : rows) {
        EXPECT_TRUE(fits(Scalar(row.least), row.type)) << nameOf(row.type);
        EXPECT_TRUE(fits(Scalar(row.largest), row.type)) << nameOf(row.type);
        if (row.least != INT64_MIN) {
            EXPECT_FALSE(fits(Scalar(row.least - 1), row.type)) << nameOf(row.type);
        }
        if (row.largest != UINT64_MAX) {
            EXPECT_FALSE(fits(Scalar(row.largest + 1), row.type)) << nameOf(row.type);
        }
    }
}

TEST(MofTypes, EveryTypeTakesConstantsOfItsKindAndNull) {
    const Scalar null;
    const Scalar flag(true);
    const Scalar positive(std::uint64_t{1});
    const Scalar negative(std::int64_t{-1});
    const Scalar real(1.5);
    const Scalar character(Character{0xFFFF});
    const Scalar text(std::string("x"));
    const struct {
        Type type;
        std::vector<Scalar> fitting;
    } rows[] = {{Type::Boolean, {null, flag}},
                {Type::String, {null, text}},
                {Type::DateTime, {null, text}},
                {Type::Reference, {null, text}},
                {Type::Char16, {null, character}},
                {Type::UInt8, {null, positive}},
                {Type::SInt64, {null, positive, negative}},
                {Type::Real32, {null, positive, negative, real}},
                {Type::Real64, {null, positive, negative, real}}};
    for (const auto& row : rows) {
        std::vector<Scalar> fitting;
        for (const Scalar& scalar : {null, flag, positive, negative, real, character, text}) {
            if (fits(scalar, row.type)) fitting.push_back(scalar);
        }
        EXPECT_EQ(fitting, row.fitting) << nameOf(row.type);
    }
    EXPECT_FALSE(fits(Scalar(Character{0x10000}), Type::Char16));
}

}  // namespace
