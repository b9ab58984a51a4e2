#include "Answer.h"

#include <new>

namespace VA::OSStatusFacade {

// The functions of the result. The provider calls them: nothing may be thrown into it, where it
// would count as a walk that broke off.
struct Answer::Table {
    // Headers of a later level have the handle const; the object behind it is not.
    static Answer& answerOf(const CMPIResult* result) {
        return *static_cast<Answer*>(const_cast<void*>(result->hdl));
    }

    template <class Element>
    static CMPIStatus take(const CMPIResult* result, std::vector<const Element*> Answer::*elements,
                           const Element* element) noexcept {
        if (element == nullptr) return {CMPI_RC_ERR_INVALID_PARAMETER, nullptr};
        Answer& answer = answerOf(result);
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
        return take(result, &Answer::instances_, instance);
    }
    static CMPIStatus returnObjectPath(const CMPIResult* result, const CMPIObjectPath* path) {
        return take(result, &Answer::paths_, path);
    }
    static CMPIStatus returnDone(const CMPIResult* result) {
        answerOf(result).done_ = true;
        return {CMPI_RC_OK, nullptr};
    }
    static CMPIStatus returnError(const CMPIResult*, const CMPIError*) {
        return {CMPI_RC_ERR_NOT_SUPPORTED, nullptr};
    }
};

const CMPIResultFT Answer::table = {
    CMPIVersion200,        Table::release,          Table::clone,      Table::returnData,
    Table::returnInstance, Table::returnObjectPath, Table::returnDone, Table::returnError};

void Answer::requireRoom() const {
    if (full_) throw std::bad_alloc();
}

}  // namespace VA::OSStatusFacade
