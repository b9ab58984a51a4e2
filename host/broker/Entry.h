// Wraps the implementation of a table slot: handles are resolved, faults injected, exceptions kept
// inside. Internal.
#pragma once

#include "host/broker/BrokerCore.h"
#include "host/broker/Object.h"

namespace cmpihost {

template <class Table>
inline constexpr const char* tableName = nullptr;
template <>
inline constexpr const char* tableName<CMPIBrokerFT> = "CMPIBrokerFT";
template <>
inline constexpr const char* tableName<CMPIBrokerEncFT> = "CMPIBrokerEncFT";
template <>
inline constexpr const char* tableName<CMPIBrokerExtFT> = "CMPIBrokerExtFT";
template <>
inline constexpr const char* tableName<CMPIBrokerMemFT> = "CMPIBrokerMemFT";

/// The name of a slot, set when the slot is bound.
template <auto Slot>
struct SlotName {
    static inline const char* text = "";
};

template <auto Slot>
struct TableOf;
template <class Table, class Function, Function Table::*Slot>
struct TableOf<Slot> {
    using type = Table;
};

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
inline BrokerCore& coreOf(const Shell& shell) noexcept {
    return shell.core();
}

/// Runs an implementation so that nothing is thrown into the provider.
template <class R, class Body>
R guarded(CMPIStatus* status, Body&& body) noexcept {
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
struct Entry;
template <class Table, class R, class Self, class... Args, R (*Table::*Slot)(Self*, Args...),
          auto Impl>
struct Entry<Slot, Impl> {
    static R call(Self* self, Args... args) noexcept {
        CMPIStatus* const status = statusArgument(args...);
        return guarded<R>(status, [&]() -> R {
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
        if constexpr (tableName<Table> != nullptr) {
            return {tableName<Table>, SlotName<Slot>::text};
        } else {
            return {Kind<std::remove_const_t<Self>>::table, SlotName<Slot>::text};
        }
    }
};

/// The table function of `Slot` in retired objects: reports the use.
template <auto Slot>
struct DeadEntry;
template <class Table, class R, class Self, class... Args, R (*Table::*Slot)(Self*, Args...)>
struct DeadEntry<Slot> {
    static R call(Self* self, Args... args) noexcept {
        using Edt = std::remove_const_t<Self>;
        const CallName name = {Kind<Edt>::table, SlotName<Slot>::text};
        reportLateUse(static_cast<const Object<Edt>&>(*self), name);
        setStatus(statusArgument(args...), CMPI_RC_ERR_INVALID_HANDLE);
        if constexpr (std::is_same_v<R, const char*>) {
            return tombstone;
        } else {
            return failed<R>(CMPI_RC_ERR_INVALID_HANDLE);
        }
    }
};

/// Which tables hold a slot.
enum class Since { Always, Level200, Qualifiers };

/// Bits of a table's shape.
struct TableShape {
    static constexpr std::size_t currentVersion = 1;
    static constexpr std::size_t level200 = 2;
    static constexpr std::size_t qualifiers = 4;

    static bool holds(std::size_t shape, Since since) noexcept {
        if (since == Since::Level200) return (shape & level200) != 0;
        if (since == Since::Qualifiers) return (shape & qualifiers) != 0;
        return true;
    }
};

/// Puts an implementation into the tables of its kind.
template <auto Slot, auto Impl, class Edt>
void bind(Tables<Edt>& tables, const char* name, Since since = Since::Always) {
    SlotName<Slot>::text = name;
    for (std::size_t shape = 0; shape < tables.live.size(); ++shape) {
        if (TableShape::holds(shape, since)) tables.live[shape].*Slot = &Entry<Slot, Impl>::call;
    }
    tables.dead.*Slot = &DeadEntry<Slot>::call;
}

/// Puts an implementation into a table of the broker itself.
template <auto Slot, auto Impl>
void bind(typename TableOf<Slot>::type& table, const char* name) {
    SlotName<Slot>::text = name;
    table.*Slot = &Entry<Slot, Impl>::call;
}

/// Sets the versions and the two functions that every kind has.
template <class Edt>
void bindCommon(Tables<Edt>& tables) {
    using Table = typename Kind<Edt>::Table;
    for (std::size_t shape = 0; shape < tables.live.size(); ++shape) {
        tables.live[shape].ftVersion =
            (shape & TableShape::currentVersion) != 0 ? CMPICurrentVersion : 1;
    }
    tables.dead.ftVersion = CMPICurrentVersion;
    bind<&Table::release, &release<Edt>>(tables, "release");
    bind<&Table::clone, &clone<Edt>>(tables, "clone");
}

}  // namespace cmpihost
