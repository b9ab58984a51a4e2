#include "host/cli/InstallPaths.h"

#include <gmock/gmock.h>

#include "support/TemporaryDirectory.h"

namespace {

namespace fs = std::filesystem;
using namespace cmpihost;

class InstallPaths : public testing::Test {
  protected:
    InstallPaths() {
        for (const char* folder : {"bin", "lib/cmpi", "lib64/cmpi"}) {
            fs::create_directories(prefix_ / folder);
        }
    }
    void touch(const char* file) { directory_.write(file, ""); }
    fs::path found() { return findLibrary(Library::Provider, prefix_ / "bin"); }

    const TemporaryDirectory directory_;
    const fs::path prefix_ = directory_.path();
};

TEST_F(InstallPaths, LookForTheSchemaBesideTheProgramsFolder) {
    EXPECT_EQ(schemaFolder("/opt/x/bin"), "/opt/x/share/korva-osstatus/schema");
}

TEST_F(InstallPaths, PreferTheLibraryFolderThenTheProgramsThenTheObjectManagers) {
    EXPECT_EQ(found(), "");
    touch("lib64/cmpi/libkorzbosstatusprofileprovider.so");
    EXPECT_EQ(found(), prefix_ / "lib64/cmpi/libkorzbosstatusprofileprovider.so");
    touch("lib/cmpi/libkorzbosstatusprofileprovider.so");
    EXPECT_EQ(found(), prefix_ / "lib/cmpi/libkorzbosstatusprofileprovider.so");
    touch("bin/libkorzbosstatusprofileprovider.so.1");
    EXPECT_EQ(found(), prefix_ / "bin/libkorzbosstatusprofileprovider.so.1");
    touch("lib/libkorzbosstatusprofileprovider.so.1");
    EXPECT_EQ(found(), prefix_ / "lib/libkorzbosstatusprofileprovider.so.1");
}

TEST_F(InstallPaths, KnowTheFolderThatTheProvidersAreInstalledIn) {
    fs::create_directories(prefix_ / "agents");
    touch("lib/cmpi/libkorzbosstatusprofileprovider.so");
    touch("lib/cmpi/libkorvacomputersystemprovider.so");
    EXPECT_EQ(findLibrary(Library::Provider, prefix_ / "bin", "agents"),
              prefix_ / "lib/cmpi/libkorzbosstatusprofileprovider.so");
    touch("agents/libkorzbosstatusprofileprovider.so");
    touch("agents/libkorvacomputersystemprovider.so");
    for (const fs::path& installed : {fs::path("agents"), prefix_ / "agents"}) {
        EXPECT_EQ(findLibrary(Library::Provider, prefix_ / "bin", installed),
                  prefix_ / "agents/libkorzbosstatusprofileprovider.so");
        EXPECT_EQ(findLibrary(Library::Companion, prefix_ / "bin", installed),
                  prefix_ / "agents/libkorvacomputersystemprovider.so");
    }
    EXPECT_EQ(installedProviderFolder(), KORVA_CMPI_FOLDER);
}

TEST_F(InstallPaths, HoldTheFacadeBesideTheProvider) {
    touch("lib/libkorzbosstatusprofileprovider.so.1");
    EXPECT_EQ(findLibrary(Library::Facade, prefix_ / "bin"), "");
    touch("lib/libkorvaosstatusfacade.so.1");
    EXPECT_EQ(findLibrary(Library::Facade, prefix_ / "bin"),
              prefix_ / "lib/libkorvaosstatusfacade.so.1");
}

TEST_F(InstallPaths, TellTheNameOfAProviderByTheFileOfItsLibrary) {
    for (const char* file : {"libkorvaosstatusfacade.so", "/x/libkorvaosstatusfacade.so.1"}) {
        EXPECT_EQ(providerName(file), "OSStatusFacade") << file;
    }
    for (const char* file :
         {"libkorzbosstatusprofileprovider.so.1", "/libkorvaosstatusfacade.so/other.so", "x.so"}) {
        EXPECT_EQ(providerName(file), "OperatingSystemProvider") << file;
    }
}

TEST_F(InstallPaths, DoNotTakeAFolderForALibrary) {
    fs::create_directories(prefix_ / "lib/libkorzbosstatusprofileprovider.so.1");
    EXPECT_EQ(found(), "");
}

TEST_F(InstallPaths, KnowTheFolderOfTheRunningProgram) {
    EXPECT_EQ(programFolder("elsewhere"), fs::path(KORVA_BINARY_DIR) / "bin");
}

TEST_F(InstallPaths, TakeTheFolderOfTheCalledNameWhereTheSystemTellsNone) {
    const fs::path missing = prefix_ / "exe";
    touch("bin/program");
    fs::create_symlink(prefix_ / "bin/program", prefix_ / "called");
    EXPECT_EQ(programFolder((prefix_ / "bin/program").string(), missing), prefix_ / "bin");
    EXPECT_EQ(programFolder((prefix_ / "called").string(), missing), prefix_ / "bin");
}

TEST_F(InstallPaths, TakeTheInstallationFolderWhereNothingTellsAnother) {
    const fs::path missing = prefix_ / "exe";
    EXPECT_EQ(programFolder("cmpihost", missing), KORVA_PROGRAM_FOLDER);
    EXPECT_EQ(programFolder("", missing), KORVA_PROGRAM_FOLDER);
    EXPECT_EQ(programFolder("/nowhere/cmpihost", missing), KORVA_PROGRAM_FOLDER);
}

}  // namespace
