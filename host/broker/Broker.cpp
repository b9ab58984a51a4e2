#include "host/broker/Broker.h"

#include "host/broker/BrokerCore.h"

namespace cmpihost {

Broker::Broker(const ClassCatalogue* catalogue, BrokerOptions options)
    : core_(std::make_unique<BrokerCore>(*this, catalogue, std::move(options))) {}

Broker::~Broker() = default;

const CMPIBroker* Broker::cmpi() const noexcept {
    return core_->cmpi();
}
const BrokerOptions& Broker::options() const noexcept {
    return core_->options();
}
const ClassCatalogue* Broker::catalogue() const noexcept {
    return core_->catalogue();
}

void Broker::route(const std::string& className, UpcallService& service) {
    core_->route(className, service);
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
std::vector<LogRecord> Broker::logRecords() const {
    return core_->logRecords(false);
}
std::vector<LogRecord> Broker::takeLogRecords() {
    return core_->logRecords(true);
}

std::size_t Broker::unreleasedClones() const {
    return core_->unreleasedClones();
}
std::size_t Broker::quarantined() const {
    return core_->quarantined();
}

}  // namespace cmpihost
