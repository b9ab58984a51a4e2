// The schema keeps classes as they are declared and walks up to superclasses when it is asked: a
// superclass may be read after its subclasses, or be declared in no file at all.
#include "host/mof/Schema.h"

#include <algorithm>
#include <stdexcept>
#include <unordered_set>
#include <utility>

#include "base/Ascii.h"
#include "host/mof/SchemaFiles.h"

namespace cmpihost {

namespace {

namespace fs = std::filesystem;

const mof::Feature* ownProperty(const mof::Class& declared, std::string_view name) {
    for (const mof::Feature& property : declared.properties)
        if (base::equalsIgnoreCase(property.name, name)) return &property;
    return nullptr;
}

std::string listed(const std::vector<fs::path>& paths) {
    std::string text;
    for (const fs::path& path : paths) text += (text.empty() ? "" : ", ") + path.string();
    return text;
}

}  // namespace

Schema Schema::load(const std::vector<fs::path>& paths) {
    Schema schema;
    for (mof::Document& document : readSchemaFiles(paths)) schema.addClasses(std::move(document));
    schema.pairInheritedLists();
    if (schema.classes_.empty())
        throw std::runtime_error("the schema " + listed(paths) + " holds no MOF class");
    return schema;
}

void Schema::add(mof::Document document) {
    addClasses(std::move(document));
    pairInheritedLists();
}

void Schema::addClasses(mof::Document document) {
    for (const mof::QualifierType& type : document.qualifierTypes) qualifierTypes_.add(type);
    for (mof::Class& added : document.classes) {
        check(added);
        subclasses_[base::toLower(added.superclass)].push_back(added.name);
        std::string name = base::toLower(added.name);
        // Of the class as it is kept: value maps are found by the address of the property.
        keepValueMaps(classes_.emplace(std::move(name), std::move(added)).first->second);
    }
}

void Schema::check(const mof::Class& added) const {
    if (const mof::Class* earlier = find(added.name)) {
        throw mof::MofError(added.file, added.position,
                            "class '" + added.name + "' is declared twice, first at " +
                                earlier->file + ":" + std::to_string(earlier->position.line));
    }
    // Files may come in any order, so each class is looked at when it closes a circle.
    if (isA(added.superclass, added.name)) {
        throw mof::MofError(added.file, added.position,
                            "class '" + added.name + "' descends from itself");
    }
}

void Schema::keepValueMaps(const mof::Class& added) {
    for (const mof::Feature& property : added.properties) {
        const mof::Qualifier* const values = mof::findQualifier(property.qualifiers, "Values");
        const mof::Qualifier* const valueMap = mof::findQualifier(property.qualifiers, "ValueMap");
        keepValueMap(added, property, values, valueMap);
        if ((values == nullptr) != (valueMap == nullptr))
            withOneList_.emplace_back(&added, &property);
    }
}

void Schema::keepValueMap(const mof::Class& owner, const mof::Feature& property,
                          const mof::Qualifier* values, const mof::Qualifier* valueMap) {
    try {
        ValueMap map = ValueMap::of(property.type, values, valueMap);
        if (!map.empty()) valueMaps_[&property] = std::move(map);
    } catch (const std::runtime_error& error) {
        throw mof::MofError(owner.file, property.position,
                            "property '" + property.name + "': " + error.what());
    }
}

/// When all classes are there: superclasses may come last.
void Schema::pairInheritedLists() {
    for (const auto& [owner, property] : withOneList_) {
        const auto* const values = propertyQualifier(owner->name, property->name, "Values");
        const auto* const valueMap = propertyQualifier(owner->name, property->name, "ValueMap");
        // Lists of different length do not belong together.
        if (valueMap != nullptr && mof::texts(values).size() == mof::texts(valueMap).size())
            keepValueMap(*owner, *property, values, valueMap);
    }
}

const mof::Class* Schema::find(std::string_view className) const {
    const auto found = classes_.find(base::toLower(className));
    return found == classes_.end() ? nullptr : &found->second;
}

const mof::Feature* Schema::findProperty(std::string_view className,
                                         std::string_view propertyName) const {
    for (const mof::Class* level = find(className); level != nullptr;
         level = find(level->superclass)) {
        if (const mof::Feature* property = ownProperty(*level, propertyName)) return property;
    }
    return nullptr;
}

const mof::Method* Schema::findMethod(std::string_view className,
                                      std::string_view methodName) const {
    for (const mof::Class* level = find(className); level != nullptr;
         level = find(level->superclass)) {
        for (const mof::Method& method : level->methods)
            if (base::equalsIgnoreCase(method.result.name, methodName)) return &method;
    }
    return nullptr;
}

std::vector<const mof::Feature*> Schema::properties(const std::string& className) const {
    std::vector<const mof::Feature*> result;
    std::unordered_set<std::string> seen;
    for (const mof::Class* level = find(className); level != nullptr;
         level = find(level->superclass)) {
        for (const mof::Feature& property : level->properties) {
            // The nearest declaration counts: an override hides the inherited one.
            if (seen.insert(base::toLower(property.name)).second) result.push_back(&property);
        }
    }
    return result;
}

bool Schema::isA(std::string_view className, std::string_view ancestor) const {
    std::string_view name = className;
    while (!name.empty() && !base::equalsIgnoreCase(name, ancestor)) {
        const mof::Class* level = find(name);
        name = level == nullptr ? std::string_view() : std::string_view(level->superclass);
    }
    return !name.empty();
}

bool Schema::isKey(std::string_view className, std::string_view propertyName) const {
    for (const mof::Class* level = find(className); level != nullptr;
         level = find(level->superclass)) {
        // An override need not say Key again.
        const mof::Feature* property = ownProperty(*level, propertyName);
        if (property != nullptr && mof::isSet(property->qualifiers, "Key")) return true;
    }
    return false;
}

bool Schema::isAssociation(std::string_view className) const {
    // The qualifier is inherited: a subclass need not say it again.
    const mof::Class* level = find(className);
    while (level != nullptr && !mof::isSet(level->qualifiers, "Association")) {
        level = find(level->superclass);
    }
    return level != nullptr;
}

const ValueMap& Schema::valueMap(std::string_view className, std::string_view propertyName) const {
    static const ValueMap none;
    for (const mof::Class* level = find(className); level != nullptr;
         level = find(level->superclass)) {
        const auto found = valueMaps_.find(ownProperty(*level, propertyName));
        if (found != valueMaps_.end()) return found->second;
    }
    return none;
}

std::vector<std::string> Schema::classNames() const {
    std::vector<std::string> names;
    for (const auto& entry : classes_) names.push_back(entry.second.name);
    return names;
}

std::vector<std::string> Schema::subclasses(std::string_view className, bool anyDegree) const {
    std::vector<std::string> names;
    const auto append = [&](std::string_view name) {
        const auto found = subclasses_.find(base::toLower(name));
        if (found != subclasses_.end())
            names.insert(names.end(), found->second.begin(), found->second.end());
    };
    append(className);
    for (std::size_t index = 0; anyDegree && index < names.size(); ++index)
        append(std::string(names[index]));
    std::sort(names.begin(), names.end(), [](const std::string& left, const std::string& right) {
        return base::toLower(left) < base::toLower(right);
    });
    return names;
}

}  // namespace cmpihost
