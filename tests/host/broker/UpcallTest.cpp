// What a provider gets that asks for objects of other classes.
#include "BrokerFixture.h"

#include "host/broker/ComputerSystemService.h"
#include "host/broker/ProviderLibrary.h"

#include <new>

namespace cmpihost {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;

class Upcalls : public BrokerTest {
  protected:
    const CMPIContext* context = request.makeContext({}, "root/cimv2");

    std::vector<std::string> names(const CMPIEnumeration* items) {
        std::vector<std::string> result;
        while (CMHasNext(items, nullptr) != 0) {
            const CMPIData item = CMGetNext(items, &status);
            if (status.rc != CMPI_RC_OK) {
                result.push_back("status " + std::to_string(status.rc));
                break;
            }
            const CMPIObjectPath* const path =
                item.type == CMPI_ref ? item.value.ref : CMGetObjectPath(item.value.inst, nullptr);
            result.push_back(toString(valueOf(path)));
        }
        return result;
    }
};

TEST_F(Upcalls, AnUnknownClassGivesNullAndItsStatus) {
    EXPECT_EQ(CBEnumInstances(mb, context, newPath(), nullptr, &status), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_CLASS);
    EXPECT_EQ(textOf(status.msg), "No provider for class TEST_Thing");
    EXPECT_EQ(CBEnumInstanceNames(mb, context, newPath(), nullptr), nullptr);
    EXPECT_EQ(CBGetInstance(mb, context, newPath(), nullptr, &status), nullptr);
    EXPECT_EQ(CBDeleteInstance(mb, context, newPath()).rc, CMPI_RC_ERR_INVALID_CLASS);
    EXPECT_THAT(broker.violations(), IsEmpty());
}

TEST_F(Upcalls, ADeclaredClassWithoutAProviderIsNotSupported) {
    const TestCatalogue catalogue = testClasses();
    Broker schooled(&catalogue);
    Request scope(schooled);
    EXPECT_EQ(CBEnumInstances(schooled.cmpi(), context, newPath(), nullptr, &status), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_NOT_SUPPORTED);
}

TEST_F(Upcalls, NullArgumentsAreViolations) {
    EXPECT_EQ(CBEnumInstances(mb, context, nullptr, nullptr, &status), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_PARAMETER);
    EXPECT_EQ(CBEnumInstances(mb, nullptr, newPath(), nullptr, &status), nullptr);
    EXPECT_THAT(broker.violations(),
                ElementsAre("CMPIBrokerFT.enumerateInstances: null CMPIObjectPath",
                            "CMPIBrokerFT.enumerateInstances: null CMPIContext"));
}

TEST_F(Upcalls, ServicesThatTheHostDoesNotHaveSaySo) {
    EXPECT_EQ(CBDeliverIndication(mb, context, "root", newInstance()).rc,
              CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_EQ(CBSetProperty(mb, context, newPath(), "A", "x", CMPI_chars).rc,
              CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_EQ(CBGetProperty(mb, context, newPath(), "A", &status).state, CMPI_notFound);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_NOT_SUPPORTED);
    CBInvokeMethod(mb, context, newPath(), "Run", nullptr, nullptr, &status);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_NOT_SUPPORTED);
}

class ComputerSystems : public Upcalls {
  protected:
    ComputerSystems() { broker.route("korva_computersystem", service); }

    CMPIObjectPath* classPath() { return newPath("KORVA_ComputerSystem"); }

    ComputerSystemService service{std::string("node7")};
};

TEST_F(ComputerSystems, ThereIsOneNamedAfterTheHost) {
    const CMPIEnumeration* const items =
        CBEnumInstances(mb, context, classPath(), nullptr, &status);
    ASSERT_NE(items, nullptr);
    const CMPIData item = CMGetNext(items, &status);
    ASSERT_EQ(item.type, CMPI_instance);
    const InstanceValue computer = valueOf(item.value.inst);
    EXPECT_EQ(toString(computer.path),
              "root/cimv2:KORVA_ComputerSystem.CreationClassName="
              "\"KORVA_ComputerSystem\",Name=\"node7\"");
    EXPECT_EQ(computer.property("Name")->text(), "node7");
    EXPECT_EQ(computer.property("CreationClassName")->text(), "KORVA_ComputerSystem");
    EXPECT_FALSE(CMHasNext(items, nullptr));
}

TEST_F(ComputerSystems, KeysOfAnEnumeratedPathDoNotMatter) {
    CMPIObjectPath* const path = classPath();
    CMAddKey(path, "Name", "other", CMPI_chars);
    EXPECT_EQ(names(CBEnumInstanceNames(mb, context, path, &status)).size(), 1u);
}

TEST_F(ComputerSystems, ThereMayBeNoneOrMany) {
    service.setNames({});
    EXPECT_THAT(names(CBEnumInstances(mb, context, classPath(), nullptr, &status)), IsEmpty());
    EXPECT_EQ(status.rc, CMPI_RC_OK);
    service.setNames({"a", "b", "c"});
    EXPECT_EQ(names(CBEnumInstances(mb, context, classPath(), nullptr, &status)).size(), 3u);
}

TEST_F(ComputerSystems, OneIsFoundByItsKeys) {
    CMPIObjectPath* const path = classPath();
    CMAddKey(path, "Name", "node7", CMPI_chars);
    EXPECT_EQ(CBGetInstance(mb, context, path, nullptr, &status), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_NOT_FOUND);
    CMAddKey(path, "CreationClassName", "KORVA_ComputerSystem", CMPI_chars);
    EXPECT_NE(CBGetInstance(mb, context, path, nullptr, &status), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_OK);
}

TEST_F(ComputerSystems, AnEnumerationMayFail) {
    service.failEnumerations(CMPI_RC_ERR_ACCESS_DENIED);
    EXPECT_EQ(CBEnumInstances(mb, context, classPath(), nullptr, &status), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_ACCESS_DENIED);
    EXPECT_EQ(status.msg, nullptr);
    service.failEnumerations(CMPI_RC_OK);
    EXPECT_NE(CBEnumInstances(mb, context, classPath(), nullptr, &status), nullptr);
}

TEST_F(ComputerSystems, AStepOfAnEnumerationMayFail) {
    service.setNames({"a", "b", "c"});
    service.failAtNext(2, CMPI_RC_ERR_ACCESS_DENIED);
    EXPECT_THAT(names(CBEnumInstanceNames(mb, context, classPath(), &status)),
                ElementsAre("root/cimv2:KORVA_ComputerSystem.CreationClassName="
                            "\"KORVA_ComputerSystem\",Name=\"a\"",
                            "status 2"));
}

TEST_F(ComputerSystems, TheyCannotBeAltered) {
    EXPECT_EQ(CBDeleteInstance(mb, context, classPath()).rc, CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_EQ(CBModifyInstance(mb, context, classPath(), newInstance(), nullptr).rc,
              CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_EQ(CBCreateInstance(mb, context, classPath(), newInstance(), &status), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_NOT_SUPPORTED);
}

/// Answers with what it was asked.
class EchoService final : public UpcallService {
  public:
    UpcallAnswer perform(Broker&, const OperationRequest& request) override {
        last = request;
        UpcallAnswer answer;
        answer.paths.push_back(request.path);
        answer.instances.push_back({request.path, {}});
        return answer;
    }
    OperationRequest last;
};

TEST_F(Upcalls, AllOperationsReachTheServiceOfTheirClass) {
    EchoService service;
    broker.route("TEST_Thing", service);
    const CMPIContext* const flagged = request.makeContext({5, "me", "role"}, "root");
    const char* properties[] = {"A", "B", nullptr};

    EXPECT_NE(CBEnumInstances(mb, flagged, newPath(), properties, &status), nullptr);
    EXPECT_EQ(service.last.operation, Operation::EnumerateInstances);
    EXPECT_THAT(*service.last.properties, ElementsAre("A", "B"));
    EXPECT_EQ(service.last.context.flags, 5u);
    EXPECT_EQ(service.last.context.principal, "me");
    EXPECT_EQ(service.last.context.role, "role");

    EXPECT_NE(CBGetInstance(mb, flagged, newPath(), nullptr, &status), nullptr);
    EXPECT_EQ(service.last.operation, Operation::GetInstance);
    EXPECT_FALSE(service.last.properties);
    EXPECT_NE(CBCreateInstance(mb, flagged, newPath(), newInstance(), &status), nullptr);
    EXPECT_EQ(service.last.operation, Operation::CreateInstance);
    EXPECT_EQ(CBModifyInstance(mb, flagged, newPath(), newInstance(), properties).rc, CMPI_RC_OK);
    EXPECT_EQ(service.last.operation, Operation::ModifyInstance);
    EXPECT_EQ(CBDeleteInstance(mb, flagged, newPath()).rc, CMPI_RC_OK);
    EXPECT_EQ(service.last.operation, Operation::DeleteInstance);
    EXPECT_NE(CBExecQuery(mb, flagged, newPath(), "SELECT", "WQL", &status), nullptr);
    EXPECT_EQ(service.last.query, "SELECT");
}

TEST_F(Upcalls, AssociationRequestsGoToTheAssociationThatTheyName) {
    EchoService link;
    EchoService thing;
    broker.route("TEST_Link", link);
    broker.route("TEST_Thing", thing);
    const CMPIEnumeration* const items = CBAssociators(
        mb, context, newPath(), "TEST_Link", "TEST_Other", "Left", "Right", nullptr, &status);
    EXPECT_EQ(CMGetNext(items, nullptr).type, CMPI_instance);
    EXPECT_EQ(link.last.operation, Operation::Associators);
    EXPECT_EQ(link.last.resultClass, "TEST_Other");
    EXPECT_EQ(link.last.role, "Left");
    EXPECT_EQ(link.last.resultRole, "Right");

    CBReferences(mb, context, newPath(), "TEST_Link", nullptr, nullptr, &status);
    EXPECT_EQ(link.last.operation, Operation::References);
    CBReferenceNames(mb, context, newPath(), nullptr, "Left", &status);
    EXPECT_EQ(thing.last.operation, Operation::ReferenceNames);
    const CMPIEnumeration* const paths =
        CBAssociatorNames(mb, context, newPath(), nullptr, nullptr, nullptr, nullptr, &status);
    EXPECT_EQ(CMGetNext(paths, nullptr).type, CMPI_ref);
    EXPECT_EQ(thing.last.operation, Operation::AssociatorNames);
    EXPECT_FALSE(thing.last.assocClass);
}

TEST_F(Upcalls, ALaterRouteReplacesAnEarlierOne) {
    EchoService first;
    EchoService second;
    broker.route("TEST_Thing", first);
    broker.route("test_THING", second);
    CBDeleteInstance(mb, context, newPath());
    EXPECT_EQ(first.last.path.className, "");
    EXPECT_EQ(second.last.path.className, "TEST_Thing");
}

/// Fails in the way of C++.
class ThrowingService final : public UpcallService {
  public:
    UpcallAnswer perform(Broker&, const OperationRequest&) override { throw std::bad_alloc(); }
};

TEST_F(Upcalls, AnExceptionNeverReachesTheProvider) {
    ThrowingService service;
    broker.route("TEST_Thing", service);
    EXPECT_EQ(CBEnumInstances(mb, context, newPath(), nullptr, &status), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(CBDeleteInstance(mb, context, newPath()).rc, CMPI_RC_ERR_FAILED);
}

class LibraryUpcalls : public Upcalls {
  protected:
    LibraryUpcalls() { broker.route("TEST_Thing", library); }

    ProviderLibrary library{KORVA_BINARY_DIR "/lib/libbroker_test_good.so", broker, {"Good"}};
};

TEST_F(LibraryUpcalls, AreAnsweredByTheOtherLibrary) {
    EXPECT_THAT(
        names(CBEnumInstances(mb, context, newPath(), nullptr, &status)),
        ElementsAre("root/cimv2:TEST_Thing.Name=\"one\"", "root/cimv2:TEST_Thing.Name=\"two\""));
    EXPECT_THAT(
        names(CBEnumInstanceNames(mb, context, newPath(), &status)),
        ElementsAre("root/cimv2:TEST_Thing.Name=\"one\"", "root/cimv2:TEST_Thing.Name=\"two\""));
    EXPECT_THAT(broker.violations(), IsEmpty());
}

TEST_F(LibraryUpcalls, PassTheStatusAndItsTextOn) {
    EXPECT_EQ(CBDeleteInstance(mb, context, newPath()).rc, CMPI_RC_ERR_NOT_FOUND);
    EXPECT_EQ(textOf(CBDeleteInstance(mb, context, newPath()).msg), "It has gone");
}

TEST_F(LibraryUpcalls, TheirObjectsLiveUntilTheOuterRequestEnds) {
    CMPIInstance* const instance = CBGetInstance(mb, context, newPath(), nullptr, &status);
    ASSERT_NE(instance, nullptr);
    EXPECT_GT(CMGetPropertyCount(instance, nullptr), 0u);
    request.end();
    EXPECT_EQ(CMGetPropertyCount(instance, nullptr), 0u);
    EXPECT_EQ(broker.violations().size(), 1u);
}

TEST_F(LibraryUpcalls, AnExceptionOfTheOtherLibraryBecomesAStatus) {
    EXPECT_EQ(CBExecQuery(mb, context, newPath(), "SELECT", "WQL", &status), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_FAILED);
    EXPECT_THAT(request.violations(), ElementsAre("an exception left ExecQuery of " KORVA_BINARY_DIR
                                                  "/lib/libbroker_test_good.so"));
}

}  // namespace
}  // namespace cmpihost
