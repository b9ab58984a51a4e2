// What the schema of the output refuses: a schema that takes anything would prove nothing.
#include "host/cli/OutputForm.h"

#include <gtest/gtest.h>

#include <nlohmann/json.hpp>

namespace {

using Document = nlohmann::json;

const char* const instances = R"json([
  {
    "class": "Machine",
    "path": "root/cimv2:Machine.Name=\"m\"",
    "keys": {"Name": "m"},
    "properties": {
      "Name": "m", "Kind": 36, "States": [2, null], "Started": "20240102030405.000000+000",
      "Other": {"class": "Machine", "path": "a/b:Machine.Name=\"x\"", "keys": {"Name": "x"}},
      "Part": {"class": "Part", "properties": {}, "names": {}, "times": {}, "units": {}},
      "Memory": 18446744073709551615, "Ratio": 0.5, "On": true
    },
    "names": {"Kind": "LINUX", "States": ["OK", null]},
    "times": {"Started": "2024-01-02T03:04:05Z"},
    "units": {"Memory": "KiloBytes"}
  }
])json";

TEST(JsonSchema, TakesInstancesInTheFormOfInstances) {
    EXPECT_EQ(complaintOnJson(instances), "");
    EXPECT_EQ(complaintOnJson(instances, "instances"), "");
    EXPECT_NE(complaintOnJson(instances, "paths"), "");
    EXPECT_NE(complaintOnJson(instances, "tree"), "");
    EXPECT_NE(complaintOnJson("[", "instances"), "");
}

TEST(JsonSchema, RefusesAnInstanceWithAnyDamage) {
    const struct {
        const char* place;
        Document damage;
    } rows[] = {
        {"/0/class", 5},
        {"/0/class", ""},
        {"/0/path", nullptr},
        {"/0/keys", "Name=m"},
        {"/0/keys/Name", Document::array()},
        {"/0/properties", Document::array()},
        {"/0/properties/Name", Document::object()},
        {"/0/properties/Other/keys", nullptr},
        {"/0/properties/Other/key", "more"},
        {"/0/properties/Part/path", "more"},
        {"/0/properties/States/0", Document::array()},
        {"/0/names/Kind", 36},
        {"/0/names/States/0", 2},
        {"/0/times/Started", "20240102030405.000000+000"},
        {"/0/times/Started", "2024-01-02T03:04:05+01:00"},
        {"/0/times/Started", nullptr},
        {"/0/units/Memory", 1024},
        {"/0/unit", Document::object()},
    };
    for (const auto& row : rows) {
        Document damaged = Document::parse(instances);
        damaged[Document::json_pointer(row.place)] = row.damage;
        EXPECT_NE(complaintOnJson(damaged.dump(), "instances"), "") << row.place;
        EXPECT_NE(complaintOnJson(damaged.dump()), "") << row.place;
    }
}

TEST(JsonSchema, RefusesAnInstanceThatLacksAMember) {
    const Document whole = Document::parse(instances);
    for (const auto& member : whole[0].items()) {
        Document damaged = whole;
        damaged[0].erase(member.key());
        EXPECT_NE(complaintOnJson(damaged.dump()), "") << member.key();
    }
}

TEST(Mof, IsRefusedWhereItIsNone) {
    EXPECT_EQ(complaintOnMof("instance of A {\n    B = 1;\n};\n"), "");
    EXPECT_NE(complaintOnMof("instance of A {\n    B = 1\n};\n"), "");
}

}  // namespace
