// What each kind of CMPI object holds. Internal.
#pragma once

#include "host/broker/ClassCatalogue.h"
#include "host/broker/Value.h"

#include <cmpi/cmpift.h>

#include <cstring>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace cmpihost {

struct ResultState;

/// NUL-terminated text on the heap, so that a stale pointer to it is a memory error to a checker.
class Characters {
  public:
    Characters() = default;
    /// Null: no characters at all.
    explicit Characters(const char* text);
    explicit Characters(std::string_view text);
    Characters(const Characters& other) : Characters(other.get()) {}
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

struct SelectBody {
    std::string query{};
    std::string className{};
    bool hasCondition = false;
};

struct ErrorBody {
    std::optional<std::string> owner{};
    std::optional<std::string> id{};
    std::optional<std::string> message{};
    CMPIErrorSeverity severity = ErrorSevUnknown;
    CMPIErrorProbableCause cause = ErrorProbCauseUnknown;
    CMPIrc code = CMPI_RC_OK;
    CMPIErrorType type = UnknownErrorType;
    CMPIErrorSrcFormat sourceFormat = CMPIErrSrcUnknown;
    std::optional<std::string> otherType{};
    std::optional<std::string> causeDescription{};
    std::optional<std::string> source{};
    std::optional<std::string> otherSourceFormat{};
    std::optional<std::string> codeDescription{};
    std::vector<Value> actions{};
    std::vector<Value> arguments{};
};

/// Body, function table and names of one kind; `describe` names an object in a violation.
template <class Edt>
struct Kind;

template <>
struct Kind<CMPIString> {
    using Table = CMPIStringFT;
    using Body = Characters;
    static constexpr const char* name = "CMPIString";
    static constexpr const char* table = "CMPIStringFT";
    static std::string_view describe(const Body& body) {
        return body.get() == nullptr ? std::string_view() : body.get();
    }
};

template <>
struct Kind<CMPIObjectPath> {
    using Table = CMPIObjectPathFT;
    using Body = std::shared_ptr<ObjectPathValue>;
    static constexpr const char* name = "CMPIObjectPath";
    static constexpr const char* table = "CMPIObjectPathFT";
    static std::string_view describe(const Body& body) { return body->className; }
};

template <>
struct Kind<CMPIInstance> {
    using Table = CMPIInstanceFT;
    using Body = InstanceBody;
    static constexpr const char* name = "CMPIInstance";
    static constexpr const char* table = "CMPIInstanceFT";
    static std::string_view describe(const Body& body) { return body.value->path.className; }
};

template <>
struct Kind<CMPIArray> {
    using Table = CMPIArrayFT;
    using Body = ArrayBody;
    static constexpr const char* name = "CMPIArray";
    static constexpr const char* table = "CMPIArrayFT";
    static std::string_view describe(const Body&) { return {}; }
};

template <>
struct Kind<CMPIArgs> {
    using Table = CMPIArgsFT;
    using Body = std::vector<NamedValue>;
    static constexpr const char* name = "CMPIArgs";
    static constexpr const char* table = "CMPIArgsFT";
    static std::string_view describe(const Body&) { return {}; }
};

template <>
struct Kind<CMPIContext> {
    using Table = CMPIContextFT;
    using Body = std::vector<NamedValue>;
    static constexpr const char* name = "CMPIContext";
    static constexpr const char* table = "CMPIContextFT";
    static std::string_view describe(const Body&) { return {}; }
};

template <>
struct Kind<CMPIDateTime> {
    using Table = CMPIDateTimeFT;
    using Body = std::string;
    static constexpr const char* name = "CMPIDateTime";
    static constexpr const char* table = "CMPIDateTimeFT";
    static std::string_view describe(const Body& body) { return body; }
};

template <>
struct Kind<CMPIEnumeration> {
    using Table = CMPIEnumerationFT;
    using Body = EnumerationBody;
    static constexpr const char* name = "CMPIEnumeration";
    static constexpr const char* table = "CMPIEnumerationFT";
    static std::string_view describe(const Body&) { return {}; }
};

template <>
struct Kind<CMPISelectExp> {
    using Table = CMPISelectExpFT;
    using Body = SelectBody;
    static constexpr const char* name = "CMPISelectExp";
    static constexpr const char* table = "CMPISelectExpFT";
    static std::string_view describe(const Body& body) { return body.query; }
};

template <>
struct Kind<CMPIError> {
    using Table = CMPIErrorFT;
    using Body = ErrorBody;
    static constexpr const char* name = "CMPIError";
    static constexpr const char* table = "CMPIErrorFT";
    static std::string_view describe(const Body&) { return {}; }
};

template <>
struct Kind<CMPIResult> {
    using Table = CMPIResultFT;
    using Body = std::shared_ptr<ResultState>;
    static constexpr const char* name = "CMPIResult";
    static constexpr const char* table = "CMPIResultFT";
    static std::string_view describe(const Body&) { return {}; }
};

}  // namespace cmpihost
