// What the built library exports and needs, and that it can be taken away again.
#include <dlfcn.h>
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <filesystem>
#include <iterator>
#include <set>
#include <sstream>
#include <string>
#include <thread>

#include "support/FixtureTree.h"
#include "support/ProcessMap.h"
#include "support/ProgramRun.h"

namespace {

std::set<std::string> linesOf(const std::string& command) {
    const ProgramRun run = runProgram("/bin/sh", {"-c", command});
    EXPECT_EQ(run.status, 0) << command;
    const auto all = lines(run.out);
    return {all.begin(), all.end()};
}

// The part of `text` before the first `end`.
std::string before(const std::string& text, char end) {
    return text.substr(0, text.find(end));
}

const std::string library = INSTRUMENTATION_LIBRARY;

TEST(LibraryFile, ExportsInstrumentationAndTheSeamAloneAndNothingUnique) {
    std::set<std::string> exported;
    for (const auto& line : linesOf("nm -DC --defined-only --format=posix '" + library + "'")) {
        // A unique symbol would pin the library.
        EXPECT_EQ(line.find(" u "), std::string::npos) << line;
        // "name T value size": the demangled name has blanks too.
        for (const char* const type : {" T ", " V ", " W ", " D ", " B ", " R ", " A "}) {
            const auto end = line.rfind(type);
            if (end != std::string::npos) exported.insert(before(line.substr(0, end), '('));
        }
    }
    std::set<std::string> expected{"VA::setHostSource", "VA::currentHostSource",
                                   "VA::makeLinuxHost"};
    for (const std::string member :
         {"Instrumentation", "~Instrumentation", "selectNode", "operator bool", "operator++",
          "getProperty", "isPropertyReadOnly", "getNodeStatus", "getComputerName"})
        expected.insert("VA::Instrumentation::" + member);
    for (const std::string name : {"NodeCursor", "HostSource"}) {
        expected.insert({"VA::" + name + "::" + name, "VA::" + name + "::~" + name});
        for (const std::string part : {"vtable", "typeinfo", "typeinfo name"})
            expected.insert(part + " for VA::" + name);
    }
    EXPECT_EQ(exported, expected);
}

TEST(LibraryFile, NoFunctionIsCalledThatForksResolvesNamesOrSetsUpTheZone) {
    std::istringstream names(
        "fork vfork _Fork clone clone3 execl execle execlp execv execve execvp "
        "execvpe fexecve posix_spawn posix_spawnp system popen wordexp getaddrinfo "
        "gethostbyname gethostbyname_r gethostbyaddr getnameinfo tzset localtime "
        "localtime_r gmtime gmtime_r mktime timegm strftime ctime ctime_r asctime "
        "setutxent getutxent getutent endutxent utmpname dlmopen __localtime64 "
        "__localtime64_r __gmtime64 __gmtime64_r __mktime64 __timegm64 __ctime64 "
        "__ctime64_r ");
    const std::set<std::string> forbidden{std::istream_iterator<std::string>(names), {}};
    int undefined = 0;
    for (const auto& line : linesOf("nm -D --undefined-only --format=posix '" + library + "'")) {
        ++undefined;
        EXPECT_EQ(forbidden.count(before(before(line, ' '), '@')), 0u) << line;
    }
    EXPECT_GT(undefined, 20);
}

TEST(LibraryFile, NeedsTheSystemsOwnLibrariesAloneAndBearsItsVersion) {
    const std::string allowed =
        "(libstdc\\+\\+|libgcc_s|libc|libm|libdl|libasan|libubsan|libtsan|ld-linux(-x86-64)?)"
        "\\.so\\.[0-9]+";
    std::string soname;
    int needed = 0;
    for (const auto& line : linesOf("readelf -d '" + library + "'")) {
        const std::string name = before(line.substr(line.find('[') + 1), ']');
        if (line.find("(SONAME)") != std::string::npos) soname = name;
        if (line.find("(NEEDED)") == std::string::npos) continue;
        ++needed;
        EXPECT_THAT(name, testing::MatchesRegex(allowed));
    }
    EXPECT_GE(needed, 2);
    EXPECT_EQ(soname, "libvainstrumentation.so.1");
}

std::ptrdiff_t openDescriptors() {
    const std::filesystem::directory_iterator all("/proc/self/fd"), end;
    return std::distance(all, end);
}

void loadUseUnload(const std::string& root) {
    void* plugin = ::dlopen(INSTRUMENTATION_PLUGIN, RTLD_NOW | RTLD_LOCAL);
    ASSERT_TRUE(plugin) << ::dlerror();
    EXPECT_TRUE(isMapped("libvainstrumentation.so"));
    const auto use = reinterpret_cast<int (*)(const char*)>(::dlsym(plugin, "useLibrary"));
    ASSERT_TRUE(use);
    EXPECT_EQ(use(root.c_str()), 1);
    // A worker's own thread-local data must not hold the library either.
    std::thread([&] { EXPECT_EQ(use(root.c_str()), 1); }).join();
    ASSERT_EQ(::dlclose(plugin), 0);
}

TEST(LibraryFile, VanishesFromTheProcessEachOfAHundredTimesItIsUnloaded) {
    FixtureTree tree;
    tree.writeCompleteHost();
    tree.makeFolder("run/systemd/system");  // so that libsystemd is loaded where there is one
    loadUseUnload(tree.root());
    const auto descriptors = openDescriptors();
    for (int i = 0; i < 100; ++i) {
        loadUseUnload(tree.root());
        ASSERT_FALSE(isMapped("libvainstrumentation")) << i;
        ASSERT_FALSE(isMapped("instrumentation_plugin")) << i;
    }
    EXPECT_EQ(openDescriptors(), descriptors);
}

}  // namespace
