#include "host/cli/Serve.h"

#include <unistd.h>

#include <cerrno>
#include <cstring>

#include "base/Utf8.h"
#include "host/cli/Diagnostics.h"

namespace cmpihost {

ExitStatus becomeServer(const std::vector<std::string>& arguments,
                        const std::filesystem::path& programFolder, std::ostream& err) {
    std::string file = programFolder / "cmpihost-serve";
    std::vector<std::string> words = arguments;
    std::vector<char*> pointers = {file.data()};
    for (std::string& word : words) pointers.push_back(word.data());
    pointers.push_back(nullptr);
    execv(file.c_str(), pointers.data());
    const int error = errno;
    const std::string why = error == ENOENT
                                ? " is not there; it is a 64-bit program, which the package "
                                  "korva-osstatus-server brings"
                                : std::string(": ") + std::strerror(error);
    err << messageLines(base::escapeForTerminal(file) + why);
    return exitNotLoaded;
}

}  // namespace cmpihost
