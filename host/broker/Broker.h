#ifndef HOST_BROKER_BROKER_H
#define HOST_BROKER_BROKER_H

#include "host/broker/ClassCatalogue.h"
#include "host/broker/FaultPlan.h"
#include "host/broker/Operation.h"

#include <cmpi/cmpift.h>

#include <functional>
#include <memory>
#include <string>
#include <vector>

/// The embedded, strict CMPI broker.
namespace cmpihost {

class Broker;
class BrokerCore;

/// How a broker presents itself, so that tests can stand for object managers of both kinds.
struct BrokerOptions {
    enum class Shape {
        /// Level 200 with every slot of every table filled.
        Complete,
        /// The opposite in all that object managers may leave out or do in their own way: low table
        /// versions, no memory table, null slots where level 200 added members and in the optional
        /// services, a context of flags and principal only, key values in the state CMPI_goodValue,
        /// CMPI_RC_ERR_NOT_FOUND for a missing item, and the keys of a path set as properties by
        /// newInstance.
        Sparse
    };

    Shape shape = Shape::Complete;
    /// How many ended objects are kept to recognise a late use.
    std::size_t quarantine = 4096;

    static BrokerOptions sparse() { return {Shape::Sparse}; }
};

/// What a service answers to an up-call.
struct UpcallAnswer : OperationResult {
    /// For enumerations: the k-th getNext (from 1) fails with `failRc`; 0: none.
    unsigned failAt = 0;
    CMPIrc failRc = CMPI_RC_ERR_FAILED;
};

/// What a provider logged or traced through its broker.
struct ProviderMessage {
    bool trace = false;
    /// The CMPISeverity of a logged message, the CMPILevel of a traced one.
    int level = 0;
    /// The message's identifier, or the traced component; empty: none was given.
    std::string source{};
    std::string text{};
};
/// Several threads may call it at once. What it throws becomes CMPI_RC_ERR_FAILED.
using MessageSink = std::function<void(const ProviderMessage&)>;

/// Stands for the provider of one or more classes. Up-calls arrive on the thread of the request; a
/// service that several threads may reach at once must cope with that.
class UpcallService {
  public:
    virtual ~UpcallService() = default;

    /// Answers one operation. An rc other than CMPI_RC_OK goes to the caller with a null object.
    virtual UpcallAnswer perform(Broker& broker, const OperationRequest& request) = 0;

  protected:
    UpcallService() = default;
    UpcallService(const UpcallService&) = default;
    UpcallService& operator=(const UpcallService&) = default;
};

/// A broker with all its tables, for one or more providers. Objects that providers make through it
/// belong to the RequestScope that is open on the thread. Several threads may run requests at once;
/// catalogue, routes, message sink and fault plan are set while none runs. The broker outlives its
/// requests and loaded libraries.
class Broker {
  public:
    /// `catalogue` outlives the broker; null: nothing is checked against a schema.
    explicit Broker(const ClassCatalogue* catalogue = nullptr, BrokerOptions options = {});
    ~Broker();
    Broker(const Broker&) = delete;
    Broker& operator=(const Broker&) = delete;

    /// What a provider's factory is given.
    const CMPIBroker* cmpi() const noexcept;

    /// Up-calls for the class go to `service`, which outlives its use; a later route replaces an
    /// earlier one.
    void route(const std::string& className, UpcallService& service);
    /// Up-calls for all classes without a route go to `service`, which outlives its use. Without
    /// one they get null and CMPI_RC_ERR_INVALID_CLASS, or CMPI_RC_ERR_NOT_SUPPORTED when the
    /// catalogue knows the class.
    void routeOthers(UpcallService& service);

    /// Shows what providers log and trace to `sink`, on the threads that do; none: nowhere.
    void setMessageSink(MessageSink sink);

    /// Null: no faults, no counting. The plan outlives its use.
    void setFaultPlan(FaultPlan* plan) noexcept;

    /// What the broker caught since the start or the last take, in order, one line each.
    std::vector<std::string> violations() const;
    std::vector<std::string> takeViolations();

    /// Clones that no provider has released yet.
    std::size_t unreleasedClones() const;
    /// Ended objects in quarantine.
    std::size_t quarantined() const;

    /// For the parts of this library.
    BrokerCore& core() noexcept { return *core_; }

  private:
    std::unique_ptr<BrokerCore> core_;
};

}  // namespace cmpihost

#endif
