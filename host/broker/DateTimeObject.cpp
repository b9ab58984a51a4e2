#include "host/broker/Conversion.h"
#include "host/broker/DateTimeText.h"
#include "host/broker/Entry.h"

namespace cmpihost {

namespace {

using DateTime = const Object<CMPIDateTime>;

CMPIUint64 getBinaryFormat(DateTime& dateTime, CMPIStatus* status) {
    const auto binary = parseDateTime(dateTime.body);
    if (!binary || !binary->microseconds) return refuse<CMPIUint64>(status, CMPI_RC_ERR_FAILED);
    return *binary->microseconds;
}

CMPIString* getStringFormat(DateTime& dateTime, CMPIStatus*) {
    return makeString(dateTime.core(), dateTime.body);
}

CMPIBoolean isInterval(DateTime& dateTime, CMPIStatus*) {
    const auto binary = parseDateTime(dateTime.body);
    return binary && binary->interval ? 1 : 0;
}

}  // namespace

template <>
Tables<CMPIDateTime>& tablesOf() {
    static Tables<CMPIDateTime> tables = [] {
        using FT = CMPIDateTimeFT;
        Tables<CMPIDateTime> made;
        bindCommon(made);
        bind<&FT::getBinaryFormat, &getBinaryFormat>(made, "getBinaryFormat");
        bind<&FT::getStringFormat, &getStringFormat>(made, "getStringFormat");
        bind<&FT::isInterval, &isInterval>(made, "isInterval");
        return made;
    }();
    return tables;
}

}  // namespace cmpihost
