// Object paths, instances and strings as a provider sees them through their tables.
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
        return shown(CMGetKey(path, name, &status));
    }
    std::string keyAt(const CMPIObjectPath* path, CMPICount index) {
        CMPIString* name = nullptr;
        const std::string value = shown(CMGetKeyAt(path, index, &name, &status));
        return textOf(name) + '=' + value;
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
    EXPECT_EQ(toString(valueOf(path)), "//node7/root/interop:TEST_Other");
    EXPECT_EQ(textOf(CMGetHostname(path, &status)), "node7");
    CMPIObjectPath* const bare = CMNewObjectPath(mb, nullptr, "TEST_Thing", &status);
    EXPECT_EQ(textOf(CMGetNameSpace(bare, nullptr)), "");
}

TEST_F(PathObject, FindsKeysWithoutCaseAndKeepsTheirOrder) {
    CMPIObjectPath* const path = newPath();
    CMAddKey(path, "Zeta", "z", CMPI_chars);
    CMAddKey(path, "Alpha", "a", CMPI_chars);
    EXPECT_EQ(CMGetKeyCount(path, nullptr), 2u);
    EXPECT_EQ(keyAt(path, 0), "Zeta=key string z");
    EXPECT_EQ(keyAt(path, 1), "Alpha=key string a");
    CMAddKey(path, "ZETA", "again", CMPI_chars);
    EXPECT_EQ(key(path, "zeta"), "key string again");
    EXPECT_EQ(textOf(path->ft->toString(path, nullptr)),
              "root/cimv2:TEST_Thing.Zeta=\"again\",Alpha=\"a\"");
}

TEST_F(PathObject, TextKeysComeBackAsStringsAndNumbersReadOnlyTheBytesOfTheirType) {
    CMPIObjectPath* const path = newPath();
    CMPIString* const text = CMNewString(mb, "long enough for the heap, surely", nullptr);
    char* characters = const_cast<char*>("by address");
    const auto small = std::make_unique<CMPIUint8>(CMPIUint8{200});
    const auto wide = std::make_unique<CMPISint64>(CMPISint64{-5});
    const auto flag = std::make_unique<CMPIBoolean>(CMPIBoolean{7});
    const struct {
        const void* value;
        CMPIType type;
        const char* expected;
    } rows[] = {{"chars", CMPI_chars, "key string chars"},
                {&text, CMPI_string, "key string long enough for the heap, surely"},
                {&characters, CMPI_charsptr, "key string by address"},
                {small.get(), CMPI_uint8, "key uint8 200"},
                {wide.get(), CMPI_sint64, "key sint64 -5"},
                {flag.get(), CMPI_boolean, "key boolean true"}};
    for (const auto& row : rows) {
        EXPECT_EQ(CMAddKey(path, "Key", row.value, row.type).rc, CMPI_RC_OK) << row.expected;
        EXPECT_EQ(key(path, "Key"), row.expected);
    }
}

TEST_F(PathObject, AReferenceKeyIsACopyOfItsPath) {
    CMPIObjectPath* const end = newPath("TEST_Other");
    CMAddKey(end, "Id", "1", CMPI_chars);
    CMPIObjectPath* const link = newPath("TEST_Link");
    CMAddKey(link, "Right", &end, CMPI_ref);
    const std::string expected = "key ref root/cimv2:TEST_Other.Id=\"1\"";
    CMAddKey(end, "Id", "changed", CMPI_chars);
    EXPECT_EQ(key(link, "Right"), expected);
    CMAddKey(CMGetKey(link, "Right", &status).value.ref, "Id", "mine", CMPI_chars);
    EXPECT_EQ(key(link, "Right"), expected);
}

TEST_F(PathObject, AMissingKeyIsToldByStatusAndState) {
    CMPIObjectPath* const path = newPath();
    EXPECT_EQ(key(path, "Name"), "missing");
    EXPECT_EQ(status.rc, CMPI_RC_ERR_NO_SUCH_PROPERTY);
    EXPECT_EQ(keyAt(path, 0), "(null)=missing");
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
    CMPIrc set(CMPIInstance* instance, const char* name, T value, CMPIType type) {
        return CMSetProperty(instance, name, &value, type).rc;
    }
    std::string get(const CMPIInstance* instance, const char* name) {
        return shown(CMGetProperty(instance, name, &status));
    }
};

TEST_F(InstanceObject, KeepsValuesOfEveryType) {
    CMPIInstance* const instance = newInstance();
    const auto kept = [&](auto value, CMPIType type) {
        EXPECT_EQ(set(instance, "Value", value, type), CMPI_RC_OK) << cimTypeName(type);
        return get(instance, "Value");
    };
    EXPECT_EQ(kept(CMPIBoolean{1}, CMPI_boolean), "boolean true");
    EXPECT_EQ(kept(CMPIChar16{0x20AC}, CMPI_char16), "char16 8364");
    EXPECT_EQ(kept(CMPIUint8{255}, CMPI_uint8), "uint8 255");
    EXPECT_EQ(kept(CMPIUint16{65535}, CMPI_uint16), "uint16 65535");
    EXPECT_EQ(kept(CMPIUint32{4294967295u}, CMPI_uint32), "uint32 4294967295");
    EXPECT_EQ(kept(~CMPIUint64{0}, CMPI_uint64), "uint64 18446744073709551615");
    EXPECT_EQ(kept(CMPISint8{-128}, CMPI_sint8), "sint8 -128");
    EXPECT_EQ(kept(CMPISint16{-32768}, CMPI_sint16), "sint16 -32768");
    EXPECT_EQ(kept(CMPISint32{-7}, CMPI_sint32), "sint32 -7");
    EXPECT_EQ(kept(CMPISint64{-9}, CMPI_sint64), "sint64 -9");
    EXPECT_EQ(kept(CMPIReal32{0.1f}, CMPI_real32), "real32 0.1");
    EXPECT_EQ(kept(CMPIReal64{0.1}, CMPI_real64), "real64 0.1");
    const CMPIString* const none = nullptr;
    EXPECT_EQ(kept(none, CMPI_string), "null string");
    CMSetProperty(instance, "Value", nullptr, CMPI_uint32);
    EXPECT_EQ(get(instance, "Value"), "null uint32");
    EXPECT_EQ(status.rc, CMPI_RC_OK);
    EXPECT_EQ(CMGetPropertyCount(instance, nullptr), 1u);
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

    EXPECT_EQ(get(instance, "ref"), "ref root/cimv2:TEST_Other");
    EXPECT_EQ(get(instance, "date"), "datetime 20000229123456.000007+000");
    const CMPIData kept = CMGetProperty(instance, "instance", nullptr);
    EXPECT_EQ(valueOf(kept.value.inst), (InstanceValue{{"root/cimv2", "TEST_Other"}}));
    EXPECT_EQ(get(instance, "array"), "uint16[]");
    const CMPIArray* const codes = CMGetProperty(instance, "array", nullptr).value.array;
    EXPECT_EQ(shown(CMGetArrayElementAt(codes, 0, nullptr)), "uint16 5");
    EXPECT_EQ(shown(CMGetArrayElementAt(codes, 1, nullptr)), "null uint16");
}

TEST_F(InstanceObject, AnArrayIsTakenAsTheTypeOfItsElementsOnly) {
    CMPIInstance* const instance = newInstance();
    CMPIArray* const numbers = newArray(CMPI_uint16);
    CMPIArray* const texts = newArray(CMPI_string);
    EXPECT_EQ(set(instance, "Texts", texts, CMPI_charsA), CMPI_RC_OK);
    EXPECT_EQ(get(instance, "Texts"), "string[]");
    EXPECT_EQ(set(instance, "A", numbers, CMPI_stringA), CMPI_RC_ERR_TYPE_MISMATCH);
    EXPECT_EQ(set(instance, "A", texts, CMPI_uint16A), CMPI_RC_ERR_TYPE_MISMATCH);
    EXPECT_EQ(set(instance, "A", numbers, CMPI_uint32A), CMPI_RC_ERR_TYPE_MISMATCH);
    EXPECT_EQ(CMGetPropertyCount(instance, nullptr), 1u);
}

TEST_F(InstanceObject, FindsPropertiesByNameWithoutCaseAndByIndex) {
    CMPIInstance* const instance = newInstance();
    CMSetProperty(instance, "Zeta", "z", CMPI_chars);
    CMSetProperty(instance, "Alpha", "a", CMPI_chars);
    CMSetProperty(instance, "ZETA", "again", CMPI_chars);
    EXPECT_EQ(CMGetPropertyCount(instance, nullptr), 2u);
    CMPIString* name = nullptr;
    EXPECT_EQ(shown(CMGetPropertyAt(instance, 0, &name, &status)), "string again");
    EXPECT_EQ(textOf(name), "Zeta");
    EXPECT_EQ(shown(CMGetPropertyAt(instance, 2, &name, &status)), "missing");
    EXPECT_EQ(status.rc, CMPI_RC_ERR_NO_SUCH_PROPERTY);
    EXPECT_EQ(get(instance, "beta"), "missing");
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

TEST_F(StringObject, TheHostMayMakeOneWithoutCharacters) {
    CMPIString* const string = request.makeString(std::nullopt);
    ASSERT_NE(string, nullptr);
    EXPECT_EQ(CMGetCharsPtr(string, &status), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_OK);
    EXPECT_EQ(CMGetCharPtr(string), nullptr);
}

}  // namespace
}  // namespace cmpihost
