#include "host/mof/Schema.h"

#include <algorithm>
#include <fstream>
#include <iterator>
#include <stdexcept>

#include "host/broker/Value.h"
#include "host/mof/MofParser.h"
#include "host/mof/Names.h"

namespace cmpihost {

namespace {

namespace fs = std::filesystem;

std::vector<fs::path> mofFiles(const fs::path& folder) {
    std::vector<fs::path> files;
    std::error_code error;
    for (fs::directory_iterator entry(folder, error), end; !error && entry != end;
         entry.increment(error)) {
        if (equalNames(entry->path().extension().string(), ".mof")) {
            files.push_back(entry->path());
        }
    }
    if (error) {
        throw std::runtime_error("the schema folder " + folder.string() +
                                 " cannot be read: " + error.message());
    }
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
    if (!stream) {
        throw std::runtime_error("the schema file " + file.string() + " cannot be read");
    }
    return content;
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
        keepValueMaps(classes_.emplace(lowered(added.name), added).first->second);
    }
}

void Schema::check(const mof::Class& added) const {
    if (const mof::Class* earlier = find(added.name)) {
        throw mof::MofError(added.file, added.position,
                            "class '" + added.name + "' is declared twice, first at " +
                                earlier->file + ":" + std::to_string(earlier->position.line));
    }
    if (isA(added.superclass, added.name)) {
        throw mof::MofError(added.file, added.position,
                            "class '" + added.name + "' descends from itself");
    }
}

void Schema::keepValueMaps(const mof::Class& added) {
    for (const mof::Feature& property : added.properties) {
        try {
            ValueMap map = ValueMap::of(property);
            if (!map.empty()) {
                valueMaps_.emplace(&property, std::move(map));
            }
        } catch (const std::runtime_error& error) {
            throw mof::MofError(added.file, property.position,
                                "property '" + property.name + "': " + error.what());
        }
    }
}

const mof::Class* Schema::find(const std::string& className) const {
    const auto found = classes_.find(lowered(className));
    return found == classes_.end() ? nullptr : &found->second;
}

const mof::Feature* Schema::findProperty(const std::string& className,
                                         const std::string& propertyName) const {
    for (const mof::Class* level = find(className); level != nullptr;
         level = find(level->superclass)) {
        for (const mof::Feature& property : level->properties) {
            if (equalNames(property.name, propertyName)) {
                return &property;
            }
        }
    }
    return nullptr;
}

std::vector<const mof::Feature*> Schema::properties(const std::string& className) const {
    std::vector<const mof::Feature*> result;
    NameSet seen;
    for (const mof::Class* level = find(className); level != nullptr;
         level = find(level->superclass)) {
        for (const mof::Feature& property : level->properties) {
            if (seen.add(property.name)) {
                result.push_back(&property);
            }
        }
    }
    return result;
}

bool Schema::isA(const std::string& className, const std::string& ancestor) const {
    std::string name = className;
    while (!name.empty() && !equalNames(name, ancestor)) {
        const mof::Class* level = find(name);
        name = level == nullptr ? std::string() : level->superclass;
    }
    return !name.empty();
}

bool Schema::isKey(const std::string& className, const std::string& propertyName) const {
    for (const mof::Class* level = find(className); level != nullptr;
         level = find(level->superclass)) {
        for (const mof::Feature& property : level->properties) {
            if (equalNames(property.name, propertyName) && mof::isSet(property.qualifiers, "Key")) {
                return true;
            }
        }
    }
    return false;
}

bool Schema::isAssociation(const std::string& className) const {
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
    for (const auto& entry : classes_) {
        names.push_back(entry.second.name);
    }
    return names;
}

}  // namespace cmpihost
