#include <dlfcn.h>
#include <gmock/gmock.h>
#include <malloc.h>

#include <cstdlib>
#include <set>
#include <stdexcept>
#include <thread>
#include <vector>

#include "support/ProcessMap.h"
#include "support/ProgramRun.h"
#include "tests/logging/LoggingSupport.h"

namespace {

using namespace logging_test;
using testing::Contains;
using testing::Not;

constexpr const char* library = ZBLOG_LIBRARY;

using Write = void (*)(const char*, const char*, int, const std::string&, int, char*, int, int,
                       const std::string&);
using Construct = void (*)(void*);
using Append = void* (*)(void*, const char*);
using Take = const std::string& (*)(void*, void*);

/// The library, loaded for as long as this object lives.
class LoadedLibrary {
  public:
    LoadedLibrary() : handle_(::dlopen(library, RTLD_NOW | RTLD_GLOBAL)) {
        if (handle_ == nullptr) throw std::runtime_error(::dlerror());
    }
    ~LoadedLibrary() { ::dlclose(handle_); }
    LoadedLibrary(const LoadedLibrary&) = delete;
    LoadedLibrary& operator=(const LoadedLibrary&) = delete;

    template <class Function>
    Function get(const char* name) const {
        void* const address = ::dlsym(handle_, name);
        if (address == nullptr) throw std::runtime_error(::dlerror());
        return reinterpret_cast<Function>(address);
    }

    void log(const std::string& text) const { write("15logLevelMessage", text); }
    void trace(const std::string& text) const { write("17traceLevelMessage", text); }

  private:
    void write(const std::string& function, const std::string& text) const {
        const std::string name = "_ZN5ZBLog8ZBLogger" + function +
                                 "EPKcS2_iRKNSt7__cxx1112basic_stringIcSt11char_traitsIcESaIcEEE"
                                 "iPciiSA_";
        get<Write>(name.c_str())("work", "Work.cpp", 12, "Zumbrel.Test", 3000, nullptr, 0, 0, text);
    }

    void* handle_;
};

/// Names a configuration that logs everything to these files.
void configure(const TemporaryDirectory& folder) {
    folder.write("zblog.conf",
                 "log.sink = file:" + folder.path("log") +
                     "\nlog.records = all\ntrace.sink = file:" + folder.path("trace") + "\n");
    ::setenv("ZBLOG_CONF", folder.path("zblog.conf").c_str(), 1);
}

/// The lines that a command of the shell writes; a symbol that is there twice, as constructors are,
/// is one of them.
std::set<std::string> outputOf(const std::string& command) {
    const std::vector<std::string> written = lines(runProgram("/bin/sh", {"-c", command}).out);
    return {written.begin(), written.end()};
}

TEST(Library, ExportsTheTwoClassesAndNothingElse) {
    const std::string text = "[abi:cxx11]";
    EXPECT_THAT(
        outputOf("nm -DC --defined-only '" + std::string(library) +
                 "' | cut -d' ' -f3- | "
                 "sed 's/std::__cxx11::basic_string<char, std::char_traits<char>, "
                 "std::allocator<char> >/std::string/g'"),
        testing::UnorderedElementsAre(
            "ZBLog::ZBLogger::logLevelMessage(char const*, char const*, int, std::string const&, "
            "int, char*, int, int, std::string const&)",
            "ZBLog::ZBLogger::traceLevelMessage(char const*, char const*, int, std::string const&, "
            "int, char*, int, int, std::string const&)",
            "ZBLog::ZBMessageBuffer::ZBMessageBuffer()",
            "ZBLog::ZBMessageBuffer::~ZBMessageBuffer()",
            "ZBLog::ZBMessageBuffer::operator<<(char const*)",
            "ZBLog::ZBMessageBuffer::operator std::ostream&()",
            "ZBLog::ZBMessageBuffer::str" + text + "(ZBLog::ZBMessageBuffer&)",
            "ZBLog::ZBMessageBuffer::str" + text + "(std::ostream&)"));
}

TEST(Library, NeedsNothingButTheLanguagesLibraries) {
    const std::string needed =
        "readelf -d '" + std::string(library) + "' | sed -n 's/.*(NEEDED).*\\[\\(.*\\)\\]/\\1/p'";
    for (const std::string& name : outputOf(needed)) {
        EXPECT_THAT(name, testing::MatchesRegex("(libstdc\\+\\+|libgcc_s|libc|libm|ld-linux[^ ]*|"
                                                "lib[atu][a-z]*san)\\.so\\.[0-9]+"));
    }
    EXPECT_FALSE(outputOf(needed).empty());
}

TEST(Library, TouchesNothingThatBelongsToTheProcess) {
    const std::set<std::string> used = outputOf("nm -D --undefined-only '" + std::string(library) +
                                                "' | sed 's/^ *[Uw] //; s/@.*//'");
    EXPECT_THAT(used, Contains("write"));
    for (const char* name :
         {"openlog",        "closelog",  "setlogmask",  "setlocale",   "uselocale",
          "signal",         "sigaction", "localtime",   "localtime_r", "gmtime",
          "gmtime_r",       "mktime",    "tzset",       "umask",       "fork",
          "vfork",          "execve",    "posix_spawn", "system",      "popen",
          "setenv",         "putenv",    "exit",        "abort",       "pthread_create",
          "pthread_atfork", "chdir"}) {
        EXPECT_THAT(used, Not(Contains(name)));
    }
}

TEST(Library, IsGoneAfterEachOfAHundredUnloads) {
    const TemporaryDirectory folder;
    configure(folder);
    std::size_t descriptors = 0;
    std::size_t bytes = 0;
    for (int round = 0; round < 100; ++round) {
        ASSERT_FALSE(isMapped("libzblog.so"));
        {
            const LoadedLibrary loaded;
            ASSERT_TRUE(isMapped("libzblog.so"));
            void* buffer = nullptr;
            loaded.get<Construct>("_ZN5ZBLog15ZBMessageBufferC1Ev")(&buffer);
            loaded.get<Append>("_ZN5ZBLog15ZBMessageBufferlsEPKc")(&buffer, "round");
            const std::string& text =
                loaded.get<Take>("_ZN5ZBLog15ZBMessageBuffer3strB5cxx11ERS0_")(&buffer, &buffer);
            loaded.log(text + " " + std::to_string(round));
            loaded.trace(text + " " + std::to_string(round));
            std::thread([&] { loaded.log("of a thread"); }).join();
            loaded.get<Construct>("_ZN5ZBLog15ZBMessageBufferD1Ev")(&buffer);
        }
        ASSERT_FALSE(isMapped("libzblog.so"));
        if (round == 0) descriptors = openDescriptors();
        ASSERT_EQ(openDescriptors(), descriptors);
        if (round == 50) bytes = ::mallinfo2().uordblks;
    }
    EXPECT_LT(::mallinfo2().uordblks, bytes + 2000);
    const auto texts = textsOf(readFile(folder.path("log")));
    ASSERT_EQ(texts.size(), 200u);
    EXPECT_EQ(texts.front(), "round 0");
    EXPECT_EQ(texts[198], "round 99");
    EXPECT_EQ(textsOf(readFile(folder.path("trace"))).size(), 100u);
}

TEST(Library, ReadsNoFileWhenTheEnvironmentNamesNone) {
    ::setenv("ZBLOG_CONF", "", 1);
    const LoadedLibrary loaded;
    testing::internal::CaptureStderr();
    loaded.log("nothing of this is a failure");
    loaded.trace("MESSAGE [File: A, Line: 9]: traced nowhere");
    EXPECT_EQ(testing::internal::GetCapturedStderr(), "");
    ::unsetenv("ZBLOG_CONF");
}

/// A process that ends while its threads go on logging.
TEST(Library, LetsAProcessEndWhileItsThreadsGoOn) {
    const TemporaryDirectory folder;
    configure(folder);
    for (int round = 0; round < 10; ++round) {
        const int status = inChildProcess([&]() -> int {
            static const LoadedLibrary& loaded =
                *new LoadedLibrary;  // stays loaded until the process is gone
            for (int thread = 0; thread < 3; ++thread) {
                std::thread([] {
                    for (;;) loaded.log("going on");
                }).detach();
            }
            while (readFile(folder.path("log")).size() < 1000) std::this_thread::yield();
            std::exit(7);
        });
        EXPECT_EQ(status, 7);
    }
}

}  // namespace
