// Everything is found relative to the program, so that a build tree, an installation under any
// prefix and an unpacked package all work without configuration.
#include "host/cli/InstallPaths.h"

#include <algorithm>
#include <string>

namespace cmpihost {

namespace fs = std::filesystem;

namespace {

/// In the order of Library.
constexpr const char* fileNames[] = {"libkorzbosstatusprofileprovider.so",
                                     "libkorvaosstatusfacade.so",
                                     "libkorvacomputersystemprovider.so"};

std::string fileName(Library library) {
    return fileNames[static_cast<std::size_t>(library)];
}

/// The folders that object managers load providers from, below a prefix: the one that the providers
/// are installed in, then the usual ones.
std::vector<fs::path> cmpiFolders(const fs::path& installed) {
    std::vector<fs::path> folders = {installed};
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

fs::path installedProviderFolder() {
    return KORVA_CMPI_FOLDER;
}

std::vector<fs::path> candidates(Library library, const fs::path& programFolder,
                                 const fs::path& installed) {
    const std::string name = fileName(library);
    const std::string soname = name + ".1";
    const fs::path prefix = programFolder.parent_path();
    // A library beside the program belongs to it, so it goes before whatever is installed. An
    // absolute folder of providers takes the place of the prefix.
    std::vector<fs::path> result = {prefix / "lib" / soname, programFolder / soname};
    for (const fs::path& folder : cmpiFolders(installed)) {
        for (const std::string& file : {name, soname}) {
            fs::path candidate = prefix / folder / file;
            if (std::find(result.begin(), result.end(), candidate) == result.end()) {
                result.push_back(std::move(candidate));
            }
        }
    }
    return result;
}

fs::path findLibrary(Library library, const fs::path& programFolder, const fs::path& installed) {
    for (const fs::path& candidate : candidates(library, programFolder, installed)) {
        std::error_code error;
        if (fs::is_regular_file(candidate, error)) return candidate;
    }
    return {};
}

std::string providerName(const fs::path& file) {
    // By the beginning of the file's name: with or without a version behind it.
    const bool facade = file.filename().string().rfind(fileName(Library::Facade), 0) == 0;
    return facade ? "OSStatusFacade" : "OperatingSystemProvider";
}

}  // namespace cmpihost
