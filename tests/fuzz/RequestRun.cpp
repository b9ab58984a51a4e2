#include "fuzz/RequestRun.h"

#include <cstdio>
#include <cstdlib>

#include "fuzz/StrictLog.h"
#include "host/broker/ResultCollector.h"
#include "host/mof/Schema.h"

namespace fuzz {

using namespace cmpihost;

namespace {

const ClassCatalogue& catalogue() {
    static const SchemaCatalogue made(Schema::load(KORVA_SOURCE_DIR "/schema"));
    return made;
}

Ending run(Scene& scene, Broker& broker, const ManagementInterfaces& interfaces) {
    FaultPlan plan;
    for (const Fault& fault : scene.faults) plan.add(fault);
    broker.setFaultPlan(&plan);
    startRecords(scene.logThrowsFrom);
    Ending ending;
    try {
        ending.outcome = invoke(interfaces, broker, scene.request, [&](ResultCollector& result) {
            result.failReturnInstance(scene.resultFailsFrom, CMPI_RC_ERR_FAILED);
            result.failReturnObjectPath(scene.resultFailsFrom, CMPI_RC_ERR_FAILED);
            result.failReturnDone(scene.resultFailsFrom, CMPI_RC_ERR_FAILED);
        });
    } catch (const ForeignException&) {
        ending.foreignException = true;
    } catch (const std::exception&) {
    }
    broker.setFaultPlan(nullptr);
    ending.faultsFired = plan.fired();
    return ending;
}

// For people who look at an input: FUZZ_SHOW in the environment has it told.
void show(const Scene& scene, const Ending& ending, const Broker& broker) {
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

void runRequest(const std::uint8_t* data, std::size_t size, Factories factories, Check check) {
    Decoder input(data, size);
    Scene scene = decodeScene(input);
    VA::setHostSource(scene.host);
    {
        Broker broker(&catalogue(), scene.options);
        if (scene.computersServed) broker.route("KORVA_ComputerSystem", scene.computers);
        const Ending ending = run(scene, broker, factories(broker.cmpi()));
        show(scene, ending, broker);
        check(scene, ending, broker);
    }
    VA::setHostSource(nullptr);
}

}  // namespace fuzz
