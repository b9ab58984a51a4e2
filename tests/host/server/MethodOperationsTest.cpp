#include <gmock/gmock.h>

#include "host/server/ServerFixture.h"

namespace cmpihost::server {
namespace {

using namespace fixture;
using testing::StartsWith;

const std::string thingsClass = "<CLASSNAME NAME=\"test_THING\"/>";

std::string argument(const std::string& name, const std::string& content,
                     const std::string& type = {}) {
    return "<PARAMVALUE NAME=\"" + name + "\"" +
           (type.empty() ? "" : " PARAMTYPE=\"" + type + "\"") + ">" + content + "</PARAMVALUE>";
}

std::string number(const std::string& name, const std::string& text) {
    return argument(name, "<VALUE>" + text + "</VALUE>");
}

std::string called(const std::string& method, const std::string& object,
                   const std::string& arguments = {}) {
    const std::string document =
        respond(foreignManager(), methodCall(method, object, arguments, "root/test"));
    return error(document).empty() ? content(document) : error(document);
}

TEST(MethodOperations, AMethodReturnsItsValueAndWhatComesOut) {
    EXPECT_EQ(called("Sum", thingsClass, number("a", "2") + number("B", "40")),
              "<RETURNVALUE PARAMTYPE=\"uint16\"><VALUE>2</VALUE></RETURNVALUE>"
              "<PARAMVALUE NAME=\"Total\" PARAMTYPE=\"uint32\"><VALUE>42</VALUE></PARAMVALUE>");
    EXPECT_EQ(called("sUM", thingsClass, argument("A", "<VALUE>0x10</VALUE>", "string")),
              "<RETURNVALUE PARAMTYPE=\"uint16\"><VALUE>1</VALUE></RETURNVALUE>"
              "<PARAMVALUE NAME=\"Total\" PARAMTYPE=\"uint32\"><VALUE>16</VALUE></PARAMVALUE>");
    EXPECT_EQ(called("Describe", instanceName("TEST_Thing", {{"Name", "first"}})),
              "<RETURNVALUE PARAMTYPE=\"string\"><VALUE>one of the things</VALUE></RETURNVALUE>");
}

TEST(MethodOperations, TheNameComesBackAsItWasSent) {
    const std::string document = respond(
        foreignManager(),
        methodCall("dEsCribe", instanceName("TEST_Thing", {{"Name", "x"}}), "", "root/test"));
    EXPECT_THAT(
        document.substr(document.find("<METHOD")),
        StartsWith("<METHODRESPONSE NAME=\"dEsCribe\"><ERROR CODE=\"6\" "
                   "DESCRIPTION=\"InvokeMethod of TEST_Thing: there is no such instance\"/>"));
}

TEST(MethodOperations, WhatIsWrongWithACallHasAStatusOfItsOwn) {
    const std::string first = instanceName("TEST_Thing", {{"Name", "first"}});
    const struct {
        std::string answer;
        const char* error;
    } rows[] = {
        {called("Sum", "<CLASSNAME NAME=\"TEST_Nothing\"/>"),
         "5: TEST_Nothing: no such class in root/test"},
        {called("Product", thingsClass), "17: TEST_Thing has no method Product"},
        {called("Sum", "<CLASSNAME NAME=\"TEST_Part\"/>"), "17: TEST_Part has no method Sum"},
        {called("Sum", "<CLASSNAME NAME=\"TEST_Base\"/>"),
         "16: nobody serves the method Sum of TEST_Base"},
        {called("Describe", instanceName("TEST_Thing", {{"Nome", "first"}})),
         "4: TEST_Thing.Nome: the class has no such key"},
        {called("Sum", thingsClass, number("C", "1")), "4: Sum has no parameter C"},
        {called("Sum", thingsClass, number("A", "1") + number("a", "2")),
         "4: the parameter a is there twice"},
        {called("Sum", thingsClass, number("A", "-1")), "4: '-1' is no uint32"},
        {called("Sum", thingsClass, argument("A", "<VALUE.ARRAY/>")),
         "13: an array is given for a single value"},
        {called("Sum", thingsClass, argument("A", first)),
         "4: the parameter A holds a INSTANCENAME, which is no value of its type"},
    };
    for (const auto& row : rows) EXPECT_EQ(row.answer, row.error);
}

TEST(MethodOperations, AParameterWithoutAValueIsNull) {
    EXPECT_EQ(called("Sum", thingsClass, argument("A", "") + number("B", "1")),
              "<RETURNVALUE PARAMTYPE=\"uint16\"><VALUE>2</VALUE></RETURNVALUE>"
              "<PARAMVALUE NAME=\"Total\" PARAMTYPE=\"uint32\"><VALUE>1</VALUE></PARAMVALUE>");
}

/// Of a class that only its registration names, and of one that descends from a class that no
/// schema declares, the provider alone knows the methods.
class UndeclaredMethods : public testing::TestWithParam<const char*> {};

INSTANTIATE_TEST_SUITE_P(Of, UndeclaredMethods,
                         testing::Values("", "class OTHER_Thing : CIM_Elsewhere {};"));

TEST_P(UndeclaredMethods, TakeTheTypesThatTheClientTells) {
    ObjectManager& manager = foreignManager(
        registration("OTHER_Thing", "Things", "foreign_things", "method", "root/test"), GetParam());
    const auto asked = [&](const std::string& arguments) {
        const std::string document =
            respond(manager,
                    methodCall("Sum", "<CLASSNAME NAME=\"other_thing\"/>", arguments, "root/test"));
        return error(document).empty() ? content(document) : error(document);
    };
    EXPECT_EQ(asked(argument("A", "<VALUE>5</VALUE>", "uint32")),
              "<RETURNVALUE PARAMTYPE=\"uint16\"><VALUE>1</VALUE></RETURNVALUE>"
              "<PARAMVALUE NAME=\"Total\" PARAMTYPE=\"uint32\"><VALUE>5</VALUE></PARAMVALUE>");
    EXPECT_EQ(asked(number("A", "5")),
              "13: InvokeMethod of OTHER_Thing: a value is of the wrong type");
    EXPECT_EQ(asked(argument("A", "<VALUE>5</VALUE>", "uint23")),
              "4: uint23: there is no such type");
}

TEST(MethodOperations, OfOperatingSystemsAreServedByNobodyHere) {
    const std::string computer = "<CLASSNAME NAME=\"KORVA_ComputerSystem\"/>";
    for (const char* method : {"Reboot", "Shutdown", "requestStateChange"}) {
        EXPECT_EQ(
            error(respond(methodCall(method, operatingSystem()))),
            std::string("16: nobody serves the method ") + method + " of KORVA_OperatingSystem");
    }
    EXPECT_EQ(error(respond(methodCall("Nonsense", operatingSystem()))),
              "17: KORVA_OperatingSystem has no method Nonsense");
    EXPECT_EQ(error(respond(methodCall("Reboot", computer))),
              "17: KORVA_ComputerSystem has no method Reboot");
}

}  // namespace
}  // namespace cmpihost::server
