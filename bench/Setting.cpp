#include "bench/Setting.h"

#include "bench/Requests.h"
#include "framework/instrumentation/HostSource.h"
#include "host/mof/Schema.h"

#include <stdexcept>

namespace bench {

using namespace cmpihost;

namespace {

const ClassCatalogue& schemaCatalogue() {
    static const SchemaCatalogue catalogue(Schema::load(KORVA_SOURCE_DIR "/schema"));
    return catalogue;
}

LoadOptions optionsOf(const char* providerName) {
    LoadOptions options;
    options.providerName = providerName;
    return options;
}

}  // namespace

const char* nameOf(Answerer answerer) noexcept {
    switch (answerer) {
        case Answerer::Provider:
            return "provider";
        case Answerer::Facade:
            return "facade";
        case Answerer::Floor:
            break;
    }
    return "floor";
}

Setting::Setting()
    : host_(VA::SimulatedHost::withOneNode()),
      broker_(&schemaCatalogue()),
      computers_("simulated.example"),
      provider_(KORVA_BINARY_DIR "/lib/libkorzbosstatusprofileprovider.so.1", broker_),
      facade_(KORVA_BINARY_DIR "/lib/libkorvaosstatusfacade.so.1", broker_,
              optionsOf("OSStatusFacade")),
      floor_(KORVA_BINARY_DIR "/lib/libkorvafloor.so", broker_, optionsOf("FloorProvider")) {
    broker_.route(ComputerSystemService::className, computers_);
    useSimulatedHost();
}

Setting::~Setting() {
    VA::setHostSource(nullptr);
}

const ProviderLibrary& Setting::library(Answerer answerer) const {
    switch (answerer) {
        case Answerer::Provider:
            return provider_;
        case Answerer::Facade:
            return facade_;
        case Answerer::Floor:
            break;
    }
    return floor_;
}

Outcome Setting::run(Answerer answerer, const OperationRequest& request) {
    Outcome outcome = invoke(library(answerer), broker_, request);
    if (!outcome.violations.empty()) throw std::runtime_error(outcome.violations.front());
    return outcome;
}

void Setting::setNodes(unsigned count) {
    host_->clearNodes();
    host_->addNodes(VA::SimulatedHost::plausibleNode(), count);
    reinterpret_cast<void (*)(unsigned)>(floor_.symbol("setFloorNodes"))(count);
}

void Setting::useRealHost() {
    VA::setHostSource(nullptr);
}

void Setting::useSimulatedHost() {
    VA::setHostSource(host_);
}

void Setting::compareAnswers() {
    for (const NamedRequest& each : requests()) {
        const Outcome ours = run(Answerer::Provider, each.request);
        const Outcome floors = run(Answerer::Floor, each.request);
        if (ours.rc != floors.rc || ours.doneCount != floors.doneCount ||
            ours.paths != floors.paths || ours.instances != floors.instances)
            throw std::runtime_error("provider and floor differ on " + each.name);
    }
}

}  // namespace bench
