// How well a management interface behaves on load. Internal.
#pragma once

#include <cmpi/cmpift.h>

#include <string>
#include <vector>

namespace cmpihost {

/// One line for each thing that a real object manager might not forgive; the table is there.
std::vector<std::string> badManners(const CMPIInstanceMIFT& table);
std::vector<std::string> badManners(const CMPIAssociationMIFT& table);

}  // namespace cmpihost
