#include "host/broker/SelectQuery.h"

#include "host/broker/Value.h"

namespace cmpihost {

namespace {

constexpr std::string_view blanks = " \t\r\n";

/// Takes the next word or comma off the front; empty at the end.
std::string_view nextToken(std::string_view& text) noexcept {
    text.remove_prefix(std::min(text.find_first_not_of(blanks), text.size()));
    std::size_t length = text.find_first_of(" \t\r\n,");
    if (length == 0) length = 1;
    const std::string_view token = text.substr(0, length);
    text.remove_prefix(token.size());
    return token;
}

bool isName(std::string_view token) noexcept {
    return !token.empty() && token != "," && token != "*";
}

/// The list between SELECT and FROM, FROM included.
bool readProjection(std::string_view& text, std::vector<std::string>& names) {
    std::string_view token = nextToken(text);
    if (token == "*") return equalNames(nextToken(text), "FROM");
    while (isName(token)) {
        names.emplace_back(token);
        token = nextToken(text);
        if (token != ",") return equalNames(token, "FROM");
        token = nextToken(text);
    }
    return false;
}

}  // namespace

std::optional<SelectQuery> parseSelect(std::string_view query) {
    SelectQuery result;
    if (!equalNames(nextToken(query), "SELECT")) return std::nullopt;
    if (!readProjection(query, result.projection)) return std::nullopt;
    const std::string_view className = nextToken(query);
    if (!isName(className)) return std::nullopt;
    result.className = className;

    const std::string_view next = nextToken(query);
    if (next.empty()) return result;
    result.hasCondition = equalNames(next, "WHERE") && !nextToken(query).empty();
    if (!result.hasCondition) return std::nullopt;
    return result;
}

}  // namespace cmpihost
