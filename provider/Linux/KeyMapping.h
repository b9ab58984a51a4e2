#ifndef PROVIDER_LINUX_KEY_MAPPING_H
#define PROVIDER_LINUX_KEY_MAPPING_H

#include <initializer_list>
#include <string>

#include "Moniker.h"

namespace VA::OSStatusProvider {

/// The value of the first key, in the moniker's order, that bears one of `names`, letter for
/// letter. Leaves that key selected. Throws VA::FrameworkException with the text `missing` when
/// there is none.
std::string valueOfFirst(VA::Moniker& moniker, std::initializer_list<const char*> names,
                         const char* missing);

/// A moniker with one key.
VA::Moniker monikerOf(const char* name, const std::string& value);

/// The identity of the computer system that an operating system runs on: its one key "Name" holds
/// the first of the operating system's keys "CSName" and "Name". Which of them comes first decides.
VA::Moniker computerSystemMonikerOf(VA::Moniker& monikerOS);

/// The identity of a computer system's operating system: its one key "CSName" holds the computer
/// system's "Name".
VA::Moniker operatingSystemMonikerOf(VA::Moniker& monikerComputer);

}  // namespace VA::OSStatusProvider

#endif
