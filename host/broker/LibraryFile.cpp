// The dynamic loader tells little about a file that is no library, and maps one that is cut off, so
// that its first use ends the process: files are examined before.
#include "host/broker/LibraryFile.h"

#include <dlfcn.h>
#include <link.h>

#include <cerrno>
#include <cstdint>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <system_error>

namespace cmpihost {

namespace {

namespace fs = std::filesystem;

constexpr bool is64Bit = sizeof(void*) == 8;
constexpr int ownClass = is64Bit ? ELFCLASS64 : ELFCLASS32;

/// The front of the header, which is the same in both word sizes.
struct ElfStart {
    unsigned char ident[EI_NIDENT];
    Elf32_Half type;
    Elf32_Half machine;
};

/// Fills `value` from that place of the file; false when the file ends before.
template <class Record>
bool readAt(std::istream& stream, std::uint64_t offset, Record& value) {
    stream.clear();
    stream.seekg(static_cast<std::streamoff>(offset));
    stream.read(reinterpret_cast<char*>(&value), sizeof value);
    return stream.gcount() == sizeof value;
}

bool liesWithin(std::uint64_t offset, std::uint64_t size, std::uint64_t fileSize) {
    return size <= fileSize && offset <= fileSize - size;
}

/// Whether the file has every byte that the loader maps. Touching one that it lacks ends a process.
bool isWhole(std::istream& stream, std::uint64_t fileSize) {
    ElfW(Ehdr) header{};
    if (!readAt(stream, 0, header)) return false;
    for (std::uint64_t index = 0; index < header.e_phnum; ++index) {
        ElfW(Phdr) segment{};
        const std::uint64_t offset = header.e_phoff + index * sizeof segment;
        if (!readAt(stream, offset, segment)) return false;
        if (segment.p_type == PT_LOAD &&
            !liesWithin(segment.p_offset, segment.p_filesz, fileSize)) {
            return false;
        }
    }
    return true;
}

void examine(const std::string& file) {
    // A name without folder is searched by the loader.
    if (file.find('/') == std::string::npos) return;

    // Opening a named pipe would wait for its other end.
    std::error_code error;
    const fs::file_status status = fs::status(file, error);
    if (fs::exists(status) && !fs::is_regular_file(status)) {
        throw LoadError(file + ": " + "not a regular file");
    }
    std::ifstream stream(file, std::ios::binary);
    if (!stream) {
        const std::error_code reason(errno, std::generic_category());
        throw LoadError(file + ": " + reason.message());
    }
    ElfStart start{};
    const bool isElf = readAt(stream, 0, start) && std::memcmp(start.ident, ELFMAG, SELFMAG) == 0 &&
                       start.type == ET_DYN;
    if (!isElf) throw LoadError(file + ": " + "not a shared library");
    if (start.ident[EI_CLASS] != ownClass) {
        throw LoadError(file + ": " + std::string("a ") + (is64Bit ? "32" : "64") +
                        "-bit library, this host is " + (is64Bit ? "64" : "32") + "-bit");
    }
    const std::uintmax_t size = fs::file_size(file, error);
    if (error || !isWhole(stream, size)) throw LoadError(file + ": " + "the file is cut off");
}

}  // namespace

void CloseLibrary::operator()(void* handle) const noexcept {
    dlclose(handle);
}

LibraryHandle openLibrary(const std::string& file, bool global) {
    examine(file);
    LibraryHandle handle(dlopen(file.c_str(), RTLD_NOW | (global ? RTLD_GLOBAL : RTLD_LOCAL)));
    if (handle == nullptr) {
        const char* const reason = dlerror();
        const std::string text = reason == nullptr ? "unknown reason" : reason;
        // The loader starts with the file's own name where the file itself is at fault.
        const bool named = text.rfind(file + ": ", 0) == 0;
        throw LoadError(named ? text : file + ": " + text);
    }
    return handle;
}

}  // namespace cmpihost
