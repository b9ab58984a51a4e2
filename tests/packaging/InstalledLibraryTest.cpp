// The installed libraries and their framework, under the habits of object managers' loaders.
#include <dlfcn.h>
#include <gmock/gmock.h>

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <iterator>

#include "host/broker/Invoke.h"
#include "host/broker/ProviderLibrary.h"
#include "host/mof/Schema.h"
#include "support/ComputerSystemService.h"
#include "support/TemporaryDirectory.h"

namespace {

namespace fs = std::filesystem;
using namespace cmpihost;

/// Lines of a file under /proc/self.
std::vector<std::string> linesOfProcess(const char* file) {
    std::ifstream stream(std::string("/proc/self/") + file);
    std::vector<std::string> lines;
    for (std::string line; std::getline(stream, line);) lines.push_back(line);
    return lines;
}

std::size_t openFiles() {
    const fs::directory_iterator files("/proc/self/fd");
    return static_cast<std::size_t>(std::distance(begin(files), end(files)));
}

long residentKiB() {
    constexpr const char* label = "VmRSS:";
    for (const std::string& line : linesOfProcess("status")) {
        if (line.compare(0, 6, label) == 0) return std::strtol(line.c_str() + 6, nullptr, 10);
    }
    return 0;
}

/// What object managers are told of, by default or with --bare.
struct Registered {
    const char* file;
    const char* provider;
};

class InstalledLibrary : public testing::TestWithParam<Registered> {
  protected:
    static void SetUpTestSuite() {
        const std::string command = KORVA_CMAKE " --install '" KORVA_BINARY_DIR
                                                "' --component provider --prefix '" +
                                    prefix_.string() + "' >/dev/null";
        ASSERT_EQ(std::system(command.c_str()), 0);
        setenv("ZBLOG_CONF", "", 1);
    }

    InstalledLibrary()
        : catalogue_(Schema::load(prefix_ / "share/korva-osstatus/schema")), broker_(&catalogue_) {
        broker_.route(ComputerSystemService::className, computers_);
    }
    void TearDown() override { EXPECT_THAT(broker_.takeViolations(), testing::IsEmpty()); }

    static std::string file() { return prefix_ / KORVA_CMPI_FOLDER / GetParam().file; }
    static LoadOptions options() {
        LoadOptions options;
        options.providerName = GetParam().provider;
        return options;
    }
    static std::vector<std::string> mapped() {
        std::vector<std::string> found;
        for (const std::string& line : linesOfProcess("maps")) {
            if (line.find(prefix_.string()) != std::string::npos) found.push_back(line);
        }
        return found;
    }
    std::size_t instancesOf(const char* className, ProviderLibrary& library) {
        OperationRequest request;
        request.operation = Operation::EnumerateInstances;
        request.path = {"root/cimv2", className};
        return invoke(library, broker_, request).instances.size();
    }

    static inline const TemporaryDirectory directory_;
    static inline const fs::path prefix_ = directory_.path();
    SchemaCatalogue catalogue_;
    ComputerSystemService computers_{"host1"};
    Broker broker_;
};

TEST_P(InstalledLibrary, OffersItsFactoriesByNameAndNoGenericOne) {
    void* const handle = dlopen(file().c_str(), RTLD_NOW | RTLD_GLOBAL);
    ASSERT_NE(handle, nullptr) << dlerror();
    for (const char* kind : {"Instance", "Association"}) {
        const std::string factory = std::string(GetParam().provider) + "_Create_" + kind + "MI";
        EXPECT_NE(dlsym(handle, factory.c_str()), nullptr) << factory;
    }
    for (const char* kind : {"Instance", "Association", "Method", "Indication", "Property"}) {
        const std::string generic = std::string("_Generic_Create_") + kind + "MI";
        EXPECT_EQ(dlsym(handle, generic.c_str()), nullptr) << generic;
    }
    EXPECT_EQ(dlclose(handle), 0);
    EXPECT_THAT(mapped(), testing::IsEmpty());
}

TEST_P(InstalledLibrary, ServesRequestsAfterAnIdleCleanup) {
    ProviderLibrary library(file(), broker_, options());
    for (int round = 0; round < 3; ++round) {
        EXPECT_EQ(instancesOf("KORVA_OperatingSystem", library), 1U);
        EXPECT_EQ(instancesOf("KORVA_RunningOS", library), 1U);
        CMPIInstanceMI* const instance = library.instanceMI();
        EXPECT_EQ(instance->ft->cleanup(instance, nullptr, 0).rc, CMPI_RC_OK);
        CMPIAssociationMI* const association = library.associationMI();
        EXPECT_EQ(association->ft->cleanup(association, nullptr, 0).rc, CMPI_RC_OK);
    }
}

TEST_P(InstalledLibrary, LeavesNothingBehindWhenItIsLoadedAndUnloadedAHundredTimes) {
    ProviderLibrary library(file(), broker_, options());
    std::size_t filesBefore = 0;
    long memoryBefore = 0;
    for (int round = 1; round <= 100; ++round) {
        library.load();
        ASSERT_EQ(instancesOf("KORVA_OperatingSystem", library), 1U);
        ASSERT_EQ(instancesOf("KORVA_InstalledOS", library), 1U);
        ASSERT_TRUE(library.unload(false));
        ASSERT_THAT(mapped(), testing::IsEmpty());
        if (round == 20) {
            filesBefore = openFiles();
            memoryBefore = residentKiB();
        }
    }
    EXPECT_EQ(openFiles(), filesBefore);
    EXPECT_LT(residentKiB() - memoryBefore, 512);
}

INSTANTIATE_TEST_SUITE_P(Libraries, InstalledLibrary,
                         testing::Values(Registered{"libkorvaosstatusfacade.so", "OSStatusFacade"},
                                         Registered{"libkorzbosstatusprofileprovider.so",
                                                    "OperatingSystemProvider"}),
                         [](const auto& row) { return std::string(row.param.provider); });

}  // namespace
