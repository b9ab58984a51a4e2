#include "host/mof/MofSyntax.h"

#include "host/broker/Value.h"

namespace cmpihost::mof {

const Qualifier* findQualifier(const std::vector<Qualifier>& qualifiers, const std::string& name) {
    for (const Qualifier& qualifier : qualifiers) {
        if (equalNames(qualifier.name, name)) {
            return &qualifier;
        }
    }
    return nullptr;
}

bool isSet(const std::vector<Qualifier>& qualifiers, const std::string& name) {
    const Qualifier* qualifier = findQualifier(qualifiers, name);
    if (qualifier == nullptr) {
        return false;
    }
    if (!qualifier->value) {
        return true;
    }
    const auto& items = qualifier->value->items;
    return items.size() == 1 && items.front() == Scalar(true);
}

std::vector<std::string> texts(const std::vector<Qualifier>& qualifiers, const std::string& name) {
    std::vector<std::string> result;
    const Qualifier* qualifier = findQualifier(qualifiers, name);
    if (qualifier != nullptr && qualifier->value) {
        for (const Scalar& item : qualifier->value->items) {
            if (const auto* string = std::get_if<std::string>(&item)) {
                result.push_back(*string);
            }
        }
    }
    return result;
}

std::string text(const std::vector<Qualifier>& qualifiers, const std::string& name) {
    const std::vector<std::string> all = texts(qualifiers, name);
    return all.empty() ? std::string() : all.front();
}

}  // namespace cmpihost::mof
