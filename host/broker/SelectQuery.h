// The part of a query that the broker understands. Internal.
#pragma once

#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace cmpihost {

struct SelectQuery {
    /// Empty: all properties.
    std::vector<std::string> projection{};
    std::string className{};
    /// There is a WHERE clause; it is not read.
    bool hasCondition = false;
};

/// Reads "SELECT *|name[, name...] FROM class [WHERE ...]"; keywords without case. None: not such a
/// text.
std::optional<SelectQuery> parseSelect(std::string_view query);

}  // namespace cmpihost
