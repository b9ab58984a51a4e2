// One lock for each thing that threads share (findings, clones, what belongs to no request); the
// objects of a request are its thread's alone and take none.
#include "host/broker/BrokerCore.h"

#include "base/Ascii.h"

#include <utility>

namespace cmpihost {

namespace {

/// The innermost is enough: each scope knows the one around it.
ObjectScope*& innermostOfThread() noexcept {
    static thread_local ObjectScope* innermost = nullptr;
    return innermost;
}

[[noreturn]] void refuseHandle(const std::string& violation, CMPIrc rc) {
    // An invalid handle does not lead to its broker: that of the request is the likeliest.
    if (ObjectScope* const scope = ObjectScope::innermost()) scope->core().report(violation);
    throw Failure{rc};
}

}  // namespace

void reportLateUse(const ObjectBase& object, const CallName& call) noexcept {
    try {
        object.core().report(call.text() + ": " + object.describe() +
                             (object.lifetime() == Lifetime::Released
                                  ? " used after it was released"
                                  : " used after its request ended"));
    } catch (...) {
        // Without memory there is no report; the call fails all the same.
    }
}

void refuseNull(const CallName& call, std::string_view kind) {
    refuseHandle(call.text().append(": null ").append(kind), CMPI_RC_ERR_INVALID_PARAMETER);
}

void refuseForeign(const CallName& call, std::string_view kind) {
    refuseHandle(call.text().append(": no ").append(kind).append(" of this host"),
                 CMPI_RC_ERR_INVALID_HANDLE);
}

ObjectScope* ObjectScope::innermost() noexcept {
    return innermostOfThread();
}

ObjectScope::ObjectScope(BrokerCore& core, Kind kind)
    : core_(core), kind_(kind), outer_(innermost()), arena_(core.threadArena()) {
    if (arena_ == nullptr) arena_ = &own_.emplace();
    innermostOfThread() = this;
}

void ObjectScope::end() noexcept {
    if (!open_) return;
    open_ = false;
    innermostOfThread() = outer_;
    if (own_) core_.endRequest(*own_);
}

BrokerCore::BrokerCore(Broker& owner, const ClassCatalogue* catalogue, BrokerOptions options)
    : owner_(owner),
      catalogue_(catalogue),
      options_(options),
      upcalls_(upcallTable(isSparse())),
      factories_(factoryTable(isSparse())),
      threads_(threadTable(isSparse())),
      memory_(memoryTable()),
      broker_{this, &upcalls_, &factories_, &threads_, isSparse() ? nullptr : &memory_},
      quarantine_(options.quarantine) {}

const ClassDeclaration* BrokerCore::declaration(std::string_view className) const {
    return catalogue_ == nullptr ? nullptr : catalogue_->find(className);
}

Arena* BrokerCore::threadArena() const noexcept {
    for (ObjectScope* scope = ObjectScope::innermost(); scope; scope = scope->outer()) {
        if (&scope->core() == this) return &scope->arena();
    }
    return nullptr;
}

void BrokerCore::adopt(std::unique_ptr<ObjectBase> object) {
    if (Arena* const arena = threadArena()) {
        arena->add(std::move(object));
        return;
    }
    // The object works all the same, so that one finding does not hide the next.
    report(object->describe() + " made while no request is open on the thread");
    const std::lock_guard<std::mutex> lock(unownedMutex_);
    unowned_.add(std::move(object));
}

void BrokerCore::adoptClone(std::unique_ptr<ObjectBase> object) {
    const std::lock_guard<std::mutex> lock(cloneMutex_);
    ObjectBase* const key = object.get();
    // Found again by address: release gets nothing else.
    clones_.emplace(key, std::move(object));
}

void BrokerCore::releaseObject(const ObjectBase& object) noexcept {
    if (object.arena() != nullptr) {
        quarantine_.take(object.arena()->release(object));
        return;
    }
    // Retired outside the lock: its content may be large.
    std::unique_ptr<ObjectBase> owned;
    {
        const std::lock_guard<std::mutex> lock(cloneMutex_);
        const auto found = clones_.find(&object);
        if (found == clones_.end()) return;
        owned = std::move(found->second);
        clones_.erase(found);
    }
    owned->retire(Lifetime::Released);
    quarantine_.take(std::move(owned));
}

std::size_t BrokerCore::unreleasedClones() const {
    const std::lock_guard<std::mutex> lock(cloneMutex_);
    return clones_.size();
}

void BrokerCore::report(std::string violation) noexcept {
    try {
        // What an inner request is caught at happened during the outer one, too.
        for (ObjectScope* scope = ObjectScope::innermost(); scope; scope = scope->outer()) {
            if (&scope->core() == this) scope->violations().push_back(violation);
        }
        const std::lock_guard<std::mutex> lock(findingsMutex_);
        violations_.push_back(std::move(violation));
    } catch (...) {
        // Out of memory: the finding is lost, the request goes on.
    }
}

std::vector<std::string> BrokerCore::violations(bool take) {
    const std::lock_guard<std::mutex> lock(findingsMutex_);
    return take ? std::exchange(violations_, {}) : violations_;
}

CMPIrc BrokerCore::inject(FaultPlan& plan, const CallName& call) {
    const auto failure = plan.onCall(call.text());
    if (!failure) return CMPI_RC_OK;
    // With a value the call does its work, and only the status that it reports is wrong.
    if (!failure->withValue) throw Failure{failure->rc};
    return failure->rc;
}

void BrokerCore::route(const std::string& className, UpcallService& service) {
    for (auto& [known, knownService] : services_) {
        if (!base::equalsIgnoreCase(known, className)) continue;
        knownService = &service;
        return;
    }
    services_.emplace_back(className, &service);
}

UpcallService* BrokerCore::serviceOf(const std::string& className) const {
    for (const auto& [known, service] : services_) {
        if (base::equalsIgnoreCase(known, className)) return service;
    }
    return nullptr;
}

UpcallService* BrokerCore::serviceFor(const OperationRequest& request) const {
    // Object managers send an association request to the provider of the association, where it is
    // named.
    const bool references = request.operation == Operation::References ||
                            request.operation == Operation::ReferenceNames;
    const std::optional<std::string>& association =
        references ? request.resultClass : request.assocClass;
    if (association) {
        if (UpcallService* const found = serviceOf(*association)) return found;
    }
    UpcallService* const found = serviceOf(request.path.className);
    return found == nullptr ? others_ : found;
}

UpcallAnswer BrokerCore::perform(const OperationRequest& request) {
    if (UpcallService* const found = serviceFor(request)) return found->perform(owner_, request);
    UpcallAnswer answer;
    // A class that nobody serves is another mistake than a name that is wrong.
    answer.rc = declaration(request.path.className) == nullptr ? CMPI_RC_ERR_INVALID_CLASS
                                                               : CMPI_RC_ERR_NOT_SUPPORTED;
    answer.message = "No provider for class " + request.path.className;
    return answer;
}

Broker::Broker(const ClassCatalogue* catalogue, BrokerOptions options)
    : core_(std::make_unique<BrokerCore>(*this, catalogue, options)) {}

Broker::~Broker() = default;

const CMPIBroker* Broker::cmpi() const noexcept {
    return core_->cmpi();
}
void Broker::route(const std::string& className, UpcallService& service) {
    core_->route(className, service);
}
void Broker::routeOthers(UpcallService& service) {
    core_->routeOthers(service);
}
void Broker::setMessageSink(MessageSink sink) {
    core_->setMessageSink(std::move(sink));
}
void Broker::setFaultPlan(FaultPlan* plan) noexcept {
    core_->setFaultPlan(plan);
}
std::vector<std::string> Broker::violations() const {
    return core_->violations(false);
}
std::vector<std::string> Broker::takeViolations() {
    return core_->violations(true);
}
std::size_t Broker::unreleasedClones() const {
    return core_->unreleasedClones();
}
std::size_t Broker::quarantined() const {
    return core_->quarantined();
}

}  // namespace cmpihost
