#include "host/broker/Entry.h"
#include "host/broker/NamedItems.h"

namespace cmpihost {

namespace {

using Array = const Object<CMPIArray>;

CMPICount getSize(Array& array, CMPIStatus*) {
    return static_cast<CMPICount>(array.body.elements->size());
}

CMPIType getSimpleType(Array& array, CMPIStatus*) {
    return array.body.elementType;
}

CMPIData getElementAt(Array& array, CMPICount index, CMPIStatus* status) {
    if (index >= array.body.elements->size()) return missingItem(array.core(), status);
    return writeValue(array.core(), (*array.body.elements)[index]);
}

CMPIStatus setElementAt(Array& array, const CallName& call, CMPICount index, const CMPIValue* value,
                        CMPIType type) {
    auto& elements = array.body.elements;
    if (index >= elements->size()) return statusOf(array.core().options().missingItem);

    Value read = readValue(value, type, call);
    const CMPIType given =
        type == CMPI_chars || type == CMPI_charsptr ? CMPIType{CMPI_string} : type;
    if (given != array.body.elementType) {
        array.core().report("element of an array of " + cimTypeName(array.body.elementType) +
                            " set to a " + cimTypeName(type));
        return statusOf(CMPI_RC_ERR_TYPE_MISMATCH);
    }
    if (elements.use_count() != 1) elements = std::make_shared<std::vector<Value>>(*elements);
    (*elements)[index] = std::move(read);
    return statusOf(CMPI_RC_OK);
}

}  // namespace

template <>
Tables<CMPIArray>& tablesOf() {
    static Tables<CMPIArray> tables = [] {
        using FT = CMPIArrayFT;
        Tables<CMPIArray> made;
        bindCommon(made);
        bind<&FT::getSize, &getSize>(made, "getSize");
        bind<&FT::getSimpleType, &getSimpleType>(made, "getSimpleType");
        bind<&FT::getElementAt, &getElementAt>(made, "getElementAt");
        bind<&FT::setElementAt, &setElementAt>(made, "setElementAt");
        return made;
    }();
    return tables;
}

}  // namespace cmpihost
