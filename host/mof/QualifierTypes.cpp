// A schema of one's own seldom declares the qualifiers that it uses: those of the standard are
// known to every object manager, and so they are here.
#include "host/mof/QualifierTypes.h"

#include <algorithm>
#include <iterator>

#include "base/Ascii.h"

namespace cmpihost {

namespace {

struct StandardRow {
    const char* name;
    Inheritance inheritance;
};

constexpr Inheritance restricted{false, true};
constexpr Inheritance fixed{true, false};

/// The qualifiers of DSP0004 that differ from the others, which are inherited and may be
/// overridden.
constexpr StandardRow standard[] = {
    {"Abstract", restricted},
    {"Aggregate", fixed},
    {"Aggregation", fixed},
    {"ArrayType", fixed},
    {"Association", fixed},
    {"Composition", fixed},
    {"Deprecated", restricted},
    {"DN", fixed},
    {"EmbeddedObject", fixed},
    {"Exception", fixed},
    {"Experimental", restricted},
    {"In", fixed},
    {"Indication", fixed},
    {"Key", fixed},
    {"OctetString", fixed},
    {"Out", fixed},
    {"Override", restricted},
    {"Propagated", fixed},
    {"Required", fixed},
    {"Revision", restricted},
    {"Static", fixed},
    {"Terminal", restricted},
    {"Version", restricted},
    {"Weak", fixed},
};

constexpr const char* translatable[] = {"Alias",    "BitValues", "Description", "DisplayName",
                                        "Revision", "Units",     "Values",      "Version"};

Inheritance standardInheritance(const std::string& name) {
    for (const StandardRow& row : standard)
        if (base::equalsIgnoreCase(row.name, name)) return row.inheritance;
    return {};
}

Inheritance with(const mof::Flavor& told, Inheritance otherwise) {
    return {told.toSubclass.value_or(otherwise.toSubclass),
            told.overridable.value_or(otherwise.overridable)};
}

}  // namespace

void QualifierTypes::add(const mof::QualifierType& added) {
    const auto [place, isNew] = declared_.emplace(base::toLower(added.name), added);
    const mof::QualifierType& earlier = place->second;
    // Schemas that are read together may each bring the declarations along.
    if (isNew || (earlier.type == added.type && earlier.array == added.array &&
                  earlier.flavor == added.flavor)) {
        return;
    }
    throw mof::MofError(added.file, added.position,
                        "qualifier '" + added.name + "' is declared otherwise than at " +
                            earlier.file + ":" + std::to_string(earlier.position.line));
}

const mof::QualifierType* QualifierTypes::find(const std::string& name) const {
    const auto found = declared_.find(base::toLower(name));
    return found == declared_.end() ? nullptr : &found->second;
}

std::vector<const mof::QualifierType*> QualifierTypes::all() const {
    std::vector<const mof::QualifierType*> result;
    for (const auto& entry : declared_) result.push_back(&entry.second);
    return result;
}

Inheritance QualifierTypes::inheritanceOf(const mof::Qualifier& qualifier) const {
    const mof::QualifierType* const type = find(qualifier.name);
    // A declaration that tells no flavor has that of the standard's default.
    const Inheritance known =
        type == nullptr ? standardInheritance(qualifier.name) : with(type->flavor, {});
    return with(qualifier.flavor, known);
}

bool QualifierTypes::isTranslatable(const mof::Qualifier& qualifier) const {
    if (qualifier.flavor.translatable) return true;
    if (const mof::QualifierType* const type = find(qualifier.name))
        return type->flavor.translatable;
    return std::any_of(std::begin(translatable), std::end(translatable), [&](const char* name) {
        return base::equalsIgnoreCase(name, qualifier.name);
    });
}

}  // namespace cmpihost
