// A request alone finds little: the host, the broker and the log around it are decoded with it.
#include "fuzz/FuzzCase.h"

#include <new>
#include <stdexcept>

#include "InstrumentationException.h"
#include "support/Requests.h"

namespace fuzz {

using cmpihost::BrokerOptions;
using cmpihost::InstanceValue;
using cmpihost::ObjectPathValue;
using cmpihost::Operation;
using cmpihost::OperationRequest;
using VA::SimulatedHost;
using VA::NodeLexicon::Properties;

namespace {

constexpr Operation operations[] = {
    Operation::EnumerateInstances, Operation::EnumerateInstanceNames,
    Operation::GetInstance,        Operation::AssociatorNames,
    Operation::Associators,        Operation::CreateInstance,
    Operation::ModifyInstance,     Operation::DeleteInstance,
    Operation::ExecQuery,          Operation::References,
    Operation::ReferenceNames,
};
constexpr const char* dates[] = {"2009-03-17-08:15:42", "", "0-0-0", "9999-12-31-23:59:59",
                                 "2009--1-17-08:15:42"};
// How often the decoded nodes and computer systems are there; mostly once, since many cost time.
constexpr unsigned repetitions[] = {1, 1, 1, 2, 8, 40, 1, 1, 1, 1, 1, 1, 1, 1, 1, 1};

std::vector<std::string> names(Decoder& input) {
    std::vector<std::string> result;
    for (auto count = input.numberUpTo(4); count > 0; --count) result.push_back(input.text(32));
    return result;
}

OperationRequest decodeRequest(Decoder& input) {
    OperationRequest request;
    request.operation = input.pick(operations);
    request.path = input.path();
    request.assocClass = input.optionalClassName();
    request.resultClass = input.optionalClassName();
    request.role = input.optionalText();
    request.resultRole = input.optionalText();
    if (input.flag()) request.properties = names(input);
    if (request.operation == Operation::CreateInstance ||
        request.operation == Operation::ModifyInstance)
        request.instance = input.instance();
    if (request.operation == Operation::ExecQuery) request.query = input.text();
    request.context.principal = input.optionalText();
    request.context.role = input.optionalText();
    request.context.flags = static_cast<CMPIFlags>(input.numberUpTo(0xFF));
    return request;
}

SimulatedHost::Value propertyValue(Decoder& input) {
    switch (input.numberUpTo(3)) {
        case 0:
            return input.textLike(dates);
        case 1:
            return static_cast<unsigned int>(input.number());
        case 2:
            return input.flag();
        default:
            return std::string(static_cast<std::size_t>(input.numberUpTo(2000)), 'x');
    }
}

SimulatedHost::Node decodeNode(Decoder& input) {
    constexpr unsigned statuses[] = {1, 0, 2, 8, 9, 12, 16, 20, 21, 26, 27};
    SimulatedHost::Node node = SimulatedHost::plausibleNode();
    node.properties[VA::NodeLexicon::Name] = std::string("Linux");
    node.status = input.flag() ? static_cast<unsigned int>(input.number()) : input.pick(statuses);
    if (input.flag()) node.properties.clear();
    for (auto changes = input.numberUpTo(6); changes > 0; --changes) {
        const auto id = static_cast<Properties>(input.flag() ? input.numberUpTo(200) : 108);
        if (input.flag())
            node.properties.erase(id);
        else
            node.properties[id] = propertyValue(input);
        if (input.flag()) node.readOnly[id] = input.flag();
    }
    return node;
}

void addNodes(Decoder& input, FuzzCase& fuzzCase) {
    std::vector<SimulatedHost::Node> nodes(1, decodeNode(input));
    for (auto more = input.numberUpTo(3); more > 0; --more) nodes.push_back(decodeNode(input));
    if (input.flag()) nodes.clear();
    const unsigned times = input.pick(repetitions);
    for (unsigned each = 0; each < times; ++each) {
        for (SimulatedHost::Node node : nodes) {
            auto& name = node.properties[VA::NodeLexicon::Name];
            if (each > 0) name = "node" + std::to_string(each);
            fuzzCase.host->addNode(std::move(node));
            ++fuzzCase.nodes;
        }
    }
}

void addException(Decoder& input, FuzzCase& fuzzCase) {
    fuzzCase.exception = static_cast<HostException>(input.numberUpTo(4));
    const auto from = input.numberUpTo(200) + 1;
    switch (fuzzCase.exception) {
        case HostException::Standard:
            return fuzzCase.host->throwFromCall(from, std::runtime_error("from the host"));
        case HostException::Framework:
            return fuzzCase.host->throwFromCall(from, VA::InstrumentationException("Not Found."));
        case HostException::NoMemory:
            return fuzzCase.host->throwFromCall(from, std::bad_alloc());
        case HostException::Foreign:
            return fuzzCase.host->throwFromCall(from, ForeignException{});
        default:
            return;
    }
}

InstanceValue computerSystem(const std::string& name) {
    InstanceValue instance;
    instance.path = computerSystemPath(name);
    return instance;
}

void addComputers(Decoder& input, FuzzCase& fuzzCase) {
    cmpihost::UpcallAnswer& answer = fuzzCase.computers.answer;
    fuzzCase.computersServed = !input.flag();
    if (input.flag()) answer.rc = input.status();
    answer.failAt = static_cast<unsigned>(input.numberUpTo(3));
    answer.failRc = input.status();
    std::vector<InstanceValue> systems(1, computerSystem("host1"));
    for (auto more = input.numberUpTo(3); more > 0; --more) {
        const bool odd = input.flag();
        systems.push_back(odd ? input.instance(1) : computerSystem(input.text(64)));
        fuzzCase.oddComputers = fuzzCase.oddComputers || odd;
    }
    if (input.flag()) systems.clear();
    const unsigned times = input.pick(repetitions);
    for (unsigned each = 0; each < times; ++each) {
        for (const InstanceValue& system : systems) {
            answer.paths.push_back(system.path);
            answer.instances.push_back(system);
        }
    }
}

BrokerOptions decodeOptions(Decoder& input) {
    const BrokerOptions options = input.flag() ? BrokerOptions::sparse() : BrokerOptions();
    // Two more flags lie in the seeds; they mean nothing.
    input.flag();
    input.flag();
    return options;
}

void addFaults(Decoder& input, FuzzCase& fuzzCase) {
    constexpr const char* entries[] = {
        "",
        "newObjectPath",
        "newInstance",
        "newArray",
        "newDateTimeFromChars",
        "newString",
        "enumerateInstances",
        "getNext",
        "hasNext",
        "getObjectPath",
        "getKey",
        "getKeyAt",
        "getKeyCount",
        "getClassName",
        "getNameSpace",
        "addKey",
        "setProperty",
        "getCharPtr",
        "setElementAt",
        "returnInstance",
        "returnObjectPath",
    };
    for (auto count = input.numberUpTo(2); count > 0; --count) {
        cmpihost::Fault fault;
        fault.entry = input.pick(entries);
        fault.nth = static_cast<unsigned>(input.numberUpTo(100)) + 1;
        fault.times = static_cast<unsigned>(input.numberUpTo(2));
        fault.rc = input.status();
        fuzzCase.faults.push_back(fault);
    }
    fuzzCase.resultFailsFrom = static_cast<unsigned>(input.numberUpTo(4));
}

}  // namespace

FuzzCase decodeCase(Decoder& input) {
    FuzzCase fuzzCase;
    fuzzCase.request = decodeRequest(input);
    addNodes(input, fuzzCase);
    if (!input.flag()) fuzzCase.host->setComputerName("host1");
    addComputers(input, fuzzCase);
    fuzzCase.options = decodeOptions(input);
    addException(input, fuzzCase);
    addFaults(input, fuzzCase);
    fuzzCase.logThrowsFrom = input.flag() ? input.numberUpTo(400) + 1 : 0;
    return fuzzCase;
}

std::string describe(const FuzzCase& fuzzCase) {
    const OperationRequest& request = fuzzCase.request;
    std::string text = std::string(operationName(request.operation)) + ' ' + toString(request.path);
    text += "\n  association class " + request.assocClass.value_or("(none)");
    text += "\n  " + std::to_string(fuzzCase.nodes) + " nodes, " +
            std::to_string(fuzzCase.computers.answer.instances.size()) + " computer systems" +
            (fuzzCase.computersServed ? "" : " that nobody serves");
    for (const ObjectPathValue& path : fuzzCase.computers.answer.paths)
        text += "\n  " + toString(path);
    for (const cmpihost::Fault& fault : fuzzCase.faults)
        text += "\n  fault of '" + fault.entry + "' at call " + std::to_string(fault.nth) + ", " +
                std::to_string(fault.times) + " times, status " + std::to_string(fault.rc);
    text +=
        "\n  host exception of kind " + std::to_string(static_cast<unsigned>(fuzzCase.exception));
    text += "\n  log throws from record " + std::to_string(fuzzCase.logThrowsFrom);
    return text + '\n';
}

}  // namespace fuzz
