// What the file of the provider is: looked at with the tools of the linker, and loaded on its own.
// An object manager binds to these names and unloads the file at will.
#include <dlfcn.h>
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cstdio>
#include <map>
#include <memory>
#include <string>
#include <vector>

#include "support/ProcessMap.h"
#include "support/ProgramRun.h"

namespace {

using testing::Contains;
using testing::HasSubstr;
using testing::IsSubsetOf;
using testing::Not;
using testing::StartsWith;
using testing::UnorderedElementsAre;

const std::string folder = KORVA_BINARY_DIR "/lib/";
const std::string provider = folder + "libkorzbosstatusprofileprovider.so.1";
const std::string facade = folder + "libkorvaosstatusfacade.so.1";

constexpr const char* libraries[] = {"libkorvaosstatusfacade.so.1",
                                     "libkorzbosstatusprofileprovider.so.1", "libvaprovider.so.1",
                                     "libvainstrumentation.so.1", "libzblog.so.1"};

std::string output(const std::string& command) {
    const std::unique_ptr<std::FILE, int (*)(std::FILE*)> pipe(popen(command.c_str(), "r"), pclose);
    std::string text;
    char part[4096];
    while (pipe && std::fgets(part, sizeof part, pipe.get()) != nullptr) text += part;
    return text;
}

// Names between brackets behind a tag of the dynamic section.
std::vector<std::string> dynamicEntries(const std::string& file, const std::string& tag) {
    std::vector<std::string> names;
    for (const std::string& line : lines(output("readelf -dW " + file)))
        if (line.find("(" + tag + ")") != std::string::npos)
            names.push_back(line.substr(line.find('[') + 1, line.find(']') - line.find('[') - 1));
    return names;
}

std::vector<std::string> definedSymbols(const std::string& file) {
    std::vector<std::string> names;
    for (const std::string& line : lines(output("nm -D --defined-only " + file)))
        names.push_back(line.substr(line.rfind(' ') + 1));
    return names;
}

std::vector<std::string> undefinedSymbols(const std::string& file) {
    std::vector<std::string> names;
    for (const std::string& line : lines(output("nm -D --undefined-only " + file))) {
        const std::string name = line.substr(line.rfind(' ') + 1);
        names.push_back(name.substr(0, name.find('@')));
    }
    return names;
}

TEST(LibraryFile, BearsItsSoname) {
    for (const char* name : libraries)
        EXPECT_EQ(dynamicEntries(folder + name, "SONAME"), std::vector<std::string>{name});
}

TEST(LibraryFile, ExportsTheTwoFactoriesAndTheNotice) {
    EXPECT_THAT(definedSymbols(provider),
                UnorderedElementsAre("OperatingSystemProvider_Create_InstanceMI",
                                     "OperatingSystemProvider_Create_AssociationMI",
                                     "_ZN2VA16OSStatusProvider9COPYRIGHTE"));
}

TEST(LibraryFile, OfTheFacadeExportsItsFactoriesAndNeedsProviderAndLog) {
    EXPECT_THAT(definedSymbols(facade),
                UnorderedElementsAre("OSStatusFacade_Create_InstanceMI",
                                     "OSStatusFacade_Create_AssociationMI"));
    const std::vector<std::string> needed = dynamicEntries(facade, "NEEDED");
    EXPECT_THAT(needed, Contains("libkorzbosstatusprofileprovider.so.1"));
    EXPECT_THAT(needed, Contains("libzblog.so.1"));
    for (const char* library : {"libvaprovider.so.1", "libvainstrumentation.so.1"})
        EXPECT_THAT(needed, Not(Contains(library)));
}

// The sections of the provider's objects whose names contain `part`, by name.
std::map<std::string, std::string> sectionsOf(const std::string& part) {
    std::map<std::string, std::string> sections;
    for (const std::string& line : lines(output("objdump -t " + provider))) {
        const std::string name = line.substr(line.rfind(' ') + 1);
        const std::size_t begin = line.find(" O ");
        if (begin == std::string::npos || name.find(part) == std::string::npos) continue;
        sections[name] = line.substr(begin + 3, line.find('\t') - begin - 3);
    }
    return sections;
}

// What the loader fills in is read-only from then on; nothing is left to be built at a first call.
TEST(LibraryFile, HoldsItsFunctionTablesAndRecordsAsConstantData) {
    const auto tables = sectionsOf("MIFT__");
    EXPECT_EQ(tables.size(), 2U);
    for (const auto& [name, section] : tables) EXPECT_EQ(section, ".data.rel.ro") << name;
    const auto records = sectionsOf("2mi");
    EXPECT_EQ(records.size(), 2U);
    for (const auto& [name, section] : records) EXPECT_THAT(section, StartsWith(".data")) << name;
    EXPECT_THAT(sectionsOf("_ZGV"), testing::IsEmpty());
}

// One for each of the functions that format a record, whatever number of units call them.
TEST(LibraryFile, HasFourMessageBuffers) {
    std::vector<std::string> buffers;
    for (const std::string& line : lines(output("nm " + provider)))
        if (line.find("messageBuffer") != std::string::npos) buffers.push_back(line);
    EXPECT_EQ(buffers.size(), 4U);
}

TEST(LibraryFile, NeedsTheFrameworkAndTheLanguagesLibrariesOnly) {
    const std::vector<std::string> needed = dynamicEntries(provider, "NEEDED");
    for (const char* framework :
         {"libvaprovider.so.1", "libvainstrumentation.so.1", "libzblog.so.1", "libstdc++.so.6"})
        EXPECT_THAT(needed, Contains(framework));
    EXPECT_THAT(needed, IsSubsetOf({"libvaprovider.so.1", "libvainstrumentation.so.1",
                                    "libzblog.so.1", "libstdc++.so.6", "libgcc_s.so.1", "libm.so.6",
                                    "libc.so.6", "libasan.so.8", "libubsan.so.1", "libtsan.so.2",
                                    "ld-linux-x86-64.so.2", "ld-linux.so.2"}));
}

TEST(LibraryFile, IsHardened) {
    for (const char* name : libraries) {
        const std::string segments = output("readelf -lW " + folder + name);
        EXPECT_THAT(segments, HasSubstr("GNU_RELRO")) << name;
        for (const std::string& line : lines(segments))
            EXPECT_FALSE(line.find("GNU_STACK") != std::string::npos &&
                         line.find("RWE") != std::string::npos)
                << name;
        EXPECT_THAT(output("readelf -dW " + folder + name), HasSubstr("NOW")) << name;
        EXPECT_THAT(output("readelf -dW " + folder + name), Not(HasSubstr("TEXTREL"))) << name;
    }
    EXPECT_THAT(undefinedSymbols(provider),
                Contains(testing::AnyOf("__stack_chk_fail", "__stack_chk_fail_local")));
#ifdef KORVA_FORTIFIED
    EXPECT_THAT(undefinedSymbols(provider), Contains("__snprintf_chk"));
#endif
}

TEST(LibraryFile, StartsNoProcessAndTouchesNoProcessWideState) {
    for (const char* name : libraries)
        for (const char* forbidden :
             {"fork",          "vfork",     "execve",   "execv",      "execl",
              "posix_spawn",   "system",    "popen",    "tzset",      "localtime",
              "localtime_r",   "gmtime",    "gmtime_r", "mktime",     "getaddrinfo",
              "gethostbyname", "openlog",   "closelog", "setlogmask", "setlocale",
              "signal",        "sigaction", "chdir",    "umask",      "setenv",
              "putenv",        "exit",      "_exit"})
            EXPECT_THAT(undefinedSymbols(folder + name), Not(Contains(forbidden))) << name;
}

void expectGoneAfterUnloading(const std::string& file, const char* factory) {
    for (int round = 0; round < 100; ++round) {
        void* handle = dlopen(file.c_str(), RTLD_NOW | RTLD_GLOBAL);
        ASSERT_NE(handle, nullptr) << dlerror();
        EXPECT_NE(dlsym(handle, factory), nullptr);
        EXPECT_TRUE(isMapped("libkorzbosstatusprofileprovider"));
        EXPECT_EQ(dlclose(handle), 0);
        for (const char* library : libraries) EXPECT_FALSE(isMapped(library));
    }
}

TEST(LibraryFile, IsGoneFromTheProcessAfterUnloading) {
    expectGoneAfterUnloading(provider, "OperatingSystemProvider_Create_InstanceMI");
    expectGoneAfterUnloading(facade, "OSStatusFacade_Create_InstanceMI");
}

}  // namespace
