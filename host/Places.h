#pragma once

#include <filesystem>
#include <vector>

namespace cmpihost {

/// The folder that the running program's file is in. Throws std::system_error when the system does
/// not tell it.
std::filesystem::path programFolder();

/// The folder of the MOF files that belongs to a program in that folder.
std::filesystem::path schemaFolder(const std::filesystem::path& programFolder);

/// Where the provider's library can be for a program in that folder, best place first: the library
/// folder beside it, the folder itself, the folders that object managers load providers from.
std::vector<std::filesystem::path> providerCandidates(const std::filesystem::path& programFolder);

/// The first candidate that exists; empty when none does.
std::filesystem::path findProvider(const std::filesystem::path& programFolder);

/// The library of the computer system's provider, looked for in the same places; empty when there
/// is none.
std::filesystem::path findCompanion(const std::filesystem::path& programFolder);

}  // namespace cmpihost
