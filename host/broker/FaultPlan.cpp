// Faults count per fault, not per plan: "the second addKey" stays the second addKey whatever else
// is planned.
#include "host/broker/FaultPlan.h"

namespace cmpihost {

namespace {

/// `call` is "table.slot".
bool names(std::string_view entry, std::string_view call) {
    return entry.empty() || entry == call || entry == call.substr(call.find('.') + 1);
}

}  // namespace

FaultPlan::FaultPlan(Fault fault) {
    add(std::move(fault));
}

void FaultPlan::add(Fault fault) {
    const std::lock_guard<std::mutex> lock(mutex_);
    faults_.push_back({std::move(fault), 0});
}

void FaultPlan::clear() {
    const std::lock_guard<std::mutex> lock(mutex_);
    faults_.clear();
    calls_.clear();
    total_ = 0;
    fired_.clear();
}

unsigned FaultPlan::calls() const {
    const std::lock_guard<std::mutex> lock(mutex_);
    return total_;
}

unsigned FaultPlan::calls(std::string_view entry) const {
    const std::lock_guard<std::mutex> lock(mutex_);
    unsigned sum = 0;
    for (const auto& [name, count] : calls_) {
        if (names(entry, name)) sum += count;
    }
    return sum;
}

std::map<std::string, unsigned> FaultPlan::callsByEntry() const {
    const std::lock_guard<std::mutex> lock(mutex_);
    return calls_;
}

unsigned FaultPlan::fired() const {
    const std::lock_guard<std::mutex> lock(mutex_);
    return static_cast<unsigned>(fired_.size());
}

std::vector<std::string> FaultPlan::firedCalls() const {
    const std::lock_guard<std::mutex> lock(mutex_);
    return fired_;
}

std::optional<FaultPlan::Failure> FaultPlan::onCall(const std::string& call) {
    const std::lock_guard<std::mutex> lock(mutex_);
    ++total_;
    ++calls_[call];

    // Every fault counts the call, also when another one has already made it fail.
    std::optional<Failure> answer;
    for (Planned& planned : faults_) {
        const Fault& fault = planned.fault;
        if (!names(fault.entry, call)) continue;
        ++planned.seen;
        const bool reached = planned.seen >= fault.nth;
        const bool past = fault.times != 0 && planned.seen - fault.nth >= fault.times;
        if (reached && !past && !answer) answer = Failure{fault.rc, fault.withValue};
    }
    if (answer) fired_.push_back(call);
    return answer;
}

}  // namespace cmpihost
