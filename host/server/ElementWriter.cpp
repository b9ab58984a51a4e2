// Elements with content stand between a start and an end tag, empty ones too: some clients take
// what follows a self-closing PROPERTY or VALUE for its content. Those that never have content
// (CLASSNAME, NAMESPACE) close themselves.
#include "host/server/ElementWriter.h"

#include <algorithm>
#include <initializer_list>

#include "host/server/ValueText.h"
#include "host/server/XmlText.h"

namespace cmpihost::server {

namespace {

void append(std::string& xml, std::initializer_list<std::string_view> parts) {
    for (const std::string_view part : parts) xml += part;
}

/// What stands in a VALUE or KEYVALUE: a value that is neither null nor an array nor a reference.
void writeScalarText(std::string& xml, const Value& value, const Site& site) {
    if (value.type() != CMPI_instance) return writeValueText(xml, value);
    std::string embedded;
    writeInstance(embedded, value.instance(), site);
    writeText(xml, embedded);
}

void writeScalar(std::string& xml, const Value& value, const Site& site) {
    xml += "<VALUE>";
    writeScalarText(xml, value, site);
    xml += "</VALUE>";
}

void writeReference(std::string& xml, const ObjectPathValue& path, const Site& site) {
    xml += "<VALUE.REFERENCE>";
    if (path.keys.empty()) {
        writeClassPath(xml, path.className,
                       {site.hostName, path.nameSpace.empty() ? site.nameSpace : path.nameSpace});
    } else {
        writeInstancePath(xml, path, site);
    }
    xml += "</VALUE.REFERENCE>";
}

/// An element of an array that is null. Clients stumble over VALUE.NULL, so an empty text stands
/// for it among texts, which keeps the others in their places; other types have no value that
/// could, and the element is left out.
void writeNullElement(std::string& xml, const XmlType& type) {
    if (type.cmpi == CMPI_string || type.cmpi == CMPI_chars) xml += "<VALUE></VALUE>";
}

void writeArray(std::string& xml, const Value& value, const XmlType& type, const Site& site) {
    const bool references = type.cmpi == CMPI_ref;
    xml += references ? "<VALUE.REFARRAY>" : "<VALUE.ARRAY>";
    for (const Value& element : value.elements()) {
        if (element.isNull()) {
            writeNullElement(xml, type);
        } else if (references) {
            writeReference(xml, element.reference(), site);
        } else {
            writeScalar(xml, element, site);
        }
    }
    xml += references ? "</VALUE.REFARRAY>" : "</VALUE.ARRAY>";
}

void writeNameSpacePath(std::string& xml, std::string_view hostName, std::string_view nameSpace) {
    xml += "<NAMESPACEPATH><HOST>";
    writeText(xml, hostName);
    xml += "</HOST><LOCALNAMESPACEPATH>";
    while (!nameSpace.empty()) {
        const std::string_view component = nameSpace.substr(0, nameSpace.find('/'));
        if (!component.empty()) {
            xml += "<NAMESPACE";
            writeAttribute(xml, "NAME", component);
            xml += "/>";
        }
        nameSpace.remove_prefix(std::min(nameSpace.size(), component.size() + 1));
    }
    xml += "</LOCALNAMESPACEPATH></NAMESPACEPATH>";
}

void writeKey(std::string& xml, const KeyBinding& key, const Site& site) {
    xml += "<KEYBINDING";
    writeAttribute(xml, "NAME", key.name);
    xml += '>';
    const XmlType* const type = xmlTypeOf(key.value);
    if (type == nullptr || key.value.isNull() || key.value.isArray()) {
        // No such key is a proper one; an empty text is what is left of it.
        xml += "<KEYVALUE VALUETYPE=\"string\"></KEYVALUE>";
    } else if (type->cmpi == CMPI_ref) {
        writeReference(xml, key.value.reference(), site);
    } else {
        append(xml, {"<KEYVALUE VALUETYPE=\"", type->keyName, "\">"});
        writeScalarText(xml, key.value, site);
        xml += "</KEYVALUE>";
    }
    xml += "</KEYBINDING>";
}

/// Whether the value is one that a property can have.
bool hasPropertyForm(const Value& value, const XmlType* type) {
    const bool referenceArray = value.isArray() && type != nullptr && type->cmpi == CMPI_ref;
    return type != nullptr && !value.isNull() && !referenceArray;
}

void writeProperty(std::string& xml, const PropertyValue& property, const Site& site,
                   bool classOrigin) {
    const Value& value = property.value;
    const XmlType* const type = xmlTypeOf(value);
    if (!hasPropertyForm(value, type)) return;
    const bool reference = type->cmpi == CMPI_ref;
    const std::string_view tag = reference         ? "PROPERTY.REFERENCE"
                                 : value.isArray() ? "PROPERTY.ARRAY"
                                                   : "PROPERTY";
    append(xml, {"<", tag});
    writeAttribute(xml, "NAME", property.name);
    if (reference) {
        writeAttribute(xml, "REFERENCECLASS", value.reference().className);
    } else {
        append(xml, {" TYPE=\"", type->name, "\""});
    }
    if (classOrigin && !property.origin.empty())
        writeAttribute(xml, "CLASSORIGIN", property.origin);
    if (type->cmpi == CMPI_instance) xml += " EmbeddedObject=\"instance\"";
    xml += '>';
    writeValue(xml, value, site);
    append(xml, {"</", tag, ">"});
}

/// The attributes and the content of a PARAMVALUE or RETURNVALUE.
void writeTyped(std::string& xml, const Value& value, const Site& site) {
    if (const XmlType* const type = xmlTypeOf(value)) {
        append(xml, {" PARAMTYPE=\"", type->name, "\""});
        if (type->cmpi == CMPI_instance) xml += " EmbeddedObject=\"instance\"";
    }
    xml += '>';
    writeValue(xml, value, site);
}

}  // namespace

void writeValue(std::string& xml, const Value& value, const Site& site) {
    const XmlType* const type = xmlTypeOf(value);
    if (type == nullptr || value.isNull()) return;
    if (value.isArray()) {
        writeArray(xml, value, *type, site);
    } else if (type->cmpi == CMPI_ref) {
        writeReference(xml, value.reference(), site);
    } else {
        writeScalar(xml, value, site);
    }
}

void writeInstanceName(std::string& xml, const ObjectPathValue& path, const Site& site) {
    xml += "<INSTANCENAME";
    writeAttribute(xml, "CLASSNAME", path.className);
    xml += '>';
    for (const KeyBinding& key : path.keys) writeKey(xml, key, site);
    xml += "</INSTANCENAME>";
}

void writeInstancePath(std::string& xml, const ObjectPathValue& path, const Site& site) {
    xml += "<INSTANCEPATH>";
    writeNameSpacePath(xml, path.hostName.empty() ? site.hostName : path.hostName,
                       path.nameSpace.empty() ? site.nameSpace : path.nameSpace);
    writeInstanceName(xml, path, site);
    xml += "</INSTANCEPATH>";
}

void writeClassPath(std::string& xml, const std::string& className, const Site& site) {
    xml += "<CLASSPATH>";
    writeNameSpacePath(xml, site.hostName, site.nameSpace);
    xml += "<CLASSNAME";
    writeAttribute(xml, "NAME", className);
    xml += "/></CLASSPATH>";
}

void writeInstance(std::string& xml, const InstanceValue& instance, const Site& site,
                   bool classOrigin) {
    xml += "<INSTANCE";
    writeAttribute(xml, "CLASSNAME", instance.path.className);
    xml += '>';
    for (const PropertyValue& property : instance.properties)
        writeProperty(xml, property, site, classOrigin);
    xml += "</INSTANCE>";
}

void writeParameter(std::string& xml, std::string_view name, const Value& value, const Site& site) {
    xml += "<PARAMVALUE";
    writeAttribute(xml, "NAME", name);
    writeTyped(xml, value, site);
    xml += "</PARAMVALUE>";
}

void writeReturnValue(std::string& xml, const Value& value, const Site& site) {
    if (value.isNull() || value.isArray() || xmlTypeOf(value) == nullptr) return;
    xml += "<RETURNVALUE";
    writeTyped(xml, value, site);
    xml += "</RETURNVALUE>";
}

void writeNamedInstances(std::string& xml, const std::vector<InstanceValue>& instances,
                         const Site& site, bool classOrigin) {
    for (const InstanceValue& instance : instances) {
        xml += "<VALUE.NAMEDINSTANCE>";
        writeInstanceName(xml, instance.path, site);
        writeInstance(xml, instance, site, classOrigin);
        xml += "</VALUE.NAMEDINSTANCE>";
    }
}

void writeObjectsWithPath(std::string& xml, const std::vector<InstanceValue>& instances,
                          const Site& site, bool classOrigin) {
    for (const InstanceValue& instance : instances) {
        xml += "<VALUE.OBJECTWITHPATH>";
        writeInstancePath(xml, instance.path, site);
        writeInstance(xml, instance, site, classOrigin);
        xml += "</VALUE.OBJECTWITHPATH>";
    }
}

void writeInstanceNames(std::string& xml, const std::vector<ObjectPathValue>& paths,
                        const Site& site) {
    for (const ObjectPathValue& path : paths) writeInstanceName(xml, path, site);
}

void writeObjectPaths(std::string& xml, const std::vector<ObjectPathValue>& paths,
                      const Site& site) {
    for (const ObjectPathValue& path : paths) {
        xml += "<OBJECTPATH>";
        writeInstancePath(xml, path, site);
        xml += "</OBJECTPATH>";
    }
}

}  // namespace cmpihost::server
