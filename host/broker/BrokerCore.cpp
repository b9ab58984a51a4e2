#include "host/broker/BrokerCore.h"

#include "host/broker/BrokerTables.h"

#include <algorithm>

namespace cmpihost {

char tombstone[] = "(object of a request that ended)";

Scope*& innermostScope() noexcept {
    static thread_local Scope* innermost = nullptr;
    return innermost;
}

void reportLateUse(const Shell& shell, const CallName& call) noexcept {
    try {
        shell.core().report(call.text() + ": " + shell.describe() + ' ' + shell.endOfLife());
    } catch (...) {
        // Without memory there is no report; the call fails all the same.
    }
}

namespace {

void reportToThread(const std::string& violation) {
    if (const Scope* const scope = innermostScope()) scope->core->report(violation);
}

}  // namespace

void refuseNull(const CallName& call, const char* kind) {
    reportToThread(call.text() + ": null " + kind);
    throw Failure{CMPI_RC_ERR_INVALID_PARAMETER};
}

void refuseForeign(const CallName& call, const char* kind) {
    reportToThread(call.text() + ": no " + kind + " of this host");
    throw Failure{CMPI_RC_ERR_INVALID_HANDLE};
}

BrokerCore::BrokerCore(Broker& owner, const ClassCatalogue* catalogue, BrokerOptions options)
    : owner_(owner),
      catalogue_(catalogue),
      options_(std::move(options)),
      shape_(shapeOf(options_)),
      upcalls_(upcallsFor(options_)),
      factories_(factoriesFor(options_)),
      threads_(threadsFor(options_)),
      memory_(memoryTable()),
      broker_{this, &upcalls_, &factories_, &threads_, options_.memoryTable ? &memory_ : nullptr},
      quarantine_(options_.quarantine) {}

BrokerCore::~BrokerCore() = default;

const ClassDeclaration* BrokerCore::declaration(std::string_view className) const {
    return catalogue_ == nullptr ? nullptr : catalogue_->find(className);
}

Arena* BrokerCore::threadArena() const noexcept {
    for (const Scope* scope = innermostScope(); scope != nullptr; scope = scope->outer) {
        if (scope->core == this) return scope->arena;
    }
    return nullptr;
}

void BrokerCore::adopt(std::unique_ptr<Shell> shell) {
    if (Arena* const arena = threadArena()) {
        arena->add(std::move(shell));
        return;
    }
    report(shell->describe() + " made while no request is open on the thread");
    const std::lock_guard<std::mutex> lock(strayMutex_);
    strays_.add(std::move(shell));
}

void BrokerCore::adoptClone(std::unique_ptr<Shell> shell) {
    const std::lock_guard<std::mutex> lock(cloneMutex_);
    Shell* const key = shell.get();
    clones_.emplace(key, std::move(shell));
}

void BrokerCore::giveBack(const Shell& shell) noexcept {
    if (shell.arena() != nullptr) {
        quarantine_.take(shell.arena()->giveBack(shell));
        return;
    }
    std::unique_ptr<Shell> owned;
    {
        const std::lock_guard<std::mutex> lock(cloneMutex_);
        const auto found = clones_.find(&shell);
        if (found == clones_.end()) return;
        owned = std::move(found->second);
        clones_.erase(found);
    }
    owned->retire(Life::GivenBack);
    quarantine_.take(std::move(owned));
}

std::size_t BrokerCore::unreleasedClones() const {
    const std::lock_guard<std::mutex> lock(cloneMutex_);
    return clones_.size();
}

void BrokerCore::report(std::string violation) noexcept {
    try {
        for (Scope* scope = innermostScope(); scope != nullptr; scope = scope->outer) {
            if (scope->core == this) scope->violations.push_back(violation);
        }
        const std::lock_guard<std::mutex> lock(findingsMutex_);
        violations_.push_back(std::move(violation));
    } catch (...) {
        // Out of memory: the finding is lost, the request goes on.
    }
}

void BrokerCore::log(LogRecord record) {
    const std::lock_guard<std::mutex> lock(findingsMutex_);
    log_.push_back(std::move(record));
}

std::vector<std::string> BrokerCore::violations(bool take) {
    const std::lock_guard<std::mutex> lock(findingsMutex_);
    std::vector<std::string> result = violations_;
    if (take) violations_.clear();
    return result;
}

std::vector<LogRecord> BrokerCore::logRecords(bool take) {
    const std::lock_guard<std::mutex> lock(findingsMutex_);
    std::vector<LogRecord> result = log_;
    if (take) log_.clear();
    return result;
}

CMPIrc BrokerCore::inject(FaultPlan& plan, const CallName& call) {
    const std::optional<PlannedFailure> failure = plan.onCall(call.table, call.slot);
    if (!failure) return CMPI_RC_OK;
    if (!failure->withValue) throw Failure{failure->rc};
    return failure->rc;
}

void BrokerCore::route(std::string className, UpcallService& service) {
    const auto known = std::find_if(services_.begin(), services_.end(), [&](const auto& entry) {
        return equalNames(entry.first, className);
    });
    if (known != services_.end()) {
        known->second = &service;
    } else {
        services_.emplace_back(std::move(className), &service);
    }
}

UpcallService* BrokerCore::service(const std::string& className) const {
    const auto found = std::find_if(services_.begin(), services_.end(), [&](const auto& entry) {
        return equalNames(entry.first, className);
    });
    return found == services_.end() ? nullptr : found->second;
}

UpcallService* BrokerCore::serviceFor(const OperationRequest& request) const {
    // Object managers send an association request to the provider of the association, where it is
    // named.
    const bool references = request.operation == Operation::References ||
                            request.operation == Operation::ReferenceNames;
    const std::optional<std::string>& association =
        references ? request.resultClass : request.assocClass;
    if (association) {
        if (UpcallService* const found = service(*association)) return found;
    }
    return service(request.path.className);
}

UpcallAnswer BrokerCore::perform(const OperationRequest& request) {
    if (UpcallService* const found = serviceFor(request)) return found->perform(owner_, request);
    UpcallAnswer answer;
    answer.rc = declaration(request.path.className) == nullptr ? CMPI_RC_ERR_INVALID_CLASS
                                                               : CMPI_RC_ERR_NOT_SUPPORTED;
    answer.message = "No provider for class " + request.path.className;
    return answer;
}

}  // namespace cmpihost
