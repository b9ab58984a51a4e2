// The computer system belongs to another provider: it is asked of the object manager, in a call
// from within the request, and handed on as it came.
#include "CMPIComputerSystem.h"

#include <utility>

#include "ProviderException.h"
#include "UnitLog.h"

namespace VA::OSStatusProvider {

static const std::string loggerCMPIOSComputerSystem("Zumbrel.OperatingSystemProvider");
static constexpr UnitLog log("CMPIComputerSystem.cpp", loggerCMPIOSComputerSystem);

namespace {

bool hasNext(const CMPIEnumeration* enumeration) {
    return enumeration->ft->hasNext(enumeration, nullptr) != 0;
}

// The next instance of the enumeration; false, and null, when the broker reports a failure.
bool fetch(const CMPIEnumeration* enumeration, CMPIInstance*& instance) {
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    const CMPIData data = enumeration->ft->getNext(enumeration, &status);
    const bool fetched = status.rc == CMPI_RC_OK;
    instance = fetched ? data.value.inst : nullptr;
    return fetched;
}

}  // namespace

CMPIOSComputerSystem::CMPIOSComputerSystem(const CMPIBroker* _broker, const CMPIContext* _context,
                                           std::string _nameSpace)
    : broker(_broker), context(_context), nameSpace(std::move(_nameSpace)) {
    log.method();
}

CMPIOSComputerSystem::~CMPIOSComputerSystem() noexcept(false) {
    log.destructor();
}

void CMPIOSComputerSystem::setObjectPath(const CMPIObjectPath* objectPath) {
    const ParameterList parameters(" objectPath=", objectPath);
    log.entering(parameters);
    // Without a path there is nothing to ask for; a broker might not survive the question.
    if (objectPath == nullptr || !fetchFirst(objectPath)) {
        throw VA::ProviderException("Could not obtain an instance of Computer System");
    }
    firstPending = true;
    log.exiting(parameters);
}

bool CMPIOSComputerSystem::fetchFirst(const CMPIObjectPath* objectPath) {
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    enumeration = broker->bft->enumerateInstances(broker, context, objectPath, nullptr, &status);
    return status.rc == CMPI_RC_OK && enumeration != nullptr && hasNext(enumeration) &&
           fetch(enumeration, instance);
}

CMPIObjectPath* CMPIOSComputerSystem::getObjectPath() {
    log.entering();
    CMPIObjectPath* path = nullptr;
    if (instance != nullptr) {
        CMPIStatus status = {CMPI_RC_OK, nullptr};
        path = instance->ft->getObjectPath(instance, &status);
        if (status.rc != CMPI_RC_OK) path = nullptr;
    }
    log.exiting();
    return path;
}

CMPIInstance* CMPIOSComputerSystem::getCMPIInstance(const char**) {
    log.method();
    return instance;
}

CMPIOSComputerSystem::operator bool() {
    log.entering();
    bool current = false;
    if (firstPending) {
        firstPending = false;
        current = true;
    } else if (enumeration != nullptr) {
        current = hasNext(enumeration);
    }
    log.exiting();
    return current;
}

CMPIOSComputerSystem& CMPIOSComputerSystem::operator++() {
    log.entering();
    instance = nullptr;
    if (enumeration != nullptr) fetch(enumeration, instance);
    log.exiting();
    return *this;
}

}  // namespace VA::OSStatusProvider
