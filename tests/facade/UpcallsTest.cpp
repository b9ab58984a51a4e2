#include "facade/FacadeFixture.h"

// How often the object manager is asked for computer systems, which is what costs most.

namespace {

using namespace facade;

class FacadeUpcalls : public FacadeFixture {};

TEST_F(FacadeUpcalls, AreOneForAnAssociationWithComputerSystemsAndOneForTheirInstances) {
    const ObjectPathValue os = operatingSystemPath("host1", "Linux");
    const ObjectPathValue cs = computerSystemPath("host1");
    struct Row {
        ObjectPathValue source;
        const char* associationClass;
        unsigned associatorNames, associators, referenceNames, references;
    };
    const Row rows[] = {
        {os, "KORVA_InstalledOS", 1, 2, 1, 1},
        {os, "CIM_Dependency", 1, 2, 1, 1},
        {os, "KORVA_OSElementCapabilities", 0, 0, 0, 0},
        {os, "", 2, 3, 2, 2},
        {cs, "KORVA_RunningOS", 1, 1, 1, 1},
        {cs, "", 2, 2, 2, 2},
        {cs, "KORVA_OSElementCapabilities", 0, 0, 0, 0},
        {capabilitiesPath("Linux"), "", 0, 0, 0, 0},
        {os, "CIM_HostedService", 0, 0, 0, 0},
        {operatingSystemPath("host1", "unknown"), "KORVA_RunningOS", 1, 1, 1, 1},
        {path("KORVA_OperatingSystem", {{"Name", "Linux"}}), "", 0, 0, 0, 0},
        {path("TEST_Thing", {{"Name", "x"}}), "", 0, 0, 0, 0},
    };
    for (const Row& row : rows) {
        const auto made = [&](Operation operation) {
            return upcalls(associationRequest(operation, row.source, row.associationClass));
        };
        SCOPED_TRACE(toString(row.source) + " " + row.associationClass);
        EXPECT_EQ(made(Operation::AssociatorNames), row.associatorNames);
        EXPECT_EQ(made(Operation::Associators), row.associators);
        EXPECT_EQ(made(Operation::ReferenceNames), row.referenceNames);
        EXPECT_EQ(made(Operation::References), row.references);
    }
}

TEST_F(FacadeUpcalls, OfRequestsForInstancesAreTheProviders) {
    for (const auto& [name, count] : {std::pair("KORVA_OperatingSystem", 0U),
                                      {"KORVA_OperatingSystemCapabilities", 0U},
                                      {"KORVA_InstalledOS", 1U},
                                      {"KORVA_RunningOS", 1U},
                                      {"KORVA_OSElementCapabilities", 0U}}) {
        OperationRequest request;
        request.path = path(name);
        request.operation = Operation::EnumerateInstanceNames;
        EXPECT_EQ(upcalls(request), count) << name;
        const Outcome names = ask(request);
        request.operation = Operation::EnumerateInstances;
        EXPECT_EQ(upcalls(request), count) << name;
        request.operation = Operation::GetInstance;
        request.path = names.paths.at(0);
        EXPECT_EQ(upcalls(request), count) << name;
    }
}

// What an enumeration costs beyond the provider: the class and the namespace of its path are read.
TEST_F(FacadeUpcalls, EnumerationsTakeTwoLooksAtTheirPathMoreThanTheProvider) {
    OperationRequest request;
    request.path = path("KORVA_OperatingSystem");
    for (const Operation operation :
         {Operation::EnumerateInstances, Operation::EnumerateInstanceNames}) {
        request.operation = operation;
        const auto calls = [&](const ProviderLibrary& asked) {
            FaultPlan plan;
            broker.setFaultPlan(&plan);
            cmpihost::invoke(asked, broker, request);
            broker.setFaultPlan(nullptr);
            return plan.calls();
        };
        EXPECT_EQ(calls(facade), calls(library) + 4);
    }
}

}  // namespace
