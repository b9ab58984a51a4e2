// The format is that of sfcb: sections of `[Class]` with `name: value` lines below. A mistake that
// an object manager would stumble over is an error here, told with its line.
#include "host/broker/Registrations.h"

#include "base/Ascii.h"

#include <algorithm>
#include <fstream>
#include <iterator>
#include <sstream>

namespace cmpihost {

namespace {

namespace fs = std::filesystem;

constexpr const char* blanks = " \t\r";

std::string trimmed(const std::string& text) {
    const std::size_t start = text.find_first_not_of(blanks);
    if (start == std::string::npos) return {};
    return text.substr(start, text.find_last_not_of(blanks) - start + 1);
}

std::vector<std::string> words(const std::string& text) {
    std::istringstream stream(text);
    return {std::istream_iterator<std::string>(stream), {}};
}

bool same(const std::string& left, const std::string& right) {
    return base::equalsIgnoreCase(left, right);
}

std::string place(const fs::path& file, std::size_t line) {
    return file.string() + ":" + std::to_string(line);
}

/// Reads one text line by line.
class SectionReader {
  public:
    explicit SectionReader(fs::path file) : file_(std::move(file)) {}

    std::vector<Registration> read(const std::string& text) {
        std::istringstream stream(text);
        for (std::string line; std::getline(stream, line);) {
            ++line_;
            const std::string content = trimmed(line);
            if (content.empty() || content.front() == '#') continue;
            if (content.front() == '[') {
                begin(content);
            } else {
                readEntry(content);
            }
        }
        if (!sections_.empty()) expectComplete(sections_.back());
        return std::move(sections_);
    }

  private:
    [[noreturn]] void refuse(const std::string& why) const {
        throw RegistrationError(place(file_, line_) + ": " + why);
    }

    void begin(const std::string& heading) {
        if (!sections_.empty()) expectComplete(sections_.back());
        const std::size_t end = heading.find(']');
        const std::string name = trimmed(heading.substr(1, end - 1));
        if (end != heading.size() - 1 || name.empty()) {
            refuse("expected [CLASS], found " + heading);
        }
        sections_.emplace_back();
        sections_.back().className = name;
        sections_.back().file = file_;
        sections_.back().line = line_;
        entries_.clear();
    }

    void readEntry(const std::string& content) {
        const std::size_t colon = content.find(':');
        if (colon == std::string::npos) refuse("expected NAME: VALUE, found " + content);
        const std::string name = base::toLower(trimmed(content.substr(0, colon)));
        const std::string value = trimmed(content.substr(colon + 1));
        if (sections_.empty()) refuse(name + " stands before the first [CLASS]");
        if (std::find(entries_.begin(), entries_.end(), name) != entries_.end()) {
            refuse(name + " stands twice");
        }
        entries_.push_back(name);
        if (value.empty()) refuse(name + " has no value");
        set(sections_.back(), name, value);
    }

    void set(Registration& section, const std::string& name, const std::string& value) {
        if (name == "provider") {
            section.provider = value;
        } else if (name == "location") {
            section.location = value;
        } else if (name == "type") {
            section.types = readTypes(value);
        } else if (name == "namespace") {
            section.nameSpaces = words(value);
        } else if (name == "parameters") {
            section.parameters = value;
        } else if (name != "user" && name != "group" && name != "unload") {
            // Those three say how an object manager runs its processes; here there is but one.
            refuse("there is no entry '" + name +
                   "'; known are provider, location, type, namespace, parameters, user, group and "
                   "unload");
        }
    }

    /// The types that this host does not drive are known, and left aside.
    std::vector<Interface> readTypes(const std::string& value) const {
        std::vector<Interface> types;
        for (const std::string& word : words(value)) {
            const auto* const found =
                std::find_if(std::begin(allInterfaces), std::end(allInterfaces),
                             [&](Interface which) { return same(word, interfaceName(which)); });
            if (found != std::end(allInterfaces)) {
                types.push_back(*found);
            } else if (!same(word, "indication") && !same(word, "class") &&
                       !same(word, "qualifier")) {
                refuse("there is no type '" + word +
                       "'; known are instance, association, method, property, indication, class "
                       "and qualifier");
            }
        }
        return types;
    }

    void expectComplete(const Registration& section) const {
        for (const char* name : {"provider", "location", "type", "namespace"}) {
            if (std::find(entries_.begin(), entries_.end(), name) != entries_.end()) continue;
            throw RegistrationError(place(file_, section.line) + ": [" + section.className +
                                    "] has no " + name);
        }
    }

    fs::path file_;
    std::size_t line_ = 0;
    std::vector<Registration> sections_;
    /// The entries of the last section so far.
    std::vector<std::string> entries_;
};

std::vector<fs::path> registrationFiles(const fs::path& path) {
    std::error_code error;
    if (!fs::is_directory(path, error)) return {path};
    std::vector<fs::path> files;
    for (fs::directory_iterator entry(path, error), end; !error && entry != end;
         entry.increment(error)) {
        if (entry->path().extension() == ".reg") files.push_back(entry->path());
    }
    if (error) {
        throw std::runtime_error("the folder " + path.string() +
                                 " of registrations cannot be read: " + error.message());
    }
    // Folders have an order of their own on each machine; complaints must not.
    std::sort(files.begin(), files.end());
    return files;
}

std::string contentOf(const fs::path& file) {
    std::error_code error;
    // Opening a named pipe would wait for its other end.
    const bool regular = fs::is_regular_file(file, error);
    std::ifstream stream(file, std::ios::binary);
    std::string content;
    if (regular) content.assign(std::istreambuf_iterator<char>(stream), {});
    if (!regular || !stream) {
        throw std::runtime_error("the registration file " + file.string() + " cannot be read" +
                                 (error ? ": " + error.message() : ""));
    }
    return content;
}

bool sharesNamespace(const Registration& left, const Registration& right) {
    return std::any_of(left.nameSpaces.begin(), left.nameSpaces.end(), [&](const auto& one) {
        return std::any_of(right.nameSpaces.begin(), right.nameSpaces.end(),
                           [&](const auto& other) { return same(one, other); });
    });
}

/// Whether both register the class for the same interface in a namespace that both name.
bool collide(const Registration& left, const Registration& right) {
    const bool sharesType = std::any_of(left.types.begin(), left.types.end(), [&](Interface type) {
        return std::find(right.types.begin(), right.types.end(), type) != right.types.end();
    });
    return same(left.className, right.className) && sharesType && sharesNamespace(left, right);
}

}  // namespace

bool Registration::isFor(const std::string& nameSpace) const {
    return std::any_of(nameSpaces.begin(), nameSpaces.end(),
                       [&](const auto& each) { return each == "*" || same(each, nameSpace); });
}

bool Registration::serves(Interface type, const std::string& nameSpace) const {
    return std::find(types.begin(), types.end(), type) != types.end() && isFor(nameSpace);
}

Registrations Registrations::read(const std::vector<fs::path>& paths) {
    Registrations result;
    for (const fs::path& path : paths) {
        for (const fs::path& file : registrationFiles(path)) result.add(contentOf(file), file);
    }
    return result;
}

void Registrations::add(const std::string& text, const fs::path& file) {
    for (Registration& section : SectionReader(file).read(text)) addSection(std::move(section));
}

void Registrations::addSection(Registration section) {
    for (const Registration& known : sections_) {
        // The same file may be reached by two ways.
        const bool sameProvider =
            known.provider == section.provider && known.location == section.location;
        if (sameProvider || !collide(known, section)) continue;
        throw RegistrationError(place(section.file, section.line) + ": [" + section.className +
                                "] is registered already, at " + place(known.file, known.line) +
                                ", for the provider " + known.provider);
    }
    sections_.push_back(std::move(section));
}

const Registration* Registrations::find(const std::string& className, const std::string& nameSpace,
                                        Interface type) const {
    const auto found =
        std::find_if(sections_.begin(), sections_.end(), [&](const Registration& section) {
            return same(section.className, className) && section.serves(type, nameSpace);
        });
    return found == sections_.end() ? nullptr : &*found;
}

bool Registrations::names(const std::string& nameSpace) const {
    return std::any_of(sections_.begin(), sections_.end(),
                       [&](const Registration& section) { return section.isFor(nameSpace); });
}

std::vector<std::string> Registrations::nameSpaces() const {
    std::vector<std::string> result;
    for (const Registration& section : sections_) {
        for (const std::string& each : section.nameSpaces) {
            const auto isKnown = [&](const std::string& known) { return same(known, each); };
            if (each != "*" && std::none_of(result.begin(), result.end(), isKnown))
                result.push_back(each);
        }
    }
    return result;
}

}  // namespace cmpihost
