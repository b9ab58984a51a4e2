// The baseline: a CMPI library that answers what the provider answers, from constants and without a
// record. What the provider costs beyond it is the price of being a provider.

#include <cmpi/cmpidt.h>
#include <cmpi/cmpift.h>

#include <cstdint>

#include "Answers.h"

namespace baseline {
namespace {

const CMPIBroker* broker = nullptr;
unsigned nodes = 1;

constexpr const char* nameSpace = "root/cimv2";
constexpr CMPIStatus done = {CMPI_RC_OK, nullptr};
constexpr CMPIStatus refused = {CMPI_RC_ERR_NOT_SUPPORTED, nullptr};

CMPIObjectPath* make(const Path& path) {
    CMPIObjectPath* made = broker->eft->newObjectPath(broker, nameSpace, path.className, nullptr);
    for (unsigned index = 0; index < path.keyCount; ++index) {
        const Key& key = path.keys[index];
        if (key.reference != nullptr) {
            CMPIValue value = {};
            value.ref = make(*key.reference);
            made->ft->addKey(made, key.name, &value, CMPI_ref);
        } else {
            made->ft->addKey(made, key.name, reinterpret_cast<const CMPIValue*>(key.text),
                             CMPI_chars);
        }
    }
    return made;
}

CMPIArray* makeList(const Property& property) {
    CMPIArray* array = broker->eft->newArray(broker, property.listLength, CMPI_uint16, nullptr);
    for (unsigned index = 0; index < property.listLength; ++index) {
        CMPIValue element = {};
        element.uint16 = property.list[index];
        array->ft->setElementAt(array, index, &element, CMPI_uint16);
    }
    return array;
}

CMPIValue valueOf(const Property& property) {
    CMPIValue value = {};
    switch (property.type) {
        case CMPI_boolean:
            value.boolean = static_cast<CMPIBoolean>(property.number);
            break;
        case CMPI_uint16:
            value.uint16 = static_cast<CMPIUint16>(property.number);
            break;
        case CMPI_uint32:
            value.uint32 = static_cast<CMPIUint32>(property.number);
            break;
        case CMPI_dateTime:
            value.dateTime = broker->eft->newDateTimeFromChars(broker, property.text, nullptr);
            break;
        case CMPI_ref:
            value.ref = make(*property.reference);
            break;
        case CMPI_uint16A:
            value.array = makeList(property);
            break;
        default:
            value.uint64 = property.number;
    }
    return value;
}

CMPIInstance* make(const Answer& answer) {
    CMPIInstance* instance = broker->eft->newInstance(broker, make(answer.path), nullptr);
    for (unsigned index = 0; index < answer.propertyCount; ++index) {
        const Property& property = answer.properties[index];
        if (property.type == CMPI_chars) {
            instance->ft->setProperty(instance, property.name,
                                      reinterpret_cast<const CMPIValue*>(property.text),
                                      CMPI_chars);
        } else {
            const CMPIValue value = valueOf(property);
            instance->ft->setProperty(instance, property.name, &value, property.type);
        }
    }
    return instance;
}

CMPIStatus answerInstances(const CMPIResult* result, const Answer* answer, unsigned count) {
    for (unsigned sent = 0; answer != nullptr && sent < count; ++sent)
        result->ft->returnInstance(result, make(*answer));
    result->ft->returnDone(result);
    return done;
}

CMPIStatus answerPaths(const CMPIResult* result, const Answer* answer, unsigned count) {
    for (unsigned sent = 0; answer != nullptr && sent < count; ++sent)
        result->ft->returnObjectPath(result, make(answer->path));
    result->ft->returnDone(result);
    return done;
}

const char* classOf(const CMPIObjectPath* path) {
    const CMPIString* name = path->ft->getClassName(path, nullptr);
    return name->ft->getCharPtr(name, nullptr);
}

// Whatever the slot takes.
template <class... Arguments>
CMPIStatus succeed(Arguments...) {
    return done;
}

template <class... Arguments>
CMPIStatus refuse(Arguments...) {
    return refused;
}

CMPIStatus enumInstanceNames(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result,
                             const CMPIObjectPath* path) {
    return answerPaths(result, answerOf(classOf(path)), nodes);
}

CMPIStatus enumInstances(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result,
                         const CMPIObjectPath* path, const char**) {
    return answerInstances(result, answerOf(classOf(path)), nodes);
}

CMPIStatus getInstance(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result,
                       const CMPIObjectPath* path, const char**) {
    return answerInstances(result, answerOf(classOf(path)), 1);
}

CMPIStatus associators(CMPIAssociationMI*, const CMPIContext*, const CMPIResult* result,
                       const CMPIObjectPath* path, const char* assocClass, const char*, const char*,
                       const char*, const char**) {
    return answerInstances(result, farEndOf(classOf(path), assocClass), nodes);
}

CMPIStatus associatorNames(CMPIAssociationMI*, const CMPIContext*, const CMPIResult* result,
                           const CMPIObjectPath* path, const char* assocClass, const char*,
                           const char*, const char*) {
    return answerPaths(result, farEndOf(classOf(path), assocClass), nodes);
}

CMPIInstanceMIFT instanceTable = {
    CMPIVersion200,
    CMPIVersion200,
    "instanceBaseline",
    succeed,
    enumInstanceNames,
    enumInstances,
    getInstance,
    refuse,
    refuse,
    refuse,
    refuse,
};

CMPIAssociationMIFT associationTable = {
    CMPIVersion200, CMPIVersion200, "associationBaseline", succeed, associators, associatorNames,
    refuse,         refuse,
};

}  // namespace
}  // namespace baseline

extern "C" {

/// How many times an enumeration returns its answer.
[[gnu::visibility("default")]] void setBaselineNodes(unsigned count) {
    baseline::nodes = count;
}

[[gnu::visibility("default")]] CMPIInstanceMI* BaselineProvider_Create_InstanceMI(
    const CMPIBroker* broker, const CMPIContext*, CMPIStatus*) {
    static CMPIInstanceMI mi = {nullptr, &baseline::instanceTable};
    baseline::broker = broker;
    return &mi;
}

[[gnu::visibility("default")]] CMPIAssociationMI* BaselineProvider_Create_AssociationMI(
    const CMPIBroker* broker, const CMPIContext*, CMPIStatus*) {
    static CMPIAssociationMI mi = {nullptr, &baseline::associationTable};
    baseline::broker = broker;
    return &mi;
}
}
