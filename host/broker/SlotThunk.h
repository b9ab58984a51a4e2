#ifndef HOST_BROKER_SLOT_THUNK_H
#define HOST_BROKER_SLOT_THUNK_H

#include "host/broker/BrokerCore.h"

#include <type_traits>

/// Wraps the implementation of a table slot: handles are resolved, faults injected, exceptions kept
/// inside. Internal.
namespace cmpihost {

template <class Table>
inline constexpr std::string_view tableName{};
template <>
inline constexpr std::string_view tableName<CMPIBrokerFT> = "CMPIBrokerFT";
template <>
inline constexpr std::string_view tableName<CMPIBrokerEncFT> = "CMPIBrokerEncFT";
template <>
inline constexpr std::string_view tableName<CMPIBrokerExtFT> = "CMPIBrokerExtFT";
template <>
inline constexpr std::string_view tableName<CMPIBrokerMemFT> = "CMPIBrokerMemFT";

/// The name of a slot, set when the slot is bound.
template <auto Slot>
inline std::string_view slotName{};

inline void setStatus(CMPIStatus* status, CMPIrc rc) noexcept {
    if (status != nullptr) *status = statusOf(rc);
}

/// Sets the status and gives the answer of a call that has nothing to give.
template <class T = std::nullptr_t>
T failWith(CMPIStatus* status, CMPIrc rc) noexcept {
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

/// The status out-argument among the arguments of a call, null if it has none.
template <class... Args>
CMPIStatus* statusArgument(Args... args) noexcept {
    CMPIStatus* found = nullptr;
    [[maybe_unused]] const auto look = [&found](auto arg) {
        if constexpr (std::is_same_v<decltype(arg), CMPIStatus*>) found = arg;
    };
    (look(args), ...);
    return found;
}

/// A slot that answers CMPI_RC_ERR_NOT_SUPPORTED: a service that this broker does not offer.
template <class R, class Target, class... Args>
R notSupported(Target&, Args... args) {
    setStatus(statusArgument(args...), CMPI_RC_ERR_NOT_SUPPORTED);
    if constexpr (std::is_same_v<R, CMPIStatus>) {
        return statusOf(CMPI_RC_ERR_NOT_SUPPORTED);
    } else if constexpr (std::is_same_v<R, CMPIData>) {
        return noData(CMPI_notFound);
    } else {
        return R{};
    }
}

/// A handle of a kind that this broker does not make: whatever it is, it is a violation.
[[noreturn]] inline void refuseNeverMade(const void* handle, const CallName& call,
                                         std::string_view kind) {
    if (handle == nullptr) refuseNull(call, kind);
    refuseForeign(call, kind);
}

inline BrokerCore& target(const CMPIBroker* broker, const CallName& call) {
    if (broker == nullptr) refuseNull(call, "CMPIBroker");
    return *static_cast<BrokerCore*>(broker->hdl);
}
template <class Handle>
ObjectOf<Handle>& target(Handle* handle, const CallName& call) {
    return fromHandle(handle, call);
}

inline BrokerCore& coreOf(BrokerCore& core) noexcept {
    return core;
}
inline BrokerCore& coreOf(const ObjectBase& object) noexcept {
    return object.core();
}

/// Runs an implementation so that nothing is thrown into the provider.
template <class R, class Body>
R exceptionsToStatus(CMPIStatus* status, Body&& body) noexcept {
    CMPIrc rc = CMPI_RC_ERR_FAILED;
    try {
        setStatus(status, CMPI_RC_OK);
        return body();
    } catch (const Failure& failure) {
        rc = failure.rc;
    } catch (...) {
        // Out of memory, or a callback of the provider that threw.
    }
    setStatus(status, rc);
    return failed<R>(rc);
}

/// Does the work of a call; a status other than CMPI_RC_OK takes the place of its own.
template <class R, class Work>
R reporting(CMPIrc rc, CMPIStatus* status, Work&& work) {
    if constexpr (std::is_void_v<R>) {
        work();
    } else {
        R result = work();
        if (rc == CMPI_RC_OK) return result;
        setStatus(status, rc);
        if constexpr (std::is_same_v<R, CMPIStatus>) result = statusOf(rc);
        return result;
    }
}

/// The table function of `Slot` in live objects: Impl(target, arguments...) or Impl(target, name of
/// the call, arguments...), with the status among the arguments.
template <auto Slot, auto Impl>
struct SlotThunk;
template <class Table, class R, class Self, class... Args, R (*Table::*Slot)(Self*, Args...),
          auto Impl>
struct SlotThunk<Slot, Impl> {
    static R call(Self* self, Args... args) noexcept {
        CMPIStatus* const status = statusArgument(args...);
        return exceptionsToStatus<R>(status, [&]() -> R {
            const CallName name = callName();
            auto& object = target(self, name);
            return reporting<R>(coreOf(object).countCall(name), status, [&]() -> R {
                if constexpr (std::is_invocable_v<decltype(Impl), decltype(object), const CallName&,
                                                  Args...>) {
                    return Impl(object, name, args...);
                } else {
                    return Impl(object, args...);
                }
            });
        });
    }

    static CallName callName() noexcept {
        if constexpr (!tableName<Table>.empty()) {
            return {tableName<Table>, slotName<Slot>};
        } else {
            return {ObjectTraits<std::remove_const_t<Self>>::table, slotName<Slot>};
        }
    }
};

/// The table function of `Slot` in retired objects: reports the use.
template <auto Slot>
struct RetiredSlotThunk;
template <class Table, class R, class Self, class... Args, R (*Table::*Slot)(Self*, Args...)>
struct RetiredSlotThunk<Slot> {
    static R call(Self* self, Args... args) noexcept {
        using Edt = std::remove_const_t<Self>;
        reportLateUse(static_cast<const Object<Edt>&>(*self),
                      {ObjectTraits<Edt>::table, slotName<Slot>});
        setStatus(statusArgument(args...), CMPI_RC_ERR_INVALID_HANDLE);
        if constexpr (std::is_same_v<R, const char*>) {
            return tombstone;
        } else {
            return failed<R>(CMPI_RC_ERR_INVALID_HANDLE);
        }
    }
};

/// Puts an implementation into the tables of its kind.
template <auto Slot, auto Impl, class Edt>
void bind(Tables<Edt>& tables, std::string_view name) {
    slotName<Slot> = name;
    tables.complete.*Slot = &SlotThunk<Slot, Impl>::call;
    tables.sparse.*Slot = &SlotThunk<Slot, Impl>::call;
    tables.retired.*Slot = &RetiredSlotThunk<Slot>::call;
}

/// Puts an implementation into a table of the broker itself.
template <auto Slot, auto Impl, class Table,
          std::enable_if_t<!tableName<Table>.empty(), bool> = true>
void bind(Table& table, std::string_view name) {
    slotName<Slot> = name;
    table.*Slot = &SlotThunk<Slot, Impl>::call;
}

/// The release and clone of every kind.
template <class Edt>
CMPIStatus release(Object<Edt>& object) {
    if (object.arena() != nullptr) {
        object.core().report(object.describe() + " released that belongs to the object manager");
        return statusOf(CMPI_RC_ERR_INVALID_HANDLE);
    }
    object.core().releaseObject(object);
    return statusOf(CMPI_RC_OK);
}

template <class Edt>
Edt* clone(const Object<Edt>& object, CMPIStatus*) {
    return object.core().template makeClone<Edt>(object.body);
}

/// Sets the versions and the two functions that every kind has.
template <class Edt>
void bindCommon(Tables<Edt>& tables) {
    using Table = typename ObjectTraits<Edt>::Table;
    tables.complete.ftVersion = CMPICurrentVersion;
    tables.sparse.ftVersion = 1;
    tables.retired.ftVersion = CMPICurrentVersion;
    bind<&Table::release, &release<Edt>>(tables, "release");
    bind<&Table::clone, &clone<Edt>>(tables, "clone");
}

}  // namespace cmpihost

#endif
