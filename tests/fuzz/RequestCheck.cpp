// What a request must leave behind whatever its bytes decode to. The provider and the facade differ
// in what they answer, but not in how they are run.
#include "fuzz/RequestCheck.h"

#include <algorithm>
#include <cstdio>
#include <cstdlib>

#include "base/Ascii.h"
#include "fuzz/Invariant.h"
#include "fuzz/StrictLog.h"
#include "host/broker/ResultCollector.h"
#include "support/Requests.h"

namespace fuzz {

using namespace cmpihost;

namespace {

bool isRefused(Operation operation) {
    switch (operation) {
        case Operation::EnumerateInstances:
        case Operation::EnumerateInstanceNames:
        case Operation::GetInstance:
        case Operation::Associators:
        case Operation::AssociatorNames:
            return false;
        default:
            return true;
    }
}

bool asksForFarEnds(Operation operation) {
    return operation == Operation::Associators || operation == Operation::AssociatorNames;
}

// Whether the request's class selects an adapter. A name ends where its C string ends.
bool isServed(const OperationRequest& request) {
    constexpr const char* associations[] = {"KORVA_InstalledOS", "KORVA_RunningOS",
                                            "KORVA_OSElementCapabilities"};
    constexpr const char* elements[] = {"KORVA_OperatingSystem",
                                        "KORVA_OperatingSystemCapabilities"};
    const bool association = asksForFarEnds(request.operation);
    const std::string given =
        association ? request.assocClass.value_or("") : request.path.className;
    const auto named = [name = std::string(given.c_str())](const char* each) {
        return base::equalsIgnoreCase(name, each);
    };
    return std::any_of(std::begin(associations), std::end(associations), named) ||
           (!association && std::any_of(std::begin(elements), std::end(elements), named));
}

void checkRefusal(const Outcome& outcome) {
    expect(outcome.rc == CMPI_RC_ERR_NOT_SUPPORTED, "a refused operation says so");
    expect(outcome.doneCount == 0 && outcome.paths.empty() && outcome.instances.empty(),
           "a refused operation leaves the result alone");
    expect(countedRecords().all == 2, "a refused operation leaves one record a channel");
}

// A request for all elements of a class whose elements are the nodes.
bool asksForEveryNode(const OperationRequest& request) {
    constexpr const char* elements[] = {"KORVA_OperatingSystem",
                                        "KORVA_OperatingSystemCapabilities"};
    const std::string name = request.path.className.c_str();
    return !asksForFarEnds(request.operation) && request.path.keys.empty() &&
           std::any_of(std::begin(elements), std::end(elements),
                       [&](const char* each) { return base::equalsIgnoreCase(name, each); });
}

void checkCount(const FuzzCase& fuzzCase, const Outcome& outcome) {
    const std::size_t found = outcome.paths.size() + outcome.refusedPaths.size() +
                              outcome.instances.size() + outcome.refusedInstances.size();
    if (outcome.doneCount == 1 && asksForEveryNode(fuzzCase.request))
        expect(found == fuzzCase.nodes, "every node is one element");
}

void checkService(const FuzzCase& fuzzCase, const Outcome& outcome, bool faultless) {
    const RecordCounts records = countedRecords();
    expect(records.entries == 4 && records.exits == 4, "two markers open and close a request");
    expect(outcome.doneCount <= 1, "the end is reported once");
    // A capabilities association has a first element before anybody looks whether its ends exist.
    expect(outcome.paths.size() + outcome.instances.size() <=
               1 + 2 * (fuzzCase.nodes + fuzzCase.computers.answer.instances.size()),
           "results are made from nodes and computer systems");
    if (!faultless) {
        expect(outcome.rc == CMPI_RC_OK || outcome.rc == CMPI_RC_ERR_INVALID_CLASS,
               "a request is served or its class is not known");
        return;
    }
    if (!isServed(fuzzCase.request)) {
        expect(outcome.rc == CMPI_RC_ERR_INVALID_CLASS, "a class that is not served is invalid");
        expect(outcome.doneCount == 0, "an invalid class leaves the result alone");
        return;
    }
    expect(outcome.rc == CMPI_RC_OK, "a served class is served");
    expect(records.messages == 0 || records.messages == 2, "one exception leaves one message");
    expect((outcome.doneCount == 1) == (records.messages == 0),
           "the end is reported unless an exception was");
    checkCount(fuzzCase, outcome);
}

void checkException(const FuzzCase& fuzzCase, const Ending& ending) {
    const bool fromHost = ending.foreignException && fuzzCase.exception == HostException::Foreign;
    const bool fromLog = !ending.foreignException && fuzzCase.logThrowsFrom != 0;
    expect(fromHost || fromLog, "an exception leaves the handler only by design");
}

// What a strict broker may find in answers that were made from incomplete values, and in objects of
// other providers, which are handed on as they came.
bool isHarmless(const std::string& violation, bool oddComputers) {
    const auto holds = [&](const char* part) { return violation.find(part) != std::string::npos; };
    if (holds(" without key ")) return true;
    return oddComputers && (violation.rfind("path of ", 0) == 0 || holds(" refers to ") ||
                            holds(", not ") || holds(", in the path "));
}

Ending run(FuzzCase& fuzzCase, Broker& broker, const ManagementInterfaces& interfaces) {
    FaultPlan plan;
    for (const Fault& fault : fuzzCase.faults) plan.add(fault);
    broker.setFaultPlan(&plan);
    startRecords(fuzzCase.logThrowsFrom);
    Ending ending;
    try {
        ending.outcome = invoke(interfaces, broker, fuzzCase.request, [&](ResultCollector& result) {
            result.failReturnInstance(fuzzCase.resultFailsFrom, CMPI_RC_ERR_FAILED);
            result.failReturnObjectPath(fuzzCase.resultFailsFrom, CMPI_RC_ERR_FAILED);
            result.failReturnDone(fuzzCase.resultFailsFrom, CMPI_RC_ERR_FAILED);
        });
    } catch (const ForeignException&) {
        ending.foreignException = true;
    } catch (const std::exception&) {
    }
    broker.setFaultPlan(nullptr);
    ending.faultsFired = plan.fired();
    return ending;
}

// For people who look at an input: FUZZ_SHOW in the environment has it told.
void show(const FuzzCase& fuzzCase, const Ending& ending, const Broker& broker) {
    if (std::getenv("FUZZ_SHOW") == nullptr) return;
    std::fputs(describe(fuzzCase).c_str(), stderr);
    if (ending.outcome)
        std::fprintf(stderr, "  status %u, %zu paths, %zu instances, %u times done\n",
                     static_cast<unsigned>(ending.outcome->rc), ending.outcome->paths.size(),
                     ending.outcome->instances.size(), ending.outcome->doneCount);
    for (const std::string& violation : broker.violations())
        std::fprintf(stderr, "  violation: %s\n", violation.c_str());
}

}  // namespace

void checkViolations(const FuzzCase& fuzzCase, Broker& broker) {
    for (const std::string& violation : broker.takeViolations())
        if (!isHarmless(violation, fuzzCase.oddComputers))
            broken("the broker is used as it may be: " + violation);
    expect(broker.unreleasedClones() == 0, "clones are released");
}

void checkEnding(const FuzzCase& fuzzCase, const Ending& ending, Broker& broker) {
    const bool faultless = ending.faultsFired == 0 && fuzzCase.logThrowsFrom == 0;
    if (!ending.outcome)
        checkException(fuzzCase, ending);
    else if (ending.outcome->message)
        broken("a status carries no message");
    else if (isRefused(fuzzCase.request.operation))
        checkRefusal(*ending.outcome);
    else
        checkService(fuzzCase, *ending.outcome, faultless);
    checkViolations(fuzzCase, broker);
}

void runRequest(const std::uint8_t* data, std::size_t size, Factories factories, Check check) {
    Decoder input(data, size);
    FuzzCase fuzzCase = decodeCase(input);
    VA::setHostSource(fuzzCase.host);
    {
        Broker broker(&schemaCatalogue(), fuzzCase.options);
        if (fuzzCase.computersServed) broker.route("KORVA_ComputerSystem", fuzzCase.computers);
        const Ending ending = run(fuzzCase, broker, factories(broker.cmpi()));
        show(fuzzCase, ending, broker);
        check(fuzzCase, ending, broker);
    }
    VA::setHostSource(nullptr);
}

}  // namespace fuzz
