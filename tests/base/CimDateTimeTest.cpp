#include "base/CimDateTime.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

namespace base {
namespace {

constexpr CimDateTime::Field any;  // what asterisks give

// year, month, day, days, hour, minute, second, microsecond, offset; nothing for a text that is
// none.
std::vector<CimDateTime::Field> fieldsOf(std::string_view text) {
    const auto parsed = parseCimDateTime(text);
    if (!parsed) return {};
    return {parsed->year,   parsed->month,  parsed->day,         parsed->days,     parsed->hour,
            parsed->minute, parsed->second, parsed->microsecond, parsed->utcOffset};
}

using Fields = std::vector<CimDateTime::Field>;

TEST(CimDateTime, InstantsGiveTheirFields) {
    const struct {
        const char* text;
        Fields fields;
    } rows[] = {
        {"20090317081542.012345+300", {2009, 3, 17, any, 8, 15, 42, 12345, 300}},
        {"20090317081542.000000-060", {2009, 3, 17, any, 8, 15, 42, 0, -60}},
        {"00000101000000.000000+000", {0, 1, 1, any, 0, 0, 0, 0, 0}},
        {"99991231235960.999999-999", {9999, 12, 31, any, 23, 59, 60, 999999, -999}},
        {"20090231000000.000000-000", {2009, 2, 31, any, 0, 0, 0, 0, 0}},
        {"20090317******.******+000", {2009, 3, 17, any, any, any, any, any, 0}},
        {"****0317081542.000000-***", {any, 3, 17, any, 8, 15, 42, 0, any}},
        {"2009****081542.000000+***", {2009, any, any, any, 8, 15, 42, 0, any}},
    };
    for (const auto& row : rows) {
        EXPECT_EQ(fieldsOf(row.text), row.fields) << row.text;
        EXPECT_FALSE(parseCimDateTime(row.text)->isInterval) << row.text;
    }
}

TEST(CimDateTime, IntervalsGiveTheirFields) {
    const struct {
        const char* text;
        Fields fields;
    } rows[] = {
        {"00000011132312.125000:000", {any, any, any, 11, 13, 23, 12, 125000, 0}},
        {"99999999235959.999999:000", {any, any, any, 99999999, 23, 59, 59, 999999, 0}},
        {"00000000000000.000000:000", {any, any, any, 0, 0, 0, 0, 0, 0}},
        {"********132312.******:000", {any, any, any, any, 13, 23, 12, any, 0}},
        {"00000011******.000000:***", {any, any, any, 11, any, any, any, 0, any}},
    };
    for (const auto& row : rows) {
        EXPECT_EQ(fieldsOf(row.text), row.fields) << row.text;
        EXPECT_TRUE(parseCimDateTime(row.text)->isInterval) << row.text;
    }
}

TEST(CimDateTime, AnythingElseIsNone) {
    const std::string none[] = {
        "", "2009", std::string(100000, '2'), std::string(25, '\0'), std::string(25, '*'),
        // another length, other separators
        "20090317081542.000000+30", "20090317081542.000000+3000", "20090317081542,000000+300",
        "20090317081542.000000 300", "20090317081542.000000*300", "20090317081542.00000-+000",
        // a field out of its range
        "20091317081542.000000+000", "20090017081542.000000+000", "20090300081542.000000+000",
        "20090332081542.000000+000", "20090317241542.000000+000", "20090317086042.000000+000",
        "20090317081561.000000+000", "00000011242312.125000:000", "00000011136012.125000:000",
        "00000011132360.125000:000", "00000011132312.125000:001",
        // no digits, or asterisks for a part of a field
        "   00000000000.000000+000", "2009031708154x.000000+000", "2x090317081542.000000+000",
        "20090317081542.00a000+000", "20090317081542.000000+0x0", "20090317081542.000000+ 12",
        "x0000011132312.125000:000", "0000x011132312.125000:000", "2009*317081542.000000+000",
        "2009031708154*.000000+000", "2009031708154:.000000+000", "200903170/1542.000000+000",
        "00000011132312.12500*:000", "00000011132312.125000:00*"};
    for (const std::string& text : none) EXPECT_FALSE(parseCimDateTime(text)) << text.substr(0, 99);
}

}  // namespace
}  // namespace base
