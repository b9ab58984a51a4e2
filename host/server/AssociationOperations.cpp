// The four association operations, from instances and from classes.
#include "host/server/AssociationTraversal.h"
#include "host/server/CimError.h"
#include "host/server/ClassWriter.h"

namespace cmpihost::server {

namespace {

std::vector<InstanceValue> traversedInstances(const Call& call, std::string_view sourceParameter,
                                              Operation operation) {
    std::vector<InstanceValue> instances = traversed(call, sourceParameter, operation).instances;
    applyPropertyList(instances, call.parameters.names("PropertyList"));
    return instances;
}

}  // namespace

std::vector<InstanceValue> associators(const Call& call, std::string_view sourceParameter) {
    return traversedInstances(call, sourceParameter, Operation::Associators);
}
std::vector<ObjectPathValue> associatorNames(const Call& call, std::string_view sourceParameter) {
    return traversed(call, sourceParameter, Operation::AssociatorNames).paths;
}
std::vector<InstanceValue> references(const Call& call, std::string_view sourceParameter) {
    return traversedInstances(call, sourceParameter, Operation::References);
}
std::vector<ObjectPathValue> referenceNames(const Call& call, std::string_view sourceParameter) {
    return traversed(call, sourceParameter, Operation::ReferenceNames).paths;
}

namespace {

constexpr const char* sourceObject = "ObjectName";

/// Whether the source is a class. Throws CimError for an instance without keys: some clients name a
/// class so, but they cannot read paths of classes and are better served with a sentence.
bool asksForClasses(const Call& call) {
    const RequestPath source = *call.parameters.path(sourceObject);
    if (!source.instance) return true;
    if (!source.keys.empty()) return false;
    const std::string className = sourceClass(call, sourceObject);
    throw CimError(cimNotSupported, className +
                                        ": an instance without keys is none to start from; give "
                                        "all keys, or a CLASSNAME to be answered with classes");
}

std::vector<std::string> tiedClasses(const Call& call, Operation operation) {
    const std::string source = sourceClass(call, sourceObject);
    const AssociationFilter filter = associationFilter(call, operation);
    return (isReferenceOperation(operation) ? referringClasses : associatedClasses)(
        call.manager, call.nameSpace, source, filter);
}

void writeClasses(const Call& call, Operation operation, std::string& xml) {
    ClassView view;
    view.qualifiers = call.parameters.flag("IncludeQualifiers", false);
    view.classOrigin = call.parameters.flag("IncludeClassOrigin", false);
    view.properties = call.parameters.names("PropertyList");
    const Schema& schema = call.manager.schema(call.nameSpace);
    for (const std::string& name : tiedClasses(call, operation)) {
        xml += "<VALUE.OBJECTWITHPATH>";
        writeClassPath(xml, name, call.site());
        writeClass(xml, resolvedClass(schema, name).value(), schema.qualifierTypes(), view);
        xml += "</VALUE.OBJECTWITHPATH>";
        checkClassBytes(xml.size(), "their names");
    }
}

void writeClassNames(const Call& call, Operation operation, std::string& xml) {
    for (const std::string& name : tiedClasses(call, operation)) {
        xml += "<OBJECTPATH>";
        writeClassPath(xml, name, call.site());
        xml += "</OBJECTPATH>";
    }
}

/// Answers Associators or References.
template <Operation operation>
void runWithObjects(const Call& call, std::string& xml) {
    xml += "<IRETURNVALUE>";
    if (asksForClasses(call)) {
        writeClasses(call, operation, xml);
    } else {
        writeObjectsWithPath(xml, traversedInstances(call, sourceObject, operation), call.site(),
                             call.parameters.flag("IncludeClassOrigin", false));
    }
    xml += "</IRETURNVALUE>";
}

/// Answers AssociatorNames or ReferenceNames.
template <Operation operation>
void runWithNames(const Call& call, std::string& xml) {
    xml += "<IRETURNVALUE>";
    if (asksForClasses(call)) {
        writeClassNames(call, operation, xml);
    } else {
        writeObjectPaths(xml, traversed(call, sourceObject, operation).paths, call.site());
    }
    xml += "</IRETURNVALUE>";
}

}  // namespace

const std::vector<OperationRow>& associationOperations() {
    using Holds = ParameterKind;
    static const ParameterRow source = {sourceObject, Holds::ObjectName, true};
    static const ParameterRow assocClass = {"AssocClass", Holds::ClassName};
    static const ParameterRow resultClass = {"ResultClass", Holds::ClassName};
    static const ParameterRow role = {"Role", Holds::Text};
    static const ParameterRow resultRole = {"ResultRole", Holds::Text};
    static const ParameterRow qualifiers = {"IncludeQualifiers", Holds::Boolean};
    static const ParameterRow classOrigin = {"IncludeClassOrigin", Holds::Boolean};
    static const ParameterRow properties = {"PropertyList", Holds::PropertyList};
    static const std::vector<OperationRow> rows = {
        {"Associators",
         {source, assocClass, resultClass, role, resultRole, qualifiers, classOrigin, properties},
         runWithObjects<Operation::Associators>},
        {"AssociatorNames",
         {source, assocClass, resultClass, role, resultRole},
         runWithNames<Operation::AssociatorNames>},
        {"References",
         {source, resultClass, role, qualifiers, classOrigin, properties},
         runWithObjects<Operation::References>},
        {"ReferenceNames", {source, resultClass, role}, runWithNames<Operation::ReferenceNames>}};
    return rows;
}

}  // namespace cmpihost::server
