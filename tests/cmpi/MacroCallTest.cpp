// The macros are what providers are written with: each calls its slot with all arguments in order
// and hands the result through. Macros on objects, on queries and errors, and on the broker.
#include <cmpi/cmpimacs.h>

#include "RecordingTables.h"

namespace {

using cmpi_test::CmpiMacros;

CMPIData noProperty(const char*, void*) {
    return {CMPI_null, CMPI_notFound, {0}};
}

TEST_F(CmpiMacros, NewObjectsComeFromTheEncapsulatedFunctions) {
    CMPIArray* projection = nullptr;
    expectCall("CMPIBrokerEncFT.newInstance", CMNewInstance(mb, path, rc), mb, path, rc);
    expectCall("CMPIBrokerEncFT.newObjectPath", CMNewObjectPath(mb, ns, cn, rc), mb, ns, cn, rc);
    expectCall("CMPIBrokerEncFT.newArgs", CMNewArgs(mb, rc), mb, rc);
    expectCall("CMPIBrokerEncFT.newString", CMNewString(mb, text, rc), mb, text, rc);
    expectCall("CMPIBrokerEncFT.newArray", CMNewArray(mb, 5, CMPI_uint16, rc), mb, 5, 0x90, rc);
    expectCall("CMPIBrokerEncFT.newDateTime", CMNewDateTime(mb, rc), mb, rc);
    expectCall("CMPIBrokerEncFT.newDateTimeFromBinary",
               CMNewDateTimeFromBinary(mb, 1000000000000ULL, 1, rc), mb, 1000000000000ULL, 1, rc);
    expectCall("CMPIBrokerEncFT.newDateTimeFromChars", CMNewDateTimeFromChars(mb, text, rc), mb,
               text, rc);
    expectCall("CMPIBrokerEncFT.newSelectExp", CMNewSelectExp(mb, text, name, &projection, rc), mb,
               text, name, &projection, rc);
}

TEST_F(CmpiMacros, GenericServicesTakeAnyObject) {
    expectCall("CMPIBrokerEncFT.classPathIsA", CMClassPathIsA(mb, path, cn, rc), mb, path, cn, rc);
    expectCall("CMPIBrokerEncFT.toString", CDToString(mb, inst, rc), mb, inst, rc);
    expectCall("CMPIBrokerEncFT.isOfType", CDIsOfType(mb, path, text, rc), mb, path, text, rc);
    expectCall("CMPIBrokerEncFT.getType", CDGetType(mb, inst, rc), mb, inst, rc);
    expectCall("CMPIBrokerEncFT.logMessage",
               CMLogMessage(mb, CMPI_SEV_WARNING, name, text, &stringObject), mb, 3, name, text,
               &stringObject);
    expectCall("CMPIBrokerEncFT.trace", CMTraceMessage(mb, CMPI_LEV_VERBOSE, name, text, NULL), mb,
               3, name, text, nullptr);
}

TEST_F(CmpiMacros, CloneAndReleaseWorkOnEveryKindOfObject) {
    expectCall("CMPIContextFT.clone", CMClone(ctx, rc), ctx, rc);
    expectCall("CMPIInstanceFT.clone", CMClone(inst, rc), inst, rc);
    expectCall("CMPIObjectPathFT.clone", CMClone(path, NULL), path, nullptr);
    expectCall("CMPIDateTimeFT.clone", CMClone(&dateTimeObject, rc), &dateTimeObject, rc);
    expectCall("CMPIInstanceFT.release", CMRelease(inst), inst);
    expectCall("CMPIObjectPathFT.release", CMRelease(path), path);
    expectCall("CMPIStringFT.release", CMRelease(&stringObject), &stringObject);
}

TEST_F(CmpiMacros, KeysPassTextItselfAndOtherValuesByAddress) {
    expectCall("CMPIObjectPathFT.addKey", CMAddKey(path, name, text, CMPI_chars), path, name, text,
               0x1700);
    expectCall("CMPIObjectPathFT.addKey", CMAddKey(path, name, &number, CMPI_uint32), path, name,
               &number, 0xA0);
    expectCall("CMPIObjectPathFT.addKey", CMAddKey(path, name, &otherPath, CMPI_ref), path, name,
               &otherPath, 0x1100);
}

TEST_F(CmpiMacros, ObjectPathMacrosCallTheirSlots) {
    expectCall("CMPIObjectPathFT.setNameSpace", CMSetNameSpace(path, ns), path, ns);
    expectCall("CMPIObjectPathFT.getNameSpace", CMGetNameSpace(path, rc), path, rc);
    expectCall("CMPIObjectPathFT.setHostname", CMSetHostname(path, text), path, text);
    expectCall("CMPIObjectPathFT.getHostname", CMGetHostname(path, rc), path, rc);
    expectCall("CMPIObjectPathFT.setClassName", CMSetClassName(path, cn), path, cn);
    expectCall("CMPIObjectPathFT.getClassName", CMGetClassName(path, rc), path, rc);
    expectCall("CMPIObjectPathFT.getKey", CMGetKey(path, name, rc), path, name, rc);
    expectCall("CMPIObjectPathFT.getKeyAt", CMGetKeyAt(path, 3, outName, rc), path, 3, outName, rc);
    expectCall("CMPIObjectPathFT.getKeyCount", CMGetKeyCount(path, rc), path, rc);
    expectCall("CMPIObjectPathFT.setNameSpaceFromObjectPath",
               CMSetNameSpaceFromObjectPath(path, otherPath), path, otherPath);
    expectCall("CMPIObjectPathFT.setHostAndNameSpaceFromObjectPath",
               CMSetHostAndNameSpaceFromObjectPath(path, otherPath), path, otherPath);
    expectCall("CMPIObjectPathFT.toString", CMObjectPathToString(path, rc), path, rc);
}

TEST_F(CmpiMacros, QualifierMacrosCallTheirSlots) {
    expectCall("CMPIObjectPathFT.getClassQualifier", CMGetClassQualifier(path, text, rc), path,
               text, rc);
    expectCall("CMPIObjectPathFT.getPropertyQualifier",
               CMGetPropertyQualifier(path, name, text, rc), path, name, text, rc);
    expectCall("CMPIObjectPathFT.getMethodQualifier", CMGetMethodQualifier(path, name, text, rc),
               path, name, text, rc);
    expectCall("CMPIObjectPathFT.getParameterQualifier",
               CMGetParameterQualifier(path, cn, name, text, rc), path, cn, name, text, rc);
}

TEST_F(CmpiMacros, InstanceMacrosCallTheirSlots) {
    expectCall("CMPIInstanceFT.setProperty", CMSetProperty(inst, name, text, CMPI_chars), inst,
               name, text, 0x1700);
    expectCall("CMPIInstanceFT.setProperty", CMSetProperty(inst, name, NULL, CMPI_uint64), inst,
               name, nullptr, 0xB0);
    expectCall("CMPIInstanceFT.setPropertyWithOrigin",
               CMSetPropertyWithOrigin(inst, name, &number, CMPI_uint32, origin), inst, name,
               &number, 0xA0, origin);
    expectCall("CMPIInstanceFT.getProperty", CMGetProperty(inst, name, rc), inst, name, rc);
    expectCall("CMPIInstanceFT.getPropertyAt", CMGetPropertyAt(inst, 4, outName, rc), inst, 4,
               outName, rc);
    expectCall("CMPIInstanceFT.getPropertyCount", CMGetPropertyCount(inst, rc), inst, rc);
    expectCall("CMPIInstanceFT.getObjectPath", CMGetObjectPath(inst, rc), inst, rc);
    expectCall("CMPIInstanceFT.setObjectPath", CMSetObjectPath(inst, path), inst, path);
    expectCall("CMPIInstanceFT.setPropertyFilter", CMSetPropertyFilter(inst, list, keys), inst,
               list, keys);
}

TEST_F(CmpiMacros, StringAndDateTimeMacrosCallTheirSlots) {
    const CMPIString* const string = &stringObject;
    const CMPIDateTime* const date = &dateTimeObject;
    expectCall("CMPIStringFT.getCharPtr", CMGetCharsPtr(string, rc), string, rc);
    expectCall("CMPIDateTimeFT.getStringFormat", CMGetStringFormat(date, rc), date, rc);
    expectCall("CMPIDateTimeFT.getBinaryFormat", CMGetBinaryFormat(date, rc), date, rc);
    expectCall("CMPIDateTimeFT.isInterval", CMIsInterval(date, rc), date, rc);
}

TEST_F(CmpiMacros, ArrayMacrosCallTheirSlots) {
    CMPIArray* const array = &arrayObject;
    expectCall("CMPIArrayFT.getSize", CMGetArrayCount(array, rc), array, rc);
    expectCall("CMPIArrayFT.getSimpleType", CMGetArrayType(array, rc), array, rc);
    expectCall("CMPIArrayFT.getElementAt", CMGetArrayElementAt(array, 2, rc), array, 2, rc);
    expectCall("CMPIArrayFT.setElementAt", CMSetArrayElementAt(array, 2, &number, CMPI_uint32),
               array, 2, &number, 0xA0);
}

TEST_F(CmpiMacros, ArgumentMacrosCallTheirSlots) {
    CMPIArgs* const args = &argsObject;
    expectCall("CMPIArgsFT.addArg", CMAddArg(args, name, text, CMPI_chars), args, name, text,
               0x1700);
    expectCall("CMPIArgsFT.getArg", CMGetArg(args, name, rc), args, name, rc);
    expectCall("CMPIArgsFT.getArgAt", CMGetArgAt(args, 1, outName, rc), args, 1, outName, rc);
    expectCall("CMPIArgsFT.getArgCount", CMGetArgCount(args, rc), args, rc);
}

TEST_F(CmpiMacros, ContextMacrosCallTheirSlots) {
    expectCall("CMPIContextFT.getEntry", CMGetContextEntry(ctx, name, rc), ctx, name, rc);
    expectCall("CMPIContextFT.getEntryAt", CMGetContextEntryAt(ctx, 0, outName, rc), ctx, 0,
               outName, rc);
    expectCall("CMPIContextFT.getEntryCount", CMGetContextEntryCount(ctx, rc), ctx, rc);
    expectCall("CMPIContextFT.addEntry", CMAddContextEntry(ctx, name, &number, CMPI_uint32), ctx,
               name, &number, 0xA0);
}

TEST_F(CmpiMacros, EnumerationMacrosCallTheirSlots) {
    CMPIEnumeration* const walk = &enumerationObject;
    expectCall("CMPIEnumerationFT.hasNext", CMHasNext(walk, rc), walk, rc);
    expectCall("CMPIEnumerationFT.getNext", CMGetNext(walk, rc), walk, rc);
    expectCall("CMPIEnumerationFT.toArray", CMToArray(walk, rc), walk, rc);
}

TEST_F(CmpiMacros, ResultMacrosYieldTheStatusAndDoNotReturn) {
    expectCall("CMPIResultFT.returnData", CMReturnData(rslt, &number, CMPI_uint32), rslt, &number,
               0xA0);
    expectCall("CMPIResultFT.returnInstance", CMReturnInstance(rslt, inst), rslt, inst);
    expectCall("CMPIResultFT.returnObjectPath", CMReturnObjectPath(rslt, path), rslt, path);
    expectCall("CMPIResultFT.returnError", CMReturnError(rslt, err), rslt, err);
    expectCall("CMPIResultFT.returnDone", CMReturnDone(rslt), rslt);
}

TEST_F(CmpiMacros, QueryMacrosCallTheirSlots) {
    const CMPISelectExp* const query = &queryObject;
    expectCall("CMPISelectExpFT.evaluate", CMEvaluateSelExp(query, inst, rc), query, inst, rc);
    expectCall("CMPISelectExpFT.evaluateUsingAccessor",
               CMEvaluateSelExpUsingAccessor(query, noProperty, &number, rc), query, &noProperty,
               &number, rc);
    expectCall("CMPISelectExpFT.getString", CMGetSelExpString(query, rc), query, rc);
    expectCall("CMPISelectExpFT.getDOC", CMGetDoc(query, rc), query, rc);
    expectCall("CMPISelectExpFT.getCOD", CMGetCod(query, rc), query, rc);
}

TEST_F(CmpiMacros, ConditionMacrosCallTheirSlots) {
    const CMPISelectCond* const condition = &conditionObject;
    const CMPISubCond* const term = &subConditionObject;
    int kind = 0;
    expectCall("CMPISelectCondFT.getCountAndType", CMGetSubCondCountAndType(condition, &kind, rc),
               condition, &kind, rc);
    expectCall("CMPISelectCondFT.getSubCondAt", CMGetSubCondAt(condition, 2, rc), condition, 2, rc);
    expectCall("CMPISubCondFT.getCount", CMGetPredicateCount(term, rc), term, rc);
    expectCall("CMPISubCondFT.getPredicateAt", CMGetPredicateAt(term, 1, rc), term, 1, rc);
    expectCall("CMPISubCondFT.getPredicate", CMGetPredicate(term, name, rc), term, name, rc);
}

TEST_F(CmpiMacros, PredicateMacrosCallTheirSlots) {
    const CMPIPredicate* const predicate = &predicateObject;
    CMPIType type = 0;
    CMPIPredOp operation = CMPI_PredOp_Equals;
    CMPIString* lhs = nullptr;
    CMPIString* rhs = nullptr;
    expectCall("CMPIPredicateFT.getData",
               CMGetPredicateData(predicate, &type, &operation, &lhs, &rhs), predicate, &type,
               &operation, &lhs, &rhs);
    expectCall("CMPIPredicateFT.evaluateUsingAccessor",
               CMEvaluatePredicateUsingAccessor(predicate, noProperty, &number, rc), predicate,
               &noProperty, &number, rc);
}

TEST_F(CmpiMacros, AnErrorIsMadeByTheBroker) {
    expectCall(
        "CMPIBrokerEncFT.newCMPIError",
        CMNewCMPIError(mb, origin, name, text, ErrorSevHigh, Disk_Failure, CMPI_RC_ERR_FAILED, rc),
        mb, origin, name, text, 4, 86, 1, rc);
}

TEST_F(CmpiMacros, ErrorGettersCallTheirSlots) {
    expectCall("CMPIErrorFT.getErrorType", CMGetErrorType(err, rc), err, rc);
    expectCall("CMPIErrorFT.getOtherErrorType", CMGetOtherErrorType(err, rc), err, rc);
    expectCall("CMPIErrorFT.getOwningEntity", CMGetOwningEntity(err, rc), err, rc);
    expectCall("CMPIErrorFT.getMessageID", CMGetMessageID(err, rc), err, rc);
    expectCall("CMPIErrorFT.getMessage", CMGetErrorMessage(err, rc), err, rc);
    expectCall("CMPIErrorFT.getPerceivedSeverity", CMGetPerceivedSeverity(err, rc), err, rc);
    expectCall("CMPIErrorFT.getProbableCause", CMGetProbableCause(err, rc), err, rc);
    expectCall("CMPIErrorFT.getProbableCauseDescription", CMGetProbableCauseDescription(err, rc),
               err, rc);
    expectCall("CMPIErrorFT.getRecommendedActions", CMGetRecommendedActions(err, rc), err, rc);
    expectCall("CMPIErrorFT.getErrorSource", CMGetErrorSource(err, rc), err, rc);
    expectCall("CMPIErrorFT.getErrorSourceFormat", CMGetErrorSourceFormat(err, rc), err, rc);
    expectCall("CMPIErrorFT.getOtherErrorSourceFormat", CMGetOtherErrorSourceFormat(err, rc), err,
               rc);
    expectCall("CMPIErrorFT.getCIMStatusCode", CMGetCIMStatusCode(err, rc), err, rc);
    expectCall("CMPIErrorFT.getCIMStatusCodeDescription", CMGetCIMStatusCodeDescription(err, rc),
               err, rc);
    expectCall("CMPIErrorFT.getMessageArguments", CMGetMessageArguments(err, rc), err, rc);
}

TEST_F(CmpiMacros, ErrorSettersCallTheirSlots) {
    CMPIArray* const array = &arrayObject;
    expectCall("CMPIErrorFT.setErrorType", CMSetErrorType(err, SecurityError), err, 7);
    expectCall("CMPIErrorFT.setOtherErrorType", CMSetOtherErrorType(err, text), err, text);
    expectCall("CMPIErrorFT.setProbableCauseDescription", CMSetProbableCauseDescription(err, text),
               err, text);
    expectCall("CMPIErrorFT.setRecommendedActions", CMSetRecommendedActions(err, array), err,
               array);
    expectCall("CMPIErrorFT.setErrorSource", CMSetErrorSource(err, text), err, text);
    expectCall("CMPIErrorFT.setErrorSourceFormat", CMSetErrorSourceFormat(err, CIMObjectHandle),
               err, 2);
    expectCall("CMPIErrorFT.setOtherErrorSourceFormat", CMSetOtherErrorSourceFormat(err, text), err,
               text);
    expectCall("CMPIErrorFT.setCIMStatusCodeDescription", CMSetCIMStatusCodeDescription(err, text),
               err, text);
    expectCall("CMPIErrorFT.setMessageArguments", CMSetMessageArguments(err, array), err, array);
}

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
