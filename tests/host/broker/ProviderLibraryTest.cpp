#include "host/broker/ProviderLibrary.h"

#include "BrokerFixture.h"

#include <dlfcn.h>
#include <elf.h>
#include <unistd.h>

#include <fstream>

namespace cmpihost {
namespace {

using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::IsEmpty;
using ::testing::StartsWith;

const std::string libraries = KORVA_BINARY_DIR "/lib/lib";
const std::string goodFile = libraries + "broker_test_good.so";
const std::string badFile = libraries + "broker_test_bad.so";

LoadOptions instanceOnly(const char* provider) {
    LoadOptions options;
    options.providerName = provider;
    options.association = false;
    return options;
}

bool inProcessMap(const std::string& file) {
    std::ifstream map("/proc/self/maps");
    std::string line;
    while (std::getline(map, line)) {
        if (line.find(file) != std::string::npos) return true;
    }
    return false;
}

class Library : public ::testing::Test {
  protected:
    Broker broker;

    /// What the attempt to load says; empty if it loads.
    std::string problem(const std::string& file, const LoadOptions& options, LoadProblem expected) {
        try {
            ProviderLibrary library(file, broker, options);
            return {};
        } catch (const LoadError& error) {
            EXPECT_EQ(error.problem(), expected) << error.what();
            return error.what();
        }
    }
};

TEST_F(Library, GivesBothInterfacesOfAGoodProvider) {
    ProviderLibrary library(goodFile, broker, {"Good"});
    EXPECT_TRUE(library.loaded());
    ASSERT_NE(library.instanceMI(), nullptr);
    ASSERT_NE(library.associationMI(), nullptr);
    EXPECT_STREQ(library.instanceMI()->ft->miName, "instanceGood");
    EXPECT_STREQ(library.associationMI()->ft->miName, "associationGood");
    EXPECT_NE(library.symbol("cleanups"), nullptr);
    EXPECT_EQ(library.symbol("noSuchSymbol"), nullptr);
    EXPECT_THAT(broker.violations(), IsEmpty());
}

TEST_F(Library, LoadsOnlyTheInterfacesThatAreAskedFor) {
    ProviderLibrary library(goodFile, broker, instanceOnly("Good"));
    EXPECT_NE(library.instanceMI(), nullptr);
    EXPECT_EQ(library.associationMI(), nullptr);
}

TEST_F(Library, LeavesTheProcessWhenItIsDestroyed) {
    { ProviderLibrary library(goodFile, broker, {"Good", false}); }
    EXPECT_FALSE(inProcessMap(goodFile));
}

TEST_F(Library, IsCleanedUpOnceForEachInterface) {
    void* const held = dlopen(goodFile.c_str(), RTLD_NOW);
    ASSERT_NE(held, nullptr);
    auto* const cleanups = static_cast<int*>(dlsym(held, "cleanups"));
    auto* const terminations = static_cast<int*>(dlsym(held, "terminations"));
    *cleanups = 0;
    *terminations = 0;
    {
        ProviderLibrary library(goodFile, broker, {"Good"});
        EXPECT_EQ(*cleanups, 0);
    }
    EXPECT_EQ(*cleanups, 2);
    EXPECT_EQ(*terminations, 2);
    dlclose(held);
}

TEST_F(Library, StaysLoadedWhenTheProviderRefusesToGo) {
    ProviderLibrary library(goodFile, broker, {"Good"});
    *static_cast<int*>(library.symbol("refuseUnload")) = 1;
    EXPECT_FALSE(library.unload(false));
    EXPECT_TRUE(library.loaded());
    EXPECT_NE(library.instanceMI(), nullptr);
    EXPECT_TRUE(library.unload(true));
    EXPECT_FALSE(library.loaded());
    EXPECT_EQ(library.instanceMI(), nullptr);
    EXPECT_EQ(library.symbol("cleanups"), nullptr);
    EXPECT_TRUE(library.unload(true));
}

TEST_F(Library, CanBeLoadedAgain) {
    ProviderLibrary library(goodFile, broker, {"Good"});
    for (int round = 0; round < 20; ++round) {
        EXPECT_TRUE(library.unload(false));
        library.load();
        library.load();
        ASSERT_NE(library.instanceMI(), nullptr);
    }
    EXPECT_THAT(broker.violations(), IsEmpty());
}

TEST_F(Library, TheGenericFactoryComesFirst) {
    ProviderLibrary library(libraries + "broker_test_generic.so", broker, instanceOnly("Named"));
    ASSERT_NE(library.instanceMI(), nullptr);
    EXPECT_STREQ(library.instanceMI()->ft->miName, "Named");
}

TEST_F(Library, AMissingFileIsTold) {
    EXPECT_EQ(problem("/no/such/library.so", {}, LoadProblem::FileMissing),
              "/no/such/library.so: No such file or directory");
    EXPECT_THAT(problem("libNoSuchProvider.so", {}, LoadProblem::FileMissing),
                HasSubstr("libNoSuchProvider.so: cannot open shared object file"));
}

/// A file with a name of its own: the tests run beside each other.
class FakeFile {
  public:
    explicit FakeFile(const std::string& content)
        : name_(::testing::TempDir() + "broker_fake_XXXXXX.so") {
        const int file = mkstemps(name_.data(), 3);
        EXPECT_NE(file, -1);
        EXPECT_EQ(write(file, content.data(), content.size()),
                  static_cast<ssize_t>(content.size()));
        close(file);
    }
    ~FakeFile() { std::remove(name_.c_str()); }
    const std::string& name() const { return name_; }

  private:
    std::string name_;
};

TEST_F(Library, AFileThatIsNoLibraryIsTold) {
    const FakeFile text("#!/bin/sh\necho not a library\n");
    EXPECT_EQ(problem(text.name(), {}, LoadProblem::NotALibrary),
              text.name() + ": not a shared library");
    const FakeFile empty("");
    EXPECT_EQ(problem(empty.name(), {}, LoadProblem::NotALibrary),
              empty.name() + ": not a shared library");
}

TEST_F(Library, ALibraryOfTheOtherWordSizeIsTold) {
    std::string header(64, '\0');
    header.replace(0, 4,
                   "\x7F"
                   "ELF");
    header[EI_CLASS] = static_cast<char>(sizeof(void*) == 8 ? ELFCLASS32 : ELFCLASS64);
    header[16] = ET_DYN;
    const FakeFile other(header);
    EXPECT_EQ(problem(other.name(), {}, LoadProblem::NotALibrary),
              other.name() + (sizeof(void*) == 8 ? ": a 32-bit library, this host is 64-bit"
                                                 : ": a 64-bit library, this host is 32-bit"));
}

TEST_F(Library, AnUnresolvedSymbolIsTold) {
    const std::string file = libraries + "broker_test_unresolved.so";
    EXPECT_THAT(problem(file, {}, LoadProblem::Unresolved),
                StartsWith(file + ": undefined symbol: symbolThatNobodyDefines"));
}

TEST_F(Library, AMissingFactoryIsTold) {
    const std::string plain = libraries + "broker_test_plain.so";
    EXPECT_EQ(problem(plain, {"Good"}, LoadProblem::NoFactory),
              plain + ": neither _Generic_Create_InstanceMI nor Good_Create_InstanceMI");
    EXPECT_EQ(
        problem(badFile, {"LowVersion"}, LoadProblem::NoFactory),
        badFile + ": neither _Generic_Create_AssociationMI nor LowVersion_Create_AssociationMI");
}

TEST_F(Library, AFactoryThatFailsIsTold) {
    const std::string where = badFile + ": factory of the Instance MI";
    EXPECT_EQ(problem(badFile, instanceOnly("Null"), LoadProblem::FactoryFailed),
              where + " returned null");
    EXPECT_EQ(problem(badFile, instanceOnly("Refusing"), LoadProblem::FactoryFailed),
              where + " answered status 2: not today");
    EXPECT_EQ(problem(badFile, instanceOnly("Throwing"), LoadProblem::FactoryFailed),
              where + " threw: no such luck");
    EXPECT_EQ(problem(badFile, instanceOnly("NoTable"), LoadProblem::NoTable),
              where + " gave no table");
    EXPECT_FALSE(inProcessMap(badFile));
}

TEST_F(Library, AVersionBelow100IsBadManners) {
    ProviderLibrary library(badFile, broker, instanceOnly("LowVersion"));
    EXPECT_THAT(broker.violations(),
                ::testing::Contains("table of the instance MI: ftVersion 1 is below 100"));
}

TEST_F(Library, AnMiVersionAboveItsTableIsBadManners) {
    ProviderLibrary library(badFile, broker, instanceOnly("HighMi"));
    EXPECT_THAT(
        broker.violations(),
        ::testing::Contains("table of the instance MI: miVersion 200 is above ftVersion 100"));
}

TEST_F(Library, EmptySlotsAreBadManners) {
    {
        ProviderLibrary library(badFile, broker, instanceOnly("EmptySlots"));
        EXPECT_THAT(broker.takeViolations(),
                    ElementsAre("table of the instance MI: miName is null",
                                "table of the instance MI: enumerateInstanceNames is null",
                                "table of the instance MI: enumerateInstances is null",
                                "table of the instance MI: getInstance is null",
                                "table of the instance MI: createInstance is null",
                                "table of the instance MI: modifyInstance is null",
                                "table of the instance MI: deleteInstance is null",
                                "table of the instance MI: execQuery is null"));
    }
    EXPECT_THAT(broker.violations(), ElementsAre("cleanup answered status 1"));
}

}  // namespace
}  // namespace cmpihost
