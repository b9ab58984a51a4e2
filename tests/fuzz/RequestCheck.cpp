#include "fuzz/RequestCheck.h"

#include <algorithm>

#include "fuzz/Invariant.h"
#include "fuzz/StrictLog.h"

namespace fuzz {

using cmpihost::Operation;
using cmpihost::Outcome;

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

bool isAssociationOperation(Operation operation) {
    return operation == Operation::Associators || operation == Operation::AssociatorNames;
}

// Whether the request's class selects an adapter. A name ends where its C string ends.
bool isServed(const cmpihost::OperationRequest& request) {
    constexpr const char* associations[] = {"KORVA_InstalledOS", "KORVA_RunningOS",
                                            "KORVA_OSElementCapabilities"};
    constexpr const char* elements[] = {"KORVA_OperatingSystem",
                                        "KORVA_OperatingSystemCapabilities"};
    const bool association = isAssociationOperation(request.operation);
    const std::string given =
        association ? request.assocClass.value_or("") : request.path.className;
    const auto named = [name = std::string(given.c_str())](const char* each) {
        return cmpihost::equalNames(name, each);
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
bool asksForEveryNode(const cmpihost::OperationRequest& request) {
    constexpr const char* elements[] = {"KORVA_OperatingSystem",
                                        "KORVA_OperatingSystemCapabilities"};
    const std::string name = request.path.className.c_str();
    return !isAssociationOperation(request.operation) && request.path.keys.empty() &&
           std::any_of(std::begin(elements), std::end(elements),
                       [&](const char* each) { return cmpihost::equalNames(name, each); });
}

void checkCount(const Scene& scene, const Outcome& outcome) {
    const std::size_t found = outcome.paths.size() + outcome.refusedPaths.size() +
                              outcome.instances.size() + outcome.refusedInstances.size();
    if (outcome.doneCount == 1 && asksForEveryNode(scene.request))
        expect(found == scene.nodes, "every node is one element");
}

void checkService(const Scene& scene, const Outcome& outcome, bool faultless) {
    const RecordCounts records = countedRecords();
    expect(records.entries == 4 && records.exits == 4, "two markers open and close a request");
    expect(outcome.doneCount <= 1, "the end is reported once");
    // A capabilities association has a first element before anybody looks whether its ends exist.
    expect(outcome.paths.size() + outcome.instances.size() <=
               1 + 2 * (scene.nodes + scene.computers.answer.instances.size()),
           "results are made from nodes and computer systems");
    if (!faultless) {
        expect(outcome.rc == CMPI_RC_OK || outcome.rc == CMPI_RC_ERR_INVALID_CLASS,
               "a request is served or its class is not known");
        return;
    }
    if (!isServed(scene.request)) {
        expect(outcome.rc == CMPI_RC_ERR_INVALID_CLASS, "a class that is not served is invalid");
        expect(outcome.doneCount == 0, "an invalid class leaves the result alone");
        return;
    }
    expect(outcome.rc == CMPI_RC_OK, "a served class is served");
    expect(records.messages == 0 || records.messages == 2, "one exception leaves one message");
    expect((outcome.doneCount == 1) == (records.messages == 0),
           "the end is reported unless an exception was");
    checkCount(scene, outcome);
}

void checkException(const Scene& scene, const Ending& ending) {
    const bool fromHost = ending.foreignException && scene.exception == HostException::Foreign;
    const bool fromLog = !ending.foreignException && scene.logThrowsFrom != 0;
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

}  // namespace

void checkManners(const Scene& scene, cmpihost::Broker& broker) {
    for (const std::string& violation : broker.takeViolations())
        if (!isHarmless(violation, scene.oddComputers)) broken("good manners: " + violation);
    expect(broker.unreleasedClones() == 0, "clones are released");
}

void checkEnding(const Scene& scene, const Ending& ending, cmpihost::Broker& broker) {
    const bool faultless = ending.faultsFired == 0 && scene.logThrowsFrom == 0;
    if (!ending.outcome)
        checkException(scene, ending);
    else if (ending.outcome->message)
        broken("a status carries no message");
    else if (isRefused(scene.request.operation))
        checkRefusal(*ending.outcome);
    else
        checkService(scene, *ending.outcome, faultless);
    checkManners(scene, broker);
}

}  // namespace fuzz
