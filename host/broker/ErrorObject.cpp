#include "host/broker/Conversion.h"
#include "host/broker/Entry.h"

namespace cmpihost {

namespace {

using Error = const Object<CMPIError>;

template <auto Member>
auto getNumber(Error& error, CMPIStatus*) {
    return error.body.*Member;
}

template <auto Member, class Number>
CMPIStatus setNumber(Error& error, Number value) {
    error.body.*Member = value;
    return statusOf(CMPI_RC_OK);
}

/// A text that was never set is a null string.
template <auto Member>
CMPIString* getText(Error& error, CMPIStatus*) {
    const std::optional<std::string>& text = error.body.*Member;
    return text ? makeString(error.core(), *text) : nullptr;
}

template <auto Member>
CMPIStatus setText(Error& error, const CallName& call, const char* text) {
    error.body.*Member = required(error.core(), text, call, "text");
    return statusOf(CMPI_RC_OK);
}

template <auto Member>
CMPIArray* getList(Error& error, CMPIStatus*) {
    return error.core().make<CMPIArray>(
        {CMPI_string, std::make_shared<std::vector<Value>>(error.body.*Member)});
}

template <auto Member>
CMPIStatus setList(Error& error, const CallName& call, const CMPIArray* array) {
    const ArrayBody& list = fromHandle(array, call).body;
    if (list.elementType != CMPI_string) return statusOf(CMPI_RC_ERR_TYPE_MISMATCH);
    error.body.*Member = *list.elements;
    return statusOf(CMPI_RC_OK);
}

CMPIStatus setArguments(Error& error, const CallName& call, CMPIArray* array) {
    return setList<&ErrorBody::arguments>(error, call, array);
}

using FT = CMPIErrorFT;
using Body = ErrorBody;

void bindGetters(Tables<CMPIError>& tables) {
    bind<&FT::getErrorType, &getNumber<&Body::type>>(tables, "getErrorType");
    bind<&FT::getOtherErrorType, &getText<&Body::otherType>>(tables, "getOtherErrorType");
    bind<&FT::getOwningEntity, &getText<&Body::owner>>(tables, "getOwningEntity");
    bind<&FT::getMessageID, &getText<&Body::id>>(tables, "getMessageID");
    bind<&FT::getMessage, &getText<&Body::message>>(tables, "getMessage");
    bind<&FT::getPerceivedSeverity, &getNumber<&Body::severity>>(tables, "getPerceivedSeverity");
    bind<&FT::getProbableCause, &getNumber<&Body::cause>>(tables, "getProbableCause");
    bind<&FT::getProbableCauseDescription, &getText<&Body::causeDescription>>(
        tables, "getProbableCauseDescription");
    bind<&FT::getRecommendedActions, &getList<&Body::actions>>(tables, "getRecommendedActions");
    bind<&FT::getErrorSource, &getText<&Body::source>>(tables, "getErrorSource");
    bind<&FT::getErrorSourceFormat, &getNumber<&Body::sourceFormat>>(tables,
                                                                     "getErrorSourceFormat");
    bind<&FT::getOtherErrorSourceFormat, &getText<&Body::otherSourceFormat>>(
        tables, "getOtherErrorSourceFormat");
    bind<&FT::getCIMStatusCode, &getNumber<&Body::code>>(tables, "getCIMStatusCode");
    bind<&FT::getCIMStatusCodeDescription, &getText<&Body::codeDescription>>(
        tables, "getCIMStatusCodeDescription");
    bind<&FT::getMessageArguments, &getList<&Body::arguments>>(tables, "getMessageArguments");
}

void bindSetters(Tables<CMPIError>& tables) {
    bind<&FT::setErrorType, &setNumber<&Body::type, CMPIErrorType>>(tables, "setErrorType");
    bind<&FT::setOtherErrorType, &setText<&Body::otherType>>(tables, "setOtherErrorType");
    bind<&FT::setProbableCauseDescription, &setText<&Body::causeDescription>>(
        tables, "setProbableCauseDescription");
    bind<&FT::setRecommendedActions, &setList<&Body::actions>>(tables, "setRecommendedActions");
    bind<&FT::setErrorSource, &setText<&Body::source>>(tables, "setErrorSource");
    bind<&FT::setErrorSourceFormat, &setNumber<&Body::sourceFormat, CMPIErrorSrcFormat>>(
        tables, "setErrorSourceFormat");
    bind<&FT::setOtherErrorSourceFormat, &setText<&Body::otherSourceFormat>>(
        tables, "setOtherErrorSourceFormat");
    bind<&FT::setCIMStatusCodeDescription, &setText<&Body::codeDescription>>(
        tables, "setCIMStatusCodeDescription");
    bind<&FT::setMessageArguments, &setArguments>(tables, "setMessageArguments");
}

}  // namespace

template <>
Tables<CMPIError>& tablesOf() {
    static Tables<CMPIError> tables = [] {
        Tables<CMPIError> made;
        bindCommon(made);
        bindGetters(made);
        bindSetters(made);
        return made;
    }();
    return tables;
}

}  // namespace cmpihost
