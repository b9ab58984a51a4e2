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
    EXPECT_THAT(broker.violations(), ::testing::IsEmpty());
}

TEST_F(PathObject, AKeyWithoutAValueIsRefused) {
    CMPIObjectPath* const path = newPath();
    EXPECT_EQ(CMAddKey(path, "Name", nullptr, CMPI_chars).rc, CMPI_RC_ERR_INVALID_PARAMETER);
    EXPECT_EQ(CMAddKey(path, "Size", nullptr, CMPI_uint32).rc, CMPI_RC_ERR_INVALID_PARAMETER);
    EXPECT_EQ(CMGetKeyCount(path, nullptr), 0u);
    EXPECT_THAT(broker.violations(), ::testing::ElementsAre("key TEST_Thing.Name without a value",
                                                            "key TEST_Thing.Size without a value"));
}

TEST_F(PathObject, ArraysAndInstancesAreNoKeys) {
    CMPIObjectPath* const path = newPath();
    CMPIArray* const array = CMNewArray(mb, 1, CMPI_uint16, nullptr);
    CMPIInstance* const instance = newInstance();
    EXPECT_EQ(CMAddKey(path, "Codes", &array, CMPI_uint16A).rc, CMPI_RC_ERR_TYPE_MISMATCH);
    EXPECT_EQ(CMAddKey(path, "Thing", &instance, CMPI_instance).rc, CMPI_RC_ERR_TYPE_MISMATCH);
    EXPECT_THAT(broker.violations(),
                ::testing::ElementsAre("key TEST_Thing.Codes of type uint16[]",
                                       "key TEST_Thing.Thing of type instance"));
}

TEST_F(PathObject, ATypeThatIsNoneIsRefused) {
    CMPIObjectPath* const path = newPath();
    const CMPIUint64 number = 1;
    EXPECT_EQ(CMAddKey(path, "Name", &number, 0x7FF).rc, CMPI_RC_ERR_INVALID_DATA_TYPE);
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
    CMGetClassQualifier(path, "Association", &status);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_NOT_SUPPORTED);
    CMGetPropertyQualifier(path, "Name", "Key", &status);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_NOT_SUPPORTED);
    CMGetMethodQualifier(path, "Run", "Static", &status);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_NOT_SUPPORTED);
    CMGetParameterQualifier(path, "Run", "How", "In", &status);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_NOT_SUPPORTED);
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
    EXPECT_THAT(broker.violations(),
                ::testing::ElementsAre("CMPIObjectPathFT.setClassName: null text",
                                       "CMPIObjectPathFT.addKey: null name",
                                       "CMPIObjectPathFT.getKey: null name",
                                       "CMPIBrokerEncFT.newObjectPath: null class name",
                                       "CMPIObjectPathFT.getKeyCount: null CMPIObjectPath"));
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
    EXPECT_THAT(broker.violations(),
                ::testing::ElementsAre("CMPIBrokerEncFT.newString: null text"));
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
