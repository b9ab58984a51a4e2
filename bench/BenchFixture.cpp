// One broker and one host under all that is compared, so that only the answering library differs.
#include "bench/BenchFixture.h"

#include "framework/instrumentation/HostSource.h"

#include <algorithm>
#include <stdexcept>

namespace bench {

using namespace cmpihost;

namespace {

std::vector<NamedRequest> makeRequests() {
    std::vector<NamedRequest> made;
    for (const NamedRequest& each :
         servedRequests({"simulated.example", "Simulated Linux", "Simulated Linux"}))
        if (each.plain) made.push_back(each);
    for (const NamedRequest& each : refusedRequests()) made.push_back(each);
    for (NamedRequest& each : made) {
        each.name =
            std::string(operationName(each.request.operation)) + " " + each.request.path.className;
        if (each.request.assocClass) each.name += " " + *each.request.assocClass;
    }
    return made;
}

LoadOptions optionsOf(const char* providerName) {
    LoadOptions options;
    options.providerName = providerName;
    return options;
}

}  // namespace

const std::vector<NamedRequest>& requests() {
    static const std::vector<NamedRequest> all = makeRequests();
    return all;
}

const OperationRequest& requestNamed(const std::string& name) {
    const auto found = std::find_if(requests().begin(), requests().end(),
                                    [&](const NamedRequest& each) { return each.name == name; });
    if (found == requests().end()) throw std::invalid_argument("no request " + name);
    return found->request;
}

const char* nameOf(Answerer answerer) noexcept {
    switch (answerer) {
        case Answerer::Provider:
            return "provider";
        case Answerer::Facade:
            return "facade";
        case Answerer::Baseline:
            break;
    }
    return "baseline";
}

BenchFixture::BenchFixture()
    : host_(VA::SimulatedHost::withOneNode()),
      broker_(&schemaCatalogue()),
      computers_("simulated.example"),
      provider_(KORVA_BINARY_DIR "/lib/libkorzbosstatusprofileprovider.so.1", broker_),
      facade_(KORVA_BINARY_DIR "/lib/libkorvaosstatusfacade.so.1", broker_,
              optionsOf("OSStatusFacade")),
      baseline_(KORVA_BINARY_DIR "/lib/libkorvabaseline.so", broker_,
                optionsOf("BaselineProvider")) {
    broker_.route(ComputerSystemService::className, computers_);
    useSimulatedHost();
}

BenchFixture::~BenchFixture() {
    VA::setHostSource(nullptr);
}

const ProviderLibrary& BenchFixture::library(Answerer answerer) const {
    switch (answerer) {
        case Answerer::Provider:
            return provider_;
        case Answerer::Facade:
            return facade_;
        case Answerer::Baseline:
            break;
    }
    return baseline_;
}

Outcome BenchFixture::run(Answerer answerer, const OperationRequest& request) {
    Outcome outcome = invoke(library(answerer), broker_, request);
    if (!outcome.violations.empty()) throw std::runtime_error(outcome.violations.front());
    return outcome;
}

void BenchFixture::setNodes(unsigned count) {
    host_->clearNodes();
    host_->addNodes(VA::SimulatedHost::plausibleNode(), count);
    reinterpret_cast<void (*)(unsigned)>(baseline_.symbol("setBaselineNodes"))(count);
}

void BenchFixture::useRealHost() {
    VA::setHostSource(nullptr);
}

void BenchFixture::useSimulatedHost() {
    VA::setHostSource(host_);
}

void BenchFixture::compareAnswers() {
    for (const NamedRequest& each : requests()) {
        const Outcome ours = run(Answerer::Provider, each.request);
        const Outcome baselines = run(Answerer::Baseline, each.request);
        if (ours.rc != baselines.rc || ours.doneCount != baselines.doneCount ||
            ours.paths != baselines.paths || ours.instances != baselines.instances)
            throw std::runtime_error("provider and baseline differ on " + each.name);
    }
}

}  // namespace bench
