// The facade asks the provider as an object manager would, and gathers what comes back before it
// hands anything over: an answer that broke off must not look like a whole one.
#include "ClientRequest.h"

#include <algorithm>
#include <new>

#include "CimError.h"
#include "base/Ascii.h"
#include "base/CmpiText.h"

namespace VA::OSStatusFacade {

// The functions of the result. The provider calls them: nothing may be thrown into it, where it
// would count as a walk that broke off.
struct ResultCollector::Table {
    // Headers of a later level have the handle const; the object behind it is not.
    static ResultCollector& collectorOf(const CMPIResult* result) {
        return *static_cast<ResultCollector*>(const_cast<void*>(result->hdl));
    }

    template <class Element>
    static CMPIStatus gather(const CMPIResult* result,
                             std::vector<const Element*> ResultCollector::*elements,
                             const Element* element) noexcept {
        if (element == nullptr) return {CMPI_RC_ERR_INVALID_PARAMETER, nullptr};
        ResultCollector& answer = collectorOf(result);
        try {
            (answer.*elements).push_back(element);
        } catch (const std::bad_alloc&) {
            answer.full_ = true;
            return {CMPI_RC_ERR_FAILED, nullptr};
        }
        return {CMPI_RC_OK, nullptr};
    }

    static CMPIStatus release(CMPIResult*) { return {CMPI_RC_OK, nullptr}; }
    static CMPIResult* clone(const CMPIResult*, CMPIStatus* status) {
        if (status != nullptr) *status = {CMPI_RC_ERR_NOT_SUPPORTED, nullptr};
        return nullptr;
    }
    static CMPIStatus returnData(const CMPIResult*, const CMPIValue*, CMPIType) {
        return {CMPI_RC_ERR_NOT_SUPPORTED, nullptr};
    }
    static CMPIStatus returnInstance(const CMPIResult* result, const CMPIInstance* instance) {
        return gather(result, &ResultCollector::instances_, instance);
    }
    static CMPIStatus returnObjectPath(const CMPIResult* result, const CMPIObjectPath* path) {
        return gather(result, &ResultCollector::paths_, path);
    }
    static CMPIStatus returnDone(const CMPIResult* result) {
        collectorOf(result).done_ = true;
        return {CMPI_RC_OK, nullptr};
    }
    static CMPIStatus returnError(const CMPIResult*, const CMPIError*) {
        return {CMPI_RC_ERR_NOT_SUPPORTED, nullptr};
    }
};

const CMPIResultFT ResultCollector::table = {
    CMPIVersion200,        Table::release,          Table::clone,      Table::returnData,
    Table::returnInstance, Table::returnObjectPath, Table::returnDone, Table::returnError};

void ResultCollector::requireRoom() const {
    if (full_) throw std::bad_alloc();
}

namespace {

bool contains(const std::vector<const char*>& names, const std::string& name) {
    return std::any_of(names.begin(), names.end(), [&name](const char* each) {
        return each != nullptr && base::equalsIgnoreCase(each, name);
    });
}

void copyProperties(const CMPIInstance* from, const std::vector<const char*>& names,
                    const CMPIInstance* to) {
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    const CMPICount count = from->ft->getPropertyCount(from, &status);
    if (status.rc != CMPI_RC_OK) {
        throw CimError(CMPI_RC_ERR_FAILED, "the object manager does not count properties");
    }
    for (CMPICount index = 0; index < count; ++index) {
        CMPIString* name = nullptr;
        const CMPIData data = from->ft->getPropertyAt(from, index, &name, &status);
        if (status.rc != CMPI_RC_OK) {
            throw CimError(CMPI_RC_ERR_FAILED, "the object manager does not tell a property");
        }
        if ((data.state & CMPI_nullValue) != 0) continue;
        const std::string property = charactersOf(name);
        if (!contains(names, property)) continue;
        const CMPIValue* const value =
            data.type == CMPI_chars ? base::charsArgument(data.value.chars) : &data.value;
        status = to->ft->setProperty(to, property.c_str(), value, data.type);
        if (status.rc != CMPI_RC_OK) {
            throw CimError(CMPI_RC_ERR_FAILED, "the object manager does not take a property");
        }
    }
}

// The instance with the properties of the list and its keys: a new one, or the instance itself
// when the list is null. The list ends with a null; names compare without case, unknown ones are
// passed over. Throws CimError when the broker makes no instance.
const CMPIInstance* withProperties(const CMPIBroker* broker, const CMPIInstance* instance,
                                   const char** properties) {
    if (properties == nullptr) return instance;
    const CMPIObjectPath* const path = pathOf(instance);
    CMPIInstance* const result = broker->eft->newInstance(broker, path, nullptr);
    if (result == nullptr) {
        throw CimError(CMPI_RC_ERR_FAILED, "the object manager makes no instance");
    }

    const std::vector<KeyBinding> keys = keysOf(path);
    std::vector<const char*> keyNames;
    keyNames.reserve(keys.size() + 1);
    for (const KeyBinding& key : keys) keyNames.push_back(key.name.c_str());
    std::vector<const char*> names = keyNames;
    for (const char** property = properties; *property != nullptr; ++property) {
        names.push_back(*property);
    }
    keyNames.push_back(nullptr);
    names.push_back(nullptr);
    // An object manager may have filled the new instance with all properties of its class: the
    // filter takes those out.
    result->ft->setPropertyFilter(result, names.data(), keyNames.data());
    copyProperties(instance, names, result);
    return result;
}

}  // namespace

ClientRequest::ClientRequest(const Provider& provider, const CMPIContext* context,
                             const CMPIResult* result, const CMPIObjectPath* path)
    : provider_(provider),
      context_(context),
      result_(result),
      path_(path),
      className_(classNameOf(path)),
      class_(findClass(className_)),
      nameSpace_(nameSpaceOf(path)) {}

CanonicalPath ClientRequest::canonicalPathOf(const CMPIObjectPath* path) const {
    return OSStatusFacade::canonicalPathOf(path, nameSpace_);
}

CMPIObjectPath* ClientRequest::newPath(const char* className) const {
    CMPIObjectPath* const path =
        broker()->eft->newObjectPath(broker(), nameSpace_.c_str(), className, nullptr);
    if (path == nullptr) throw CimError(CMPI_RC_ERR_FAILED, "the object manager makes no path");
    return path;
}

ResultCollector ClientRequest::enumerateInstanceNames(const CMPIObjectPath* path) const {
    CMPIInstanceMI* const mi = provider_.instances;
    return ResultCollector([&](const CMPIResult* result) {
        return mi->ft->enumerateInstanceNames(mi, context_, result, path);
    });
}

ResultCollector ClientRequest::enumerateInstances(const CMPIObjectPath* path) const {
    CMPIInstanceMI* const mi = provider_.instances;
    return ResultCollector([&](const CMPIResult* result) {
        return mi->ft->enumerateInstances(mi, context_, result, path, nullptr);
    });
}

ResultCollector ClientRequest::getInstance(const CMPIObjectPath* path) const {
    CMPIInstanceMI* const mi = provider_.instances;
    return ResultCollector([&](const CMPIResult* result) {
        return mi->ft->getInstance(mi, context_, result, path, nullptr);
    });
}

void ClientRequest::returnPaths(const std::vector<const CMPIObjectPath*>& paths) const {
    for (const CMPIObjectPath* path : paths) result_->ft->returnObjectPath(result_, path);
    result_->ft->returnDone(result_);
}

void ClientRequest::returnInstances(const std::vector<const CMPIInstance*>& instances,
                                    const char** properties) const {
    std::vector<const CMPIInstance*> answer = instances;
    for (const CMPIInstance*& instance : answer) {
        instance = withProperties(broker(), instance, properties);
    }
    for (const CMPIInstance* instance : answer) result_->ft->returnInstance(result_, instance);
    result_->ft->returnDone(result_);
}

void requireServed(const ResultCollector& answer, const std::string& className) {
    if (answer.rc() == CMPI_RC_ERR_INVALID_CLASS) {
        throw CimError(CMPI_RC_ERR_INVALID_CLASS, printable(className) + " is not served here");
    }
    if (answer.rc() != CMPI_RC_OK) {
        throw CimError(answer.rc(), "the question about " + printable(className) + " is refused");
    }
}

void requireWhole(const ResultCollector& answer, const std::string& className) {
    requireServed(answer, className);
    if (answer.isDone()) return;
    const Class* const known = findClass(className);
    if (known != nullptr && known->isAssociation() && answer.isEmpty()) return;
    throw CimError(CMPI_RC_ERR_FAILED, "the answer about " + printable(className) + " broke off");
}

}  // namespace VA::OSStatusFacade
