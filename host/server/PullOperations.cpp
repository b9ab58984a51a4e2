// An enumeration is computed whole when it is opened: what a client does not take at once waits.
#include "host/server/Operations.h"

#include "host/server/CimError.h"

#include <chrono>
#include <cstdint>
#include <iterator>
#include <utility>

namespace cmpihost::server {

namespace {

constexpr std::uint32_t defaultTimeout = 30;
constexpr std::uint32_t longestTimeout = 90;
constexpr std::uint32_t mostObjects = 10000;

/// The parameter MaxObjectCount; 0 where it is not given.
std::uint32_t objectCount(const Parameters& given) {
    const std::uint32_t count = given.number("MaxObjectCount").value_or(0);
    if (count > mostObjects)
        throw CimError(cimInvalidParameter,
                       "MaxObjectCount is at most " + std::to_string(mostObjects));
    return count;
}

/// What a client may ask of any enumeration that it opens.
struct OpenOptions {
    std::uint32_t count;
    std::chrono::seconds timeout;
};

OpenOptions openOptions(const Parameters& given) {
    const std::uint32_t count = objectCount(given);
    if (given.text("FilterQueryLanguage") || given.text("FilterQuery"))
        throw CimError(cimFilteredEnumerationNotSupported, "enumerations are not filtered here");
    if (given.flag("ContinueOnError", false))
        throw CimError(cimContinuationOnErrorNotSupported,
                       "an enumeration does not go on after an error here");
    const std::uint32_t timeout = given.number("OperationTimeout").value_or(defaultTimeout);
    if (timeout == 0 || timeout > longestTimeout)
        throw CimError(cimInvalidOperationTimeout, "OperationTimeout is from 1 to " +
                                                       std::to_string(longestTimeout) + " seconds");
    return {count, std::chrono::seconds(timeout)};
}

WrittenResults writtenInstances(const std::vector<InstanceValue>& instances, const Call& call) {
    const Site site = call.site();
    const bool classOrigin = call.parameters.flag("IncludeClassOrigin", false);
    WrittenResults results;
    for (const InstanceValue& instance : instances) {
        results.xml += "<VALUE.INSTANCEWITHPATH>";
        writeInstancePath(results.xml, instance.path, site);
        writeInstance(results.xml, instance, site, classOrigin);
        results.xml += "</VALUE.INSTANCEWITHPATH>";
        results.ends.push_back(results.xml.size());
    }
    return results;
}

WrittenResults writtenPaths(const std::vector<ObjectPathValue>& paths, const Call& call) {
    const Site site = call.site();
    WrittenResults results;
    for (const ObjectPathValue& path : paths) {
        writeInstancePath(results.xml, path, site);
        results.ends.push_back(results.xml.size());
    }
    return results;
}

EnumerationOwner ownerOf(const Call& call) {
    return {call.user, call.nameSpace};
}

void writePiece(const Piece& piece, const Call& call, std::string& xml) {
    xml += "<IRETURNVALUE>" + piece.xml + "</IRETURNVALUE>";
    writeParameter(xml, "EnumerationContext", piece.context, call.site());
    writeParameter(xml, "EndOfSequence", Value::fromBoolean(piece.context.empty()), call.site());
}

/// What an enumeration yields, by the parameters of its call.
using InstanceSource = std::vector<InstanceValue> (*)(const Call&);
using PathSource = std::vector<ObjectPathValue> (*)(const Call&);

void openEnumeration(const Call& call, const OpenOptions& options, PulledKind kind,
                     WrittenResults results, std::string& xml) {
    writePiece(call.manager.openEnumerations().open(ownerOf(call), kind, std::move(results),
                                                    options.count, options.timeout),
               call, xml);
}

template <InstanceSource source>
void openInstances(const Call& call, std::string& xml) {
    const OpenOptions options = openOptions(call.parameters);
    openEnumeration(call, options, PulledKind::InstancesWithPath,
                    writtenInstances(source(call), call), xml);
}

template <PathSource source>
void openPaths(const Call& call, std::string& xml) {
    const OpenOptions options = openOptions(call.parameters);
    openEnumeration(call, options, PulledKind::InstancePaths, writtenPaths(source(call), call),
                    xml);
}

constexpr const char* sourceInstance = "InstanceName";

std::vector<InstanceValue> openedAssociators(const Call& call) {
    return associators(call, sourceInstance);
}
std::vector<ObjectPathValue> openedAssociatorNames(const Call& call) {
    return associatorNames(call, sourceInstance);
}
std::vector<InstanceValue> openedReferences(const Call& call) {
    return references(call, sourceInstance);
}
std::vector<ObjectPathValue> openedReferenceNames(const Call& call) {
    return referenceNames(call, sourceInstance);
}

template <PulledKind kind>
void pullNext(const Call& call, std::string& xml) {
    const std::uint32_t count = objectCount(call.parameters);
    writePiece(call.manager.openEnumerations().pull(*call.parameters.text("EnumerationContext"),
                                                    ownerOf(call), kind, count),
               call, xml);
}

void closeEnumeration(const Call& call, std::string&) {
    call.manager.openEnumerations().close(*call.parameters.text("EnumerationContext"),
                                          ownerOf(call));
}

void refuseQuery(const Call&, std::string&) {
    throw CimError(cimNotSupported, "enumerations of queries are not supported");
}
void refuseCount(const Call&, std::string&) {
    throw CimError(cimNotSupported, "what is left of an enumeration is not counted");
}

/// An operation that opens an enumeration: its own parameters and those of all.
OperationRow opening(const char* name, std::vector<ParameterRow> parameters,
                     void (*run)(const Call&, std::string&)) {
    using Holds = ParameterKind;
    const ParameterRow common[] = {{"FilterQueryLanguage", Holds::Text},
                                   {"FilterQuery", Holds::Text},
                                   {"OperationTimeout", Holds::Number},
                                   {"ContinueOnError", Holds::Boolean},
                                   {"MaxObjectCount", Holds::Number}};
    parameters.insert(parameters.end(), std::begin(common), std::end(common));
    return {name, std::move(parameters), run};
}

OperationRow pulling(const char* name, void (*run)(const Call&, std::string&)) {
    using Holds = ParameterKind;
    return {name,
            {{"EnumerationContext", Holds::Text, true}, {"MaxObjectCount", Holds::Number, true}},
            run};
}

}  // namespace

const std::vector<OperationRow>& pullOperations() {
    using Holds = ParameterKind;
    static const ParameterRow className = {"ClassName", Holds::ClassName, true};
    static const ParameterRow source = {sourceInstance, Holds::InstanceName, true};
    static const ParameterRow assocClass = {"AssocClass", Holds::ClassName};
    static const ParameterRow resultClass = {"ResultClass", Holds::ClassName};
    static const ParameterRow role = {"Role", Holds::Text};
    static const ParameterRow resultRole = {"ResultRole", Holds::Text};
    static const ParameterRow deepInheritance = {"DeepInheritance", Holds::Boolean};
    static const ParameterRow classOrigin = {"IncludeClassOrigin", Holds::Boolean};
    static const ParameterRow properties = {"PropertyList", Holds::PropertyList};
    static const ParameterRow context = {"EnumerationContext", Holds::Text, true};
    static const std::vector<OperationRow> rows = {
        opening("OpenEnumerateInstances", {className, deepInheritance, classOrigin, properties},
                openInstances<enumeratedInstances>),
        opening("OpenEnumerateInstancePaths", {className}, openPaths<enumeratedInstanceNames>),
        opening("OpenAssociatorInstances",
                {source, assocClass, resultClass, role, resultRole, classOrigin, properties},
                openInstances<openedAssociators>),
        opening("OpenAssociatorInstancePaths", {source, assocClass, resultClass, role, resultRole},
                openPaths<openedAssociatorNames>),
        opening("OpenReferenceInstances", {source, resultClass, role, classOrigin, properties},
                openInstances<openedReferences>),
        opening("OpenReferenceInstancePaths", {source, resultClass, role},
                openPaths<openedReferenceNames>),
        opening("OpenQueryInstances", {{"ReturnQueryResultClass", Holds::Boolean}}, refuseQuery),
        pulling("PullInstancesWithPath", pullNext<PulledKind::InstancesWithPath>),
        pulling("PullInstancePaths", pullNext<PulledKind::InstancePaths>),
        pulling("PullInstances", pullNext<PulledKind::Instances>),
        {"CloseEnumeration", {context}, closeEnumeration},
        {"EnumerationCount", {context}, refuseCount}};
    return rows;
}

}  // namespace cmpihost::server
