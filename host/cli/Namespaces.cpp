// A class may be registered several times, for each of its interfaces, and is listed once.
#include "host/cli/Namespaces.h"

#include <algorithm>
#include <map>

#include "base/Ascii.h"
#include "host/cli/Json.h"
#include "host/cli/PathParser.h"

namespace cmpihost {

namespace {

/// By their names in lower case, since letter case does not count.
using Names = std::map<std::string, std::string>;

std::vector<std::string> valuesOf(const Names& names) {
    std::vector<std::string> result;
    for (const auto& entry : names) result.push_back(entry.second);
    return result;
}

}  // namespace

std::vector<NamespaceSummary> namespaceSummaries(const Registrations& registrations) {
    Names nameSpaces = {{defaultNamespace, defaultNamespace}};
    for (const std::string& name : registrations.nameSpaces())
        nameSpaces.emplace(base::toLower(name), name);
    std::vector<NamespaceSummary> result;
    for (const std::string& name : valuesOf(nameSpaces)) {
        Names classes;
        for (const Registration& registration : registrations.all()) {
            if (registration.isFor(name))
                classes.emplace(base::toLower(registration.className), registration.className);
        }
        result.push_back({name, valuesOf(classes)});
    }
    return result;
}

void print(const std::vector<NamespaceSummary>& namespaces, const Terminal& terminal,
           std::ostream& stream) {
    std::size_t width = 0;
    for (const NamespaceSummary& each : namespaces)
        width = std::max(width, columnsOf(terminal.shown(each.name)));
    for (const NamespaceSummary& each : namespaces) {
        const std::string name = terminal.shown(each.name);
        std::string classes;
        for (const std::string& className : each.classes)
            classes += (classes.empty() ? "" : ", ") + terminal.shown(className);
        stream << name;
        if (!classes.empty()) {
            stream << std::string(width - columnsOf(name) + 2, ' ')
                   << wrap(classes, terminal.width, width + 2);
        }
        stream << '\n';
    }
}

void writeJson(const std::vector<NamespaceSummary>& namespaces, std::ostream& stream) {
    JsonValue list = JsonValue::array();
    for (const NamespaceSummary& each : namespaces)
        list.push_back({{"namespace", each.name}, {"classes", each.classes}});
    writeJson(list, stream);
}

}  // namespace cmpihost
