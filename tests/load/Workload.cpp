// A leak shows only in what is done over and over: loading, asking and unloading, on hosts that
// change.
#include "load/Workload.h"

#include <dlfcn.h>

#include <algorithm>
#include <fstream>
#include <memory>
#include <stdexcept>
#include <thread>

#include "host/broker/Invoke.h"

namespace load {

using namespace cmpihost;

namespace {

const char* const folder = KORVA_BINARY_DIR "/lib/";

// The hosts and who is asked, in turn.
struct Turn {
    int nodes;
    bool throughFacade;
};
constexpr int thisMachine = -1;
constexpr Turn turns[] = {{thisMachine, true},  {1, false}, {20, true},  {0, false},
                          {thisMachine, false}, {1, true},  {20, false}, {0, true}};

struct CloseLibrary {
    void operator()(void* handle) const noexcept { ::dlclose(handle); }
};
using LibraryHandle = std::unique_ptr<void, CloseLibrary>;

// Has the instrumentation show simulated nodes as long as the result lives.
LibraryHandle simulate(unsigned int nodes) {
    LibraryHandle hosts(::dlopen(KORVA_LOAD_HOSTS, RTLD_NOW | RTLD_LOCAL));
    if (hosts == nullptr) throw std::runtime_error(::dlerror());
    reinterpret_cast<void (*)(unsigned int)>(::dlsym(hosts.get(), "showNodes"))(nodes);
    return hosts;
}

}  // namespace

Workload::Workload()
    : computers_("host1"),
      broker_(nullptr, {BrokerOptions::Shape::Complete, 0}),  // no shells: they take memory
      provider_(std::string(folder) + "libkorzbosstatusprofileprovider.so.1", broker_),
      facade_(std::string(folder) + "libkorvaosstatusfacade.so.1", broker_, {"OSStatusFacade"}) {
    findOutNames();
    broker_.route(ComputerSystemService::className, computers_);
    facade_.unload();
    provider_.unload();
}

void Workload::findOutNames() {
    const Outcome outcome =
        invoke(provider_, broker_,
               requestFor(Operation::EnumerateInstanceNames, path("KORVA_OperatingSystem")));
    if (outcome.paths.size() != 1) throw std::runtime_error("this machine has no one system");
    const Value* const name = outcome.paths[0].key("CSName");
    const Value* const systemName = outcome.paths[0].key("Name");
    const std::string computer = name == nullptr ? "" : name->text();
    const std::string system = systemName == nullptr ? "" : systemName->text();
    forProvider_ = {mixedRequests(computer, system), mixedRequests("host1", "os1")};
    forFacade_ = {mixedFacadeRequests(computer, system), mixedFacadeRequests("host1", "os1")};
}

void Workload::runOnce(unsigned long count, unsigned int threads) {
    const Turn turn = turns[turn_++ % std::size(turns)];
    const bool real = turn.nodes == thisMachine;
    ProviderLibrary& library = turn.throughFacade ? facade_ : provider_;
    const Requests& requests = turn.throughFacade ? forFacade_ : forProvider_;
    library.load();
    LibraryHandle hosts = real ? nullptr : simulate(static_cast<unsigned int>(turn.nodes));
    send(library, pick(real ? requests.ofThisMachine : requests.ofSimulatedHosts, count), threads);
    library.unload();
    hosts.reset();
    checkLeftovers();
}

// Goes through all of them in one order, then in another.
std::vector<const MixedRequest*> Workload::pick(const std::vector<MixedRequest>& from,
                                                unsigned long count) {
    std::vector<const MixedRequest*> order;
    for (const MixedRequest& each : from) order.push_back(&each);
    std::vector<const MixedRequest*> result;
    while (result.size() < count) {
        std::shuffle(order.begin(), order.end(), random_);
        const std::size_t missing = std::min<std::size_t>(order.size(), count - result.size());
        result.insert(result.end(), order.begin(),
                      order.begin() + static_cast<std::ptrdiff_t>(missing));
    }
    return result;
}

void Workload::send(const ProviderLibrary& to, const std::vector<const MixedRequest*>& picked,
                    unsigned int threads) {
    std::atomic<std::size_t> next{0};
    std::vector<std::thread> others;
    for (unsigned int number = 1; number < threads; ++number)
        others.emplace_back([&] { sendShare(to, picked, next); });
    sendShare(to, picked, next);
    for (std::thread& other : others) other.join();
    const MixedRequest* const wrong = wrong_;
    if (wrong != nullptr) throw std::runtime_error("wrong status of " + ::describe(wrong->request));
}

void Workload::sendShare(const ProviderLibrary& to, const std::vector<const MixedRequest*>& picked,
                         std::atomic<std::size_t>& next) {
    for (std::size_t at = next++; at < picked.size(); at = next++) {
        const MixedRequest& each = *picked[at];
        if (!each.allows(invoke(to, broker_, each.request).rc)) wrong_ = &each;
    }
}

void Workload::checkLeftovers() {
    broker_.takeViolations();
    if (broker_.unreleasedClones() != 0) throw std::runtime_error("a clone was not released");
    std::ifstream maps("/proc/self/maps");
    for (std::string line; std::getline(maps, line);)
        if (line.find(folder) != std::string::npos)
            throw std::runtime_error("still in the process: " + line);
}

}  // namespace load
