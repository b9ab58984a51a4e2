#ifndef HOST_SERVER_PARAMETERS_H
#define HOST_SERVER_PARAMETERS_H

#include <cstdint>
#include <initializer_list>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "host/server/Message.h"

/// The parameters of intrinsic operations.
namespace cmpihost::server {

/// What a parameter holds: VALUE for the first three, CLASSNAME, INSTANCENAME, either of these two,
/// VALUE.ARRAY of names, any value, INSTANCE, VALUE.NAMEDINSTANCE, anything (never looked at).
enum class ParameterKind {
    Boolean,
    Text,
    Number,
    ClassName,
    InstanceName,
    ObjectName,
    PropertyList,
    AnyValue,
    Instance,
    NamedInstance,
    Anything
};

struct ParameterRow {
    const char* name;
    ParameterKind kind;
    bool required = false;
};

/// What a client gave for the parameters of an operation, checked against their rows. A parameter
/// that is not given, or given without a value, is absent. Asking for a name that has no row, or by
/// a function that does not fit its kind, is a mistake of the caller's (std::logic_error). The rows
/// and the message outlive it.
class Parameters {
  public:
    /// Throws CimError with cimInvalidParameter for a parameter that is unknown, doubled, missing
    /// though required, or that does not hold what its kind demands.
    Parameters(const std::vector<ParameterRow>& rows, const Message& message);

    bool flag(std::string_view name, bool byDefault) const;
    std::optional<std::string> text(std::string_view name) const;
    std::optional<std::uint32_t> number(std::string_view name) const;
    std::optional<std::string> className(std::string_view name) const;
    /// An InstanceName or ObjectName.
    std::optional<RequestPath> path(std::string_view name) const;
    /// A PropertyList; absent: all properties, empty: none.
    std::optional<std::vector<std::string>> names(std::string_view name) const;
    /// The element of any other kind, null if absent. It belongs to the message.
    const XmlElement* element(std::string_view name) const;

  private:
    struct Given {
        const ParameterRow* row;
        /// Null for a parameter that is absent or NULL.
        const XmlElement* value;
        bool isGiven;
    };
    const XmlElement* find(std::string_view name, std::initializer_list<ParameterKind> kinds) const;

    std::vector<Given> given_;
};

}  // namespace cmpihost::server

#endif
