#include "host/InstallPaths.h"

#include <gmock/gmock.h>

#include "host/broker/LibraryFile.h"
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
    fs::path found(const fs::path& installed = installedProviderFolder()) {
        return findLibrary("thing", libraryFolders(prefix_ / "bin", installed));
    }

    const TemporaryDirectory directory_;
    const fs::path prefix_ = directory_.path();
};

TEST_F(InstallPaths, LookForSchemaAndRegistrationsBesideTheProgramsFolder) {
    EXPECT_EQ(schemaFolder("/opt/x/bin"), "/opt/x/share/korva-osstatus/schema");
    EXPECT_EQ(registrationFolder("/opt/x/bin"), "/opt/x/share/korva-osstatus/registration");
}

TEST_F(InstallPaths, PreferTheLibraryFolderThenTheProgramsThenTheObjectManagers) {
    EXPECT_EQ(found(), "libthing.so");
    for (const char* file :
         {"lib64/cmpi/libthing.so.1", "lib64/cmpi/libthing.so", "lib/cmpi/libthing.so",
          "bin/libthing.so.1", "lib/libthing.so.1", "lib/libthing.so"}) {
        touch(file);
        EXPECT_EQ(found(), prefix_ / file);
    }
}

TEST_F(InstallPaths, KnowTheFolderThatTheProvidersAreInstalledIn) {
    fs::create_directories(prefix_ / "agents");
    touch("lib/cmpi/libthing.so");
    EXPECT_EQ(found("agents"), prefix_ / "lib/cmpi/libthing.so");
    touch("agents/libthing.so");
    for (const fs::path& installed : {fs::path("agents"), prefix_ / "agents"})
        EXPECT_EQ(found(installed), prefix_ / "agents/libthing.so");
    EXPECT_EQ(installedProviderFolder(), KORVA_CMPI_FOLDER);
}

TEST_F(InstallPaths, KnowTheFoldersOfTheSystem) {
    const std::vector<fs::path> folders = libraryFolders("/opt/x/bin");
    for (const char* folder : {"/usr/lib/cmpi", "/usr/lib64/cmpi", "/usr/local/lib/cmpi"})
        EXPECT_THAT(folders, testing::Contains(fs::path(folder)));
}

TEST_F(InstallPaths, DoNotTakeAFolderForALibrary) {
    fs::create_directories(prefix_ / "lib/libthing.so");
    EXPECT_EQ(found(), "libthing.so");
}

TEST_F(InstallPaths, TakeALocationThatIsAPathAsItStands) {
    EXPECT_EQ(findLibrary("/a/b.so", {prefix_}), "/a/b.so");
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
