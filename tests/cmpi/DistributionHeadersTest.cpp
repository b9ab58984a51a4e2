// The provider, the facade and the companion as they are built with a distribution's CMPI headers
// of a later level, under the broker, which is of this level.
#include <gmock/gmock.h>

#include <cstdlib>

#include "host/broker/Invoke.h"
#include "host/broker/ProviderLibrary.h"
#include "host/mof/Schema.h"

namespace {

using namespace cmpihost;
using testing::ElementsAre;

constexpr const char* folder = KORVA_DISTRIBUTION_BUILD "/lib/";

struct Library {
    const char* file;
    const char* name;  ///< of the provider in it
};

void PrintTo(const Library& library, std::ostream* out) {
    *out << library.name;
}

class DistributionHeaders : public testing::TestWithParam<Library> {
  protected:
    DistributionHeaders() {
        setenv("ZBLOG_CONF", "", 1);
        broker.route("KORVA_ComputerSystem", companion);
    }
    void TearDown() override { EXPECT_THAT(broker.takeViolations(), testing::IsEmpty()); }

    Outcome ask(ProviderLibrary& library, Operation operation, const ObjectPathValue& path,
                std::optional<std::string> assocClass = std::nullopt) {
        OperationRequest request;
        request.operation = operation;
        request.path = path;
        request.assocClass = std::move(assocClass);
        return invoke(library, broker, request);
    }

    SchemaCatalogue catalogue{Schema::load(KORVA_SOURCE_DIR "/schema")};
    Broker broker{&catalogue};
    ProviderLibrary provider{std::string(folder) + GetParam().file, broker, {GetParam().name}};
    ProviderLibrary companion{std::string(folder) + "libkorvacomputersystemprovider.so.1",
                              broker,
                              {"ComputerSystemProvider", true, true, false}};
};

INSTANTIATE_TEST_SUITE_P(Of, DistributionHeaders,
                         testing::Values(Library{"libkorzbosstatusprofileprovider.so.1",
                                                 "OperatingSystemProvider"},
                                         Library{"libkorvaosstatusfacade.so.1", "OSStatusFacade"}),
                         [](const auto& each) { return each.param.name; });

TEST_P(DistributionHeaders, LeaveTheLibraryAtItsLevel) {
    for (const ProviderLibrary* library : {&provider, &companion}) {
        const CMPIInstanceMIFT& instance = *library->instanceMI()->ft;
        EXPECT_EQ(instance.ftVersion, 200) << instance.miName;
        EXPECT_EQ(instance.miVersion, 200) << instance.miName;
    }
    const CMPIAssociationMIFT& association = *provider.associationMI()->ft;
    EXPECT_EQ(association.ftVersion, 200);
    EXPECT_EQ(association.miVersion, 200);
}

TEST_P(DistributionHeaders, LeaveTheAnswersAsTheyAre) {
    const std::vector<ObjectPathValue> computers =
        ask(companion, Operation::EnumerateInstanceNames, {"root/cimv2", "KORVA_ComputerSystem"})
            .paths;
    ASSERT_EQ(computers.size(), 1U);
    const std::vector<InstanceValue> systems =
        ask(provider, Operation::EnumerateInstances, {"root/cimv2", "KORVA_OperatingSystem"})
            .instances;
    ASSERT_EQ(systems.size(), 1U);
    const ObjectPathValue& system = systems[0].path;
    EXPECT_EQ(*system.key("CSName"), *computers[0].key("Name"));
    EXPECT_EQ(systems[0].property("OSType")->toText(), "36");
    EXPECT_EQ(ask(provider, Operation::GetInstance, system).instances.size(), 1U);
    EXPECT_THAT(ask(provider, Operation::AssociatorNames, computers[0], "KORVA_InstalledOS").paths,
                ElementsAre(system));
    EXPECT_THAT(ask(provider, Operation::AssociatorNames, system, "KORVA_RunningOS").paths,
                ElementsAre(computers[0]));
}

}  // namespace
