#include "host/cli/Namespaces.h"

#include <gmock/gmock.h>

#include <sstream>

namespace {

using namespace cmpihost;

std::string section(const std::string& className, const std::string& nameSpaces) {
    return "[" + className +
           "]\n  provider: P\n  location: l\n  type: instance\n  namespace: " + nameSpaces + "\n";
}

std::string shownNamespaces(const std::string& registered, const Terminal& terminal) {
    Registrations registrations;
    registrations.add(registered, "x.reg");
    std::ostringstream stream;
    print(namespaceSummaries(registrations), terminal, stream);
    return stream.str();
}

TEST(Namespaces, AreThoseOfTheRegistrationsAndTheDefaultWithTheirClasses) {
    EXPECT_EQ(shownNamespaces(section("CIM_B", "root/Interop ROOT/cimv2") +
                                  section("cim_A", "root/interop") + section("CIM_Any", "*"),
                              {}),
              "root/cimv2    CIM_Any, CIM_B\n"
              "root/Interop  cim_A, CIM_Any, CIM_B\n");
}

TEST(Namespaces, HaveTheDefaultEvenWithoutRegistrations) {
    EXPECT_EQ(shownNamespaces("", {}), "root/cimv2\n");
    EXPECT_EQ(shownNamespaces(section("CIM_A", "other"), {}),
              "other       CIM_A\n"
              "root/cimv2\n");
}

TEST(Namespaces, WrapTheirClassesAtTheWidthOfTheTerminal) {
    EXPECT_EQ(shownNamespaces(section("CIM_FirstOfAll", "a") + section("CIM_SecondOfAll", "a"),
                              {40, true}),
              "a           CIM_FirstOfAll,\n"
              "            CIM_SecondOfAll\n"
              "root/cimv2\n");
}

}  // namespace
