// The schema keeps classes as they are declared and walks up to superclasses when it is asked: a
// superclass may be read after its subclasses, or be declared in no file at all.
#include "host/mof/Schema.h"

#include <algorithm>
#include <fstream>
#include <iterator>
#include <stdexcept>
#include <unordered_set>

#include "base/Ascii.h"
#include "host/mof/MofParser.h"

namespace cmpihost {

namespace {

namespace fs = std::filesystem;

std::vector<fs::path> mofFiles(const fs::path& folder) {
    std::vector<fs::path> files;
    std::error_code error;
    for (fs::directory_iterator entry(folder, error), end; !error && entry != end;
         entry.increment(error)) {
        if (base::equalsIgnoreCase(entry->path().extension().string(), ".mof"))
            files.push_back(entry->path());
    }
    if (error) {
        throw std::runtime_error("the schema folder " + folder.string() +
                                 " cannot be read: " + error.message());
    }
    // Folders have an order of their own on each machine; complaints must not.
    std::sort(files.begin(), files.end());
    return files;
}

std::string contentOf(const fs::path& file) {
    // Opening a named pipe would wait for its other end.
    std::error_code error;
    const fs::file_status status = fs::status(file, error);
    if (fs::exists(status) && !fs::is_regular_file(status)) {
        throw std::runtime_error("the schema file " + file.string() + " is not a regular file");
    }
    std::ifstream stream(file, std::ios::binary);
    std::string content{std::istreambuf_iterator<char>(stream), std::istreambuf_iterator<char>()};
    if (!stream) throw std::runtime_error("the schema file " + file.string() + " cannot be read");
    return content;
}

/// In the order of mof::Type.
constexpr CMPIType elementTypes[] = {CMPI_boolean, CMPI_string, CMPI_char16, CMPI_dateTime,
                                     CMPI_uint8,   CMPI_sint8,  CMPI_uint16, CMPI_sint16,
                                     CMPI_uint32,  CMPI_sint32, CMPI_uint64, CMPI_sint64,
                                     CMPI_real32,  CMPI_real64, CMPI_ref};
static_assert(std::size(elementTypes) == static_cast<std::size_t>(mof::Type::Reference) + 1);

ClassDeclaration declarationOf(const Schema& schema, const mof::Class& source) {
    ClassDeclaration result;
    result.name = source.name;
    result.superclass = source.superclass;
    result.association = schema.isAssociation(source.name);
    for (const mof::Feature* property : schema.properties(source.name)) {
        result.properties.push_back({property->name, cmpiType(*property),
                                     schema.isKey(source.name, property->name),
                                     property->referenceClass});
    }
    return result;
}

}  // namespace

Schema Schema::load(const fs::path& folder) {
    Schema schema;
    for (const fs::path& file : mofFiles(folder)) {
        schema.add(mof::parse(contentOf(file), file.string()));
    }
    if (schema.classes_.empty()) {
        throw std::runtime_error("the schema folder " + folder.string() + " holds no MOF class");
    }
    return schema;
}

void Schema::add(const mof::Document& document) {
    for (const mof::Class& added : document.classes) {
        check(added);
        // Of the class as it is kept: value maps are found by the address of the property.
        keepValueMaps(classes_.emplace(base::toLower(added.name), added).first->second);
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
        try {
            ValueMap map = ValueMap::of(property);
            if (!map.empty()) valueMaps_.emplace(&property, std::move(map));
        } catch (const std::runtime_error& error) {
            throw mof::MofError(added.file, property.position,
                                "property '" + property.name + "': " + error.what());
        }
    }
}

const mof::Class* Schema::find(const std::string& className) const {
    const auto found = classes_.find(base::toLower(className));
    return found == classes_.end() ? nullptr : &found->second;
}

const mof::Feature* Schema::findProperty(const std::string& className,
                                         const std::string& propertyName) const {
    for (const mof::Class* level = find(className); level != nullptr;
         level = find(level->superclass)) {
        for (const mof::Feature& property : level->properties) {
            if (base::equalsIgnoreCase(property.name, propertyName)) return &property;
        }
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

bool Schema::isA(const std::string& className, const std::string& ancestor) const {
    std::string name = className;
    while (!name.empty() && !base::equalsIgnoreCase(name, ancestor)) {
        const mof::Class* level = find(name);
        name = level == nullptr ? std::string() : level->superclass;
    }
    return !name.empty();
}

bool Schema::isKey(const std::string& className, const std::string& propertyName) const {
    for (const mof::Class* level = find(className); level != nullptr;
         level = find(level->superclass)) {
        for (const mof::Feature& property : level->properties) {
            // An override need not say Key again.
            if (base::equalsIgnoreCase(property.name, propertyName) &&
                mof::isSet(property.qualifiers, "Key")) {
                return true;
            }
        }
    }
    return false;
}

bool Schema::isAssociation(const std::string& className) const {
    // The qualifier is inherited: a subclass need not say it again.
    const mof::Class* level = find(className);
    while (level != nullptr && !mof::isSet(level->qualifiers, "Association")) {
        level = find(level->superclass);
    }
    return level != nullptr;
}

const ValueMap& Schema::valueMap(const std::string& className,
                                 const std::string& propertyName) const {
    static const ValueMap none;
    const mof::Feature* property = findProperty(className, propertyName);
    const auto found = valueMaps_.find(property);
    return found == valueMaps_.end() ? none : found->second;
}

std::vector<std::string> Schema::classNames() const {
    std::vector<std::string> names;
    for (const auto& entry : classes_) names.push_back(entry.second.name);
    return names;
}

CMPIType cmpiType(const mof::Feature& property) {
    const CMPIType type = elementTypes[static_cast<std::size_t>(property.type)];
    return property.array ? static_cast<CMPIType>(type | CMPI_ARRAY) : type;
}

SchemaCatalogue::SchemaCatalogue(const Schema& schema) {
    // All at once: the broker asks again for every property that a provider sets.
    for (const std::string& name : schema.classNames()) {
        declarations_.emplace(base::toLower(name), declarationOf(schema, *schema.find(name)));
    }
}

const ClassDeclaration* SchemaCatalogue::find(std::string_view className) const {
    const auto found = declarations_.find(base::toLower(className));
    return found == declarations_.end() ? nullptr : &found->second;
}

}  // namespace cmpihost
