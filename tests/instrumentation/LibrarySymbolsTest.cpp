// What the built library exports and needs.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cstdio>
#include <set>
#include <sstream>
#include <string>

namespace {

std::string outputOf(const std::string& command) {
    std::string output;
    FILE* pipe = ::popen(command.c_str(), "r");
    for (int c = std::fgetc(pipe); c != EOF; c = std::fgetc(pipe)) output += static_cast<char>(c);
    EXPECT_EQ(::pclose(pipe), 0) << command;
    return output;
}

std::set<std::string> linesOf(const std::string& command) {
    std::istringstream output(outputOf(command));
    std::set<std::string> lines;
    for (std::string line; std::getline(output, line);) lines.insert(line);
    return lines;
}

// The part of `text` before the first `end`.
std::string before(const std::string& text, char end) {
    return text.substr(0, text.find(end));
}

const std::string library = INSTRUMENTATION_LIBRARY;

TEST(LibrarySymbols, ExportedAreInstrumentationAndTheSeamAlone) {
    std::set<std::string> exported;
    for (const auto& line : linesOf("nm -DC --defined-only --format=posix '" + library + "'")) {
        // "name T value size": the demangled name has blanks too.
        for (const char type : {'T', 'V', 'W', 'D', 'B', 'R', 'u', 'A'}) {
            const auto end = line.rfind(std::string(" ") + type + ' ');
            if (end != std::string::npos) exported.insert(before(line.substr(0, end), '('));
        }
    }
    const std::set<std::string> expected{
        "VA::Instrumentation::Instrumentation",
        "VA::Instrumentation::~Instrumentation",
        "VA::Instrumentation::selectNode",
        "VA::Instrumentation::operator bool",
        "VA::Instrumentation::operator++",
        "VA::Instrumentation::getProperty",
        "VA::Instrumentation::isPropertyReadOnly",
        "VA::Instrumentation::getNodeStatus",
        "VA::Instrumentation::getComputerName",
        "VA::setHostSource",
        "VA::currentHostSource",
        "VA::makeLinuxHost",
        "VA::NodeCursor::NodeCursor",
        "VA::NodeCursor::~NodeCursor",
        "VA::HostSource::HostSource",
        "VA::HostSource::~HostSource",
        "typeinfo for VA::NodeCursor",
        "typeinfo for VA::HostSource",
        "typeinfo name for VA::NodeCursor",
        "typeinfo name for VA::HostSource",
        "vtable for VA::NodeCursor",
        "vtable for VA::HostSource",
    };
    EXPECT_EQ(exported, expected);
}

TEST(LibrarySymbols, NoneIsUniqueAsThatWouldPinTheLibrary) {
    for (const auto& line : linesOf("nm -D '" + library + "'")) {
        EXPECT_EQ(line.find(" u "), std::string::npos) << line;
    }
}

TEST(LibrarySymbols, NoFunctionIsCalledThatForksResolvesNamesOrSetsUpTheZone) {
    const std::set<std::string> forbidden{
        "fork",          "vfork",         "_Fork",
        "clone",         "clone3",        "execl",
        "execle",        "execlp",        "execv",
        "execve",        "execvp",        "execvpe",
        "fexecve",       "posix_spawn",   "posix_spawnp",
        "system",        "popen",         "wordexp",
        "getaddrinfo",   "gethostbyname", "gethostbyname_r",
        "gethostbyaddr", "getnameinfo",   "tzset",
        "localtime",     "localtime_r",   "gmtime",
        "gmtime_r",      "mktime",        "timegm",
        "strftime",      "ctime",         "ctime_r",
        "asctime",       "setutxent",     "getutxent",
        "getutent",      "endutxent",     "utmpname",
        "dlmopen",       "__localtime64", "__localtime64_r",
        "__gmtime64",    "__gmtime64_r",  "__mktime64",
        "__timegm64",    "__ctime64",     "__ctime64_r",
    };
    int undefined = 0;
    for (const auto& line : linesOf("nm -D --undefined-only --format=posix '" + library + "'")) {
        ++undefined;
        EXPECT_EQ(forbidden.count(before(before(line, ' '), '@')), 0u) << line;
    }
    EXPECT_GT(undefined, 20);
}

TEST(LibrarySymbols, OnlyTheSystemsOwnLibrariesAreNeeded) {
    int needed = 0;
    for (const auto& line : linesOf("readelf -d '" + library + "'")) {
        if (line.find("(NEEDED)") == std::string::npos) continue;
        ++needed;
        const auto start = line.find('[') + 1;
        EXPECT_THAT(line.substr(start, line.find(']') - start),
                    testing::MatchesRegex(
                        "(libstdc\\+\\+|libgcc_s|libc|libm|libdl|libasan|libubsan|libtsan|ld-linux"
                        "(-x86-64)?)\\.so\\.[0-9]+"));
    }
    EXPECT_GE(needed, 2);
}

TEST(LibrarySymbols, NameAndVersionAreThoseThatProgramsLinkAgainst) {
    EXPECT_THAT(outputOf("readelf -d '" + library + "'"),
                testing::HasSubstr("[libvainstrumentation.so.1]"));
}

}  // namespace
