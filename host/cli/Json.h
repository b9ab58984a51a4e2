#ifndef HOST_CLI_JSON_H
#define HOST_CLI_JSON_H

#include <nlohmann/json.hpp>
#include <ostream>
#include <string>

#include "host/broker/Value.h"
#include "host/mof/Schema.h"

/// The values of the host as JSON, in the shapes that docs/json.md promises.
namespace cmpihost {

/// Members stay in the order in which they were added.
using JsonValue = nlohmann::ordered_json;

/// A value with its JSON type; what an embedded instance holds is looked up in the schema.
JsonValue valueJson(const Value& value, const Schema& schema);

/// What stands beside the values of an object, each kind in a member of its own and by the names of
/// the values: `names` (of numbers), `times` (datetimes in ISO 8601) and `units`.
class Annotations {
  public:
    /// Notes what there is to say about a value; an empty text says nothing about its units.
    void add(const std::string& name, const Value& value, const ValueMap& meanings,
             const std::string& units);

    /// Adds the three members, also those that are empty.
    void addTo(JsonValue& object) &&;

  private:
    JsonValue names_ = JsonValue::object();
    JsonValue times_ = JsonValue::object();
    JsonValue units_ = JsonValue::object();
};

/// `class`, `path` and `keys`.
JsonValue pathJson(const ObjectPathValue& path, const Schema& schema);

/// The same with `properties` and their annotations.
JsonValue instanceJson(const InstanceValue& instance, const Schema& schema);

/// Writes a whole document and a line end.
void writeJson(const JsonValue& document, std::ostream& stream);

}  // namespace cmpihost

#endif
