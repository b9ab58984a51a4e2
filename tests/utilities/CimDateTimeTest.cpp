#include "framework/utilities/CimDateTime.h"

#include <gtest/gtest.h>

#include <string>

namespace {

TEST(CimDateTime, PointsInTimeAreRecognised) {
    for (const char* text :
         {"20090317081542.000000+300", "20090317081542.000000-060", "00000101000000.000000+000",
          "99991231235960.999999-999", "20090317******.******+000", "****0317081542.000000+***"})
        EXPECT_TRUE(VA::isCimDateTime(text)) << text;
}

TEST(CimDateTime, IntervalsAreRecognised) {
    EXPECT_TRUE(VA::isCimDateTime("00000011132312.125000:000"));
    EXPECT_TRUE(VA::isCimDateTime("99999999235959.999999:000"));
    EXPECT_TRUE(VA::isCimDateTime("00000000000000.000000:000"));
}

TEST(CimDateTime, AnythingElseIsNone) {
    for (const char* text : {"",
                             "2009",
                             "20090317081542.000000+30",
                             "20090317081542.000000+3000",
                             "   00000000000.000000+000",
                             "20090317081542,000000+300",
                             "20090317081542.000000 300",
                             "20091317081542.000000+000",
                             "20090017081542.000000+000",
                             "20090300081542.000000+000",
                             "20090332081542.000000+000",
                             "20090317241542.000000+000",
                             "20090317086042.000000+000",
                             "20090317081561.000000+000",
                             "2009031708154x.000000+000",
                             "2009*317081542.000000+000",
                             "00000011242312.125000:000",
                             "00000011136012.125000:000",
                             "00000011132360.125000:000",
                             "00000011132312.125000:001",
                             "20090317081542.00000-+000",
                             "20090317081542.000000+ 12"})
        EXPECT_FALSE(VA::isCimDateTime(text)) << text;
    EXPECT_FALSE(VA::isCimDateTime(std::string(100000, '2')));
    EXPECT_FALSE(VA::isCimDateTime(std::string(25, '\0')));
}

}  // namespace
