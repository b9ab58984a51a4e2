// Qualifiers are followed from the root downwards, one class after the other: what a class between
// says of a qualifier's flavor decides on what its subclasses get.
#include "host/mof/ResolvedClass.h"

#include <algorithm>
#include <unordered_set>

#include "base/Ascii.h"

namespace cmpihost {

namespace {

using Qualifiers = std::vector<ResolvedQualifier>;
/// The nearest class first.
using Line = std::vector<const mof::Class*>;

Line lineOf(const Schema& schema, std::string_view className) {
    Line line;
    for (const mof::Class* level = schema.find(className); level != nullptr;
         level = schema.find(level->superclass))
        line.push_back(level);
    return line;
}

void passToSubclass(Qualifiers& held) {
    held.erase(std::remove_if(held.begin(), held.end(),
                              [](const auto& each) { return !each.inheritance.toSubclass; }),
               held.end());
}

/// Adds a class's own qualifiers to those that it inherits.
void addOwn(const std::vector<mof::Qualifier>& own, const mof::Class& from,
            const QualifierTypes& types, Qualifiers& held) {
    for (const mof::Qualifier& qualifier : own) {
        const auto inherited =
            std::find_if(held.begin(), held.end(), [&](const ResolvedQualifier& each) {
                return base::equalsIgnoreCase(each.declared->name, qualifier.name);
            });
        const ResolvedQualifier added{&qualifier, &from, types.inheritanceOf(qualifier)};
        if (inherited == held.end()) {
            held.push_back(added);
        } else if (inherited->inheritance.overridable) {
            *inherited = added;
        }
    }
}

const mof::Feature* namedFeature(const std::vector<mof::Feature>& features,
                                 const std::string& name) {
    for (const mof::Feature& feature : features)
        if (base::equalsIgnoreCase(feature.name, name)) return &feature;
    return nullptr;
}

const mof::Method* namedMethod(const mof::Class& declared, const std::string& name) {
    for (const mof::Method& method : declared.methods)
        if (base::equalsIgnoreCase(method.result.name, name)) return &method;
    return nullptr;
}

/// A member as the line of classes declares it; `find` gives a class's own declaration of it, or
/// null.
template <class Find>
ResolvedFeature resolved(const Line& line, const QualifierTypes& types, Find find) {
    ResolvedFeature result;
    for (auto level = line.rbegin(); level != line.rend(); ++level) {
        passToSubclass(result.qualifiers);
        const mof::Feature* const own = find(**level);
        if (own == nullptr) continue;
        if (result.origin == nullptr) result.origin = *level;
        result.declared = own;
        result.from = *level;
        if (own->defaultValue) result.defaultValue = &*own->defaultValue;
        addOwn(own->qualifiers, **level, types, result.qualifiers);
    }
    return result;
}

ResolvedFeature resolvedProperty(const Line& line, const QualifierTypes& types,
                                 const std::string& name) {
    return resolved(line, types,
                    [&](const mof::Class& level) { return namedFeature(level.properties, name); });
}

ResolvedMethod resolvedMethod(const Line& line, const QualifierTypes& types,
                              const mof::Method& nearest) {
    const std::string& name = nearest.result.name;
    ResolvedMethod result;
    result.result = resolved(line, types, [&](const mof::Class& level) -> const mof::Feature* {
        const mof::Method* const own = namedMethod(level, name);
        return own == nullptr ? nullptr : &own->result;
    });
    for (const mof::Feature& parameter : nearest.parameters) {
        const auto find = [&](const mof::Class& level) -> const mof::Feature* {
            const mof::Method* const own = namedMethod(level, name);
            return own == nullptr ? nullptr : namedFeature(own->parameters, parameter.name);
        };
        result.parameters.push_back(resolved(line, types, find));
    }
    return result;
}

}  // namespace

std::optional<ResolvedClass> resolvedClass(const Schema& schema, std::string_view className) {
    const Line line = lineOf(schema, className);
    if (line.empty()) return std::nullopt;
    const QualifierTypes& types = schema.qualifierTypes();
    ResolvedClass result;
    result.declared = line.front();
    result.superclasses.assign(line.begin() + 1, line.end());
    for (auto level = line.rbegin(); level != line.rend(); ++level) {
        passToSubclass(result.qualifiers);
        addOwn((*level)->qualifiers, **level, types, result.qualifiers);
    }
    for (const mof::Feature* property : schema.properties(line.front()->name))
        result.properties.push_back(resolvedProperty(line, types, property->name));
    std::unordered_set<std::string> seen;
    for (const mof::Class* level : line) {
        for (const mof::Method& method : level->methods) {
            if (seen.insert(base::toLower(method.result.name)).second)
                result.methods.push_back(resolvedMethod(line, types, method));
        }
    }
    return result;
}

const mof::Qualifier* findQualifier(const std::vector<ResolvedQualifier>& qualifiers,
                                    std::string_view name) {
    for (const ResolvedQualifier& qualifier : qualifiers)
        if (base::equalsIgnoreCase(qualifier.declared->name, name)) return qualifier.declared;
    return nullptr;
}

const mof::Qualifier* Schema::propertyQualifier(std::string_view className,
                                                std::string_view propertyName,
                                                std::string_view qualifierName) const {
    const ResolvedFeature property =
        resolvedProperty(lineOf(*this, className), qualifierTypes_, std::string(propertyName));
    return findQualifier(property.qualifiers, qualifierName);
}

}  // namespace cmpihost
