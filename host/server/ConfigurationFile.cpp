#include "host/server/ConfigurationFile.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <cstring>
#include <stdexcept>

#include "base/FileDescriptor.h"

namespace cmpihost::server {

namespace {

constexpr std::size_t largestFile = 1024 * 1024;

[[noreturn]] void refuse(const std::string& path, const std::string& why) {
    throw std::runtime_error(path + ": " + why);
}

std::string readAll(const base::FileDescriptor& file, const std::string& path) {
    std::string text;
    char part[4096];
    ssize_t count = 0;
    while ((count = read(file.number(), part, sizeof part)) > 0) {
        text.append(part, static_cast<std::size_t>(count));
        if (text.size() > largestFile) refuse(path, "larger than 1 MiB");
    }
    if (count < 0) refuse(path, std::strerror(errno));
    return text;
}

}  // namespace

std::string readConfigurationFile(const std::string& path, bool isSecret) {
    const base::FileDescriptor file = base::FileDescriptor::open(path.c_str(), O_RDONLY);
    struct stat status {};
    if (!file.isOpen() || fstat(file.number(), &status) != 0) refuse(path, std::strerror(errno));
    if (!S_ISREG(status.st_mode)) refuse(path, "is no regular file");
    if (isSecret && (status.st_mode & S_IRWXO) != 0)
        refuse(path, "everybody may use this file; chmod o= takes that away");
    return readAll(file, path);
}

}  // namespace cmpihost::server
