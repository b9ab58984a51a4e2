// Whole requests against the provider's handlers, under a strict broker with the schema, on a
// simulated host.
#include <cstdio>
#include <cstdlib>

#include "fuzz/RequestCheck.h"
#include "fuzz/StrictLog.h"
#include "host/Schema.h"
#include "host/SchemaCatalogue.h"
#include "host/broker/ResultCollector.h"

// The provider's factories, as an object manager looks them up.
extern "C" {
CMPIInstanceMI* OperatingSystemProvider_Create_InstanceMI(const CMPIBroker*, const CMPIContext*,
                                                          CMPIStatus*);
CMPIAssociationMI* OperatingSystemProvider_Create_AssociationMI(const CMPIBroker*,
                                                                const CMPIContext*, CMPIStatus*);
}

using namespace cmpihost;

namespace {

const ClassCatalogue& catalogue() {
    static const SchemaCatalogue made(Schema::load(KORVA_SOURCE_DIR "/schema"));
    return made;
}

fuzz::Ending run(fuzz::Scene& scene, Broker& broker) {
    const ManagementInterfaces interfaces = {
        OperatingSystemProvider_Create_InstanceMI(broker.cmpi(), nullptr, nullptr),
        OperatingSystemProvider_Create_AssociationMI(broker.cmpi(), nullptr, nullptr)};
    FaultPlan plan;
    for (const Fault& fault : scene.faults) plan.add(fault);
    broker.setFaultPlan(&plan);
    fuzz::startRecords(scene.logThrowsFrom);
    fuzz::Ending ending;
    try {
        ending.outcome = invoke(interfaces, broker, scene.request, [&](ResultCollector& result) {
            result.failReturnInstance(scene.resultFailsFrom, CMPI_RC_ERR_FAILED);
            result.failReturnObjectPath(scene.resultFailsFrom, CMPI_RC_ERR_FAILED);
            result.failReturnDone(scene.resultFailsFrom, CMPI_RC_ERR_FAILED);
        });
    } catch (const fuzz::ForeignException&) {
        ending.foreignException = true;
    } catch (const std::exception&) {
    }
    broker.setFaultPlan(nullptr);
    ending.faultsFired = plan.fired();
    return ending;
}

// For people who look at an input: FUZZ_SHOW in the environment has it told.
void show(const fuzz::Scene& scene, const fuzz::Ending& ending, const Broker& broker) {
    if (std::getenv("FUZZ_SHOW") == nullptr) return;
    std::fputs(describe(scene).c_str(), stderr);
    if (ending.outcome)
        std::fprintf(stderr, "  status %u, %zu paths, %zu instances, %u times done\n",
                     static_cast<unsigned>(ending.outcome->rc), ending.outcome->paths.size(),
                     ending.outcome->instances.size(), ending.outcome->doneCount);
    for (const std::string& violation : broker.violations())
        std::fprintf(stderr, "  violation: %s\n", violation.c_str());
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    fuzz::Decoder input(data, size);
    fuzz::Scene scene = fuzz::decodeScene(input);
    VA::setHostSource(scene.host);
    {
        Broker broker(&catalogue(), scene.options);
        if (scene.computersServed) broker.route("KORVA_ComputerSystem", scene.computers);
        const fuzz::Ending ending = run(scene, broker);
        show(scene, ending, broker);
        fuzz::checkEnding(scene, ending, broker);
    }
    VA::setHostSource(nullptr);
    return 0;
}
