#ifndef COMPANION_COMPUTER_SYSTEM_H
#define COMPANION_COMPUTER_SYSTEM_H

#include <cmpi/cmpidt.h>

#include <string>
#include <vector>

/// The computer systems of the host: one, the host itself.
namespace computersystem {

/// The names of the computer systems. The first is the framework's computer name; without one there
/// is none. For demonstrations the environment variable KORVA_COMPUTER_SYSTEMS, a number up to
/// 1000, makes it none or several: host, host-2, host-3 …; any other text is as if it were not set.
std::vector<std::string> names();

/// The path or the instance of the computer system of that name; null when the broker makes none.
CMPIObjectPath* makePath(const CMPIBroker* broker, const std::string& nameSpace,
                         const std::string& name);
CMPIInstance* makeInstance(const CMPIBroker* broker, const std::string& nameSpace,
                           const std::string& name);

}  // namespace computersystem

#endif
