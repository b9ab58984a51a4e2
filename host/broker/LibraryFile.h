#ifndef HOST_BROKER_LIBRARY_FILE_H
#define HOST_BROKER_LIBRARY_FILE_H

#include "host/broker/ProviderLibrary.h"

#include <memory>
#include <string>

/// The file of a library and its handle. Internal.
namespace cmpihost {

struct CloseLibrary {
    void operator()(void* handle) const noexcept;
};
using LibraryHandle = std::unique_ptr<void, CloseLibrary>;

/// Opens a library, with its symbols in the global scope or not. Throws LoadError. A file that is
/// none for this process is recognised before the loader touches it.
LibraryHandle openLibrary(const std::string& file, bool global);

}  // namespace cmpihost

#endif
