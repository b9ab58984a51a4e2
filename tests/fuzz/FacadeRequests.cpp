// Whole requests against the facade's handlers, with the provider behind them.
#include <set>

#include "fuzz/Invariant.h"
#include "fuzz/RequestCheck.h"

// The facade's factories, as an object manager looks them up.
extern "C" {
CMPIInstanceMI* OSStatusFacade_Create_InstanceMI(const CMPIBroker*, const CMPIContext*,
                                                 CMPIStatus*);
CMPIAssociationMI* OSStatusFacade_Create_AssociationMI(const CMPIBroker*, const CMPIContext*,
                                                       CMPIStatus*);
}

namespace {

using cmpihost::Operation;
using cmpihost::Outcome;
using fuzz::expect;

cmpihost::ManagementInterfaces create(const CMPIBroker* broker) {
    return {OSStatusFacade_Create_InstanceMI(broker, nullptr, nullptr),
            OSStatusFacade_Create_AssociationMI(broker, nullptr, nullptr)};
}

std::size_t delivered(const Outcome& outcome) {
    return outcome.paths.size() + outcome.refusedPaths.size() + outcome.instances.size() +
           outcome.refusedInstances.size();
}

void expectEachOnce(const std::vector<cmpihost::ObjectPathValue>& paths) {
    std::set<std::string> seen;
    for (const cmpihost::ObjectPathValue& path : paths)
        expect(seen.insert(toString(path)).second, "an association is followed once");
}

// What holds as long as nothing fails.
void checkFaultless(Operation operation, const Outcome& outcome) {
    const bool served = outcome.rc == CMPI_RC_OK;
    expect(served != outcome.message.has_value(), "a refusal has a message, an answer none");
    switch (operation) {
        case Operation::CreateInstance:
        case Operation::ModifyInstance:
        case Operation::DeleteInstance:
        case Operation::ExecQuery:
            return expect(outcome.rc == CMPI_RC_ERR_NOT_SUPPORTED, "nothing can be changed");
        case Operation::GetInstance:
            return expect(!served || delivered(outcome) == 1, "one instance has the keys");
        case Operation::EnumerateInstances:
        case Operation::EnumerateInstanceNames:
            return expect(served || outcome.rc == CMPI_RC_ERR_INVALID_CLASS ||
                              outcome.rc == CMPI_RC_ERR_FAILED,
                          "an enumeration is whole, or the class is not served");
        default:
            expect(served || outcome.rc == CMPI_RC_ERR_FAILED,
                   "a question about associations is never wrong");
            return expectEachOnce(outcome.paths);
    }
}

void check(const fuzz::FuzzCase& fuzzCase, const fuzz::Ending& ending, cmpihost::Broker& broker) {
    expect(ending.outcome.has_value(), "no exception leaves the facade");
    const Outcome& outcome = *ending.outcome;
    const bool served = outcome.rc == CMPI_RC_OK;
    expect(served || delivered(outcome) == 0, "a refusal delivers nothing");
    expect(outcome.doneCount <= (served ? 1U : 0U), "the end of an answer is reported once");
    const bool faultless = ending.faultsFired == 0 && fuzzCase.logThrowsFrom == 0;
    expect(!faultless || !served || outcome.doneCount == 1, "the end of an answer is reported");
    if (faultless && fuzzCase.exception == fuzz::HostException::None)
        checkFaultless(fuzzCase.request.operation, outcome);
    fuzz::checkViolations(fuzzCase, broker);
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    fuzz::runRequest(data, size, create, check);
    return 0;
}
