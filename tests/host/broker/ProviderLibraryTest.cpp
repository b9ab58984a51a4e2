// Provider libraries, loaded and asked as an object manager does.
#include "host/broker/ProviderLibrary.h"

#include "BrokerFixture.h"

#include "host/broker/Invoke.h"
#include "host/broker/ResultCollector.h"
#include "support/ProcessMap.h"

#include <dlfcn.h>
#include <elf.h>
#include <unistd.h>

namespace cmpihost {
namespace {

using ::testing::HasSubstr;
using ::testing::StartsWith;

const std::string libraries = KORVA_BINARY_DIR "/lib/lib";
const std::string testFile = libraries + "broker_test_providers.so";

LoadOptions instanceOnly(const char* provider) {
    LoadOptions options;
    options.providerName = provider;
    options.association = false;
    return options;
}

class Library : public ::testing::Test {
  protected:
    Broker broker;

    /// What the attempt to load says; empty if it loads.
    std::string problem(const std::string& file, const LoadOptions& options) {
        try {
            ProviderLibrary library(file, broker, options);
            return {};
        } catch (const LoadError& error) {
            return error.what();
        }
    }
};

TEST_F(Library, GivesBothInterfacesOfAGoodProvider) {
    ProviderLibrary library(testFile, broker, {"Good"});
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
    ProviderLibrary library(testFile, broker, instanceOnly("Good"));
    EXPECT_NE(library.instanceMI(), nullptr);
    EXPECT_EQ(library.associationMI(), nullptr);
}

TEST_F(Library, LeavesTheProcessWhenItIsDestroyed) {
    { ProviderLibrary library(testFile, broker, {"Good", false}); }
    EXPECT_FALSE(isMapped(testFile));
}

TEST_F(Library, IsCleanedUpOnceForEachInterface) {
    void* const held = dlopen(testFile.c_str(), RTLD_NOW);
    ASSERT_NE(held, nullptr);
    auto* const cleanups = static_cast<int*>(dlsym(held, "cleanups"));
    auto* const terminations = static_cast<int*>(dlsym(held, "terminations"));
    *cleanups = 0;
    *terminations = 0;
    {
        ProviderLibrary library(testFile, broker, {"Good"});
        EXPECT_EQ(*cleanups, 0);
    }
    EXPECT_EQ(*cleanups, 2);
    EXPECT_EQ(*terminations, 2);
    dlclose(held);
}

TEST_F(Library, StaysLoadedWhenTheProviderRefusesToGo) {
    ProviderLibrary library(testFile, broker, {"Good"});
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
    ProviderLibrary library(testFile, broker, {"Good"});
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
    EXPECT_EQ(problem("/no/such/library.so", {}), "/no/such/library.so: No such file or directory");
    EXPECT_THAT(problem("libNoSuchProvider.so", {}),
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

TEST_F(Library, AFileThatIsNoLibraryOfThisHostIsTold) {
    constexpr bool is64Bit = sizeof(void*) == 8;
    std::string header(64, '\0');
    header.replace(0, 4, ELFMAG);
    header[EI_CLASS] = static_cast<char>(is64Bit ? ELFCLASS32 : ELFCLASS64);
    header[16] = ET_DYN;
    std::string cutOff = header;
    cutOff[EI_CLASS] = static_cast<char>(is64Bit ? ELFCLASS64 : ELFCLASS32);
    const std::pair<std::string, std::string> rows[] = {
        {"#!/bin/sh\necho not a library\n", "not a shared library"},
        {"", "not a shared library"},
        {header, is64Bit ? "a 32-bit library, this host is 64-bit"
                         : "a 64-bit library, this host is 32-bit"},
        {cutOff.substr(0, 40), "the file is cut off"}};
    for (const auto& [content, complaint] : rows) {
        const FakeFile file(content);
        EXPECT_EQ(problem(file.name(), {}), file.name() + ": " + complaint);
    }
}

TEST_F(Library, AnUnresolvedSymbolIsTold) {
    const std::string file = libraries + "broker_test_unresolved.so";
    EXPECT_THAT(problem(file, {}),
                StartsWith(file + ": undefined symbol: symbolThatNobodyDefines"));
}

TEST_F(Library, AMissingFactoryIsTold) {
    const std::string plain = libraries + "broker_test_plain.so";
    const auto complaint = [](const std::string& file, const std::string& name) {
        std::string text = file + ": not a CMPI provider: it exports none of ";
        for (const std::string& each : {name, std::string("_Generic")}) {
            text += each + "_Create_InstanceMI, " + each + "_Create_AssociationMI, " + each +
                    "_Create_MethodMI, " + each + "_Create_PropertyMI";
            text += each == name ? ", " : "";
        }
        return text;
    };
    EXPECT_EQ(problem(plain, {"Good"}), complaint(plain, "Good"));
    EXPECT_EQ(problem(plain, {}), complaint(plain, "NAME"));
    EXPECT_EQ(problem(testFile, {"Nobody"}),
              testFile +
                  ": there is no provider Nobody in it, but EmptySlots, Good, HighMi, "
                  "LowVersion, NoTable, Null, Refusing, Throwing");
}

TEST_F(Library, AFactoryThatFailsIsTold) {
    const struct {
        const char* provider;
        const char* complaint;
    } rows[] = {{"Null", " returned null"},
                {"Refusing", " answered status 2: not today"},
                {"Throwing", " threw: no such luck"},
                {"NoTable", " gave no table"}};
    for (const auto& row : rows) {
        EXPECT_EQ(problem(testFile, instanceOnly(row.provider)),
                  testFile + ": factory of the Instance MI" + row.complaint);
    }
    EXPECT_FALSE(isMapped(testFile));
}

TEST_F(Library, WhatAnObjectManagerMightNotForgiveInATableIsAViolation) {
    const auto findingsOf = [this](const char* provider) {
        ProviderLibrary library(testFile, broker, instanceOnly(provider));
        return broker.takeViolations();
    };
    const std::string who = "table of the instance MI: ";
    std::vector<std::string> empty;
    for (const char* const slot :
         {"enumerateInstanceNames", "enumerateInstances", "getInstance", "createInstance",
          "modifyInstance", "deleteInstance", "execQuery"})
        empty.push_back(who + slot + " is null");
    const auto withCleanup = [&](const std::string& version) {
        std::vector<std::string> all = {who + version, who + "cleanup is null"};
        all.insert(all.end(), empty.begin(), empty.end());
        return all;
    };
    EXPECT_EQ(findingsOf("LowVersion"), withCleanup("ftVersion 1 is below 100"));
    EXPECT_EQ(findingsOf("HighMi"), withCleanup("miVersion 200 is above ftVersion 100"));
    empty.insert(empty.begin(), who + "miName is null");
    EXPECT_EQ(findingsOf("EmptySlots"), empty);
    EXPECT_THAT(broker.violations(), ElementsAre("cleanup answered status 1"));
}

class Invocation : public ::testing::Test {
  protected:
    Broker broker;
    ProviderLibrary library{testFile, broker, {"Good"}};

    static OperationRequest request(Operation operation, std::vector<KeyBinding> keys = {}) {
        OperationRequest result;
        result.operation = operation;
        result.path = {"root/cimv2", "TEST_Thing", std::move(keys)};
        return result;
    }
    Outcome run(const OperationRequest& given, const CollectorSetup& setup = {}) {
        return invoke(library, broker, given, setup);
    }
    std::string property(const Outcome& outcome, const char* name) {
        const Value* const value = outcome.instances.at(0).property(name);
        return value == nullptr ? "(absent)" : value->toText();
    }
    std::string filtersOf(const Outcome& outcome) {
        std::string text = property(outcome, "Name");
        for (const char* name : {"AssocClass", "ResultClass", "Role", "ResultRole"})
            text += ' ' + property(outcome, name);
        return text;
    }
};

TEST_F(Invocation, CollectsPathsInstancesAndTheEnd) {
    const Outcome names = run(request(Operation::EnumerateInstanceNames));
    EXPECT_EQ(names.rc, CMPI_RC_OK);
    EXPECT_FALSE(names.message);
    EXPECT_EQ(names.doneCount, 1u);
    ASSERT_EQ(names.paths.size(), 2u);
    EXPECT_EQ(toString(names.paths[0]), "root/cimv2:TEST_Thing.Name=\"one\"");
    EXPECT_THAT(names.violations, IsEmpty());

    const Outcome instances = run(request(Operation::EnumerateInstances));
    ASSERT_EQ(instances.instances.size(), 2u);
    EXPECT_EQ(property(instances, "Name"), "one");
    EXPECT_EQ(property(instances, "Properties"), "(null)");
}

TEST_F(Invocation, HandsThePropertyListOver) {
    OperationRequest given = request(Operation::EnumerateInstances);
    given.properties = {{"A", "B"}};
    EXPECT_EQ(property(run(given), "Properties"), "AB");
    given.properties = std::vector<std::string>{};
    EXPECT_EQ(property(run(given), "Properties"), "");
}

TEST_F(Invocation, KeysArriveWithTheirTypes) {
    const auto typeOf = [this](const Value& key) {
        return property(run(request(Operation::GetInstance, {{"Name", key}})), "KeyType");
    };
    EXPECT_EQ(typeOf("text"), std::to_string(CMPI_string));
    EXPECT_EQ(typeOf(Value::fromText("text", CMPI_chars)), std::to_string(CMPI_chars));
    EXPECT_EQ(typeOf(Value::fromUnsigned(5)), std::to_string(CMPI_uint64));
    EXPECT_EQ(typeOf(Value::fromBoolean(true)), std::to_string(CMPI_boolean));
    EXPECT_EQ(typeOf(Value::fromReference({"", "TEST_Other"})), std::to_string(CMPI_ref));
}

TEST_F(Invocation, TheContextTellsAboutTheRequest) {
    const auto contextOf = [this](const RequestContext& context) {
        OperationRequest given = request(Operation::GetInstance);
        given.context = context;
        const Outcome outcome = run(given);
        return property(outcome, "Flags") + ' ' + property(outcome, CMPIPrincipal) + ' ' +
               property(outcome, CMPIRole) + ' ' + property(outcome, CMPIInitNameSpace);
    };
    EXPECT_EQ(contextOf({}), "0 (none) (none) root/cimv2");
    EXPECT_EQ(contextOf({CMPI_FLAG_LocalOnly, "operator", "admin"}), "1 operator admin root/cimv2");
}

TEST_F(Invocation, WriteOperationsReachTheirSlots) {
    OperationRequest create = request(Operation::CreateInstance);
    create.instance = {{"root/cimv2", "TEST_Thing"}, {{"Name", "new"}}};
    const Outcome created = run(create);
    ASSERT_EQ(created.paths.size(), 1u);
    EXPECT_EQ(toString(created.paths[0]), "root/cimv2:TEST_Thing.Name=\"new\"");

    EXPECT_EQ(run(request(Operation::ModifyInstance)).rc, CMPI_RC_ERR_ACCESS_DENIED);
    const Outcome deleted = run(request(Operation::DeleteInstance));
    EXPECT_EQ(deleted.rc, CMPI_RC_ERR_NOT_FOUND);
    EXPECT_EQ(deleted.message, "It has gone");
    EXPECT_EQ(deleted.doneCount, 0u);
}

TEST_F(Invocation, AssociationFiltersArriveAsGiven) {
    OperationRequest given = request(Operation::Associators);
    given.assocClass = "TEST_Link";
    given.resultRole = "Right";
    EXPECT_EQ(filtersOf(run(given)), "associators TEST_Link (null) (null) Right");

    given.operation = Operation::References;
    given.resultClass = "TEST_Link";
    given.role = "Left";
    EXPECT_EQ(filtersOf(run(given)), "references (null) TEST_Link Left (null)");

    for (const auto& [operation, name] : {std::pair(Operation::AssociatorNames, "associatorNames"),
                                          {Operation::ReferenceNames, "referenceNames"}}) {
        EXPECT_EQ(run(request(operation)).paths.at(0).key("Name")->text(), name);
    }
}

TEST_F(Invocation, AnExceptionOfTheProviderGoesOnOnceTheRequestHasEnded) {
    OperationRequest given = request(Operation::ExecQuery);
    given.query = "SELECT * FROM TEST_Thing";
    try {
        run(given);
        FAIL() << "nothing was thrown";
    } catch (const std::runtime_error& error) {
        EXPECT_STREQ(error.what(), "SELECT * FROM TEST_Thing in WQL");
    }
    const std::size_t ended = broker.quarantined();
    EXPECT_GT(ended, 0u);
    EXPECT_EQ(run(request(Operation::EnumerateInstanceNames)).paths.size(), 2u);
    EXPECT_THAT(broker.violations(), IsEmpty());
}

TEST_F(Invocation, TheCollectorCanBePreparedToRefuse) {
    const Outcome outcome = run(
        request(Operation::EnumerateInstances),
        [](ResultCollector& collector) { collector.failReturnInstance(2, CMPI_RC_ERR_FAILED); });
    EXPECT_EQ(outcome.instances.size(), 1u);
    ASSERT_EQ(outcome.refusedInstances.size(), 1u);
    EXPECT_EQ(outcome.refusedInstances[0].property("Name")->text(), "two");
    EXPECT_EQ(outcome.doneCount, 1u);
}

TEST_F(Invocation, TellsTheViolationsOfItsOwnRequestOnly) {
    const TestCatalogue catalogue = testClasses();
    Broker schooled(&catalogue);
    ProviderLibrary other(library.file(), schooled, {"Good"});
    const Outcome outcome = invoke(other, schooled, request(Operation::EnumerateInstances));
    EXPECT_THAT(outcome.violations, ElementsAre("TEST_Thing has no property Properties"));
    EXPECT_THAT(invoke(other, schooled, request(Operation::EnumerateInstanceNames)).violations,
                IsEmpty());
    EXPECT_EQ(schooled.violations().size(), 1u);
}

TEST_F(Invocation, AMissingInterfaceOrSlotIsNotSupported) {
    Outcome outcome =
        invoke(ManagementInterfaces{}, broker, request(Operation::EnumerateInstances));
    EXPECT_EQ(outcome.rc, CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_THAT(outcome.violations, IsEmpty());
    EXPECT_EQ(invoke(ManagementInterfaces{}, broker, request(Operation::Associators)).rc,
              CMPI_RC_ERR_NOT_SUPPORTED);

    CMPIAssociationMIFT table{};
    CMPIAssociationMI mi = {nullptr, &table};
    ManagementInterfaces interfaces;
    interfaces.association = &mi;
    outcome = invoke(interfaces, broker, request(Operation::ReferenceNames));
    EXPECT_EQ(outcome.rc, CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_THAT(outcome.violations, ElementsAre("no function for ReferenceNames"));
}

TEST_F(Invocation, AMissingInterfaceIsToldWithTheFactoryThatIsLacking) {
    for (const auto& [operation, kind] : {std::pair(Operation::InvokeMethod, "method"),
                                          {Operation::GetProperty, "property"},
                                          {Operation::SetProperty, "property"}}) {
        const Outcome outcome = run(request(operation));
        std::string factory = std::string("Good_Create_") + kind + "MI";
        factory[12] = static_cast<char>(std::toupper(factory[12]));
        EXPECT_EQ(outcome.rc, CMPI_RC_ERR_NOT_SUPPORTED);
        EXPECT_EQ(outcome.message, std::string("libbroker_test_providers.so has no ") + kind +
                                       " interface: it exports no " + factory);
        EXPECT_THAT(outcome.violations, IsEmpty());
    }
}

TEST(Operations, HaveTheNamesOfTheirKind) {
    EXPECT_STREQ(operationName(Operation::EnumerateInstances), "EnumerateInstances");
    EXPECT_STREQ(operationName(Operation::ReferenceNames), "ReferenceNames");
    EXPECT_STREQ(operationName(Operation::SetProperty), "SetProperty");
}

}  // namespace
}  // namespace cmpihost
