#ifndef COMPANION_COMPUTER_SYSTEM_H
#define COMPANION_COMPUTER_SYSTEM_H

#include <cmpi/cmpidt.h>

#include <optional>
#include <string>

/// The computer system of the host: the host itself.
namespace computersystem {

/// Its name, the framework's computer name; none: the name is not known, and no computer system is
/// served.
std::optional<std::string> name();

/// Its path or instance under that name; null when the broker makes none.
CMPIObjectPath* makePath(const CMPIBroker* broker, const std::string& nameSpace,
                         const std::string& name);
CMPIInstance* makeInstance(const CMPIBroker* broker, const std::string& nameSpace,
                           const std::string& name);

}  // namespace computersystem

#endif
