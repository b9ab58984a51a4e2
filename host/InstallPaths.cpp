// Everything is found relative to the program, so that a build tree, an installation under any
// prefix and an unpacked package all work without configuration.
#include "host/InstallPaths.h"

#include <algorithm>
#include <string>

namespace cmpihost {

namespace fs = std::filesystem;

namespace {

/// The folders below a prefix that object managers load providers from.
std::vector<fs::path> cmpiFolders() {
    std::vector<fs::path> folders;
    // Distributions disagree about the folder, and a package may come from another one.
    for (const char* libraries : {KORVA_LIBRARY_FOLDER, "lib", "lib64", "lib32"}) {
        folders.push_back(fs::path(libraries) / "cmpi");
    }
    return folders;
}

}  // namespace

fs::path programFolder(const std::string& invokedAs, const fs::path& ownFile) {
    std::error_code error;
    fs::path file = fs::read_symlink(ownFile, error);
    if (!error) return file.parent_path();
    const bool bare = invokedAs.find('/') == std::string::npos;
    file = bare ? fs::path() : fs::canonical(invokedAs, error);
    return file.empty() ? fs::path(KORVA_PROGRAM_FOLDER) : file.parent_path();
}

fs::path schemaFolder(const fs::path& programFolder) {
    return programFolder.parent_path() / "share/korva-osstatus/schema";
}

fs::path registrationFolder(const fs::path& programFolder) {
    return programFolder.parent_path() / "share/korva-osstatus/registration";
}

fs::path installedProviderFolder() {
    return KORVA_CMPI_FOLDER;
}

std::vector<fs::path> libraryFolders(const fs::path& programFolder, const fs::path& installed) {
    const fs::path prefix = programFolder.parent_path();
    // A library beside the program belongs to it, so it goes before whatever is installed. An
    // absolute folder of providers takes the place of the prefix.
    std::vector<fs::path> result = {prefix / "lib", programFolder, prefix / installed};
    for (const fs::path& root : {prefix, fs::path("/usr"), fs::path("/usr/local")}) {
        for (const fs::path& folder : cmpiFolders()) {
            fs::path candidate = root / folder;
            if (std::find(result.begin(), result.end(), candidate) == result.end())
                result.push_back(std::move(candidate));
        }
    }
    return result;
}

}  // namespace cmpihost
