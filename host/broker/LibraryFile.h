// What a file is before the dynamic loader sees it. Internal.
#pragma once

#include "host/broker/ProviderLibrary.h"

#include <optional>
#include <string>

namespace cmpihost {

struct FileProblem {
    LoadProblem problem;
    std::string text;
};

/// Why a file cannot be a library of this process; none: the loader may try.
std::optional<FileProblem> examineLibraryFile(const std::string& file);

}  // namespace cmpihost
