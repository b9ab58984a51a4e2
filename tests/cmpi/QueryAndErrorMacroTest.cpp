// Macros on queries and errors: each calls its slot with all arguments in order.
#include <cmpi/cmpimacs.h>

#include "RecordingTables.h"

namespace {

using cmpi_test::CmpiMacros;

CMPIData noProperty(const char*, void*) {
    return {CMPI_null, CMPI_notFound, {0}};
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

}  // namespace
