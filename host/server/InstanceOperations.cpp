// LocalOnly and IncludeQualifiers are taken for FALSE, whatever a client says: clients that leave
// them out would lose inherited properties otherwise.
#include "host/server/Operations.h"

#include <algorithm>

#include "base/Ascii.h"
#include "host/server/CimError.h"
#include "host/server/RequestValue.h"

namespace cmpihost::server {

namespace {

using Kind = ParameterKind;

/// What a client said is passed on, but for what this server takes for FALSE.
CMPIFlags flagsOf(const Call& call, bool deepInheritance) {
    CMPIFlags flags = 0;
    if (deepInheritance) flags |= CMPI_FLAG_DeepInheritance;
    if (call.parameters.flag("IncludeClassOrigin", false)) flags |= CMPI_FLAG_IncludeClassOrigin;
    return flags;
}

OperationRequest requestFor(const Call& call, Operation operation, ObjectPathValue path) {
    OperationRequest request;
    request.operation = operation;
    request.path = std::move(path);
    request.context.principal = call.user;
    return request;
}

ObjectPathValue classPath(const Call& call) {
    ObjectPathValue path;
    path.nameSpace = call.nameSpace;
    path.className =
        call.manager.knownClass(call.nameSpace, *call.parameters.className("ClassName"));
    return path;
}

/// The path of an instance of this namespace, whose class is known.
ObjectPathValue instancePath(const Call& call, RequestPath path) {
    path.className = call.manager.knownClass(call.nameSpace, path.className);
    path.nameSpace = call.nameSpace;
    return typedPath(path, call.manager.catalogue(call.nameSpace), call.nameSpace);
}

ObjectPathValue instancePath(const Call& call) {
    return instancePath(call, *call.parameters.path("InstanceName"));
}

/// The property as the class declares it; null where the schema does not have the class. Throws
/// CimError for one that the class lacks.
const PropertyDeclaration* declaredProperty(const Call& call, const std::string& className,
                                            const std::string& property) {
    const ClassDeclaration* const declared = call.manager.catalogue(call.nameSpace).find(className);
    if (declared == nullptr) return nullptr;
    const PropertyDeclaration* const found = declared->property(property);
    if (found == nullptr)
        throw CimError(cimNoSuchProperty, className + " has no property " + property);
    return found;
}

/// Leaves out what a class does not declare, as clients ask that want no properties of subclasses.
void keepDeclared(std::vector<InstanceValue>& instances, const ClassDeclaration& declaration) {
    for (InstanceValue& instance : instances) {
        auto& properties = instance.properties;
        properties.erase(std::remove_if(properties.begin(), properties.end(),
                                        [&](const PropertyValue& each) {
                                            return declaration.property(each.name) == nullptr;
                                        }),
                         properties.end());
    }
}

void getInstance(const Call& call, std::string& xml) {
    const auto properties = call.parameters.names("PropertyList");
    OperationRequest request = requestFor(call, Operation::GetInstance, instancePath(call));
    request.properties = properties;
    request.context.flags = flagsOf(call, false);
    const InstanceValue found = gottenInstance(call.manager, request);
    xml += "<IRETURNVALUE>";
    writeInstance(xml, found, call.site(), call.parameters.flag("IncludeClassOrigin", false));
    xml += "</IRETURNVALUE>";
}

void enumerateInstances(const Call& call, std::string& xml) {
    const auto instances = enumeratedInstances(call);
    xml += "<IRETURNVALUE>";
    writeNamedInstances(xml, instances, call.site(),
                        call.parameters.flag("IncludeClassOrigin", false));
    xml += "</IRETURNVALUE>";
}

void enumerateInstanceNames(const Call& call, std::string& xml) {
    const auto paths = enumeratedInstanceNames(call);
    xml += "<IRETURNVALUE>";
    writeInstanceNames(xml, paths, call.site());
    xml += "</IRETURNVALUE>";
}

void getProperty(const Call& call, std::string& xml) {
    const ObjectPathValue path = instancePath(call);
    const std::string name = *call.parameters.text("PropertyName");
    const PropertyDeclaration* const declared = declaredProperty(call, path.className, name);
    const std::string property = declared == nullptr ? name : declared->name;

    Value value;
    const auto& registrations = call.manager.registrations();
    if (registrations.find(path.className, path.nameSpace, Interface::Property) != nullptr) {
        OperationRequest request = requestFor(call, Operation::GetProperty, path);
        request.property = property;
        value = call.manager.ask(request).value.value_or(Value());
    } else {
        OperationRequest request = requestFor(call, Operation::GetInstance, path);
        request.properties = std::vector<std::string>{property};
        const InstanceValue found = gottenInstance(call.manager, request);
        if (const Value* const held = found.property(property)) value = *held;
    }
    xml += "<IRETURNVALUE>";
    writeValue(xml, value, call.site());
    xml += "</IRETURNVALUE>";
}

void setProperty(const Call& call, std::string&) {
    OperationRequest request = requestFor(call, Operation::SetProperty, instancePath(call));
    const std::string& className = request.path.className;
    const std::string name = *call.parameters.text("PropertyName");
    const PropertyDeclaration* const declared = declaredProperty(call, className, name);
    const CMPIType type = declared == nullptr ? CMPI_string : declared->type;
    request.property = declared == nullptr ? name : declared->name;
    const XmlElement* const given = call.parameters.element("NewValue");
    request.value =
        given == nullptr
            ? Value::null(type)
            : readValue(*given, type, call.manager.catalogue(call.nameSpace), call.nameSpace);
    call.manager.ask(request);
}

/// An instance that a client sent, in the schema's terms. `unknownProperty` is the status for a
/// property that the class does not have.
InstanceValue sentInstance(const Call& call, const XmlElement& element, unsigned unknownProperty) {
    const std::string spelled =
        call.manager.knownClass(call.nameSpace, *element.attribute("CLASSNAME"));
    const ClassCatalogue& catalogue = call.manager.catalogue(call.nameSpace);
    InstanceValue instance = readInstance(element, catalogue, call.nameSpace);
    instance.path.className = spelled;
    if (const ClassDeclaration* const declared = catalogue.find(spelled)) {
        for (const PropertyValue& each : instance.properties) {
            if (declared->property(each.name) == nullptr)
                throw CimError(unknownProperty, spelled + " has no property " + each.name);
        }
    }
    return instance;
}

void createInstance(const Call& call, std::string& xml) {
    const XmlElement& element = *call.parameters.element("NewInstance");
    InstanceValue instance = sentInstance(call, element, cimInvalidParameter);
    OperationRequest request = requestFor(call, Operation::CreateInstance, instance.path);
    request.instance = std::move(instance);
    const OperationResult result = call.manager.ask(request);
    if (result.paths.empty())
        throw CimError(cimFailed, "CreateInstance of " + request.path.className +
                                      ": the provider told no path");
    xml += "<IRETURNVALUE>";
    writeInstanceName(xml, result.paths.front(), call.site());
    xml += "</IRETURNVALUE>";
}

void modifyInstance(const Call& call, std::string&) {
    const XmlElement& element = *call.parameters.element("ModifiedInstance");
    OperationRequest request = requestFor(call, Operation::ModifyInstance,
                                          instancePath(call, readPath(element.children.front())));
    InstanceValue instance = sentInstance(call, element.children.back(), cimNoSuchProperty);
    if (!base::equalsIgnoreCase(instance.path.className, request.path.className)) {
        throw CimError(cimInvalidParameter, "the instance is of " + instance.path.className +
                                                ", its path of " + request.path.className);
    }
    instance.path = request.path;
    request.instance = std::move(instance);
    request.properties = call.parameters.names("PropertyList");
    call.manager.ask(request);
}

void deleteInstance(const Call& call, std::string&) {
    call.manager.ask(requestFor(call, Operation::DeleteInstance, instancePath(call)));
}

void execQuery(const Call& call, std::string& xml) {
    OperationRequest request = requestFor(call, Operation::ExecQuery, {});
    request.query = *call.parameters.text("Query");
    request.queryLanguage = *call.parameters.text("QueryLanguage");
    const std::string className = selectedClass(request.query);
    if (className.empty())
        throw CimError(cimInvalidQuery, "the query names no class behind FROM: " + request.query);
    request.path.nameSpace = call.nameSpace;
    request.path.className = call.manager.knownClass(call.nameSpace, className);
    const OperationResult result = call.manager.ask(request);
    xml += "<IRETURNVALUE>";
    writeObjectsWithPath(xml, result.instances, call.site(), false);
    xml += "</IRETURNVALUE>";
}

}  // namespace

const std::vector<OperationRow>& instanceOperations() {
    static const ParameterRow instanceName = {"InstanceName", Kind::InstanceName, true};
    static const ParameterRow className = {"ClassName", Kind::ClassName, true};
    static const ParameterRow localOnly = {"LocalOnly", Kind::Boolean};
    static const ParameterRow deepInheritance = {"DeepInheritance", Kind::Boolean};
    static const ParameterRow qualifiers = {"IncludeQualifiers", Kind::Boolean};
    static const ParameterRow classOrigin = {"IncludeClassOrigin", Kind::Boolean};
    static const ParameterRow propertyList = {"PropertyList", Kind::PropertyList};
    static const ParameterRow propertyName = {"PropertyName", Kind::Text, true};
    static const std::vector<OperationRow> rows = {
        {"GetInstance",
         {instanceName, localOnly, qualifiers, classOrigin, propertyList},
         getInstance},
        {"EnumerateInstances",
         {className, localOnly, deepInheritance, qualifiers, classOrigin, propertyList},
         enumerateInstances},
        {"EnumerateInstanceNames", {className}, enumerateInstanceNames},
        {"GetProperty", {instanceName, propertyName}, getProperty},
        {"SetProperty", {instanceName, propertyName, {"NewValue", Kind::AnyValue}}, setProperty},
        {"CreateInstance", {{"NewInstance", Kind::Instance, true}}, createInstance},
        {"ModifyInstance",
         {{"ModifiedInstance", Kind::NamedInstance, true}, qualifiers, propertyList},
         modifyInstance},
        {"DeleteInstance", {instanceName}, deleteInstance},
        {"ExecQuery",
         {{"QueryLanguage", Kind::Text, true}, {"Query", Kind::Text, true}},
         execQuery}};
    return rows;
}

std::vector<InstanceValue> enumeratedInstances(const Call& call) {
    const bool deep = call.parameters.flag("DeepInheritance", true);
    OperationRequest request = requestFor(call, Operation::EnumerateInstances, classPath(call));
    request.properties = call.parameters.names("PropertyList");
    request.context.flags = flagsOf(call, deep);
    std::vector<InstanceValue> instances = std::move(call.manager.ask(request).instances);
    applyPropertyList(instances, request.properties);
    const ClassDeclaration* const declared =
        call.manager.catalogue(call.nameSpace).find(request.path.className);
    if (!deep && declared != nullptr) keepDeclared(instances, *declared);
    return instances;
}

std::vector<ObjectPathValue> enumeratedInstanceNames(const Call& call) {
    return std::move(
        call.manager.ask(requestFor(call, Operation::EnumerateInstanceNames, classPath(call)))
            .paths);
}

}  // namespace cmpihost::server
