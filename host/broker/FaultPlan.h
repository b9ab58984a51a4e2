#ifndef HOST_BROKER_FAULT_PLAN_H
#define HOST_BROKER_FAULT_PLAN_H

#include <cmpi/cmpidt.h>

#include <map>
#include <mutex>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

/// Faults on demand: which calls of a provider into the broker fail.
namespace cmpihost {

/// Calls that are to fail. An entry is named as its slot ("newObjectPath", "setProperty",
/// "getNext", "returnInstance") and then means that slot of every table, or with its table
/// ("CMPIInstanceFT.setProperty"), or is empty for every call of every table.
struct Fault {
    std::string entry{};
    /// The first call that fails, counted from 1.
    unsigned nth = 1;
    /// How many calls fail from there on; 0: all of them.
    unsigned times = 1;
    /// The status of the failing call. A call that returns an object returns null; with CMPI_RC_OK
    /// it returns null and reports success. A call that returns only a status then answers
    /// CMPI_RC_ERR_FAILED.
    CMPIrc rc = CMPI_RC_ERR_FAILED;
    /// On: the call does its work and hands its value out with `rc` beside it, as some object
    /// managers do.
    bool withValue = false;
};

/// Counts the calls of all tables by name and decides which of them fail. Attach it with
/// Broker::setFaultPlan; several threads may run through one plan.
class FaultPlan {
  public:
    FaultPlan() = default;
    explicit FaultPlan(Fault fault);

    void add(Fault fault);
    /// Forgets faults and counts.
    void clear();

    /// All calls since the start.
    unsigned calls() const;
    /// Calls of one entry, named as in Fault.
    unsigned calls(std::string_view entry) const;
    /// "table.slot" with its number of calls.
    std::map<std::string, unsigned> callsByEntry() const;
    /// How many calls were made to fail.
    unsigned fired() const;
    /// "table.slot" of each call that was made to fail, in order.
    std::vector<std::string> firedCalls() const;

    /// How one call fails.
    struct Failure {
        CMPIrc rc;
        bool withValue;
    };
    /// For the broker: counts a call of "table.slot" and says how it fails, if it does.
    std::optional<Failure> onCall(const std::string& call);

  private:
    struct Planned {
        Fault fault;
        unsigned seen = 0;
    };
    mutable std::mutex mutex_;
    std::vector<Planned> faults_;
    std::map<std::string, unsigned> calls_;
    unsigned total_ = 0;
    std::vector<std::string> fired_;
};

}  // namespace cmpihost

#endif
