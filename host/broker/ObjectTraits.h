#ifndef HOST_BROKER_OBJECT_TRAITS_H
#define HOST_BROKER_OBJECT_TRAITS_H

#include "host/broker/ClassCatalogue.h"
#include "host/broker/Value.h"

#include <cmpi/cmpift.h>

#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

/// What each kind of CMPI object holds. Internal.
namespace cmpihost {

struct ResultState;

/// NUL-terminated text on the heap, so that a stale pointer to it is a memory error to a checker.
class Characters {
  public:
    /// No characters at all: the pointer is null.
    Characters() = default;
    explicit Characters(std::string_view text) : text_(new char[text.size() + 1]) {
        text.copy(text_.get(), text.size());
        text_[text.size()] = '\0';
    }
    Characters(const Characters& other) {
        if (other.text_ != nullptr) *this = Characters(std::string_view(other.get()));
    }
    Characters(Characters&&) = default;
    Characters& operator=(Characters&&) = default;
    Characters& operator=(const Characters&) = delete;
    ~Characters() = default;

    char* get() const noexcept { return text_.get(); }

  private:
    std::unique_ptr<char[]> text_;
};

struct InstanceBody {
    std::shared_ptr<InstanceValue> value;
    /// Null without a catalogue.
    const ClassDeclaration* declaration = nullptr;
    /// None: no filter.
    std::optional<std::vector<std::string>> filter{};
};

struct ArrayBody {
    CMPIType elementType = CMPI_null;
    std::shared_ptr<std::vector<Value>> elements;
};

struct EnumerationBody {
    CMPIType itemType = CMPI_null;
    std::vector<Value> items{};
    std::size_t position = 0;
    /// The k-th getNext (from 1) fails; 0: none.
    unsigned failAt = 0;
    CMPIrc failRc = CMPI_RC_OK;
    unsigned nextCalls = 0;
};

/// Body and function table of a kind whose objects a violation names by their kind alone.
template <class FT, class Content>
struct PlainTraits {
    using Table = FT;
    using Body = Content;
    /// Names an object in a violation.
    static std::string_view label(const Content&) { return {}; }
};

/// Body, function table and names of one kind.
template <class Edt>
struct ObjectTraits;

template <>
struct ObjectTraits<CMPIString> : PlainTraits<CMPIStringFT, Characters> {
    static constexpr std::string_view table = "CMPIStringFT";
    static std::string_view label(const Characters& body) {
        return body.get() == nullptr ? std::string_view() : body.get();
    }
};
template <>
struct ObjectTraits<CMPIObjectPath>
    : PlainTraits<CMPIObjectPathFT, std::shared_ptr<ObjectPathValue>> {
    static constexpr std::string_view table = "CMPIObjectPathFT";
    static std::string_view label(const Body& body) { return body->className; }
};
template <>
struct ObjectTraits<CMPIInstance> : PlainTraits<CMPIInstanceFT, InstanceBody> {
    static constexpr std::string_view table = "CMPIInstanceFT";
    static std::string_view label(const Body& body) { return body.value->path.className; }
};
template <>
struct ObjectTraits<CMPIArray> : PlainTraits<CMPIArrayFT, ArrayBody> {
    static constexpr std::string_view table = "CMPIArrayFT";
};
template <>
struct ObjectTraits<CMPIArgs> : PlainTraits<CMPIArgsFT, std::vector<NamedValue>> {
    static constexpr std::string_view table = "CMPIArgsFT";
};
template <>
struct ObjectTraits<CMPIContext> : PlainTraits<CMPIContextFT, std::vector<NamedValue>> {
    static constexpr std::string_view table = "CMPIContextFT";
};
template <>
struct ObjectTraits<CMPIDateTime> : PlainTraits<CMPIDateTimeFT, std::string> {
    static constexpr std::string_view table = "CMPIDateTimeFT";
    static std::string_view label(const std::string& body) { return body; }
};
template <>
struct ObjectTraits<CMPIEnumeration> : PlainTraits<CMPIEnumerationFT, EnumerationBody> {
    static constexpr std::string_view table = "CMPIEnumerationFT";
};
template <>
struct ObjectTraits<CMPIResult> : PlainTraits<CMPIResultFT, std::shared_ptr<ResultState>> {
    static constexpr std::string_view table = "CMPIResultFT";
};

/// "CMPIString" and so on: the table's name without its "FT".
template <class Edt>
inline constexpr std::string_view kindName =
    ObjectTraits<Edt>::table.substr(0, ObjectTraits<Edt>::table.size() - 2);

}  // namespace cmpihost

#endif
