// The objects that only carry data: strings, datetimes, arrays, enumerations, arguments, contexts.
// Arrays copy their elements on a change: values that were made of one share them.
#include "host/broker/Conversion.h"
#include "host/broker/DateTimeText.h"

namespace cmpihost {

namespace {

const char* getCharPtr(const Object<CMPIString>& string, CMPIStatus*) {
    return string.body.get();
}

using DateTime = const Object<CMPIDateTime>;

/// Read from the text each time: few providers ask, and the object stays one text.
CMPIUint64 getBinaryFormat(DateTime& dateTime, CMPIStatus* status) {
    const auto binary = parseDateTime(dateTime.body);
    if (!binary || !binary->microseconds) return failWith<CMPIUint64>(status, CMPI_RC_ERR_FAILED);
    return *binary->microseconds;
}

CMPIString* getStringFormat(DateTime& dateTime, CMPIStatus*) {
    return makeString(dateTime.core(), dateTime.body);
}

CMPIBoolean isInterval(DateTime& dateTime, CMPIStatus*) {
    const auto binary = parseDateTime(dateTime.body);
    return binary && binary->interval ? 1 : 0;
}

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
    if (index >= elements->size()) return statusOf(missingItemStatus(array.core()));

    Value read = readValue(value, type, call);
    if (storedType(type) != array.body.elementType) {
        array.core().report("element of an array of " + cimTypeName(array.body.elementType) +
                            " set to a " + cimTypeName(type));
        return statusOf(CMPI_RC_ERR_TYPE_MISMATCH);
    }
    // A value that was made of this array keeps what it had.
    if (elements.use_count() != 1) elements = std::make_shared<std::vector<Value>>(*elements);
    (*elements)[index] = std::move(read);
    return statusOf(CMPI_RC_OK);
}

using Enumeration = const Object<CMPIEnumeration>;

/// Past the end the status is CMPI_RC_ERR_NOT_FOUND and no violation is recorded: providers may
/// loop until then without asking hasNext.
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

/// All items, those that getNext has handed out included.
CMPIArray* toArray(Enumeration& enumeration, CMPIStatus*) {
    return makeArray(enumeration.core(), enumeration.body.itemType, enumeration.body.items);
}

// Arguments and contexts are lists of named values.

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

void bindSlots(Tables<CMPIString>& tables) {
    bindCommon(tables);
    bind<&CMPIStringFT::getCharPtr, &getCharPtr>(tables, "getCharPtr");
}

void bindSlots(Tables<CMPIDateTime>& tables) {
    using FT = CMPIDateTimeFT;
    bindCommon(tables);
    bind<&FT::getBinaryFormat, &getBinaryFormat>(tables, "getBinaryFormat");
    bind<&FT::getStringFormat, &getStringFormat>(tables, "getStringFormat");
    bind<&FT::isInterval, &isInterval>(tables, "isInterval");
}

void bindSlots(Tables<CMPIArray>& tables) {
    using FT = CMPIArrayFT;
    bindCommon(tables);
    bind<&FT::getSize, &getSize>(tables, "getSize");
    bind<&FT::getSimpleType, &getSimpleType>(tables, "getSimpleType");
    bind<&FT::getElementAt, &getElementAt>(tables, "getElementAt");
    bind<&FT::setElementAt, &setElementAt>(tables, "setElementAt");
}

void bindSlots(Tables<CMPIEnumeration>& tables) {
    using FT = CMPIEnumerationFT;
    bindCommon(tables);
    bind<&FT::getNext, &getNext>(tables, "getNext");
    bind<&FT::hasNext, &hasNext>(tables, "hasNext");
    bind<&FT::toArray, &toArray>(tables, "toArray");
}

void bindSlots(Tables<CMPIArgs>& tables) {
    using FT = CMPIArgsFT;
    bindCommon(tables);
    bind<&FT::addArg, &add<CMPIArgs>>(tables, "addArg");
    bind<&FT::getArg, &get<CMPIArgs>>(tables, "getArg");
    bind<&FT::getArgAt, &getAt<CMPIArgs>>(tables, "getArgAt");
    bind<&FT::getArgCount, &count<CMPIArgs>>(tables, "getArgCount");
}

void bindSlots(Tables<CMPIContext>& tables) {
    using FT = CMPIContextFT;
    bindCommon(tables);
    bind<&FT::addEntry, &add<CMPIContext>>(tables, "addEntry");
    bind<&FT::getEntry, &get<CMPIContext>>(tables, "getEntry");
    bind<&FT::getEntryAt, &getAt<CMPIContext>>(tables, "getEntryAt");
    bind<&FT::getEntryCount, &count<CMPIContext>>(tables, "getEntryCount");
}

}  // namespace cmpihost
