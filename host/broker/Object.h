#ifndef HOST_BROKER_OBJECT_H
#define HOST_BROKER_OBJECT_H

#include "host/broker/ObjectTraits.h"

#include <array>
#include <cstddef>

/// The {hdl, ft} pattern: one template for all kinds of objects. Internal.
namespace cmpihost {

class Arena;
class BrokerCore;

/// The slot that a provider called.
struct CallName {
    std::string_view table;
    std::string_view slot;

    std::string text() const { return std::string(table).append(".").append(slot); }
};

/// Thrown by the implementation of a slot: the call fails with this status. It never leaves the
/// broker.
struct Failure {
    CMPIrc rc;
};

inline CMPIStatus statusOf(CMPIrc rc) noexcept {
    return {rc, nullptr};
}

enum class Lifetime : unsigned char {
    Alive,
    /// The request that it belonged to has ended.
    RequestEnded,
    /// Given back by the provider: a clone released, an object freed early.
    Released
};

/// What all objects that a provider may hold a pointer to have in common. Once retired, an object
/// is empty and its function table reports every use.
class ObjectBase {
  public:
    explicit ObjectBase(BrokerCore& core) noexcept : core_(core) {}
    virtual ~ObjectBase() = default;
    ObjectBase(const ObjectBase&) = delete;
    ObjectBase& operator=(const ObjectBase&) = delete;

    BrokerCore& core() const noexcept { return core_; }
    Lifetime lifetime() const noexcept { return lifetime_; }

    /// The arena of the request that it belongs to and its index there; null: a clone, the
    /// provider's own.
    Arena* arena() const noexcept { return arena_; }
    std::size_t index() const noexcept { return index_; }
    void setArena(Arena* arena, std::size_t index) noexcept {
        arena_ = arena;
        index_ = index;
    }

    /// Drops the content.
    virtual void retire(Lifetime why) noexcept = 0;

    /// "CMPIObjectPath of KORVA_X" or the like, alive or retired.
    virtual std::string describe() const = 0;

  protected:
    /// Keeps the front of the label for describe().
    void setRetired(Lifetime why, std::string_view label) noexcept {
        lifetime_ = why;
        arena_ = nullptr;
        label_[label.copy(label_.data(), label_.size() - 1)] = '\0';
    }
    std::string_view label() const noexcept { return label_.data(); }

  private:
    BrokerCore& core_;
    Arena* arena_ = nullptr;
    std::size_t index_ = 0;
    Lifetime lifetime_ = Lifetime::Alive;
    std::array<char, 48> label_{};
};

/// What `hdl` of a retired object points to; text, because CMPIString lends its hdl as such.
inline char tombstone[] = "(object of a request that ended)";

/// The tables of live objects, one for each shape of a broker, and that of retired objects.
template <class Edt>
struct Tables {
    using Table = typename ObjectTraits<Edt>::Table;
    Table complete{};
    Table sparse{};
    Table retired{};

    bool isLive(const Table* table) const noexcept {
        return table == &complete || table == &sparse;
    }
};

/// Fill the tables of a kind.
void bindSlots(Tables<CMPIString>& tables);
void bindSlots(Tables<CMPIObjectPath>& tables);
void bindSlots(Tables<CMPIInstance>& tables);
void bindSlots(Tables<CMPIArray>& tables);
void bindSlots(Tables<CMPIArgs>& tables);
void bindSlots(Tables<CMPIContext>& tables);
void bindSlots(Tables<CMPIDateTime>& tables);
void bindSlots(Tables<CMPIEnumeration>& tables);
void bindSlots(Tables<CMPIResult>& tables);

/// The tables of a kind: built on first use, they live as long as the program.
template <class Edt>
Tables<Edt>& tablesOf() {
    static Tables<Edt> tables = [] {
        Tables<Edt> made;
        bindSlots(made);
        return made;
    }();
    return tables;
}

/// An object of the CMPI type `Edt`.
template <class Edt>
class Object final : public Edt, public ObjectBase {
  public:
    using Body = typename ObjectTraits<Edt>::Body;

    Object(BrokerCore& core, bool sparse, Body content)
        : Edt{nullptr, sparse ? &tablesOf<Edt>().sparse : &tablesOf<Edt>().complete},
          ObjectBase(core),
          body(std::move(content)) {
        if constexpr (std::is_same_v<Edt, CMPIString>) {
            this->hdl = body.get();
        } else {
            this->hdl = static_cast<ObjectBase*>(this);
        }
    }

    void retire(Lifetime why) noexcept override {
        setRetired(why, ObjectTraits<Edt>::label(body));
        body = Body{};
        this->hdl = tombstone;
        this->ft = &tablesOf<Edt>().retired;
    }

    std::string describe() const override {
        const std::string_view text =
            lifetime() == Lifetime::Alive ? ObjectTraits<Edt>::label(body) : label();
        std::string result(kindName<Edt>);
        if constexpr (std::is_same_v<Edt, CMPIObjectPath> || std::is_same_v<Edt, CMPIInstance>) {
            result.append(" of ").append(text);
        } else if (!text.empty()) {
            result.append(" \"").append(text).append("\"");
        }
        return result;
    }

    /// CMPI passes objects as const even to calls that alter them.
    mutable Body body;
};

/// Reports the use of a retired object to its broker.
void reportLateUse(const ObjectBase& object, const CallName& call) noexcept;
/// Report a handle that is no object of a broker, to the broker of the thread's request.
[[noreturn]] void refuseNull(const CallName& call, std::string_view kind);
[[noreturn]] void refuseForeign(const CallName& call, std::string_view kind);

template <class Handle>
using ObjectOf = std::conditional_t<std::is_const_v<Handle>,
                                    const Object<std::remove_const_t<Handle>>, Object<Handle>>;

/// The object behind a handle that a provider passed. A null, retired or foreign handle is a
/// violation and throws Failure.
template <class Handle>
ObjectOf<Handle>& fromHandle(Handle* handle, const CallName& call) {
    using Edt = std::remove_const_t<Handle>;
    if (handle == nullptr) refuseNull(call, kindName<Edt>);
    const Tables<Edt>& tables = tablesOf<Edt>();
    if (tables.isLive(handle->ft)) return static_cast<ObjectOf<Handle>&>(*handle);
    if (handle->ft == &tables.retired) {
        reportLateUse(static_cast<ObjectOf<Handle>&>(*handle), call);
        throw Failure{CMPI_RC_ERR_INVALID_HANDLE};
    }
    refuseForeign(call, kindName<Edt>);
}

}  // namespace cmpihost

#endif
