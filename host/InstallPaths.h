#ifndef HOST_INSTALL_PATHS_H
#define HOST_INSTALL_PATHS_H

#include <filesystem>
#include <string>
#include <vector>

namespace cmpihost {

/// The folder that the running program's file is in. Where the system does not know it (ownFile, a
/// link to that file, cannot be read), the folder of invokedAs, the name that the program was
/// called by; where that is a bare name, the folder that the program is made to be installed in.
std::filesystem::path programFolder(const std::string& invokedAs,
                                    const std::filesystem::path& ownFile = "/proc/self/exe");

/// The folder of the MOF files that belongs to a program in that folder.
std::filesystem::path schemaFolder(const std::filesystem::path& programFolder);

/// The folder of the registration files that belongs to it.
std::filesystem::path registrationFolder(const std::filesystem::path& programFolder);

/// The folder that the providers are installed in: below the prefix, or absolute.
std::filesystem::path installedProviderFolder();

/// Where the libraries of providers can be for a program in that folder, best place first: the
/// library folder beside it, the folder itself, the folder that the providers are installed in
/// (below the folder that holds the program's, or absolute), the folders that object managers
/// usually load providers from, below that folder and in the system.
std::vector<std::filesystem::path> libraryFolders(
    const std::filesystem::path& programFolder,
    const std::filesystem::path& installed = installedProviderFolder());

}  // namespace cmpihost

#endif
