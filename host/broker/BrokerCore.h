#ifndef HOST_BROKER_BROKER_CORE_H
#define HOST_BROKER_BROKER_CORE_H

#include "host/broker/Arena.h"
#include "host/broker/Broker.h"

#include <atomic>
#include <mutex>
#include <optional>
#include <unordered_map>

/// What stands behind a CMPIBroker: tables, objects, findings. Internal.
namespace cmpihost {

/// A request or an attached thread, on the calling thread from construction to end(). Scopes nest;
/// the outermost one of a broker on a thread holds the objects.
class ObjectScope {
  public:
    enum class Kind { Request, AttachedThread };

    explicit ObjectScope(BrokerCore& core, Kind kind = Kind::Request);
    ~ObjectScope() { end(); }
    ObjectScope(const ObjectScope&) = delete;
    ObjectScope& operator=(const ObjectScope&) = delete;

    /// Later calls do nothing.
    void end() noexcept;

    BrokerCore& core() const noexcept { return core_; }
    Kind kind() const noexcept { return kind_; }
    Arena& arena() const noexcept { return *arena_; }
    ObjectScope* outer() const noexcept { return outer_; }
    /// What the broker caught on this thread since construction.
    std::vector<std::string>& violations() noexcept { return violations_; }

    /// The innermost scope of the calling thread, of any broker; null: none is open.
    static ObjectScope* innermost() noexcept;

  private:
    BrokerCore& core_;
    Kind kind_;
    bool open_ = true;
    ObjectScope* outer_;
    std::optional<Arena> own_;
    Arena* arena_;
    std::vector<std::string> violations_;
};

class BrokerCore {
  public:
    BrokerCore(Broker& owner, const ClassCatalogue* catalogue, BrokerOptions options);

    Broker& owner() const noexcept { return owner_; }
    const CMPIBroker* cmpi() const noexcept { return &broker_; }
    bool isSparse() const noexcept { return options_.shape == BrokerOptions::Shape::Sparse; }
    const ClassCatalogue* catalogue() const noexcept { return catalogue_; }
    /// The declaration of a class, null if there is none or no catalogue.
    const ClassDeclaration* declaration(std::string_view className) const;

    /// A new object that belongs to the thread's request. Without one it lives as long as the
    /// broker, and that is a violation.
    template <class Edt>
    Object<Edt>* make(typename Object<Edt>::Body body) {
        auto object = std::make_unique<Object<Edt>>(*this, isSparse(), std::move(body));
        Object<Edt>* const result = object.get();
        adopt(std::move(object));
        return result;
    }

    /// A new object that belongs to the provider until it is released.
    template <class Edt>
    Object<Edt>* makeClone(typename Object<Edt>::Body body) {
        auto object = std::make_unique<Object<Edt>>(*this, isSparse(), std::move(body));
        Object<Edt>* const result = object.get();
        adoptClone(std::move(object));
        return result;
    }
    /// Ends an object before its time, whoever owns it.
    void releaseObject(const ObjectBase& object) noexcept;

    /// Where objects of the calling thread go; null: it has no open request of this broker.
    Arena* threadArena() const noexcept;

    /// Calls function(arena) with the arena of the thread's request, or with the broker's own.
    template <class Function>
    auto withArena(Function function) {
        if (Arena* const arena = threadArena()) return function(*arena);
        const std::lock_guard<std::mutex> lock(unownedMutex_);
        return function(unowned_);
    }

    /// Ends the objects of a request.
    void endRequest(Arena& arena) noexcept {
        quarantine_.take(arena.endRequest(options_.quarantine));
    }
    void quarantine(Objects retired) noexcept { quarantine_.take(std::move(retired)); }

    void report(std::string violation) noexcept;

    /// Counts a call and throws Failure if it is to fail. Else the status that it is to report
    /// beside its value, CMPI_RC_OK for its own.
    CMPIrc countCall(const CallName& call) {
        FaultPlan* const plan = plan_.load(std::memory_order_acquire);
        return plan == nullptr ? CMPI_RC_OK : inject(*plan, call);
    }
    void setFaultPlan(FaultPlan* plan) noexcept { plan_.store(plan, std::memory_order_release); }

    void route(const std::string& className, UpcallService& service);
    void routeOthers(UpcallService& service) noexcept { others_ = &service; }
    void setMessageSink(MessageSink sink) { messageSink_ = std::move(sink); }
    void show(const ProviderMessage& message) const {
        if (messageSink_) messageSink_(message);
    }
    UpcallAnswer perform(const OperationRequest& request);

    std::vector<std::string> violations(bool take);
    std::size_t unreleasedClones() const;
    std::size_t quarantined() const { return quarantine_.size(); }

  private:
    void adopt(std::unique_ptr<ObjectBase> object);
    void adoptClone(std::unique_ptr<ObjectBase> object);
    static CMPIrc inject(FaultPlan& plan, const CallName& call);
    UpcallService* serviceFor(const OperationRequest& request) const;
    UpcallService* serviceOf(const std::string& className) const;

    Broker& owner_;
    const ClassCatalogue* const catalogue_;
    const BrokerOptions options_;

    CMPIBrokerFT upcalls_;
    CMPIBrokerEncFT factories_;
    CMPIBrokerExtFT threads_;
    CMPIBrokerMemFT memory_;
    CMPIBroker broker_;

    std::atomic<FaultPlan*> plan_{nullptr};
    std::vector<std::pair<std::string, UpcallService*>> services_;
    /// Answers for the classes that have none of the services; may be null.
    UpcallService* others_ = nullptr;
    MessageSink messageSink_;

    mutable std::mutex findingsMutex_;
    std::vector<std::string> violations_;

    mutable std::mutex cloneMutex_;
    std::unordered_map<const ObjectBase*, std::unique_ptr<ObjectBase>> clones_;

    std::mutex unownedMutex_;
    /// What was made outside of requests.
    Arena unowned_;
    Quarantine quarantine_;
};

/// The tables of a broker. A sparse one lacks slots.
CMPIBrokerFT upcallTable(bool sparse);
void bindAttachment(CMPIBrokerFT& table);
CMPIBrokerEncFT factoryTable(bool sparse);
void bindMessages(CMPIBrokerEncFT& table);
CMPIBrokerExtFT threadTable(bool sparse);
CMPIBrokerMemFT memoryTable();

}  // namespace cmpihost

#endif
