// What a provider gets that asks for objects of other classes.
#include "BrokerFixture.h"

#include "host/broker/ProviderLibrary.h"
#include "support/ComputerSystemService.h"

#include <new>
#include <utility>

namespace cmpihost {
namespace {

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
    RequestScope scope(schooled);
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
}

/// Answers with a value and two arguments, and keeps what it was asked.
class MethodService final : public UpcallService {
  public:
    OperationRequest asked;
    UpcallAnswer answer;

    UpcallAnswer perform(Broker&, const OperationRequest& request) override {
        asked = request;
        return answer;
    }
};

TEST_F(Upcalls, AMethodGetsItsArgumentsAndGivesItsOwnAndAValue) {
    MethodService service;
    service.answer.value = Value::fromUnsigned(7, CMPI_uint32);
    service.answer.arguments = {{"Text", "out"}, {"Count", Value::fromUnsigned(2, CMPI_uint16)}};
    broker.routeOthers(service);
    CMPIArgs* const in = CMNewArgs(mb, nullptr);
    CMPIArgs* const out = CMNewArgs(mb, nullptr);
    CMAddArg(in, "Text", "in", CMPI_chars);
    CMAddArg(out, "text", "before", CMPI_chars);
    EXPECT_EQ(shown(CBInvokeMethod(mb, context, newPath(), "Run", in, out, &status)), "uint32 7");
    EXPECT_EQ(status.rc, CMPI_RC_OK);
    EXPECT_STREQ(operationName(service.asked.operation), "InvokeMethod");
    EXPECT_EQ(service.asked.method, "Run");
    ASSERT_EQ(service.asked.arguments.size(), 1U);
    EXPECT_EQ(service.asked.arguments[0].value, Value("in"));
    EXPECT_EQ(shown(CMGetArg(out, "Text", nullptr)), "string out");
    EXPECT_EQ(shown(CMGetArg(out, "Count", nullptr)), "uint16 2");

    service.answer = {};
    EXPECT_EQ(shown(CBInvokeMethod(mb, context, newPath(), "Run", nullptr, nullptr, &status)),
              "null null");
    service.answer.rc = CMPI_RC_ERR_METHOD_NOT_FOUND;
    EXPECT_EQ(shown(CBInvokeMethod(mb, context, newPath(), "Run", in, out, &status)), "bad");
    EXPECT_EQ(status.rc, CMPI_RC_ERR_METHOD_NOT_FOUND);
    EXPECT_THAT(broker.violations(), IsEmpty());
    CBInvokeMethod(mb, context, newPath(), nullptr, in, out, &status);
    EXPECT_THAT(broker.violations(), ElementsAre("CMPIBrokerFT.invokeMethod: null method"));
}

TEST_F(Upcalls, APropertyIsSetAndGot) {
    MethodService service;
    broker.route("TEST_Thing", service);
    EXPECT_EQ(CBSetProperty(mb, context, newPath(), "A", "x", CMPI_chars).rc, CMPI_RC_OK);
    EXPECT_STREQ(operationName(service.asked.operation), "SetProperty");
    EXPECT_EQ(service.asked.property, "A");
    EXPECT_EQ(service.asked.value, Value("x"));
    // Success without a value: there is no such property.
    EXPECT_EQ(shown(CBGetProperty(mb, context, newPath(), "B", &status)), "missing");
    EXPECT_EQ(status.rc, CMPI_RC_ERR_NO_SUCH_PROPERTY);
    EXPECT_STREQ(operationName(service.asked.operation), "GetProperty");
    service.answer.value = Value("y");
    EXPECT_EQ(shown(CBGetProperty(mb, context, newPath(), "B", &status)), "string y");
    EXPECT_EQ(status.rc, CMPI_RC_OK);
    service.answer.rc = CMPI_RC_ERR_ACCESS_DENIED;
    EXPECT_EQ(CBSetProperty(mb, context, newPath(), "A", nullptr, CMPI_string).rc,
              CMPI_RC_ERR_ACCESS_DENIED);
    EXPECT_EQ(service.asked.value, Value::null(CMPI_string));
    EXPECT_EQ(shown(CBGetProperty(mb, context, newPath(), "B", &status)), "bad");
    EXPECT_EQ(status.rc, CMPI_RC_ERR_ACCESS_DENIED);
}

TEST_F(Upcalls, WhatProvidersLogAndTraceReachesTheListener) {
    EXPECT_EQ(CMLogMessage(mb, CMPI_SEV_ERROR, "ID1", "unheard", nullptr).rc, CMPI_RC_OK);
    std::vector<std::string> heard;
    broker.setMessageSink([&](const ProviderMessage& message) {
        heard.push_back((message.trace ? "trace " : "log ") + std::to_string(message.level) + ' ' +
                        message.source + ": " + message.text);
    });
    CMPIString* const text = CMNewString(mb, "a string", nullptr);
    EXPECT_EQ(CMLogMessage(mb, CMPI_SEV_ERROR, "ID1", "a text", text).rc, CMPI_RC_OK);
    EXPECT_EQ(CMLogMessage(mb, CMPI_SEV_INFO, nullptr, nullptr, text).rc, CMPI_RC_OK);
    EXPECT_EQ(CMTraceMessage(mb, CMPI_LEV_VERBOSE, "part", "a text", nullptr).rc, CMPI_RC_OK);
    EXPECT_EQ(CMTraceMessage(mb, CMPI_LEV_INFO, "part", nullptr, nullptr).rc, CMPI_RC_OK);
    EXPECT_THAT(heard, ElementsAre("log 1 ID1: a text", "log 2 : a string", "trace 3 part: a text",
                                   "trace 1 part: "));
}

class ComputerSystems : public Upcalls {
  protected:
    ComputerSystems() { broker.route("korva_computersystem", service); }

    CMPIObjectPath* classPath() { return newPath("KORVA_ComputerSystem"); }

    ComputerSystemService service{std::string("node7")};
};

TEST_F(ComputerSystems, AreEnumeratedWhateverKeysTheAskedPathHas) {
    CMPIObjectPath* const path = classPath();
    CMAddKey(path, "Name", "other", CMPI_chars);
    const CMPIEnumeration* const items = CBEnumInstances(mb, context, path, nullptr, &status);
    ASSERT_NE(items, nullptr);
    const CMPIData item = CMGetNext(items, &status);
    ASSERT_EQ(item.type, CMPI_instance);
    const ObjectPathValue node7 = {
        "root/cimv2",
        "KORVA_ComputerSystem",
        {{"CreationClassName", "KORVA_ComputerSystem"}, {"Name", "node7"}}};
    EXPECT_EQ(
        valueOf(item.value.inst),
        (InstanceValue{node7, {{"CreationClassName", "KORVA_ComputerSystem"}, {"Name", "node7"}}}));
    EXPECT_FALSE(CMHasNext(items, nullptr));
    service.setNames({});
    EXPECT_THAT(names(CBEnumInstanceNames(mb, context, path, &status)), IsEmpty());
    EXPECT_EQ(status.rc, CMPI_RC_OK);
    service.setNames({"a", "b", "c"});
    EXPECT_EQ(names(CBEnumInstanceNames(mb, context, path, &status)).size(), 3u);
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

/// Answers with the path that it was asked for, and keeps the rest as text.
class EchoService final : public UpcallService {
  public:
    UpcallAnswer perform(Broker&, const OperationRequest& request) override {
        last = operationName(request.operation);
        last += ' ' + std::to_string(request.context.flags) + ' ' +
                request.context.principal.value_or("-") + ' ' + request.context.role.value_or("-");
        note(" assocClass=", request.assocClass);
        note(" resultClass=", request.resultClass);
        note(" role=", request.role);
        note(" resultRole=", request.resultRole);
        if (request.properties) {
            std::string list;
            for (const std::string& name : *request.properties) list += ' ' + name;
            last += " [" + list.substr(1) + ']';
        }
        if (!request.query.empty()) last += ' ' + request.query + " in " + request.queryLanguage;
        const std::string& className = request.instance.path.className;
        if (!className.empty()) last += " of " + className;
        UpcallAnswer answer;
        answer.paths.push_back(request.path);
        answer.instances.push_back({request.path, {}});
        return answer;
    }
    std::string last;

  private:
    void note(const char* name, const std::optional<std::string>& text) {
        if (text) last += name + *text;
    }
};

TEST_F(Upcalls, AllOperationsReachTheServiceOfTheirClassAsTheyWereAsked) {
    EchoService thing;
    EchoService link;
    broker.route("TEST_Thing", thing);
    broker.route("TEST_Link", link);
    const CMPIContext* const flagged = request.makeContext({5, "me", "role"}, "root");
    const char* properties[] = {"A", "B", nullptr};
    const auto asked = [](EchoService& service) { return std::exchange(service.last, ""); };

    CMPIEnumeration* items = CBEnumInstances(mb, flagged, newPath(), properties, &status);
    EXPECT_EQ(CMGetNext(items, nullptr).type, CMPI_instance);
    EXPECT_EQ(asked(thing), "EnumerateInstances 5 me role [A B]");
    items = CBEnumInstanceNames(mb, context, newPath(), &status);
    EXPECT_EQ(CMGetNext(items, nullptr).type, CMPI_ref);
    EXPECT_EQ(asked(thing), "EnumerateInstanceNames 0 - -");
    EXPECT_NE(CBGetInstance(mb, context, newPath(), nullptr, &status), nullptr);
    EXPECT_EQ(asked(thing), "GetInstance 0 - -");
    EXPECT_NE(CBCreateInstance(mb, context, newPath(), newInstance("TEST_New"), &status), nullptr);
    EXPECT_EQ(asked(thing), "CreateInstance 0 - - of TEST_New");
    EXPECT_EQ(CBModifyInstance(mb, context, newPath(), newInstance("TEST_New"), properties).rc,
              CMPI_RC_OK);
    EXPECT_EQ(asked(thing), "ModifyInstance 0 - - [A B] of TEST_New");
    EXPECT_EQ(CBDeleteInstance(mb, context, newPath()).rc, CMPI_RC_OK);
    EXPECT_EQ(asked(thing), "DeleteInstance 0 - -");
    EXPECT_NE(CBExecQuery(mb, context, newPath(), "SELECT", "CQL", &status), nullptr);
    EXPECT_EQ(asked(thing), "ExecQuery 0 - - SELECT in CQL");

    // Association requests go to the association that they name.
    items = CBAssociators(mb, context, newPath(), "TEST_Link", "TEST_Other", "Left", "Right",
                          properties, &status);
    EXPECT_EQ(CMGetNext(items, nullptr).type, CMPI_instance);
    EXPECT_EQ(asked(link),
              "Associators 0 - - assocClass=TEST_Link resultClass=TEST_Other role=Left "
              "resultRole=Right [A B]");
    items =
        CBAssociatorNames(mb, context, newPath(), nullptr, "TEST_Other", nullptr, nullptr, &status);
    EXPECT_EQ(CMGetNext(items, nullptr).type, CMPI_ref);
    EXPECT_EQ(asked(thing), "AssociatorNames 0 - - resultClass=TEST_Other");
    items = CBReferences(mb, context, newPath(), "TEST_Link", nullptr, properties, &status);
    EXPECT_EQ(CMGetNext(items, nullptr).type, CMPI_instance);
    EXPECT_EQ(asked(link), "References 0 - - resultClass=TEST_Link [A B]");
    items = CBReferenceNames(mb, context, newPath(), nullptr, "Left", &status);
    EXPECT_EQ(CMGetNext(items, nullptr).type, CMPI_ref);
    EXPECT_EQ(asked(thing), "ReferenceNames 0 - - role=Left");
}

TEST_F(Upcalls, ALaterRouteReplacesAnEarlierOne) {
    EchoService first;
    EchoService second;
    broker.route("TEST_Thing", first);
    broker.route("test_THING", second);
    CBDeleteInstance(mb, context, newPath());
    EXPECT_EQ(first.last, "");
    EXPECT_EQ(second.last, "DeleteInstance 0 - -");
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

    ProviderLibrary library{KORVA_BINARY_DIR "/lib/libbroker_test_providers.so", broker, {"Good"}};
};

TEST_F(LibraryUpcalls, AreAnsweredByTheOtherLibrary) {
    for (const CMPIEnumeration* items : {CBEnumInstances(mb, context, newPath(), nullptr, &status),
                                         CBEnumInstanceNames(mb, context, newPath(), &status)}) {
        EXPECT_THAT(names(items), ElementsAre("root/cimv2:TEST_Thing.Name=\"one\"",
                                              "root/cimv2:TEST_Thing.Name=\"two\""));
    }
    EXPECT_THAT(broker.violations(), IsEmpty());
}

TEST_F(LibraryUpcalls, PassTheStatusAndItsTextOn) {
    EXPECT_EQ(CBDeleteInstance(mb, context, newPath()).rc, CMPI_RC_ERR_NOT_FOUND);
    EXPECT_EQ(textOf(CBDeleteInstance(mb, context, newPath()).msg), "It has gone");
}

TEST_F(LibraryUpcalls, AnExceptionOfTheOtherLibraryBecomesAStatus) {
    EXPECT_EQ(CBExecQuery(mb, context, newPath(), "SELECT", "WQL", &status), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_FAILED);
    EXPECT_THAT(request.violations(), ElementsAre("an exception left ExecQuery of " KORVA_BINARY_DIR
                                                  "/lib/libbroker_test_providers.so"));
}

}  // namespace
}  // namespace cmpihost
