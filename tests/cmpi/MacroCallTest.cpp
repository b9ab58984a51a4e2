// The macros are what providers are written with: each calls its slot with all arguments in order
// and hands the result through. Macros on objects, on queries and errors, and on the broker.
#include <cmpi/cmpimacs.h>

#include "RecordingTables.h"

namespace {

using cmpi_test::CmpiMacros;

// The macro with these arguments calls the slot with just these.
#define EXPECT_SLOT(slot, macro, ...) expectCall(slot, macro(__VA_ARGS__), __VA_ARGS__)

CMPIData noProperty(const char*, void*) {
    return {CMPI_null, CMPI_notFound, {0}};
}

TEST_F(CmpiMacros, NewObjectsComeFromTheEncapsulatedFunctions) {
    CMPIArray* projection = nullptr;
    EXPECT_SLOT("CMPIBrokerEncFT.newInstance", CMNewInstance, mb, path, rc);
    EXPECT_SLOT("CMPIBrokerEncFT.newObjectPath", CMNewObjectPath, mb, ns, cn, rc);
    EXPECT_SLOT("CMPIBrokerEncFT.newArgs", CMNewArgs, mb, rc);
    EXPECT_SLOT("CMPIBrokerEncFT.newString", CMNewString, mb, text, rc);
    EXPECT_SLOT("CMPIBrokerEncFT.newArray", CMNewArray, mb, 5, CMPI_uint16, rc);
    EXPECT_SLOT("CMPIBrokerEncFT.newDateTime", CMNewDateTime, mb, rc);
    EXPECT_SLOT("CMPIBrokerEncFT.newDateTimeFromBinary", CMNewDateTimeFromBinary, mb,
                1000000000000ULL, 1, rc);
    EXPECT_SLOT("CMPIBrokerEncFT.newDateTimeFromChars", CMNewDateTimeFromChars, mb, text, rc);
    EXPECT_SLOT("CMPIBrokerEncFT.newSelectExp", CMNewSelectExp, mb, text, name, &projection, rc);
}

TEST_F(CmpiMacros, GenericServicesTakeAnyObject) {
    EXPECT_SLOT("CMPIBrokerEncFT.classPathIsA", CMClassPathIsA, mb, path, cn, rc);
    EXPECT_SLOT("CMPIBrokerEncFT.toString", CDToString, mb, inst, rc);
    EXPECT_SLOT("CMPIBrokerEncFT.isOfType", CDIsOfType, mb, path, text, rc);
    EXPECT_SLOT("CMPIBrokerEncFT.getType", CDGetType, mb, inst, rc);
    EXPECT_SLOT("CMPIBrokerEncFT.logMessage", CMLogMessage, mb, CMPI_SEV_WARNING, name, text,
                &stringObject);
    EXPECT_SLOT("CMPIBrokerEncFT.trace", CMTraceMessage, mb, CMPI_LEV_VERBOSE, name, text, nullptr);
}

TEST_F(CmpiMacros, CloneAndReleaseWorkOnEveryKindOfObject) {
    EXPECT_SLOT("CMPIContextFT.clone", CMClone, ctx, rc);
    EXPECT_SLOT("CMPIInstanceFT.clone", CMClone, inst, rc);
    EXPECT_SLOT("CMPIObjectPathFT.clone", CMClone, path, nullptr);
    EXPECT_SLOT("CMPIDateTimeFT.clone", CMClone, &dateTimeObject, rc);
    EXPECT_SLOT("CMPIInstanceFT.release", CMRelease, inst);
    EXPECT_SLOT("CMPIObjectPathFT.release", CMRelease, path);
    EXPECT_SLOT("CMPIStringFT.release", CMRelease, &stringObject);
}

TEST_F(CmpiMacros, KeysPassTextItselfAndOtherValuesByAddress) {
    EXPECT_SLOT("CMPIObjectPathFT.addKey", CMAddKey, path, name, text, CMPI_chars);
    EXPECT_SLOT("CMPIObjectPathFT.addKey", CMAddKey, path, name, &number, CMPI_uint32);
    EXPECT_SLOT("CMPIObjectPathFT.addKey", CMAddKey, path, name, &otherPath, CMPI_ref);
}

TEST_F(CmpiMacros, ObjectPathMacrosCallTheirSlots) {
    EXPECT_SLOT("CMPIObjectPathFT.setNameSpace", CMSetNameSpace, path, ns);
    EXPECT_SLOT("CMPIObjectPathFT.getNameSpace", CMGetNameSpace, path, rc);
    EXPECT_SLOT("CMPIObjectPathFT.setHostname", CMSetHostname, path, text);
    EXPECT_SLOT("CMPIObjectPathFT.getHostname", CMGetHostname, path, rc);
    EXPECT_SLOT("CMPIObjectPathFT.setClassName", CMSetClassName, path, cn);
    EXPECT_SLOT("CMPIObjectPathFT.getClassName", CMGetClassName, path, rc);
    EXPECT_SLOT("CMPIObjectPathFT.getKey", CMGetKey, path, name, rc);
    EXPECT_SLOT("CMPIObjectPathFT.getKeyAt", CMGetKeyAt, path, 3, outName, rc);
    EXPECT_SLOT("CMPIObjectPathFT.getKeyCount", CMGetKeyCount, path, rc);
    EXPECT_SLOT("CMPIObjectPathFT.setNameSpaceFromObjectPath", CMSetNameSpaceFromObjectPath, path,
                otherPath);
    EXPECT_SLOT("CMPIObjectPathFT.setHostAndNameSpaceFromObjectPath",
                CMSetHostAndNameSpaceFromObjectPath, path, otherPath);
    EXPECT_SLOT("CMPIObjectPathFT.toString", CMObjectPathToString, path, rc);
}

TEST_F(CmpiMacros, QualifierMacrosCallTheirSlots) {
    EXPECT_SLOT("CMPIObjectPathFT.getClassQualifier", CMGetClassQualifier, path, text, rc);
    EXPECT_SLOT("CMPIObjectPathFT.getPropertyQualifier", CMGetPropertyQualifier, path, name, text,
                rc);
    EXPECT_SLOT("CMPIObjectPathFT.getMethodQualifier", CMGetMethodQualifier, path, name, text, rc);
    EXPECT_SLOT("CMPIObjectPathFT.getParameterQualifier", CMGetParameterQualifier, path, cn, name,
                text, rc);
}

TEST_F(CmpiMacros, InstanceMacrosCallTheirSlots) {
    EXPECT_SLOT("CMPIInstanceFT.setProperty", CMSetProperty, inst, name, text, CMPI_chars);
    EXPECT_SLOT("CMPIInstanceFT.setProperty", CMSetProperty, inst, name, nullptr, CMPI_uint64);
    EXPECT_SLOT("CMPIInstanceFT.setPropertyWithOrigin", CMSetPropertyWithOrigin, inst, name,
                &number, CMPI_uint32, origin);
    EXPECT_SLOT("CMPIInstanceFT.getProperty", CMGetProperty, inst, name, rc);
    EXPECT_SLOT("CMPIInstanceFT.getPropertyAt", CMGetPropertyAt, inst, 4, outName, rc);
    EXPECT_SLOT("CMPIInstanceFT.getPropertyCount", CMGetPropertyCount, inst, rc);
    EXPECT_SLOT("CMPIInstanceFT.getObjectPath", CMGetObjectPath, inst, rc);
    EXPECT_SLOT("CMPIInstanceFT.setObjectPath", CMSetObjectPath, inst, path);
    EXPECT_SLOT("CMPIInstanceFT.setPropertyFilter", CMSetPropertyFilter, inst, list, keys);
}

TEST_F(CmpiMacros, StringAndDateTimeMacrosCallTheirSlots) {
    const CMPIString* const string = &stringObject;
    const CMPIDateTime* const date = &dateTimeObject;
    EXPECT_SLOT("CMPIStringFT.getCharPtr", CMGetCharsPtr, string, rc);
    EXPECT_SLOT("CMPIDateTimeFT.getStringFormat", CMGetStringFormat, date, rc);
    EXPECT_SLOT("CMPIDateTimeFT.getBinaryFormat", CMGetBinaryFormat, date, rc);
    EXPECT_SLOT("CMPIDateTimeFT.isInterval", CMIsInterval, date, rc);
}

TEST_F(CmpiMacros, ArrayMacrosCallTheirSlots) {
    CMPIArray* const array = &arrayObject;
    EXPECT_SLOT("CMPIArrayFT.getSize", CMGetArrayCount, array, rc);
    EXPECT_SLOT("CMPIArrayFT.getSimpleType", CMGetArrayType, array, rc);
    EXPECT_SLOT("CMPIArrayFT.getElementAt", CMGetArrayElementAt, array, 2, rc);
    EXPECT_SLOT("CMPIArrayFT.setElementAt", CMSetArrayElementAt, array, 2, &number, CMPI_uint32);
}

TEST_F(CmpiMacros, ArgumentMacrosCallTheirSlots) {
    CMPIArgs* const args = &argsObject;
    EXPECT_SLOT("CMPIArgsFT.addArg", CMAddArg, args, name, text, CMPI_chars);
    EXPECT_SLOT("CMPIArgsFT.getArg", CMGetArg, args, name, rc);
    EXPECT_SLOT("CMPIArgsFT.getArgAt", CMGetArgAt, args, 1, outName, rc);
    EXPECT_SLOT("CMPIArgsFT.getArgCount", CMGetArgCount, args, rc);
}

TEST_F(CmpiMacros, ContextMacrosCallTheirSlots) {
    EXPECT_SLOT("CMPIContextFT.getEntry", CMGetContextEntry, ctx, name, rc);
    EXPECT_SLOT("CMPIContextFT.getEntryAt", CMGetContextEntryAt, ctx, 0, outName, rc);
    EXPECT_SLOT("CMPIContextFT.getEntryCount", CMGetContextEntryCount, ctx, rc);
    EXPECT_SLOT("CMPIContextFT.addEntry", CMAddContextEntry, ctx, name, &number, CMPI_uint32);
}

TEST_F(CmpiMacros, EnumerationMacrosCallTheirSlots) {
    CMPIEnumeration* const walk = &enumerationObject;
    EXPECT_SLOT("CMPIEnumerationFT.hasNext", CMHasNext, walk, rc);
    EXPECT_SLOT("CMPIEnumerationFT.getNext", CMGetNext, walk, rc);
    EXPECT_SLOT("CMPIEnumerationFT.toArray", CMToArray, walk, rc);
}

TEST_F(CmpiMacros, ResultMacrosYieldTheStatusAndDoNotReturn) {
    EXPECT_SLOT("CMPIResultFT.returnData", CMReturnData, rslt, &number, CMPI_uint32);
    EXPECT_SLOT("CMPIResultFT.returnInstance", CMReturnInstance, rslt, inst);
    EXPECT_SLOT("CMPIResultFT.returnObjectPath", CMReturnObjectPath, rslt, path);
    EXPECT_SLOT("CMPIResultFT.returnError", CMReturnError, rslt, err);
    EXPECT_SLOT("CMPIResultFT.returnDone", CMReturnDone, rslt);
}

TEST_F(CmpiMacros, QueryMacrosCallTheirSlots) {
    const CMPISelectExp* const query = &queryObject;
    EXPECT_SLOT("CMPISelectExpFT.evaluate", CMEvaluateSelExp, query, inst, rc);
    EXPECT_SLOT("CMPISelectExpFT.evaluateUsingAccessor", CMEvaluateSelExpUsingAccessor, query,
                noProperty, &number, rc);
    EXPECT_SLOT("CMPISelectExpFT.getString", CMGetSelExpString, query, rc);
    EXPECT_SLOT("CMPISelectExpFT.getDOC", CMGetDoc, query, rc);
    EXPECT_SLOT("CMPISelectExpFT.getCOD", CMGetCod, query, rc);
}

TEST_F(CmpiMacros, ConditionMacrosCallTheirSlots) {
    const CMPISelectCond* const condition = &conditionObject;
    const CMPISubCond* const term = &subConditionObject;
    int kind = 0;
    EXPECT_SLOT("CMPISelectCondFT.getCountAndType", CMGetSubCondCountAndType, condition, &kind, rc);
    EXPECT_SLOT("CMPISelectCondFT.getSubCondAt", CMGetSubCondAt, condition, 2, rc);
    EXPECT_SLOT("CMPISubCondFT.getCount", CMGetPredicateCount, term, rc);
    EXPECT_SLOT("CMPISubCondFT.getPredicateAt", CMGetPredicateAt, term, 1, rc);
    EXPECT_SLOT("CMPISubCondFT.getPredicate", CMGetPredicate, term, name, rc);
}

TEST_F(CmpiMacros, PredicateMacrosCallTheirSlots) {
    const CMPIPredicate* const predicate = &predicateObject;
    CMPIType type = 0;
    CMPIPredOp operation = CMPI_PredOp_Equals;
    CMPIString* lhs = nullptr;
    CMPIString* rhs = nullptr;
    EXPECT_SLOT("CMPIPredicateFT.getData", CMGetPredicateData, predicate, &type, &operation, &lhs,
                &rhs);
    EXPECT_SLOT("CMPIPredicateFT.evaluateUsingAccessor", CMEvaluatePredicateUsingAccessor,
                predicate, noProperty, &number, rc);
}

TEST_F(CmpiMacros, AnErrorIsMadeByTheBroker) {
    EXPECT_SLOT("CMPIBrokerEncFT.newCMPIError", CMNewCMPIError, mb, origin, name, text,
                ErrorSevHigh, Disk_Failure, CMPI_RC_ERR_FAILED, rc);
}

TEST_F(CmpiMacros, ErrorGettersCallTheirSlots) {
    EXPECT_SLOT("CMPIErrorFT.getErrorType", CMGetErrorType, err, rc);
    EXPECT_SLOT("CMPIErrorFT.getOtherErrorType", CMGetOtherErrorType, err, rc);
    EXPECT_SLOT("CMPIErrorFT.getOwningEntity", CMGetOwningEntity, err, rc);
    EXPECT_SLOT("CMPIErrorFT.getMessageID", CMGetMessageID, err, rc);
    EXPECT_SLOT("CMPIErrorFT.getMessage", CMGetErrorMessage, err, rc);
    EXPECT_SLOT("CMPIErrorFT.getPerceivedSeverity", CMGetPerceivedSeverity, err, rc);
    EXPECT_SLOT("CMPIErrorFT.getProbableCause", CMGetProbableCause, err, rc);
    EXPECT_SLOT("CMPIErrorFT.getProbableCauseDescription", CMGetProbableCauseDescription, err, rc);
    EXPECT_SLOT("CMPIErrorFT.getRecommendedActions", CMGetRecommendedActions, err, rc);
    EXPECT_SLOT("CMPIErrorFT.getErrorSource", CMGetErrorSource, err, rc);
    EXPECT_SLOT("CMPIErrorFT.getErrorSourceFormat", CMGetErrorSourceFormat, err, rc);
    EXPECT_SLOT("CMPIErrorFT.getOtherErrorSourceFormat", CMGetOtherErrorSourceFormat, err, rc);
    EXPECT_SLOT("CMPIErrorFT.getCIMStatusCode", CMGetCIMStatusCode, err, rc);
    EXPECT_SLOT("CMPIErrorFT.getCIMStatusCodeDescription", CMGetCIMStatusCodeDescription, err, rc);
    EXPECT_SLOT("CMPIErrorFT.getMessageArguments", CMGetMessageArguments, err, rc);
}

TEST_F(CmpiMacros, ErrorSettersCallTheirSlots) {
    CMPIArray* const array = &arrayObject;
    EXPECT_SLOT("CMPIErrorFT.setErrorType", CMSetErrorType, err, SecurityError);
    EXPECT_SLOT("CMPIErrorFT.setOtherErrorType", CMSetOtherErrorType, err, text);
    EXPECT_SLOT("CMPIErrorFT.setProbableCauseDescription", CMSetProbableCauseDescription, err,
                text);
    EXPECT_SLOT("CMPIErrorFT.setRecommendedActions", CMSetRecommendedActions, err, array);
    EXPECT_SLOT("CMPIErrorFT.setErrorSource", CMSetErrorSource, err, text);
    EXPECT_SLOT("CMPIErrorFT.setErrorSourceFormat", CMSetErrorSourceFormat, err, CIMObjectHandle);
    EXPECT_SLOT("CMPIErrorFT.setOtherErrorSourceFormat", CMSetOtherErrorSourceFormat, err, text);
    EXPECT_SLOT("CMPIErrorFT.setCIMStatusCodeDescription", CMSetCIMStatusCodeDescription, err,
                text);
    EXPECT_SLOT("CMPIErrorFT.setMessageArguments", CMSetMessageArguments, err, array);
}

TEST_F(CmpiMacros, EnumerationsReachTheBroker) {
    EXPECT_SLOT("CMPIBrokerFT.enumerateInstanceNames", CBEnumInstanceNames, mb, ctx, path, rc);
    EXPECT_SLOT("CMPIBrokerFT.enumerateInstances", CBEnumInstances, mb, ctx, path, list, rc);
    EXPECT_SLOT("CMPIBrokerFT.execQuery", CBExecQuery, mb, ctx, path, text, name, rc);
}

TEST_F(CmpiMacros, InstanceOperationsReachTheBroker) {
    EXPECT_SLOT("CMPIBrokerFT.getInstance", CBGetInstance, mb, ctx, path, list, rc);
    EXPECT_SLOT("CMPIBrokerFT.createInstance", CBCreateInstance, mb, ctx, path, inst, rc);
    EXPECT_SLOT("CMPIBrokerFT.modifyInstance", CBModifyInstance, mb, ctx, path, inst, list);
    EXPECT_SLOT("CMPIBrokerFT.modifyInstance", CBSetInstance, mb, ctx, path, inst, list);
    EXPECT_SLOT("CMPIBrokerFT.deleteInstance", CBDeleteInstance, mb, ctx, path);
}

TEST_F(CmpiMacros, AssociationOperationsReachTheBroker) {
    const char* const role = "Antecedent";
    const char* const resultRole = "Dependent";
    EXPECT_SLOT("CMPIBrokerFT.associators", CBAssociators, mb, ctx, path, cn, text, role,
                resultRole, list, rc);
    EXPECT_SLOT("CMPIBrokerFT.associatorNames", CBAssociatorNames, mb, ctx, path, cn, text, role,
                resultRole, rc);
    EXPECT_SLOT("CMPIBrokerFT.references", CBReferences, mb, ctx, path, cn, role, list, rc);
    EXPECT_SLOT("CMPIBrokerFT.referenceNames", CBReferenceNames, mb, ctx, path, cn, role, rc);
}

TEST_F(CmpiMacros, MethodsAndPropertiesReachTheBroker) {
    EXPECT_SLOT("CMPIBrokerFT.invokeMethod", CBInvokeMethod, mb, ctx, path, name, &argsObject,
                &outArgsObject, rc);
    EXPECT_SLOT("CMPIBrokerFT.setProperty", CBSetProperty, mb, ctx, path, name, text, CMPI_chars);
    EXPECT_SLOT("CMPIBrokerFT.getProperty", CBGetProperty, mb, ctx, path, name, rc);
}

TEST_F(CmpiMacros, ThreadsAndIndicationsReachTheBroker) {
    EXPECT_SLOT("CMPIBrokerFT.prepareAttachThread", CBPrepareAttachThread, mb, ctx);
    EXPECT_SLOT("CMPIBrokerFT.attachThread", CBAttachThread, mb, ctx);
    EXPECT_SLOT("CMPIBrokerFT.detachThread", CBDetachThread, mb, ctx);
    EXPECT_SLOT("CMPIBrokerFT.deliverIndication", CBDeliverIndication, mb, ctx, ns, inst);
}

TEST_F(CmpiMacros, MessageFilesReachTheBroker) {
    CMPIMsgFileHandle file = &number;
    EXPECT_SLOT("CMPIBrokerEncFT.openMessageFile", CMOpenMessageFile, mb, text, &file);
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
