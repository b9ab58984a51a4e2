#include "host/broker/LibraryFile.h"

#include <elf.h>

#include <cerrno>
#include <cstring>
#include <fstream>

namespace cmpihost {

namespace {

constexpr bool is64Bit = sizeof(void*) == 8;
constexpr int ownClass = is64Bit ? ELFCLASS64 : ELFCLASS32;

/// The front of the header, which is the same in both word sizes.
struct ElfStart {
    unsigned char ident[EI_NIDENT];
    Elf32_Half type;
    Elf32_Half machine;
};

}  // namespace

std::optional<FileProblem> examineLibraryFile(const std::string& file) {
    // A name without folder is searched by the loader.
    if (file.find('/') == std::string::npos) return std::nullopt;

    std::ifstream stream(file, std::ios::binary);
    if (!stream) {
        return FileProblem{LoadProblem::FileMissing, file + ": " + std::strerror(errno)};
    }
    ElfStart start{};
    stream.read(reinterpret_cast<char*>(&start), sizeof start);
    const bool isElf = stream.gcount() == sizeof start &&
                       std::memcmp(start.ident, ELFMAG, SELFMAG) == 0 && start.type == ET_DYN;
    if (!isElf) return FileProblem{LoadProblem::NotALibrary, file + ": not a shared library"};
    if (start.ident[EI_CLASS] != ownClass) {
        return FileProblem{LoadProblem::NotALibrary, file + ": a " + (is64Bit ? "32" : "64") +
                                                         "-bit library, this host is " +
                                                         (is64Bit ? "64" : "32") + "-bit"};
    }
    return std::nullopt;
}

}  // namespace cmpihost
