// What requests open on the host that they run on. This program's functions stand before the C
// library's. A host is asked often: each source is opened once, or not at all.
#include <dirent.h>
#include <dlfcn.h>
#include <fcntl.h>

#include <algorithm>
#include <cstdarg>
#include <map>

#include "library/LibraryFixture.h"

#include "framework/instrumentation/HostSource.h"

namespace {

using testing::Contains;
using testing::Each;
using testing::Key;
using testing::Pair;
using testing::SizeIs;

/// How often each file and folder was opened; null: nobody is counting.
std::map<std::string, int>* opened = nullptr;

void note(const char* path) {
    if (opened != nullptr) ++(*opened)[path];
}

template <class Function>
Function* next(Function*, const char* name) {
    return reinterpret_cast<Function*>(dlsym(RTLD_NEXT, name));
}

}  // namespace

extern "C" {

[[gnu::visibility("default")]] int open64(const char* path, int flags, ...) {
    static auto* const original = next(&::open64, "open64");
    std::va_list rest;
    va_start(rest, flags);
    const auto mode = va_arg(rest, unsigned int);
    va_end(rest);
    note(path);
    return original(path, flags, mode);
}

[[gnu::visibility("default")]] DIR* opendir(const char* path) {
    static auto* const original = next(&::opendir, "opendir");
    note(path);
    return original(path);
}
}

namespace {

class OpenedFiles : public LibraryFixture {
  protected:
    OpenedFiles() { VA::setHostSource(nullptr); }
    ~OpenedFiles() override { opened = nullptr; }

    std::map<std::string, int> openedBy(Operation operation, const std::string& className) {
        std::map<std::string, int> files;
        opened = &files;
        const cmpihost::Outcome outcome = operation == Operation::EnumerateInstances
                                              ? enumerate(className)
                                              : enumerateNames(className);
        opened = nullptr;
        EXPECT_EQ(outcome.rc, CMPI_RC_OK);
        EXPECT_THAT(operation == Operation::EnumerateInstances ? outcome.instances.size()
                                                               : outcome.paths.size(),
                    1U);
        return files;
    }
};

TEST_F(OpenedFiles, NamesNeedTheReleaseFileAlone) {
    const auto files = openedBy(Operation::EnumerateInstanceNames, "KORVA_OperatingSystem");
    EXPECT_THAT(files, SizeIs(1));
    EXPECT_THAT(files, Each(Pair("/etc/os-release", 1)));
}

TEST_F(OpenedFiles, NamesOfTheNextRequestNeedNone) {
    openedBy(Operation::EnumerateInstanceNames, "KORVA_OperatingSystem");
    EXPECT_THAT(openedBy(Operation::EnumerateInstanceNames, "KORVA_OperatingSystem"), SizeIs(0));
}

TEST_F(OpenedFiles, AnInstanceOpensEachSourceOnce) {
    const auto files = openedBy(Operation::EnumerateInstances, "KORVA_OperatingSystem");
    for (const char* source : {"/proc/stat", "/proc/meminfo", "/proc"})
        EXPECT_THAT(files, Contains(Key(source)));
    EXPECT_THAT(files, Each(Pair(testing::_, 1)));
}

}  // namespace
