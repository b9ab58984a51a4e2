// How one call of a table is named, refused and answered. Internal.
#pragma once

#include <cmpi/cmpift.h>

#include <string>
#include <type_traits>

namespace cmpihost {

/// The entry that a provider called.
struct CallName {
    const char* table;
    const char* slot;

    std::string text() const { return std::string(table) + '.' + slot; }
};

/// Thrown by the implementation of an entry: the call fails with this status. It never leaves the
/// broker.
struct Failure {
    CMPIrc rc;
};

inline CMPIStatus statusOf(CMPIrc rc) noexcept {
    return {rc, nullptr};
}

inline void setStatus(CMPIStatus* status, CMPIrc rc) noexcept {
    if (status != nullptr) *status = statusOf(rc);
}

/// Sets the status and gives the answer of a call that has nothing to give.
template <class T = std::nullptr_t>
T refuse(CMPIStatus* status, CMPIrc rc) noexcept {
    setStatus(status, rc);
    return T{};
}

/// A CMPIData without a value.
inline CMPIData noData(CMPIValueState state) noexcept {
    CMPIData data{};
    data.type = CMPI_null;
    data.state = state;
    return data;
}

/// What a failed call returns, by the type of its result.
template <class R>
R failed(CMPIrc rc) noexcept {
    if constexpr (std::is_same_v<R, CMPIStatus>) {
        return statusOf(rc == CMPI_RC_OK ? CMPI_RC_ERR_FAILED : rc);
    } else if constexpr (std::is_same_v<R, CMPIData>) {
        return noData(CMPI_badValue);
    } else if constexpr (!std::is_void_v<R>) {
        return R{};
    }
}

inline void noteStatus(CMPIStatus*& found, CMPIStatus* argument) noexcept {
    found = argument;
}
template <class Other>
void noteStatus(CMPIStatus*&, const Other&) noexcept {}

/// The status out-argument among the arguments of a call, null if it has none.
template <class... Args>
CMPIStatus* statusArgument(const Args&... args) noexcept {
    CMPIStatus* found = nullptr;
    (noteStatus(found, args), ...);
    return found;
}

}  // namespace cmpihost
