#include "BrokerFixture.h"

#include "host/broker/Object.h"

#include <functional>

#ifdef __SANITIZE_ADDRESS__
#include <sanitizer/asan_interface.h>
#endif

namespace cmpihost {
namespace {

class PathObject : public BrokerTest {
  protected:
    std::string key(const CMPIObjectPath* path, const char* name) {
        const CMPIData data = CMGetKey(path, name, &status);
        return status.rc == CMPI_RC_OK ? textOf(data.value.string) : "(missing)";
    }
};

TEST_F(PathObject, CarriesNamespaceClassAndHost) {
    CMPIObjectPath* const path = newPath();
    EXPECT_EQ(status.rc, CMPI_RC_OK);
    EXPECT_EQ(textOf(CMGetNameSpace(path, &status)), "root/cimv2");
    EXPECT_EQ(textOf(CMGetClassName(path, &status)), "TEST_Thing");
    EXPECT_EQ(textOf(CMGetHostname(path, &status)), "(no characters)");

    EXPECT_EQ(CMSetNameSpace(path, "root/interop").rc, CMPI_RC_OK);
    EXPECT_EQ(CMSetClassName(path, "TEST_Other").rc, CMPI_RC_OK);
    EXPECT_EQ(CMSetHostname(path, "node7").rc, CMPI_RC_OK);
    EXPECT_EQ(valueOf(path), (ObjectPathValue{"root/interop", "TEST_Other"}));
    EXPECT_EQ(textOf(CMGetHostname(path, &status)), "node7");
}

TEST_F(PathObject, MayBeMadeWithoutANamespace) {
    CMPIObjectPath* const path = CMNewObjectPath(mb, nullptr, "TEST_Thing", &status);
    ASSERT_NE(path, nullptr);
    EXPECT_EQ(textOf(CMGetNameSpace(path, nullptr)), "");
}

TEST_F(PathObject, FindsKeysWithoutCaseAndKeepsTheirOrder) {
    CMPIObjectPath* const path = newPath();
    CMAddKey(path, "Zeta", "z", CMPI_chars);
    CMAddKey(path, "Alpha", "a", CMPI_chars);
    EXPECT_EQ(key(path, "ZETA"), "z");
    EXPECT_EQ(CMGetKeyCount(path, nullptr), 2u);

    CMPIString* name = nullptr;
    EXPECT_EQ(textOf(CMGetKeyAt(path, 0, &name, &status).value.string), "z");
    EXPECT_EQ(textOf(name), "Zeta");
    EXPECT_EQ(textOf(CMGetKeyAt(path, 1, &name, &status).value.string), "a");
    EXPECT_EQ(textOf(name), "Alpha");
}

TEST_F(PathObject, AKeyOfAKnownNameIsReplacedInItsPlace) {
    CMPIObjectPath* const path = newPath();
    CMAddKey(path, "A", "1", CMPI_chars);
    CMAddKey(path, "B", "2", CMPI_chars);
    CMAddKey(path, "a", "3", CMPI_chars);
    EXPECT_EQ(toString(valueOf(path)), "root/cimv2:TEST_Thing.A=\"3\",B=\"2\"");
}

TEST_F(PathObject, TextKeysComeBackAsStringsWithTheKeyState) {
    CMPIObjectPath* const path = newPath();
    CMPIString* const text = CMNewString(mb, "long enough for the heap, surely", nullptr);
    char* characters = const_cast<char*>("by address");
    CMAddKey(path, "A", "chars", CMPI_chars);
    CMAddKey(path, "B", &text, CMPI_string);
    CMAddKey(path, "C", &characters, CMPI_charsptr);
    for (const char* const name : {"A", "B", "C"}) {
        const CMPIData data = CMGetKey(path, name, &status);
        EXPECT_EQ(data.type, CMPI_string) << name;
        EXPECT_EQ(data.state, CMPI_keyValue) << name;
    }
    EXPECT_EQ(key(path, "B"), "long enough for the heap, surely");
    EXPECT_EQ(key(path, "C"), "by address");
}

TEST_F(PathObject, NumberKeysReadOnlyTheBytesOfTheirType) {
    CMPIObjectPath* const path = newPath();
    const auto small = std::make_unique<CMPIUint8>(CMPIUint8{200});
    const auto wide = std::make_unique<CMPISint64>(CMPISint64{-5});
    const auto flag = std::make_unique<CMPIBoolean>(CMPIBoolean{7});
    CMAddKey(path, "Small", small.get(), CMPI_uint8);
    CMAddKey(path, "Wide", wide.get(), CMPI_sint64);
    CMAddKey(path, "Flag", flag.get(), CMPI_boolean);
    EXPECT_EQ(CMGetKey(path, "Small", nullptr).value.uint8, 200);
    EXPECT_EQ(CMGetKey(path, "Wide", nullptr).value.sint64, -5);
    EXPECT_EQ(CMGetKey(path, "Flag", nullptr).value.boolean, 1);
}

TEST_F(PathObject, AReferenceKeyIsACopyOfItsPath) {
    CMPIObjectPath* const end = newPath("TEST_Other");
    CMAddKey(end, "Id", "1", CMPI_chars);
    CMPIObjectPath* const link = newPath("TEST_Link");
    CMAddKey(link, "Right", &end, CMPI_ref);
    CMAddKey(end, "Id", "changed", CMPI_chars);

    const CMPIData data = CMGetKey(link, "Right", &status);
    ASSERT_EQ(data.type, CMPI_ref);
    EXPECT_EQ(key(data.value.ref, "Id"), "1");
    CMAddKey(data.value.ref, "Id", "mine", CMPI_chars);
    EXPECT_EQ(key(CMGetKey(link, "Right", nullptr).value.ref, "Id"), "1");
}

TEST_F(PathObject, AMissingKeyIsToldByStatusAndState) {
    CMPIObjectPath* const path = newPath();
    const CMPIData byName = CMGetKey(path, "Name", &status);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_NO_SUCH_PROPERTY);
    EXPECT_EQ(byName.type, CMPI_null);
    EXPECT_EQ(byName.state, CMPI_notFound);
    EXPECT_EQ(CMGetKeyAt(path, 0, nullptr, &status).state, CMPI_notFound);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_NO_SUCH_PROPERTY);
    EXPECT_THAT(broker.violations(), IsEmpty());
}

TEST_F(PathObject, WhatCannotBeAKeyIsRefused) {
    CMPIObjectPath* const path = newPath();
    CMPIArray* const array = newArray(CMPI_uint16);
    CMPIInstance* const instance = newInstance();
    const CMPIUint64 number = 1;
    CMPIValuePtr bytes = {nullptr, 0};
    const struct {
        const char* name;
        const void* value;
        CMPIType type;
        CMPIrc rc;
    } rows[] = {{"Name", nullptr, CMPI_chars, CMPI_RC_ERR_INVALID_PARAMETER},
                {"Size", nullptr, CMPI_uint32, CMPI_RC_ERR_INVALID_PARAMETER},
                {"Codes", &array, CMPI_uint16A, CMPI_RC_ERR_TYPE_MISMATCH},
                {"Thing", &instance, CMPI_instance, CMPI_RC_ERR_TYPE_MISMATCH},
                {"Bytes", &bytes, CMPI_ptr, CMPI_RC_ERR_TYPE_MISMATCH},
                {"Odd", &number, 0x7FF, CMPI_RC_ERR_INVALID_DATA_TYPE}};
    for (const auto& row : rows) {
        EXPECT_EQ(CMAddKey(path, row.name, row.value, row.type).rc, row.rc) << row.name;
    }
    EXPECT_EQ(CMGetKeyCount(path, nullptr), 0u);
    EXPECT_THAT(broker.violations(), ElementsAre("key TEST_Thing.Name without a value",
                                                 "key TEST_Thing.Size without a value",
                                                 "key TEST_Thing.Codes of type uint16[]",
                                                 "key TEST_Thing.Thing of type instance",
                                                 "key TEST_Thing.Bytes of type pointer"));
}

TEST_F(PathObject, TakesNamespaceAndHostFromAnotherPath) {
    CMPIObjectPath* const source = newPath("TEST_Other");
    CMSetHostname(source, "node7");
    CMSetNameSpace(source, "root/interop");
    CMPIObjectPath* const path = newPath();
    EXPECT_EQ(CMSetNameSpaceFromObjectPath(path, source).rc, CMPI_RC_OK);
    EXPECT_EQ(valueOf(path), (ObjectPathValue{"root/interop", "TEST_Other"}));
    EXPECT_EQ(valueOf(path).hostName, "");
    EXPECT_EQ(CMSetHostAndNameSpaceFromObjectPath(path, source).rc, CMPI_RC_OK);
    EXPECT_EQ(valueOf(path).hostName, "node7");
}

TEST_F(PathObject, AnswersNoQualifiers) {
    CMPIObjectPath* const path = newPath();
    std::vector<CMPIrc> answers;
    const auto note = [&](const CMPIData& data) {
        EXPECT_EQ(data.state, CMPI_notFound);
        answers.push_back(status.rc);
    };
    note(CMGetClassQualifier(path, "Association", &status));
    note(CMGetPropertyQualifier(path, "Name", "Key", &status));
    note(CMGetMethodQualifier(path, "Run", "Static", &status));
    note(CMGetParameterQualifier(path, "Run", "How", "In", &status));
    EXPECT_EQ(answers, std::vector<CMPIrc>(4, CMPI_RC_ERR_NOT_SUPPORTED));
}

TEST_F(PathObject, IsWrittenAsClientsWriteIt) {
    CMPIObjectPath* const path = newPath();
    CMAddKey(path, "Name", "x", CMPI_chars);
    EXPECT_EQ(textOf(path->ft->toString(path, nullptr)), "root/cimv2:TEST_Thing.Name=\"x\"");
}

TEST_F(PathObject, NullArgumentsAreViolationsAndChangeNothing) {
    CMPIObjectPath* const path = newPath();
    EXPECT_EQ(CMSetClassName(path, nullptr).rc, CMPI_RC_ERR_INVALID_PARAMETER);
    EXPECT_EQ(CMAddKey(path, nullptr, "x", CMPI_chars).rc, CMPI_RC_ERR_INVALID_PARAMETER);
    CMGetKey(path, nullptr, &status);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_PARAMETER);
    EXPECT_EQ(CMNewObjectPath(mb, "root", nullptr, &status), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_PARAMETER);
    EXPECT_EQ(path->ft->getKeyCount(nullptr, &status), 0u);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_PARAMETER);
    EXPECT_EQ(valueOf(path), (ObjectPathValue{"root/cimv2", "TEST_Thing"}));
    EXPECT_THAT(
        broker.violations(),
        ElementsAre("CMPIObjectPathFT.setClassName: null text",
                    "CMPIObjectPathFT.addKey: null name", "CMPIObjectPathFT.getKey: null name",
                    "CMPIBrokerEncFT.newObjectPath: null class name",
                    "CMPIObjectPathFT.getKeyCount: null CMPIObjectPath"));
}

class InstanceObject : public BrokerTest {
  protected:
    template <class T>
    CMPIStatus set(CMPIInstance* instance, const char* name, T value, CMPIType type) {
        return CMSetProperty(instance, name, &value, type);
    }
    CMPIData get(const CMPIInstance* instance, const char* name) {
        return CMGetProperty(instance, name, &status);
    }
};

TEST_F(InstanceObject, KeepsValuesOfEveryType) {
    CMPIInstance* const instance = newInstance();
    // Set, then read through the member of the same type.
    const auto check = [&](auto value, auto member, CMPIType type) {
        set(instance, "Value", value, type);
        const CMPIData data = get(instance, "Value");
        EXPECT_EQ(data.type, type) << cimTypeName(type);
        EXPECT_EQ(data.state, CMPI_goodValue) << cimTypeName(type);
        EXPECT_EQ(data.value.*member, value) << cimTypeName(type);
    };
    check(CMPIBoolean{1}, &CMPIValue::boolean, CMPI_boolean);
    check(CMPIChar16{0x20AC}, &CMPIValue::char16, CMPI_char16);
    check(CMPIUint8{255}, &CMPIValue::uint8, CMPI_uint8);
    check(CMPIUint16{65535}, &CMPIValue::uint16, CMPI_uint16);
    check(CMPIUint32{4294967295u}, &CMPIValue::uint32, CMPI_uint32);
    check(CMPIUint64{18446744073709551615u}, &CMPIValue::uint64, CMPI_uint64);
    check(CMPISint8{-128}, &CMPIValue::sint8, CMPI_sint8);
    check(CMPISint16{-32768}, &CMPIValue::sint16, CMPI_sint16);
    check(CMPISint32{-7}, &CMPIValue::sint32, CMPI_sint32);
    check(CMPISint64{-9}, &CMPIValue::sint64, CMPI_sint64);
    check(CMPIReal32{0.1f}, &CMPIValue::real32, CMPI_real32);
    check(CMPIReal64{0.1}, &CMPIValue::real64, CMPI_real64);
}

TEST_F(InstanceObject, KeepsObjectsAsCopies) {
    CMPIInstance* const instance = newInstance();
    CMPIObjectPath* const path = newPath("TEST_Other");
    CMPIInstance* const inner = newInstance("TEST_Other");
    CMPIDateTime* const date = CMNewDateTimeFromChars(mb, "20000229123456.000007+000", nullptr);
    CMPIArray* const array = newArray(CMPI_uint16, 2);
    const CMPIUint16 code = 5;
    CMSetArrayElementAt(array, 0, &code, CMPI_uint16);
    set(instance, "ref", path, CMPI_ref);
    set(instance, "instance", inner, CMPI_instance);
    set(instance, "date", date, CMPI_dateTime);
    set(instance, "array", array, CMPI_uint16A);
    CMSetClassName(path, "TEST_Changed");
    CMSetProperty(inner, "Later", "x", CMPI_chars);
    CMSetArrayElementAt(array, 1, &code, CMPI_uint16);

    EXPECT_EQ(textOf(CMGetClassName(get(instance, "ref").value.ref, nullptr)), "TEST_Other");
    EXPECT_EQ(CMGetPropertyCount(get(instance, "instance").value.inst, nullptr), 0u);
    EXPECT_EQ(textOf(CMGetStringFormat(get(instance, "date").value.dateTime, nullptr)),
              "20000229123456.000007+000");
    const CMPIArray* const kept = get(instance, "array").value.array;
    EXPECT_EQ(CMGetArrayElementAt(kept, 0, nullptr).value.uint16, 5);
    EXPECT_EQ(CMGetArrayElementAt(kept, 1, nullptr).state, CMPI_nullValue);
    EXPECT_EQ(get(instance, "array").type, CMPI_uint16A);
}

TEST_F(InstanceObject, AnArrayIsTakenAsTheTypeOfItsElementsOnly) {
    CMPIInstance* const instance = newInstance();
    CMPIArray* const numbers = newArray(CMPI_uint16);
    CMPIArray* const texts = newArray(CMPI_string);
    EXPECT_EQ(set(instance, "Texts", texts, CMPI_charsA).rc, CMPI_RC_OK);
    EXPECT_EQ(get(instance, "Texts").type, CMPI_stringA);
    for (const auto& [array, type] :
         {std::pair(numbers, CMPI_stringA), {texts, CMPI_uint16A}, {numbers, CMPI_uint32A}}) {
        EXPECT_EQ(set(instance, "A", array, CMPIType(type)).rc, CMPI_RC_ERR_TYPE_MISMATCH) << type;
    }
    EXPECT_EQ(CMGetPropertyCount(instance, nullptr), 1u);
}

TEST_F(InstanceObject, ANullValueIsAProperty) {
    CMPIInstance* const instance = newInstance();
    CMPIString* const none = nullptr;
    CMSetProperty(instance, "Size", nullptr, CMPI_uint32);
    CMSetProperty(instance, "Text", &none, CMPI_string);
    EXPECT_EQ(CMGetPropertyCount(instance, nullptr), 2u);
    EXPECT_EQ(get(instance, "Size").state, CMPI_nullValue);
    EXPECT_EQ(get(instance, "Size").type, CMPI_uint32);
    EXPECT_EQ(get(instance, "Text").state, CMPI_nullValue);
    EXPECT_EQ(status.rc, CMPI_RC_OK);
}

TEST_F(InstanceObject, FindsPropertiesByNameWithoutCaseAndByIndex) {
    CMPIInstance* const instance = newInstance();
    CMSetProperty(instance, "Zeta", "z", CMPI_chars);
    CMSetProperty(instance, "Alpha", "a", CMPI_chars);
    CMSetProperty(instance, "ZETA", "again", CMPI_chars);
    EXPECT_EQ(CMGetPropertyCount(instance, nullptr), 2u);
    CMPIString* name = nullptr;
    EXPECT_EQ(textOf(CMGetPropertyAt(instance, 0, &name, &status).value.string), "again");
    EXPECT_EQ(textOf(name), "Zeta");
    EXPECT_EQ(CMGetPropertyAt(instance, 2, &name, &status).state, CMPI_notFound);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_NO_SUCH_PROPERTY);
    EXPECT_EQ(get(instance, "beta").state, CMPI_notFound);
}

TEST_F(InstanceObject, RemembersWhereAPropertyComesFrom) {
    CMPIInstance* const instance = newInstance();
    CMSetPropertyWithOrigin(instance, "Name", "x", CMPI_chars, "TEST_Base");
    CMSetPropertyWithOrigin(instance, "Other", "x", CMPI_chars, nullptr);
    EXPECT_EQ(valueOf(instance).properties[0].origin, "TEST_Base");
    EXPECT_EQ(valueOf(instance).properties[1].origin, "");
}

TEST_F(InstanceObject, AFilterDropsOtherPropertiesBeforeAndAfter) {
    CMPIInstance* const instance = newInstance();
    CMSetProperty(instance, "Before", "x", CMPI_chars);
    CMSetProperty(instance, "Size", "x", CMPI_chars);
    const char* names[] = {"size", "Unknown", nullptr};
    EXPECT_EQ(CMSetPropertyFilter(instance, names, nullptr).rc, CMPI_RC_OK);
    EXPECT_EQ(CMSetProperty(instance, "After", "x", CMPI_chars).rc, CMPI_RC_OK);
    EXPECT_EQ(CMSetProperty(instance, "Size", "y", CMPI_chars).rc, CMPI_RC_OK);
    EXPECT_EQ(valueOf(instance), (InstanceValue{{"root/cimv2", "TEST_Thing"}, {{"Size", "y"}}}));
}

TEST_F(InstanceObject, ANullFilterLetsEverythingThrough) {
    CMPIInstance* const instance = newInstance();
    const char* none[] = {nullptr};
    CMSetPropertyFilter(instance, none, nullptr);
    CMSetProperty(instance, "A", "x", CMPI_chars);
    EXPECT_EQ(CMGetPropertyCount(instance, nullptr), 0u);
    CMSetPropertyFilter(instance, nullptr, nullptr);
    CMSetProperty(instance, "A", "x", CMPI_chars);
    EXPECT_EQ(CMGetPropertyCount(instance, nullptr), 1u);
}

TEST_F(InstanceObject, CarriesThePathThatItWasMadeOf) {
    CMPIObjectPath* const path = newPath();
    CMAddKey(path, "Name", "x", CMPI_chars);
    CMPIInstance* const instance = CMNewInstance(mb, path, &status);
    CMAddKey(path, "Name", "changed", CMPI_chars);
    CMPIObjectPath* const own = CMGetObjectPath(instance, &status);
    EXPECT_EQ(valueOf(own), (ObjectPathValue{"root/cimv2", "TEST_Thing", {{"Name", "x"}}}));
    EXPECT_EQ(CMGetPropertyCount(instance, nullptr), 0u);

    EXPECT_EQ(CMSetObjectPath(instance, path).rc, CMPI_RC_OK);
    EXPECT_EQ(valueOf(CMGetObjectPath(instance, nullptr)), valueOf(path));
}

TEST_F(InstanceObject, IsNotMadeOfANullPath) {
    EXPECT_EQ(CMNewInstance(mb, nullptr, &status), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_PARAMETER);
    EXPECT_THAT(broker.violations(),
                ElementsAre("CMPIBrokerEncFT.newInstance: null CMPIObjectPath"));
}

using StringObject = BrokerTest;

TEST_F(StringObject, CopiesItsTextAndLendsItThroughItsHandle) {
    std::string text = "some text";
    CMPIString* const string = CMNewString(mb, text.c_str(), &status);
    text = "overwritten";
    EXPECT_STREQ(CMGetCharsPtr(string, &status), "some text");
    EXPECT_EQ(status.rc, CMPI_RC_OK);
    EXPECT_STREQ(CMGetCharPtr(string), "some text");
    EXPECT_EQ(CMGetCharsPtr(string, nullptr), CMGetCharPtr(string));
}

// The object stays as a shell when it has ended; its characters do not.
TEST_F(StringObject, KeepsItsCharactersApartFromTheObjectHoweverFewTheyAre) {
    for (const std::size_t length : {0U, 1U, 31U, 1000U}) {
        CMPIString* const string = CMNewString(mb, std::string(length, 'x').c_str(), &status);
        const char* const characters = CMGetCharsPtr(string, nullptr);
        const auto* const object = reinterpret_cast<const char*>(string);
        EXPECT_TRUE(std::less<>()(characters, object) ||
                    std::greater_equal<>()(characters, object + sizeof(Object<CMPIString>)))
            << length;
#ifdef __SANITIZE_ADDRESS__
        mb->mft->freeString(mb, string);
        EXPECT_TRUE(__asan_address_is_poisoned(characters)) << length;
#endif
    }
}

TEST_F(StringObject, IsNotMadeOfNull) {
    EXPECT_EQ(CMNewString(mb, nullptr, &status), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_PARAMETER);
    EXPECT_THAT(broker.violations(), ElementsAre("CMPIBrokerEncFT.newString: null text"));
}

TEST_F(StringObject, TheHostMayMakeOneWithoutCharacters) {
    CMPIString* const string = request.makeString(std::nullopt);
    ASSERT_NE(string, nullptr);
    EXPECT_EQ(CMGetCharsPtr(string, &status), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_OK);
    EXPECT_EQ(CMGetCharPtr(string), nullptr);
}

}  // namespace
}  // namespace cmpihost
