// Files fail here rather than on a file system of the test's: only so a file can vanish between a
// look and the opening of it, or a read be interrupted.
#include "faults/FileFaults.h"

#include <dirent.h>
#include <dlfcn.h>
#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <cstdarg>
#include <cstring>
#include <map>
#include <optional>

namespace {

using fileFaults::Fault;

enum Call : unsigned { Open = 1, Read = 2, OpenFolder = 4, ReadFolder = 8, Dates = 16 };

unsigned callsOf(Fault fault) {
    switch (fault) {
        case Fault::Missing:
        case Fault::Denied:
            return Open | OpenFolder | Dates;
        case Fault::Gone:
            return Open;
        case Fault::Error:
            return Read | ReadFolder;
        case Fault::Interrupted:
            return Open | Read;
        default:
            return Read;
    }
}

struct State {
    Fault fault{};
    unsigned n = 0;
    std::string root;
    unsigned seen = 0;
    std::string met = "(none)";
    std::map<int, std::string> files;
    std::map<const DIR*, std::string> folders;
    std::optional<int> damaged;  // the descriptor that bytes were changed or cut short for
};

State state;
bool armed = false;

std::optional<std::string> belowRoot(const char* path) {
    if (!armed || std::strncmp(path, state.root.c_str(), state.root.size()) != 0)
        return std::nullopt;
    const std::string rest = path + state.root.size();
    if (!rest.empty() && rest.front() != '/') return std::nullopt;
    return rest.empty() ? rest : rest.substr(1);
}

// Counts a call that the fault can befall; true when it is the one.
bool isMet(Call call, const std::string& path) {
    if ((callsOf(state.fault) & call) == 0 || ++state.seen != state.n) return false;
    state.met = path;
    return true;
}

template <class Key>
const std::string* tracked(const std::map<Key, std::string>& all, Key key) {
    if (!armed) return nullptr;
    const auto found = all.find(key);
    return found == all.end() ? nullptr : &found->second;
}

// The function that this program's stands before.
template <class Function>
Function next(const char* name) {
    return reinterpret_cast<Function>(::dlsym(RTLD_NEXT, name));
}

int refusal() {
    if (state.fault == Fault::Interrupted) return EINTR;
    return state.fault == Fault::Denied ? EACCES : ENOENT;
}

ssize_t damaged(int file, char* bytes, ssize_t count) {
    if (state.fault != Fault::Piecemeal) state.damaged = file;
    if (state.fault == Fault::Garbage) {
        std::memset(bytes, 0xfe, static_cast<std::size_t>(count));
        return count;
    }
    // The bytes after the first are not read, or are lost.
    if (state.fault == Fault::Piecemeal) ::lseek(file, 1 - count, SEEK_CUR);
    return 1;
}

}  // namespace

namespace fileFaults {

void meet(Fault fault, unsigned n, const std::string& root) {
    state = State{};
    state.fault = fault;
    state.n = n;
    state.root = root;
    armed = true;
}

std::string release() {
    armed = false;
    return state.met;
}

}  // namespace fileFaults

// The headers give these the names that the libraries call them by.

extern "C" {

[[gnu::visibility("default")]] int open(const char* path, int flags, ...) {
    mode_t mode = 0;
    if ((flags & O_CREAT) != 0) {
        std::va_list arguments;
        va_start(arguments, flags);
        mode = va_arg(arguments, mode_t);
        va_end(arguments);
    }
    static const auto real = next<int (*)(const char*, int, ...)>("open64");
    const auto relative = belowRoot(path);
    if (relative && isMet(Open, *relative)) {
        if (state.fault != Fault::Gone) {
            errno = refusal();
            return -1;
        }
        ::unlink(path);
    }
    const int file = real(path, flags, mode);
    if (relative && file >= 0) state.files[file] = *relative;
    if (state.damaged == file) state.damaged = std::nullopt;
    return file;
}

[[gnu::visibility("default")]] ssize_t read(int file, void* bytes, size_t size) {
    static const auto real = next<ssize_t (*)(int, void*, size_t)>("read");
    const std::string* const path = tracked(state.files, file);
    if (path == nullptr) return real(file, bytes, size);
    const bool goesOn = state.damaged == file;
    if (goesOn && state.fault == Fault::CutShort) return 0;
    if (state.fault == Fault::Error || state.fault == Fault::Interrupted) {
        if (!isMet(Read, *path)) return real(file, bytes, size);
        errno = state.fault == Fault::Error ? EIO : EINTR;
        return -1;
    }
    const ssize_t count = real(file, bytes, size);
    if (count <= 0 || (!goesOn && !isMet(Read, *path))) return count;
    return damaged(file, static_cast<char*>(bytes), count);
}

[[gnu::visibility("default")]] DIR* opendir(const char* path) {
    static const auto real = next<DIR* (*)(const char*)>("opendir");
    const auto relative = belowRoot(path);
    if (relative && isMet(OpenFolder, *relative)) {
        errno = refusal();
        return nullptr;
    }
    DIR* const folder = real(path);
    if (relative && folder != nullptr) state.folders[folder] = *relative;
    return folder;
}

[[gnu::visibility("default")]] dirent* readdir(DIR* folder) {
    static const auto real = next<dirent* (*)(DIR*)>("readdir64");
    const std::string* const path = tracked(state.folders, static_cast<const DIR*>(folder));
    if (path == nullptr || !isMet(ReadFolder, *path)) return real(folder);
    errno = EIO;
    return nullptr;
}

[[gnu::visibility("default")]] int statx(int folder, const char* path, int flags, unsigned int mask,
                                         struct statx* info) noexcept {
    static const auto real =
        next<int (*)(int, const char*, int, unsigned int, struct statx*)>("statx");
    const auto relative = belowRoot(path);
    if (!relative || !isMet(Dates, *relative)) return real(folder, path, flags, mask, info);
    errno = refusal();
    return -1;
}
}
