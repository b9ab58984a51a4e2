#include "BrokerFixture.h"

namespace cmpihost {
namespace {

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
    set(instance, "boolean", CMPIBoolean{1}, CMPI_boolean);
    set(instance, "char16", CMPIChar16{0x20AC}, CMPI_char16);
    set(instance, "uint8", CMPIUint8{255}, CMPI_uint8);
    set(instance, "uint16", CMPIUint16{65535}, CMPI_uint16);
    set(instance, "uint32", CMPIUint32{4294967295u}, CMPI_uint32);
    set(instance, "uint64", CMPIUint64{18446744073709551615u}, CMPI_uint64);
    set(instance, "sint8", CMPISint8{-128}, CMPI_sint8);
    set(instance, "sint16", CMPISint16{-32768}, CMPI_sint16);
    set(instance, "sint32", CMPISint32{-7}, CMPI_sint32);
    set(instance, "sint64", CMPISint64{-9}, CMPI_sint64);
    set(instance, "real32", CMPIReal32{0.1f}, CMPI_real32);
    set(instance, "real64", CMPIReal64{0.1}, CMPI_real64);

    EXPECT_EQ(get(instance, "boolean").value.boolean, 1);
    EXPECT_EQ(get(instance, "char16").value.char16, 0x20AC);
    EXPECT_EQ(get(instance, "uint8").value.uint8, 255);
    EXPECT_EQ(get(instance, "uint16").value.uint16, 65535);
    EXPECT_EQ(get(instance, "uint32").value.uint32, 4294967295u);
    EXPECT_EQ(get(instance, "uint64").value.uint64, 18446744073709551615u);
    EXPECT_EQ(get(instance, "sint8").value.sint8, -128);
    EXPECT_EQ(get(instance, "sint16").value.sint16, -32768);
    EXPECT_EQ(get(instance, "sint32").value.sint32, -7);
    EXPECT_EQ(get(instance, "sint64").value.sint64, -9);
    EXPECT_EQ(get(instance, "real32").value.real32, 0.1f);
    EXPECT_EQ(get(instance, "real64").value.real64, 0.1);
    EXPECT_EQ(get(instance, "uint16").type, CMPI_uint16);
    EXPECT_EQ(get(instance, "uint16").state, CMPI_goodValue);
}

TEST_F(InstanceObject, KeepsObjectsAsCopies) {
    CMPIInstance* const instance = newInstance();
    CMPIObjectPath* const path = newPath("TEST_Other");
    CMPIInstance* const inner = newInstance("TEST_Other");
    CMPIDateTime* const date = CMNewDateTimeFromChars(mb, "20000229123456.000007+000", nullptr);
    CMPIArray* const array = CMNewArray(mb, 2, CMPI_uint16, nullptr);
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
    CMPIArray* const numbers = CMNewArray(mb, 1, CMPI_uint16, nullptr);
    CMPIArray* const texts = CMNewArray(mb, 1, CMPI_string, nullptr);
    EXPECT_EQ(set(instance, "Texts", texts, CMPI_charsA).rc, CMPI_RC_OK);
    EXPECT_EQ(get(instance, "Texts").type, CMPI_stringA);
    EXPECT_EQ(set(instance, "A", numbers, CMPI_stringA).rc, CMPI_RC_ERR_TYPE_MISMATCH);
    EXPECT_EQ(set(instance, "A", texts, CMPI_uint16A).rc, CMPI_RC_ERR_TYPE_MISMATCH);
    EXPECT_EQ(set(instance, "A", numbers, CMPI_uint32A).rc, CMPI_RC_ERR_TYPE_MISMATCH);
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
                ::testing::ElementsAre("CMPIBrokerEncFT.newInstance: null CMPIObjectPath"));
}

TEST_F(InstanceObject, AnArrayOfAnotherTypeDoesNotFitItsDeclaration) {
    CMPIInstance* const instance = newInstance();
    CMPIArray* const array = CMNewArray(mb, 1, CMPI_uint16, nullptr);
    EXPECT_EQ(set(instance, "Codes", array, CMPI_uint32A).rc, CMPI_RC_ERR_TYPE_MISMATCH);
    EXPECT_EQ(CMGetPropertyCount(instance, nullptr), 0u);
}

}  // namespace
}  // namespace cmpihost
