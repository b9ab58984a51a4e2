// Macros on the broker: each up-call reaches its slot with all arguments in order.
#include <cmpi/cmpimacs.h>

#include "RecordingTables.h"

namespace {

using cmpi_test::CmpiMacros;

TEST_F(CmpiMacros, EnumerationsReachTheBroker) {
    expectCall("CMPIBrokerFT.enumerateInstanceNames", CBEnumInstanceNames(mb, ctx, path, rc), mb,
               ctx, path, rc);
    expectCall("CMPIBrokerFT.enumerateInstances", CBEnumInstances(mb, ctx, path, list, rc), mb, ctx,
               path, list, rc);
    expectCall("CMPIBrokerFT.execQuery", CBExecQuery(mb, ctx, path, text, name, rc), mb, ctx, path,
               text, name, rc);
}

TEST_F(CmpiMacros, InstanceOperationsReachTheBroker) {
    expectCall("CMPIBrokerFT.getInstance", CBGetInstance(mb, ctx, path, list, rc), mb, ctx, path,
               list, rc);
    expectCall("CMPIBrokerFT.createInstance", CBCreateInstance(mb, ctx, path, inst, rc), mb, ctx,
               path, inst, rc);
    expectCall("CMPIBrokerFT.modifyInstance", CBModifyInstance(mb, ctx, path, inst, list), mb, ctx,
               path, inst, list);
    expectCall("CMPIBrokerFT.modifyInstance", CBSetInstance(mb, ctx, path, inst, list), mb, ctx,
               path, inst, list);
    expectCall("CMPIBrokerFT.deleteInstance", CBDeleteInstance(mb, ctx, path), mb, ctx, path);
}

TEST_F(CmpiMacros, AssociationOperationsReachTheBroker) {
    const char* const role = "Antecedent";
    const char* const resultRole = "Dependent";
    expectCall("CMPIBrokerFT.associators",
               CBAssociators(mb, ctx, path, cn, text, role, resultRole, list, rc), mb, ctx, path,
               cn, text, role, resultRole, list, rc);
    expectCall("CMPIBrokerFT.associatorNames",
               CBAssociatorNames(mb, ctx, path, cn, text, role, resultRole, rc), mb, ctx, path, cn,
               text, role, resultRole, rc);
    expectCall("CMPIBrokerFT.references", CBReferences(mb, ctx, path, cn, role, list, rc), mb, ctx,
               path, cn, role, list, rc);
    expectCall("CMPIBrokerFT.referenceNames", CBReferenceNames(mb, ctx, path, cn, role, rc), mb,
               ctx, path, cn, role, rc);
}

TEST_F(CmpiMacros, MethodsAndPropertiesReachTheBroker) {
    expectCall("CMPIBrokerFT.invokeMethod",
               CBInvokeMethod(mb, ctx, path, name, &argsObject, &outArgsObject, rc), mb, ctx, path,
               name, &argsObject, &outArgsObject, rc);
    expectCall("CMPIBrokerFT.setProperty", CBSetProperty(mb, ctx, path, name, text, CMPI_chars), mb,
               ctx, path, name, text, 0x1700);
    expectCall("CMPIBrokerFT.getProperty", CBGetProperty(mb, ctx, path, name, rc), mb, ctx, path,
               name, rc);
}

TEST_F(CmpiMacros, ThreadsAndIndicationsReachTheBroker) {
    expectCall("CMPIBrokerFT.prepareAttachThread", CBPrepareAttachThread(mb, ctx), mb, ctx);
    expectCall("CMPIBrokerFT.attachThread", CBAttachThread(mb, ctx), mb, ctx);
    expectCall("CMPIBrokerFT.detachThread", CBDetachThread(mb, ctx), mb, ctx);
    expectCall("CMPIBrokerFT.deliverIndication", CBDeliverIndication(mb, ctx, ns, inst), mb, ctx,
               ns, inst);
}

TEST_F(CmpiMacros, MessageFilesReachTheBroker) {
    CMPIMsgFileHandle file = &number;
    expectCall("CMPIBrokerEncFT.openMessageFile", CMOpenMessageFile(mb, text, &file), mb, text,
               &file);
    expectCall("CMPIBrokerEncFT.closeMessageFile", CMCloseMessageFile(mb, file), mb, &number);
}

TEST_F(CmpiMacros, FactsAboutTheBrokerAreItsFirstMembers) {
    brokerObject.bft->brokerCapabilities = CMPI_MB_BasicRead | CMPI_MB_AssociationTraversal;
    brokerObject.bft->brokerVersion = 200;
    brokerObject.bft->brokerName = text;
    EXPECT_EQ(CBGetClassification(mb), 9u);
    EXPECT_EQ(CBBrokerVersion(mb), 200u);
    EXPECT_STREQ(CBBrokerName(mb), "localhost");
}

}  // namespace
