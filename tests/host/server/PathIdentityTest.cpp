#include "host/server/PathIdentity.h"

#include <gtest/gtest.h>

namespace cmpihost::server {
namespace {

ObjectPathValue tieTo(const ObjectPathValue& end, const std::string& nameSpace = "root/cimv2") {
    return {nameSpace, "TEST_Tie", {{"End", Value::fromReference(end)}}};
}

TEST(PathIdentity, IsTheSameForPathsThatNameTheSameObject) {
    const ObjectPathValue path = {
        "root/cimv2", "TEST_Thing", {{"Name", "x"}, {"Number", Value::fromUnsigned(5)}}};
    const std::string identity = pathIdentity(path, "root/other");
    const ObjectPathValue same[] = {
        {"ROOT/CimV2", "test_thing", {{"NUMBER", "5"}, {"name", "x"}}, "a.host"},
        {"root/cimv2", "TEST_Thing", {{"Number", Value::fromSigned(5)}, {"Name", "x"}}}};
    for (const ObjectPathValue& other : same)
        EXPECT_EQ(pathIdentity(other, "root/other"), identity) << toString(other);
    const ObjectPathValue different[] = {
        {"root/cimv2", "TEST_Thing", {{"Name", "X"}, {"Number", "5"}}},
        {"root/cimv2", "TEST_Thing", {{"Name", "x"}, {"Number", "6"}}},
        {"root/cimv2", "TEST_Thing", {{"Name", "x"}}},
        {"root/cimv2", "TEST_Other", {{"Name", "x"}, {"Number", "5"}}},
        {"", "TEST_Thing", {{"Name", "x"}, {"Number", "5"}}},
        {"root/cimv2", "TEST_Thing", {{"Name", "x6:Number1:5"}}}};
    for (const ObjectPathValue& other : different)
        EXPECT_NE(pathIdentity(other, "root/other"), identity) << toString(other);
}

TEST(PathIdentity, LooksIntoReferences) {
    const ObjectPathValue end = {"", "TEST_Thing", {{"Name", "x"}}};
    const ObjectPathValue spelled = {"root/CIMV2", "test_thing", {{"NAME", "x"}}, "a.host"};
    const ObjectPathValue other = {"", "TEST_Thing", {{"Name", "y"}}};
    const ObjectPathValue elsewhere = {"root/other", "TEST_Thing", {{"Name", "x"}}};
    EXPECT_EQ(pathIdentity(tieTo(end), ""), pathIdentity(tieTo(spelled), ""));
    EXPECT_EQ(pathIdentity(tieTo(end), ""), pathIdentity(tieTo(end, ""), "root/cimv2"));
    EXPECT_NE(pathIdentity(tieTo(end), ""), pathIdentity(tieTo(other), ""));
    EXPECT_NE(pathIdentity(tieTo(end), ""), pathIdentity(tieTo(elsewhere), ""));
}

}  // namespace
}  // namespace cmpihost::server
