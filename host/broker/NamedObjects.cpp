// Arguments and contexts: lists of named values.
#include "host/broker/Entry.h"
#include "host/broker/NamedItems.h"

namespace cmpihost {

namespace {

template <class Edt>
CMPIStatus add(const Object<Edt>& list, const CallName& call, const char* name,
               const CMPIValue* value, CMPIType type) {
    const char* const itemName = required(list.core(), name, call, "name");
    putNamed(list.body, itemName, readValue(value, type, call));
    return statusOf(CMPI_RC_OK);
}

/// In a context a text that is not known is a string without characters, not a null string.
template <class Edt>
CMPIData asHandedOut(BrokerCore& core, CMPIData data) {
    if (std::is_same_v<Edt, CMPIContext> && data.type == CMPI_string &&
        data.state == CMPI_nullValue) {
        data.value.string = core.make<CMPIString>(Characters());
        data.state = CMPI_goodValue;
    }
    return data;
}

template <class Edt>
CMPIData get(const Object<Edt>& list, const CallName& call, const char* name, CMPIStatus* status) {
    const char* const itemName = required(list.core(), name, call, "name");
    return asHandedOut<Edt>(list.core(), getNamed(list.core(), list.body, itemName, status));
}

template <class Edt>
CMPIData getAt(const Object<Edt>& list, CMPICount index, CMPIString** outName, CMPIStatus* status) {
    return asHandedOut<Edt>(list.core(),
                            getNamedAt(list.core(), list.body, index, outName, status));
}

template <class Edt>
CMPICount count(const Object<Edt>& list, CMPIStatus*) {
    return static_cast<CMPICount>(list.body.size());
}

}  // namespace

template <>
Tables<CMPIArgs>& tablesOf() {
    static Tables<CMPIArgs> tables = [] {
        using FT = CMPIArgsFT;
        Tables<CMPIArgs> made;
        bindCommon(made);
        bind<&FT::addArg, &add<CMPIArgs>>(made, "addArg");
        bind<&FT::getArg, &get<CMPIArgs>>(made, "getArg");
        bind<&FT::getArgAt, &getAt<CMPIArgs>>(made, "getArgAt");
        bind<&FT::getArgCount, &count<CMPIArgs>>(made, "getArgCount");
        return made;
    }();
    return tables;
}

template <>
Tables<CMPIContext>& tablesOf() {
    static Tables<CMPIContext> tables = [] {
        using FT = CMPIContextFT;
        Tables<CMPIContext> made;
        bindCommon(made);
        bind<&FT::addEntry, &add<CMPIContext>>(made, "addEntry");
        bind<&FT::getEntry, &get<CMPIContext>>(made, "getEntry");
        bind<&FT::getEntryAt, &getAt<CMPIContext>>(made, "getEntryAt");
        bind<&FT::getEntryCount, &count<CMPIContext>>(made, "getEntryCount");
        return made;
    }();
    return tables;
}

}  // namespace cmpihost
