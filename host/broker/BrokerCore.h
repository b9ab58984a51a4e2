// What stands behind a CMPIBroker: tables, objects, findings. Internal.
#pragma once

#include "host/broker/Arena.h"
#include "host/broker/Broker.h"
#include "host/broker/Object.h"

#include <atomic>
#include <map>
#include <mutex>
#include <unordered_map>

namespace cmpihost {

/// One open request of a thread.
struct Scope {
    BrokerCore* core = nullptr;
    /// Of the outermost open request of this broker on this thread.
    Arena* arena = nullptr;
    Scope* outer = nullptr;
    std::vector<std::string> violations{};
    /// What attachThread opened; null for any other scope.
    class RequestScope* attached = nullptr;
};

/// The innermost request of the calling thread, of any broker; null: none is open.
Scope*& innermostScope() noexcept;

class BrokerCore {
  public:
    BrokerCore(Broker& owner, const ClassCatalogue* catalogue, BrokerOptions options);
    ~BrokerCore();
    BrokerCore(const BrokerCore&) = delete;
    BrokerCore& operator=(const BrokerCore&) = delete;

    Broker& owner() const noexcept { return owner_; }
    const CMPIBroker* cmpi() const noexcept { return &broker_; }
    const BrokerOptions& options() const noexcept { return options_; }
    const ClassCatalogue* catalogue() const noexcept { return catalogue_; }
    /// The declaration of a class, null if there is none or no catalogue.
    const ClassDeclaration* declaration(std::string_view className) const;

    /// A new object that belongs to the thread's request. Without one it lives as long as the
    /// broker, and that is a violation.
    template <class Edt>
    Object<Edt>* make(typename Object<Edt>::Body body) {
        auto object = std::make_unique<Object<Edt>>(*this, shape_, std::move(body));
        Object<Edt>* const result = object.get();
        adopt(std::move(object));
        return result;
    }

    /// A new object that belongs to the provider until it is released.
    template <class Edt>
    Object<Edt>* makeClone(typename Object<Edt>::Body body) {
        auto object = std::make_unique<Object<Edt>>(*this, shape_, std::move(body));
        Object<Edt>* const result = object.get();
        adoptClone(std::move(object));
        return result;
    }
    /// Ends an object before its time, whoever owns it.
    void giveBack(const Shell& shell) noexcept;

    /// Where objects of the calling thread go; null: it has no open request of this broker.
    Arena* threadArena() const noexcept;

    /// Takes the shells of a request that ended.
    void quarantine(Shells shells) noexcept { quarantine_.take(std::move(shells)); }

    /// Memory services within the thread's request.
    template <class Function>
    auto withArena(Function function) {
        if (Arena* const arena = threadArena()) return function(*arena);
        const std::lock_guard<std::mutex> lock(strayMutex_);
        return function(strays_);
    }

    void report(std::string violation) noexcept;
    void log(LogRecord record);

    /// Counts a call and throws Failure if it is to fail. Else the status that it is to report
    /// beside its value, CMPI_RC_OK for its own.
    CMPIrc countCall(const CallName& call) {
        FaultPlan* const plan = plan_.load(std::memory_order_acquire);
        return plan == nullptr ? CMPI_RC_OK : inject(*plan, call);
    }
    void setFaultPlan(FaultPlan* plan) noexcept { plan_.store(plan, std::memory_order_release); }

    void route(std::string className, UpcallService& service);
    UpcallAnswer perform(const OperationRequest& request);

    std::vector<std::string> violations(bool take);
    std::vector<LogRecord> logRecords(bool take);
    std::size_t unreleasedClones() const;
    std::size_t quarantined() const { return quarantine_.size(); }

  private:
    void adopt(std::unique_ptr<Shell> shell);
    void adoptClone(std::unique_ptr<Shell> shell);
    static CMPIrc inject(FaultPlan& plan, const CallName& call);
    UpcallService* serviceFor(const OperationRequest& request) const;
    UpcallService* service(const std::string& className) const;

    Broker& owner_;
    const ClassCatalogue* const catalogue_;
    const BrokerOptions options_;
    const std::size_t shape_;

    CMPIBrokerFT upcalls_;
    CMPIBrokerEncFT factories_;
    CMPIBrokerExtFT threads_;
    CMPIBrokerMemFT memory_;
    CMPIBroker broker_;

    std::atomic<FaultPlan*> plan_{nullptr};
    std::vector<std::pair<std::string, UpcallService*>> services_;

    mutable std::mutex findingsMutex_;
    std::vector<std::string> violations_;
    std::vector<LogRecord> log_;

    mutable std::mutex cloneMutex_;
    std::unordered_map<const Shell*, std::unique_ptr<Shell>> clones_;

    std::mutex strayMutex_;
    Arena strays_;
    Quarantine quarantine_;
};

/// What release and clone do for every kind.
template <class Edt>
CMPIStatus release(Object<Edt>& object) {
    if (object.arena() != nullptr) {
        object.core().report(object.describe() + " released that belongs to the object manager");
        return statusOf(CMPI_RC_ERR_INVALID_HANDLE);
    }
    object.core().giveBack(object);
    return statusOf(CMPI_RC_OK);
}

template <class Edt>
Edt* clone(const Object<Edt>& object, CMPIStatus*) {
    return object.core().template makeClone<Edt>(object.body);
}

}  // namespace cmpihost
