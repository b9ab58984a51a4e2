// What a client would see, and only that: paths that a provider makes for itself may be incomplete.
#include "host/broker/SchemaCheck.h"

#include "host/broker/Conversion.h"

namespace cmpihost {

namespace {

/// A string reaches the broker as one of three types; a schema knows one.
bool sameType(CMPIType declared, CMPIType given) noexcept {
    const auto stored = [](CMPIType type) {
        return storedType(static_cast<CMPIType>(type & ~CMPI_ARRAY)) | (type & CMPI_ARRAY);
    };
    return stored(declared) == stored(given);
}

std::string member(const ClassDeclaration& declaration, std::string_view name) {
    return declaration.name + '.' + std::string(name);
}

bool checkType(BrokerCore& core, const ClassDeclaration& owner, const PropertyDeclaration& declared,
               const Value& value) {
    // A provider may set a property to null without saying null of which type.
    const bool typelessNull = value.isNull() && value.type() == CMPI_null;
    if (!typelessNull && !sameType(declared.type, value.type())) {
        core.report(member(owner, declared.name) + " is " + cimTypeName(declared.type) + ", not " +
                    cimTypeName(value.type()));
        return false;
    }
    if (declared.type != CMPI_ref || value.isNull() || declared.referenceClass.empty()) return true;

    const std::string& className = value.reference().className;
    // An unknown relation passes: the ancestor may be declared in a file that nobody gave.
    if (classRelation(core.catalogue(), className, declared.referenceClass) ==
        ClassRelation::Unrelated) {
        core.report(member(owner, declared.name) + " refers to " + declared.referenceClass +
                    ", not to " + className);
        return false;
    }
    return true;
}

void checkKey(BrokerCore& core, const ClassDeclaration& owner, const KeyBinding& key) {
    const PropertyDeclaration* const declared = owner.property(key.name);
    if (declared == nullptr || !declared->key) {
        core.report("path of " + owner.name + " with " + key.name + ", which is no key of it");
        return;
    }
    // Clients follow the ends of an association, so their paths have to be complete as well.
    if (checkType(core, owner, *declared, key.value) && key.value.type() == CMPI_ref &&
        !key.value.isNull()) {
        checkPath(core, key.value.reference());
    }
}

}  // namespace

CMPIrc checkProperty(BrokerCore& core, const ClassDeclaration& declaration, std::string_view name,
                     const Value& value) {
    const PropertyDeclaration* const declared = declaration.property(name);
    if (declared == nullptr) {
        core.report(declaration.name + " has no property " + std::string(name));
        return CMPI_RC_ERR_NO_SUCH_PROPERTY;
    }
    return checkType(core, declaration, *declared, value) ? CMPI_RC_OK : CMPI_RC_ERR_TYPE_MISMATCH;
}

void checkPath(BrokerCore& core, const ObjectPathValue& path) {
    if (core.catalogue() == nullptr) return;
    const ClassDeclaration* const declaration = core.declaration(path.className);
    if (declaration == nullptr) {
        core.report("path of " + path.className + ", a class that is not declared");
        return;
    }
    for (const KeyBinding& key : path.keys) checkKey(core, *declaration, key);
    for (const PropertyDeclaration& declared : declaration->properties) {
        if (declared.key && path.key(declared.name) == nullptr) {
            core.report("path of " + declaration->name + " without key " + declared.name);
        }
    }
}

void checkInstance(BrokerCore& core, const InstanceValue& instance) {
    if (core.catalogue() == nullptr) return;
    checkPath(core, instance.path);
    // A client may read a key in either place, so both have to say the same.
    for (const KeyBinding& key : instance.path.keys) {
        const Value* const property = instance.property(key.name);
        if (property != nullptr && *property != key.value) {
            core.report(instance.path.className + '.' + key.name + " is " + property->toText() +
                        ", in the path " + key.value.toText());
        }
    }
}

void completeKeys(const ClassDeclaration* declaration, const std::vector<PropertyValue>& properties,
                  ObjectPathValue& path) {
    if (declaration == nullptr) return;
    for (const PropertyDeclaration& declared : declaration->properties) {
        if (!declared.key || path.key(declared.name) != nullptr) continue;
        const PropertyValue* const property = findNamed(properties, declared.name);
        if (property != nullptr && !property->value.isNull()) {
            path.keys.push_back({declared.name, property->value});
        }
    }
}

}  // namespace cmpihost
