#include "host/broker/Entry.h"

namespace cmpihost {

namespace {

const char* getCharPtr(const Object<CMPIString>& string, CMPIStatus*) {
    return string.body.get();
}

}  // namespace

template <>
Tables<CMPIString>& tablesOf() {
    static Tables<CMPIString> tables = [] {
        Tables<CMPIString> made;
        bindCommon(made);
        bind<&CMPIStringFT::getCharPtr, &getCharPtr>(made, "getCharPtr");
        return made;
    }();
    return tables;
}

}  // namespace cmpihost
