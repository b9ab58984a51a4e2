#include "Request.h"

#include <cmpi/cmpift.h>

#include "Names.h"
#include "PropertyList.h"
#include "Refusal.h"

namespace VA::OSStatusFacade {

Request::Request(const Provider& provider, const CMPIContext* context, const CMPIResult* result,
                 const CMPIObjectPath* path)
    : provider_(provider),
      context_(context),
      result_(result),
      path_(path),
      className_(classNameOf(path)),
      class_(findClass(className_)),
      nameSpace_(nameSpaceOf(path)) {}

Identity Request::identityOf(const CMPIObjectPath* path) const {
    return OSStatusFacade::identityOf(path, nameSpace_);
}

CMPIObjectPath* Request::newPath(const char* className) const {
    CMPIObjectPath* const path =
        broker()->eft->newObjectPath(broker(), nameSpace_.c_str(), className, nullptr);
    if (path == nullptr) throw Refusal(CMPI_RC_ERR_FAILED, "the object manager makes no path");
    return path;
}

Answer Request::enumerateInstanceNames(const CMPIObjectPath* path) const {
    CMPIInstanceMI* const mi = provider_.instances;
    return Answer([&](const CMPIResult* result) {
        return mi->ft->enumerateInstanceNames(mi, context_, result, path);
    });
}

Answer Request::enumerateInstances(const CMPIObjectPath* path) const {
    CMPIInstanceMI* const mi = provider_.instances;
    return Answer([&](const CMPIResult* result) {
        return mi->ft->enumerateInstances(mi, context_, result, path, nullptr);
    });
}

Answer Request::getInstance(const CMPIObjectPath* path) const {
    CMPIInstanceMI* const mi = provider_.instances;
    return Answer([&](const CMPIResult* result) {
        return mi->ft->getInstance(mi, context_, result, path, nullptr);
    });
}

void Request::deliver(const std::vector<const CMPIObjectPath*>& paths) const {
    for (const CMPIObjectPath* path : paths) result_->ft->returnObjectPath(result_, path);
    result_->ft->returnDone(result_);
}

void Request::deliver(const std::vector<const CMPIInstance*>& instances,
                      const char** properties) const {
    std::vector<const CMPIInstance*> answer = instances;
    for (const CMPIInstance*& instance : answer)
        instance = narrowed(broker(), instance, properties);
    for (const CMPIInstance* instance : answer) result_->ft->returnInstance(result_, instance);
    result_->ft->returnDone(result_);
}

void requireServed(const Answer& answer, const std::string& className) {
    if (answer.rc() == CMPI_RC_ERR_INVALID_CLASS)
        throw Refusal(CMPI_RC_ERR_INVALID_CLASS, printable(className) + " is not served here");
    if (answer.rc() != CMPI_RC_OK)
        throw Refusal(answer.rc(), "the question about " + printable(className) + " is refused");
}

void requireWhole(const Answer& answer, const std::string& className) {
    requireServed(answer, className);
    if (answer.isDone()) return;
    const Class* const known = findClass(className);
    if (known != nullptr && known->isAssociation() && answer.isEmpty()) return;
    throw Refusal(CMPI_RC_ERR_FAILED, "the answer about " + printable(className) + " broke off");
}

}  // namespace VA::OSStatusFacade
