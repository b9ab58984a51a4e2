#include "host/Places.h"

#include <algorithm>
#include <string>

namespace cmpihost {

namespace fs = std::filesystem;

namespace {

constexpr const char* providerName = "libkorzbosstatusprofileprovider.so";
constexpr const char* companionName = "libkorvacomputersystemprovider.so";

std::vector<fs::path> candidatesFor(const std::string& name, const fs::path& programFolder) {
    const std::string soname = name + ".1";
    const fs::path prefix = programFolder.parent_path();
    std::vector<fs::path> candidates = {prefix / "lib" / soname, programFolder / soname};
    for (const char* libraries : {KORVA_LIBRARY_FOLDER, "lib", "lib64", "lib32"}) {
        for (const std::string& file : {name, soname}) {
            fs::path candidate = prefix / libraries / "cmpi" / file;
            if (std::find(candidates.begin(), candidates.end(), candidate) == candidates.end()) {
                candidates.push_back(std::move(candidate));
            }
        }
    }
    return candidates;
}

fs::path firstFile(const std::vector<fs::path>& candidates) {
    for (const fs::path& candidate : candidates) {
        std::error_code error;
        if (fs::is_regular_file(candidate, error)) {
            return candidate;
        }
    }
    return {};
}

}  // namespace

fs::path programFolder(const std::string& invokedAs, const fs::path& ownFile) {
    std::error_code error;
    fs::path file = fs::read_symlink(ownFile, error);
    if (!error) {
        return file.parent_path();
    }
    const bool bare = invokedAs.find('/') == std::string::npos;
    file = bare ? fs::path() : fs::canonical(invokedAs, error);
    return file.empty() ? fs::path(KORVA_PROGRAM_FOLDER) : file.parent_path();
}

fs::path schemaFolder(const fs::path& programFolder) {
    return programFolder.parent_path() / "share/korva-osstatus/schema";
}

std::vector<fs::path> providerCandidates(const fs::path& programFolder) {
    return candidatesFor(providerName, programFolder);
}

fs::path findProvider(const fs::path& programFolder) {
    return firstFile(providerCandidates(programFolder));
}

fs::path findCompanion(const fs::path& programFolder) {
    return firstFile(candidatesFor(companionName, programFolder));
}

}  // namespace cmpihost
