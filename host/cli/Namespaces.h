#ifndef HOST_CLI_NAMESPACES_H
#define HOST_CLI_NAMESPACES_H

#include <ostream>
#include <string>
#include <vector>

#include "host/broker/Registrations.h"
#include "host/cli/Terminal.h"

namespace cmpihost {

/// A namespace with the classes that providers are registered for in it.
struct NamespaceSummary {
    std::string name;
    /// In alphabetical order.
    std::vector<std::string> classes;
};

/// The namespaces that the registrations name, and the one that is asked where a path names none,
/// in alphabetical order.
std::vector<NamespaceSummary> namespaceSummaries(const Registrations& registrations);

/// For people: a line for each namespace, its name and its classes, wrapped at the terminal's
/// width.
void print(const std::vector<NamespaceSummary>& namespaces, const Terminal& terminal,
           std::ostream& stream);

/// As one JSON array.
void writeJson(const std::vector<NamespaceSummary>& namespaces, std::ostream& stream);

}  // namespace cmpihost

#endif
