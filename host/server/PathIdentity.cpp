// A text rather than a comparison: doubled paths are found by looking them up, in answers of any
// size.
#include "host/server/PathIdentity.h"

#include "base/Ascii.h"

#include <algorithm>
#include <utility>
#include <vector>

namespace cmpihost::server {

namespace {

/// Texts that stand beside each other cannot be taken for others: each tells its length.
void appendIdentityPart(std::string& identity, const std::string& part) {
    identity += std::to_string(part.size()) + ':' + part;
}

}  // namespace

std::string pathIdentity(const ObjectPathValue& path, const std::string& nameSpace) {
    const std::string& ownNameSpace = path.nameSpace.empty() ? nameSpace : path.nameSpace;
    std::vector<std::pair<std::string, std::string>> keys;
    for (const KeyBinding& key : path.keys) {
        const bool reference = key.value.type() == CMPI_ref && !key.value.isNull();
        keys.emplace_back(
            base::toLower(key.name),
            reference ? pathIdentity(key.value.reference(), ownNameSpace) : key.value.toText());
    }
    std::sort(keys.begin(), keys.end());

    std::string identity;
    appendIdentityPart(identity, base::toLower(ownNameSpace));
    appendIdentityPart(identity, base::toLower(path.className));
    for (const auto& [name, value] : keys) {
        appendIdentityPart(identity, name);
        appendIdentityPart(identity, value);
    }
    return identity;
}

}  // namespace cmpihost::server
