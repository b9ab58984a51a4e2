// The {hdl, ft} pattern: one template for all kinds of objects. Internal.
#pragma once

#include "host/broker/Call.h"
#include "host/broker/Kinds.h"
#include "host/broker/Shell.h"

#include <array>
#include <functional>

namespace cmpihost {

/// What `hdl` of a retired object points to; text, because CMPIString lends its hdl as such.
extern char tombstone[];

/// How many shapes a live table comes in; see TableShape.
constexpr std::size_t tableShapes = 8;

/// The live tables of a kind in all shapes, and the table of its retired objects.
template <class Edt>
struct Tables {
    using Table = typename Kind<Edt>::Table;
    std::array<Table, tableShapes> live{};
    Table dead{};

    bool isLive(const Table* table) const noexcept {
        return std::less_equal<>()(live.data(), table) &&
               std::less<>()(table, live.data() + live.size());
    }
};

/// Built on first use; lives as long as the program.
template <class Edt>
Tables<Edt>& tablesOf();
template <>
Tables<CMPIString>& tablesOf();
template <>
Tables<CMPIObjectPath>& tablesOf();
template <>
Tables<CMPIInstance>& tablesOf();
template <>
Tables<CMPIArray>& tablesOf();
template <>
Tables<CMPIArgs>& tablesOf();
template <>
Tables<CMPIContext>& tablesOf();
template <>
Tables<CMPIDateTime>& tablesOf();
template <>
Tables<CMPIEnumeration>& tablesOf();
template <>
Tables<CMPISelectExp>& tablesOf();
template <>
Tables<CMPIError>& tablesOf();
template <>
Tables<CMPIResult>& tablesOf();

/// An object of the CMPI type `Edt`.
template <class Edt>
class Object final : public Edt, public Shell {
  public:
    using Body = typename Kind<Edt>::Body;

    Object(BrokerCore& core, std::size_t shape, Body content)
        : Edt{nullptr, &tablesOf<Edt>().live[shape]}, Shell(core), body(std::move(content)) {
        if constexpr (std::is_same_v<Edt, CMPIString>) {
            this->hdl = body.get();
        } else {
            this->hdl = static_cast<Shell*>(this);
        }
    }

    void retire(Life why) noexcept override {
        remember(why, Kind<Edt>::describe(body));
        body = Body{};
        this->hdl = tombstone;
        this->ft = &tablesOf<Edt>().dead;
    }

    std::string describe() const override {
        const std::string_view text = life() == Life::Alive ? Kind<Edt>::describe(body) : label();
        std::string result = Kind<Edt>::name;
        if constexpr (std::is_same_v<Edt, CMPIObjectPath> || std::is_same_v<Edt, CMPIInstance>) {
            result += " of ";
            result += text;
        } else if (!text.empty()) {
            result += " \"";
            result += text;
            result += '"';
        }
        return result;
    }

    /// CMPI passes objects as const even to calls that alter them.
    mutable Body body;
};

/// Reports the misuse of an object to its broker.
void reportLateUse(const Shell& shell, const CallName& call) noexcept;
/// Reports a handle that is no object of a broker, to the broker of the thread's request.
[[noreturn]] void refuseNull(const CallName& call, const char* kind);
[[noreturn]] void refuseForeign(const CallName& call, const char* kind);

template <class Handle>
using ObjectOf = std::conditional_t<std::is_const_v<Handle>,
                                    const Object<std::remove_const_t<Handle>>, Object<Handle>>;

/// The object behind a handle that a provider passed. A null, retired or foreign handle is a
/// violation and throws Failure.
template <class Handle>
ObjectOf<Handle>& fromHandle(Handle* handle, const CallName& call) {
    using Edt = std::remove_const_t<Handle>;
    if (handle == nullptr) refuseNull(call, Kind<Edt>::name);
    const Tables<Edt>& tables = tablesOf<Edt>();
    if (tables.isLive(handle->ft)) return static_cast<ObjectOf<Handle>&>(*handle);
    if (handle->ft == &tables.dead) {
        reportLateUse(static_cast<ObjectOf<Handle>&>(*handle), call);
        throw Failure{CMPI_RC_ERR_INVALID_HANDLE};
    }
    refuseForeign(call, Kind<Edt>::name);
}

}  // namespace cmpihost
