// The built program with library files of all kinds, good and bad.
#include <gmock/gmock.h>
#include <link.h>
#include <sys/stat.h>

#include <algorithm>
#include <filesystem>
#include <fstream>

#include "host/cli/Cmpihost.h"
#include "support/TemporaryDirectory.h"

namespace {

namespace fs = std::filesystem;
using testing::EndsWith;
using testing::HasSubstr;
using testing::StartsWith;

constexpr const char* moonName = "CSName=\"moon\"";

/// The length of that part of a library's file that the loader maps.
std::uintmax_t mappedSize(const fs::path& library) {
    std::ifstream stream(library, std::ios::binary);
    ElfW(Ehdr) header{};
    stream.read(reinterpret_cast<char*>(&header), sizeof header);
    stream.seekg(static_cast<std::streamoff>(header.e_phoff));
    std::uintmax_t size = 0;
    for (unsigned index = 0; index < header.e_phnum; ++index) {
        ElfW(Phdr) segment{};
        stream.read(reinterpret_cast<char*>(&segment), sizeof segment);
        if (segment.p_type == PT_LOAD) {
            size = std::max<std::uintmax_t>(size, segment.p_offset + segment.p_filesz);
        }
    }
    return size;
}

class LibraryFile : public testing::Test {
  protected:
    static ProgramRun load(const std::string& library) {
        return cmpihost({"--provider", library, "--name", "OSStatusFacade", "ei", "X"});
    }

    const TemporaryDirectory directory_;
    const fs::path folder_ = directory_.path();
};

TEST_F(LibraryFile, ThatIsANamedPipeExitsWithThree) {
    const std::string pipe = (folder_ / "pipe\x1b[31m").string();
    ASSERT_EQ(mkfifo(pipe.c_str(), 0600), 0);
    const std::string complaint =
        "cmpihost: " + (folder_ / "pipe\\x1b[31m: not a regular file\n").string();
    EXPECT_EQ(load(pipe).status, 3);
    EXPECT_EQ(load(pipe).err, complaint);
}

TEST_F(LibraryFile, ThatIsCutOffExitsWithThree) {
    const fs::path cut = folder_ / "cut.so";
    fs::copy_file(KORVA_STAND_IN, cut);
    const std::uintmax_t needed = mappedSize(cut);
    fs::resize_file(cut, needed);
    EXPECT_EQ(load(cut.string()).status, 0);
    for (const std::uintmax_t size :
         {needed - 1, needed / 2, std::uintmax_t{100}, std::uintmax_t{30}}) {
        fs::resize_file(cut, size);
        const ProgramRun run = load(cut.string());
        EXPECT_EQ(run.status, 3) << size;
        EXPECT_EQ(run.err, "cmpihost: " + cut.string() + ": the file is cut off\n") << size;
    }
}

TEST_F(LibraryFile, NamedLikeASchemaFileButAPipeExitsWithTwo) {
    ASSERT_EQ(mkfifo((folder_ / "x.mof").c_str(), 0600), 0);
    const ProgramRun run = cmpihost(
        {"--provider", KORVA_STAND_IN, "--name", "N", "--schema", folder_.string(), "ei", "X"});
    EXPECT_EQ(run.status, 2);
    EXPECT_EQ(run.err, "cmpihost: the schema file " + (folder_ / "x.mof").string() +
                           " is not a regular file\n");
}

TEST_F(LibraryFile, WithoutFolderIsTakenFromTheCurrentOne) {
    fs::copy_file(KORVA_STAND_IN, folder_ / "standin.so");
    const ProgramRun run = runProgram(
        "/usr/bin/env", {"-C", folder_.string(), KORVA_CMPIHOST, "--provider", "standin.so",
                         "--name", "OSStatusFacade", "ein", "KORVA_OperatingSystem"});
    EXPECT_EQ(run.status, 0) << run.err;
    EXPECT_THAT(run.out, HasSubstr(moonName));
}

TEST(QuestionsThatExplainAnEmptyAnswer, LeaveWhatTheyMeetThemselvesUntold) {
    const TemporaryDirectory folder;
    const std::string found = "\nprovider: OSStatusFacade\nlocation: " KORVA_STAND_IN
                              "\ntype: instance association\nnamespace: *\n";
    folder.write("a.reg", "[CIM_Faulty]" + found + "[KORVA_RunningOS]" + found +
                              "[KORVA_InstalledOS]\nprovider: Nobody\nlocation: nowhere\n"
                              "type: association\nnamespace: *\n");
    const auto ask = [&](Words words) {
        words.insert(words.begin(), {"--registration", folder.path()});
        return cmpihost(words);
    };
    // The class's instance, asked for by itself, is null.
    EXPECT_EQ(ask({"gi", "CIM_Faulty.A=1"}).status, 5);
    const ProgramRun run = ask({"rin", "CIM_Faulty.A=1", "--result-class", "KORVA_RunningOS"});
    EXPECT_EQ(run.status, 0);
    EXPECT_EQ(run.err, "cmpihost: note: there is no instance root/cimv2:CIM_Faulty.A=1\n");
    // Asked for itself, the library that is missing is told.
    EXPECT_EQ(ask({"rin", "CIM_Faulty.A=1"}).status, 3);
}

TEST(EmptyRegistrations, ExitWithThreeUnlessALibraryIsNamed) {
    const TemporaryDirectory folder;
    const ProgramRun run = cmpihost({"--registration", folder.path(), "ei", "X"});
    EXPECT_EQ(run.status, 3);
    EXPECT_EQ(run.err, "cmpihost: there are no registrations in " + folder.path() +
                           " (--registration PATH names others, --provider FILE a library)\n");
    EXPECT_EQ(cmpihost({"--registration", folder.path(), "--bare", "tree"}).status, 1);
}

TEST(AFolderOfRecords, IsGoneAlsoWhenNobodyReadsTheResults) {
    const TemporaryDirectory folder;
    const ProgramRun run = runProgram(
        "/bin/sh",
        {"-c",
         "mkfifo \"$1/pipe\"; mkdir \"$1/temporary\"; (: <\"$1/pipe\") & exec 4>\"$1/pipe\"; "
         "wait; TMPDIR=$1/temporary exec \"$0\" ein KORVA_OperatingSystem >&4",
         KORVA_CMPIHOST, folder.path()});
    EXPECT_EQ(run.status, -1) << "no signal ended it";
    EXPECT_TRUE(fs::is_empty(folder.path("temporary")));
}

/// The program in a folder of its own, with the schema and nothing else around it.
class ProgramElsewhere : public LibraryFile {
  protected:
    void SetUp() override {
        LibraryFile::SetUp();
        for (const char* folder : {"bin", "lib", "share/korva-osstatus"}) {
            fs::create_directories(folder_ / folder);
        }
        fs::copy_file(KORVA_CMPIHOST, folder_ / "bin/cmpihost");
        fs::copy(KORVA_SOURCE_DIR "/schema", share_ / "schema");
        fs::copy(KORVA_SOURCE_DIR "/schema/registration", share_ / "registration");
    }
    ProgramRun installed(const Words& arguments) const {
        return runProgram((folder_ / "bin/cmpihost").string(), arguments);
    }
    void install(const char* name) const { fs::copy_file(KORVA_STAND_IN, folder_ / "lib" / name); }

    const fs::path share_ = folder_ / "share/korva-osstatus";
};

TEST_F(ProgramElsewhere, WithoutItsLibraryExitsWithThreeAndTellsThePlaces) {
    const std::string places =
        "; looked for in " + (folder_ / "lib").string() + ", " + (folder_ / "bin").string() + ", ";
    const ProgramRun bare = installed({"--bare", "ei", "X"});
    EXPECT_EQ(bare.status, 3);
    EXPECT_THAT(bare.err,
                StartsWith("cmpihost: libkorzbosstatusprofileprovider.so was not found" + places));
    EXPECT_THAT(bare.err, EndsWith(" (--provider FILE names a library, without --bare)\n"));

    const ProgramRun registered = installed({"ei", "KORVA_OperatingSystem"});
    EXPECT_EQ(registered.status, 3);
    EXPECT_THAT(registered.err,
                StartsWith("cmpihost: " + (share_ / "registration/korva-osstatus.reg").string() +
                           ":1: the provider of KORVA_OperatingSystem: libkorvaosstatusfacade.so: "
                           "cannot open shared object file"));
    EXPECT_THAT(registered.err, HasSubstr("; looked for in " + (share_ / "registration").string() +
                                          ", " + (folder_ / "lib").string() + ", "));
}

TEST_F(ProgramElsewhere, WithoutRegistrationsNeedsToBeToldTheLibrary) {
    fs::remove_all(share_ / "registration");
    const ProgramRun run = installed({"ei", "KORVA_OperatingSystem"});
    EXPECT_EQ(run.status, 3);
    EXPECT_EQ(run.err, "cmpihost: there are no registrations in " +
                           (share_ / "registration").string() +
                           " (--registration PATH names others, --provider FILE a library)\n");
    install("libkorzbosstatusprofileprovider.so.1");
    EXPECT_THAT(installed({"--bare", "ein", "KORVA_OperatingSystem"}).out, HasSubstr(moonName));
}

TEST_F(ProgramElsewhere, LoadsTheFacadeBesideItselfOrTheProviderWhenItIsToAskThat) {
    const Words facade = {"ein", "KORVA_OperatingSystem"};
    const Words provider = {"--bare", "ein", "KORVA_OperatingSystem"};
    install("libkorvaosstatusfacade.so.1");
    EXPECT_THAT(installed(facade).out, HasSubstr(moonName));
    EXPECT_EQ(installed(provider).status, 3);
    fs::remove(folder_ / "lib/libkorvaosstatusfacade.so.1");
    install("libkorzbosstatusprofileprovider.so.1");
    EXPECT_THAT(installed(provider).out, HasSubstr(moonName));
    EXPECT_EQ(installed(facade).status, 3);
}

/// Asks the provider that is installed for what another one serves.
TEST_F(ProgramElsewhere, ThatLacksALibraryForAnUpcallExitsWithThree) {
    install("libkorzbosstatusprofileprovider.so.1");
    const ProgramRun run = installed({"--bare", "ein", "KORVA_ComputerSystem"});
    EXPECT_EQ(run.status, 3);
    EXPECT_EQ(run.out, "");
    EXPECT_THAT(run.err, StartsWith("cmpihost: an up-call for KORVA_ComputerSystem: "));
    EXPECT_THAT(run.err, HasSubstr("korva-osstatus-companion.reg:1: the provider of "
                                   "KORVA_ComputerSystem: libkorvacomputersystemprovider.so: "));
    install("libkorvacomputersystemprovider.so.1");
    EXPECT_EQ(installed({"--bare", "ein", "KORVA_OperatingSystem"}).status, 0);
}

}  // namespace
