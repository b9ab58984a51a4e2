// The embedded, strict CMPI broker.
#pragma once

#include "host/broker/BrokerOptions.h"
#include "host/broker/ClassCatalogue.h"
#include "host/broker/FaultPlan.h"
#include "host/broker/UpcallService.h"

#include <cmpi/cmpift.h>

#include <memory>
#include <string>
#include <vector>

namespace cmpihost {

class BrokerCore;

/// What a provider wrote with logMessage (severity) or trace (level).
struct LogRecord {
    enum class Channel { Log, Trace };
    Channel channel = Channel::Log;
    int severity = 0;
    /// The id of a message or the component of a trace.
    std::string id{};
    std::string text{};
};

/// A broker with all its tables, for one or more providers. Objects that providers make through it
/// belong to the Request that is open on the thread. Several threads may run requests at once;
/// catalogue, routes and fault plan are set while none runs. The broker outlives its requests and
/// loaded libraries.
class Broker {
  public:
    /// `catalogue` outlives the broker; null: nothing is checked against a schema.
    explicit Broker(const ClassCatalogue* catalogue = nullptr, BrokerOptions options = {});
    ~Broker();
    Broker(const Broker&) = delete;
    Broker& operator=(const Broker&) = delete;

    /// What a provider's factory is given.
    const CMPIBroker* cmpi() const noexcept;
    const BrokerOptions& options() const noexcept;
    const ClassCatalogue* catalogue() const noexcept;

    /// Up-calls for the class go to `service`, which outlives its use; a later route replaces an
    /// earlier one. Up-calls for a class without route: null and CMPI_RC_ERR_INVALID_CLASS, or
    /// CMPI_RC_ERR_NOT_SUPPORTED when the catalogue knows the class.
    void route(const std::string& className, UpcallService& service);

    /// Null: no faults, no counting. The plan outlives its use.
    void setFaultPlan(FaultPlan* plan) noexcept;

    /// What the broker caught since the start or the last take, in order, one line each.
    std::vector<std::string> violations() const;
    std::vector<std::string> takeViolations();
    /// What providers logged and traced since the start or the last take, in order.
    std::vector<LogRecord> logRecords() const;
    std::vector<LogRecord> takeLogRecords();

    /// Clones that no provider has released yet.
    std::size_t unreleasedClones() const;
    /// Shells of ended objects in quarantine.
    std::size_t quarantined() const;

    /// For the parts of this library.
    BrokerCore& core() noexcept { return *core_; }

  private:
    std::unique_ptr<BrokerCore> core_;
};

}  // namespace cmpihost
