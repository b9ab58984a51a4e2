#include "host/broker/LibraryFile.h"

#include "support/TemporaryDirectory.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <fstream>
#include <iterator>
#include <random>

namespace cmpihost {
namespace {

using ::testing::Contains;
using ::testing::IsEmpty;
using ::testing::Not;

const std::string providers = KORVA_BINARY_DIR "/lib/libbroker_test_providers.so";

std::string contentOf(const std::string& file) {
    std::ifstream stream(file, std::ios::binary);
    return {std::istreambuf_iterator<char>(stream), {}};
}

TEST(LibraryFile, TellsTheFunctionsThatItOffersAndNothingElse) {
    const std::vector<std::string> names = exportedFunctions(providers);
    EXPECT_THAT(names, Contains("Good_Create_InstanceMI"));
    EXPECT_THAT(names, Contains("Good_Create_AssociationMI"));
    EXPECT_THAT(names, Contains("EmptySlots_Create_InstanceMI"));
    // A variable, and a function of another library.
    EXPECT_THAT(names, Not(Contains("cleanups")));
    EXPECT_THAT(names, Not(Contains("strlen")));
}

TEST(LibraryFile, ThatIsNoneOffersNothing) {
    EXPECT_THAT(exportedFunctions("/nowhere"), IsEmpty());
    EXPECT_THAT(exportedFunctions("/etc/passwd"), IsEmpty());
}

/// Whatever the bytes are, the reader stays within the file.
TEST(LibraryFile, MayBeDamagedAnywhere) {
    const TemporaryDirectory folder;
    const std::string whole = contentOf(providers);
    const std::string file = folder.path("damaged.so");
    std::mt19937 random(7);
    for (int round = 0; round < 300; ++round) {
        std::string damaged =
            whole.substr(0, round % 3 == 0 ? random() % whole.size() : whole.size());
        // The front holds the headers and the tables that lead to the names.
        for (int byte = 0; byte < 20 && !damaged.empty(); ++byte) {
            damaged[random() % std::min<std::size_t>(damaged.size(), 4096)] =
                static_cast<char>(random());
        }
        folder.write("damaged.so", damaged);
        EXPECT_LE(exportedFunctions(file).size(), whole.size());
    }
}

TEST(LibraryFile, IsFoundInTheFirstFolderThatHoldsIt) {
    const TemporaryDirectory folder;
    folder.write("a/libx.so.1", "");
    folder.write("b/libx.so", "");
    const std::vector<std::filesystem::path> folders = {folder.path("a"), folder.path("b")};
    EXPECT_EQ(findLibrary("x", folders), folder.path("a/libx.so.1"));
    EXPECT_EQ(findLibrary("y", folders), "liby.so");
    EXPECT_EQ(findLibrary("./y.so", folders), "./y.so");
}

TEST(LibraryFile, OfTheOtherWordSizeIsTakenOnlyWhereThereIsNoOther) {
    std::string foreign = contentOf(providers);
    foreign[4] = foreign[4] == 1 ? 2 : 1;
    const TemporaryDirectory folder;
    folder.write("a/libx.so", foreign);
    folder.write("b/libx.so", contentOf(providers));
    EXPECT_EQ(findLibrary("x", {folder.path("a"), folder.path("b")}), folder.path("b/libx.so"));
    EXPECT_EQ(findLibrary("x", {folder.path(""), folder.path("a")}), folder.path("a/libx.so"));
}

}  // namespace
}  // namespace cmpihost
