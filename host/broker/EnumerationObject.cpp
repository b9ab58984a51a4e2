#include "host/broker/Conversion.h"
#include "host/broker/Entry.h"

namespace cmpihost {

namespace {

using Enumeration = const Object<CMPIEnumeration>;

CMPIData getNext(Enumeration& enumeration, CMPIStatus* status) {
    EnumerationBody& body = enumeration.body;
    ++body.nextCalls;
    if (body.nextCalls == body.failAt) {
        setStatus(status, body.failRc);
        return noData(CMPI_badValue);
    }
    if (body.position >= body.items.size()) {
        setStatus(status, CMPI_RC_ERR_NOT_FOUND);
        return noData(CMPI_notFound);
    }
    const CMPIData data = writeValue(enumeration.core(), body.items[body.position]);
    ++body.position;
    return data;
}

CMPIBoolean hasNext(Enumeration& enumeration, CMPIStatus*) {
    return enumeration.body.position < enumeration.body.items.size();
}

CMPIArray* toArray(Enumeration& enumeration, CMPIStatus*) {
    const EnumerationBody& body = enumeration.body;
    return enumeration.core().make<CMPIArray>(
        {body.itemType, std::make_shared<std::vector<Value>>(body.items)});
}

}  // namespace

template <>
Tables<CMPIEnumeration>& tablesOf() {
    static Tables<CMPIEnumeration> tables = [] {
        using FT = CMPIEnumerationFT;
        Tables<CMPIEnumeration> made;
        bindCommon(made);
        bind<&FT::getNext, &getNext>(made, "getNext");
        bind<&FT::hasNext, &hasNext>(made, "hasNext");
        bind<&FT::toArray, &toArray>(made, "toArray");
        return made;
    }();
    return tables;
}

}  // namespace cmpihost
