#include "host/Places.h"

#include <algorithm>

namespace cmpihost {

namespace fs = std::filesystem;

namespace {

constexpr const char* providerName = "libkorzbosstatusprofileprovider.so";
constexpr const char* providerSoname = "libkorzbosstatusprofileprovider.so.1";

}  // namespace

fs::path programFolder() {
    return fs::read_symlink("/proc/self/exe").parent_path();
}

fs::path schemaFolder(const fs::path& programFolder) {
    return programFolder.parent_path() / "share/korva-osstatus/schema";
}

std::vector<fs::path> providerCandidates(const fs::path& programFolder) {
    const fs::path prefix = programFolder.parent_path();
    std::vector<fs::path> candidates = {prefix / "lib" / providerSoname,
                                        programFolder / providerSoname};
    for (const char* libraries : {KORVA_LIBRARY_FOLDER, "lib", "lib64", "lib32"}) {
        for (const char* name : {providerName, providerSoname}) {
            fs::path candidate = prefix / libraries / "cmpi" / name;
            if (std::find(candidates.begin(), candidates.end(), candidate) == candidates.end()) {
                candidates.push_back(std::move(candidate));
            }
        }
    }
    return candidates;
}

fs::path findProvider(const fs::path& programFolder) {
    for (const fs::path& candidate : providerCandidates(programFolder)) {
        std::error_code error;
        if (fs::is_regular_file(candidate, error)) {
            return candidate;
        }
    }
    return {};
}

}  // namespace cmpihost
