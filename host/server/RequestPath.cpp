// What a key is comes from the schema alone: clients tell strings from numbers by the look of them.
#include "host/server/RequestPath.h"

#include <set>
#include <utility>

#include "base/Ascii.h"
#include "host/server/CimError.h"
#include "host/server/RequestValue.h"

namespace cmpihost::server {

namespace {

/// What a number may be that nobody declares, in the order of preference.
constexpr CMPIType numericTypes[] = {CMPI_uint64, CMPI_sint64, CMPI_real64};

RequestKey::Kind kindNamed(const std::string* valueType) {
    if (valueType != nullptr && base::equalsIgnoreCase(*valueType, "boolean")) {
        return RequestKey::Kind::Boolean;
    }
    if (valueType != nullptr && base::equalsIgnoreCase(*valueType, "numeric")) {
        return RequestKey::Kind::Numeric;
    }
    return RequestKey::Kind::String;
}

/// `element` is a KEYVALUE or a VALUE.REFERENCE.
RequestKey readKey(std::string name, const XmlElement& element) {
    RequestKey key;
    key.name = std::move(name);
    if (element.name == "KEYVALUE") {
        key.kind = kindNamed(element.attribute("VALUETYPE"));
        key.text = element.text;
    } else {
        key.kind = RequestKey::Kind::Reference;
        key.reference = std::make_shared<const RequestPath>(readPath(element));
    }
    return key;
}

RequestPath readInstanceName(const XmlElement& element) {
    RequestPath path;
    path.instance = true;
    path.className = *element.attribute("CLASSNAME");
    path.keys.reserve(element.children.size());
    for (const XmlElement& child : element.children) {
        path.keys.push_back(child.name == "KEYBINDING"
                                ? readKey(*child.attribute("NAME"), child.children.front())
                                : readKey({}, child));
    }
    return path;
}

[[noreturn]] void refuseKey(const RequestPath& path, const std::string& keyName,
                            const std::string& reason) {
    throw CimError(cimInvalidParameter, path.className + "." + keyName + ": " + reason);
}

Value typedReference(const RequestPath& path, const RequestKey& key,
                     const ClassCatalogue& catalogue, const std::string& nameSpace) {
    if (key.reference == nullptr) refuseKey(path, key.name, "this key is a reference");
    return Value::fromReference(typedPath(*key.reference, catalogue, nameSpace));
}

Value declaredKey(const RequestPath& path, const RequestKey& key,
                  const PropertyDeclaration& declared, const ClassCatalogue& catalogue,
                  const std::string& nameSpace) {
    if (declared.type == CMPI_ref) return typedReference(path, key, catalogue, nameSpace);
    if (key.reference != nullptr) refuseKey(path, declared.name, "this key is no reference");
    const std::optional<Value> value = valueFromText(key.text, declared.type);
    if (!value) refuseKey(path, declared.name, "its value is no " + cimTypeName(declared.type));
    return *value;
}

/// Of a key of a class that nobody declares: what the client says that it is.
Value undeclaredKey(const RequestPath& path, const RequestKey& key, const ClassCatalogue& catalogue,
                    const std::string& nameSpace) {
    std::optional<Value> value;
    switch (key.kind) {
        case RequestKey::Kind::Reference:
            return typedReference(path, key, catalogue, nameSpace);
        case RequestKey::Kind::String:
            return key.text;
        case RequestKey::Kind::Boolean:
            value = valueFromText(key.text, CMPI_boolean);
            break;
        case RequestKey::Kind::Numeric:
            for (const CMPIType type : numericTypes) {
                if (!value) value = valueFromText(key.text, type);
            }
            break;
    }
    if (!value) refuseKey(path, key.name, "its value is not of the type that is told");
    return *value;
}

std::vector<KeyBinding> undeclaredKeys(const RequestPath& path, const ClassCatalogue& catalogue,
                                       const std::string& nameSpace) {
    std::vector<KeyBinding> keys;
    std::set<std::string> names;
    for (const RequestKey& key : path.keys) {
        if (key.name.empty()) {
            throw CimError(cimInvalidParameter,
                           path.className + ": a key has no name, and the class is not declared");
        }
        if (!names.insert(base::toLower(key.name)).second) {
            refuseKey(path, key.name, "this key is given twice");
        }
        keys.push_back({key.name, undeclaredKey(path, key, catalogue, nameSpace)});
    }
    return keys;
}

std::vector<const PropertyDeclaration*> keysOf(const ClassDeclaration& declaration) {
    std::vector<const PropertyDeclaration*> keys;
    for (const PropertyDeclaration& property : declaration.properties) {
        if (property.key) keys.push_back(&property);
    }
    return keys;
}

/// The place of a key among the declared ones. A key without a name stands for the only one.
std::size_t declaredPlace(const RequestPath& path, const RequestKey& key,
                          const std::vector<const PropertyDeclaration*>& declared) {
    if (key.name.empty()) {
        if (declared.size() == 1) return 0;
        throw CimError(cimInvalidParameter,
                       path.className + ": a key has no name, and the class has not one key");
    }
    for (std::size_t place = 0; place < declared.size(); ++place) {
        if (base::equalsIgnoreCase(declared[place]->name, key.name)) return place;
    }
    refuseKey(path, key.name, "the class has no such key");
}

std::vector<KeyBinding> declaredKeys(const RequestPath& path, const ClassDeclaration& declaration,
                                     const ClassCatalogue& catalogue,
                                     const std::string& nameSpace) {
    const std::vector<const PropertyDeclaration*> declared = keysOf(declaration);
    std::vector<const RequestKey*> given(declared.size());
    for (const RequestKey& key : path.keys) {
        const RequestKey*& place = given[declaredPlace(path, key, declared)];
        if (place != nullptr) refuseKey(path, key.name, "this key is given twice");
        place = &key;
    }
    std::vector<KeyBinding> keys;
    for (std::size_t place = 0; place < declared.size(); ++place) {
        if (given[place] == nullptr) {
            refuseKey(path, declared[place]->name, "this key is missing");
        }
        keys.push_back({declared[place]->name,
                        declaredKey(path, *given[place], *declared[place], catalogue, nameSpace)});
    }
    return keys;
}

}  // namespace

std::string readNameSpace(const XmlElement& element) {
    std::string result;
    for (const XmlElement& child : element.children) {
        result += '/';
        for (const char character : *child.attribute("NAME")) {
            if (character != '/' || result.back() != '/') result += character;
        }
        if (result.back() == '/') result.pop_back();
    }
    return result.empty() ? result : result.substr(1);
}

RequestPath readPath(const XmlElement& element) {
    RequestPath path;
    if (element.name == "CLASSNAME") {
        path.className = *element.attribute("NAME");
    } else if (element.name == "INSTANCENAME") {
        path = readInstanceName(element);
    } else if (element.name == "VALUE.REFERENCE") {
        path = readPath(element.children.front());
    } else {
        // The other four: where it is, and a CLASSNAME or INSTANCENAME.
        path = readPath(element.children.back());
        const XmlElement& place = element.children.front();
        path.nameSpace =
            readNameSpace(place.name == "NAMESPACEPATH" ? place.children.back() : place);
    }
    return path;
}

ObjectPathValue typedPath(const RequestPath& path, const ClassCatalogue& catalogue,
                          const std::string& nameSpace) {
    const ClassDeclaration* const declaration = catalogue.find(path.className);
    ObjectPathValue result;
    result.nameSpace = path.nameSpace.empty() ? nameSpace : path.nameSpace;
    result.className = declaration == nullptr ? path.className : declaration->name;
    if (!path.instance) return result;
    result.keys = declaration == nullptr ? undeclaredKeys(path, catalogue, nameSpace)
                                         : declaredKeys(path, *declaration, catalogue, nameSpace);
    return result;
}

}  // namespace cmpihost::server
