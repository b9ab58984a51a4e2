#include "host/broker/Conversion.h"
#include "host/broker/Entry.h"

namespace cmpihost {

namespace {

using Select = const Object<CMPISelectExp>;

/// Conditions are not evaluated; a query without one selects by class.
CMPIBoolean evaluate(Select& select, const CallName& call, const CMPIInstance* instance,
                     CMPIStatus* status) {
    const InstanceValue& value = *fromHandle(instance, call).body.value;
    if (select.body.hasCondition) return refuse<CMPIBoolean>(status, CMPI_RC_ERR_NOT_SUPPORTED);
    const Kinship kin =
        kinship(select.core().catalogue(), value.path.className, select.body.className);
    return kin == Kinship::Same || kin == Kinship::Below ? 1 : 0;
}

CMPIString* getString(Select& select, CMPIStatus*) {
    return makeString(select.core(), select.body.query);
}

CMPISelectCond* noCondition(Select&, CMPIStatus* status) {
    return refuse(status, CMPI_RC_ERR_NOT_SUPPORTED);
}

CMPIBoolean evaluateUsingAccessor(Select& select, CMPIAccessor*, void*, CMPIStatus* status) {
    if (select.body.hasCondition) return refuse<CMPIBoolean>(status, CMPI_RC_ERR_NOT_SUPPORTED);
    return 1;
}

}  // namespace

template <>
Tables<CMPISelectExp>& tablesOf() {
    static Tables<CMPISelectExp> tables = [] {
        using FT = CMPISelectExpFT;
        Tables<CMPISelectExp> made;
        bindCommon(made);
        bind<&FT::evaluate, &evaluate>(made, "evaluate");
        bind<&FT::getString, &getString>(made, "getString");
        bind<&FT::getDOC, &noCondition>(made, "getDOC");
        bind<&FT::getCOD, &noCondition>(made, "getCOD");
        bind<&FT::evaluateUsingAccessor, &evaluateUsingAccessor>(made, "evaluateUsingAccessor");
        return made;
    }();
    return tables;
}

}  // namespace cmpihost
