// Of a superclass that only the CIM schema declares the name is known and nothing else: what
// descends from it is found by that name, and where a class has no declared superclass at all, it
// is a root to clients.
#include "host/server/Operations.h"

#include "base/Ascii.h"
#include "host/server/CimError.h"
#include "host/server/ClassWriter.h"
#include "host/server/StandardQualifiers.h"

namespace cmpihost::server {

namespace {

/// Whether a declared class is below the other one (empty: below all), directly or in any degree.
/// What is between them and known by name alone does not count.
bool isBelow(const Call& call, const std::string& className, const std::string& ancestor,
             bool anyDegree) {
    const ClassCatalogue& catalogue = call.manager.catalogue(call.nameSpace);
    const Schema& schema = call.manager.schema(call.nameSpace);
    std::optional<std::string_view> above = catalogue.superclassOf(className);
    for (; above && !above->empty(); above = catalogue.superclassOf(*above)) {
        if (base::equalsIgnoreCase(*above, ancestor)) return true;
        if (!anyDegree && schema.find(*above) != nullptr) return false;
    }
    return ancestor.empty();
}

/// What the parameters ClassName and DeepInheritance of an enumeration ask for.
std::vector<std::string> enumeratedClassNames(const Call& call) {
    const std::string ancestor = call.parameters.className("ClassName").value_or("");
    if (!ancestor.empty() && !call.manager.knowsClass(call.nameSpace, ancestor))
        throw CimError(cimInvalidClass, ancestor + ": no such class in " + call.nameSpace);
    const bool anyDegree = call.parameters.flag("DeepInheritance", false);
    std::vector<std::string> result;
    for (std::string& name : call.manager.schema(call.nameSpace).classNames())
        if (isBelow(call, name, ancestor, anyDegree)) result.push_back(std::move(name));
    return result;
}

ClassView viewOf(const Parameters& parameters) {
    ClassView view;
    view.localOnly = parameters.flag("LocalOnly", true);
    view.qualifiers = parameters.flag("IncludeQualifiers", true);
    view.classOrigin = parameters.flag("IncludeClassOrigin", false);
    return view;
}

void getClass(const Call& call, std::string& xml) {
    const std::string name = *call.parameters.className("ClassName");
    const Schema& schema = call.manager.schema(call.nameSpace);
    const std::optional<ResolvedClass> found = resolvedClass(schema, name);
    if (!found && call.manager.knowsClass(call.nameSpace, name)) {
        throw CimError(cimNotFound,
                       name +
                           ": only the name of this class is known here; the option --schema can "
                           "give the server MOF that declares it, such as a whole CIM schema");
    }
    if (!found) throw CimError(cimNotFound, name + ": no such class in " + call.nameSpace);
    ClassView view = viewOf(call.parameters);
    view.properties = call.parameters.names("PropertyList");
    xml += "<IRETURNVALUE>";
    writeClass(xml, *found, schema.qualifierTypes(), view);
    xml += "</IRETURNVALUE>";
}

void enumerateClasses(const Call& call, std::string& xml) {
    const Schema& schema = call.manager.schema(call.nameSpace);
    const ClassView view = viewOf(call.parameters);
    xml += "<IRETURNVALUE>";
    for (const std::string& name : enumeratedClassNames(call)) {
        writeClass(xml, *resolvedClass(schema, name), schema.qualifierTypes(), view);
        checkClassBytes(xml.size(), "the classes below one class, or for one after the other");
    }
    xml += "</IRETURNVALUE>";
}

void enumerateClassNames(const Call& call, std::string& xml) {
    xml += "<IRETURNVALUE>";
    for (const std::string& name : enumeratedClassNames(call)) {
        xml += "<CLASSNAME NAME=\"";
        writeAttributeText(xml, name);
        xml += "\"/>";
    }
    xml += "</IRETURNVALUE>";
}

void getQualifier(const Call& call, std::string& xml) {
    const std::string name = *call.parameters.text("QualifierName");
    for (const mof::QualifierType& type : qualifierTypes(call.manager.schema(call.nameSpace))) {
        if (!base::equalsIgnoreCase(type.name, name)) continue;
        xml += "<IRETURNVALUE>";
        writeQualifierDeclaration(xml, type);
        xml += "</IRETURNVALUE>";
        return;
    }
    throw CimError(cimNotFound, name + ": no such qualifier in " + call.nameSpace);
}

void enumerateQualifiers(const Call& call, std::string& xml) {
    xml += "<IRETURNVALUE>";
    for (const mof::QualifierType& type : qualifierTypes(call.manager.schema(call.nameSpace)))
        writeQualifierDeclaration(xml, type);
    xml += "</IRETURNVALUE>";
}

void refuseToChange(const Call&, std::string&) {
    throw CimError(cimNotSupported,
                   "classes and qualifiers are read from files when the server starts, and no "
                   "client can change them");
}

}  // namespace

const std::vector<OperationRow>& classOperations() {
    using Kind = ParameterKind;
    static const std::vector<OperationRow> rows = {
        {"GetClass",
         {{"ClassName", Kind::ClassName, true},
          {"LocalOnly", Kind::Boolean},
          {"IncludeQualifiers", Kind::Boolean},
          {"IncludeClassOrigin", Kind::Boolean},
          {"PropertyList", Kind::PropertyList}},
         getClass},
        {"EnumerateClasses",
         {{"ClassName", Kind::ClassName},
          {"DeepInheritance", Kind::Boolean},
          {"LocalOnly", Kind::Boolean},
          {"IncludeQualifiers", Kind::Boolean},
          {"IncludeClassOrigin", Kind::Boolean}},
         enumerateClasses},
        {"EnumerateClassNames",
         {{"ClassName", Kind::ClassName}, {"DeepInheritance", Kind::Boolean}},
         enumerateClassNames},
        {"GetQualifier", {{"QualifierName", Kind::Text, true}}, getQualifier},
        {"EnumerateQualifiers", {}, enumerateQualifiers},
        {"CreateClass", {{"NewClass", Kind::Anything}}, refuseToChange},
        {"ModifyClass", {{"ModifiedClass", Kind::Anything}}, refuseToChange},
        {"DeleteClass", {{"ClassName", Kind::Anything}}, refuseToChange},
        {"SetQualifier", {{"QualifierDeclaration", Kind::Anything}}, refuseToChange},
        {"DeleteQualifier", {{"QualifierName", Kind::Anything}}, refuseToChange},
    };
    return rows;
}

}  // namespace cmpihost::server
