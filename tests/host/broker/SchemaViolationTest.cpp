// What the broker finds when it knows the classes.
#include "BrokerFixture.h"

#include "host/broker/ResultCollector.h"

namespace cmpihost {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;

class SchemaViolations : public ::testing::Test {
  protected:
    const TestCatalogue catalogue = testClasses();
    Broker broker{&catalogue};
    Request request{broker};
    ResultCollector collector{request};
    const CMPIBroker* mb = broker.cmpi();
    CMPIStatus status = {CMPI_RC_OK, nullptr};

    CMPIObjectPath* thingPath(const char* className = "TEST_Thing") {
        CMPIObjectPath* const path = CMNewObjectPath(mb, "root", className, &status);
        CMAddKey(path, "Name", "x", CMPI_chars);
        return path;
    }
    CMPIObjectPath* otherPath(CMPIUint16 id = 7) {
        CMPIObjectPath* const path = CMNewObjectPath(mb, "root", "TEST_Other", &status);
        CMAddKey(path, "Id", &id, CMPI_uint16);
        return path;
    }
    CMPIInstance* thing() { return CMNewInstance(mb, thingPath(), &status); }

    template <class T>
    CMPIrc set(CMPIInstance* instance, const char* name, T value, CMPIType type) {
        return CMSetProperty(instance, name, &value, type).rc;
    }
};

TEST_F(SchemaViolations, AnInstanceOfAnUnknownClassIsNotMade) {
    CMPIObjectPath* const path = CMNewObjectPath(mb, "root", "TEST_Unknown", &status);
    ASSERT_NE(path, nullptr);
    EXPECT_EQ(CMNewInstance(mb, path, &status), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_CLASS);
    EXPECT_THAT(broker.violations(),
                ElementsAre("newInstance of TEST_Unknown, a class that is not declared"));
}

TEST_F(SchemaViolations, AnUndeclaredPropertyIsRefused) {
    CMPIInstance* const instance = thing();
    EXPECT_EQ(CMSetProperty(instance, "Colour", "red", CMPI_chars).rc,
              CMPI_RC_ERR_NO_SUCH_PROPERTY);
    EXPECT_EQ(CMGetPropertyCount(instance, nullptr), 0u);
    EXPECT_THAT(broker.violations(), ElementsAre("TEST_Thing has no property Colour"));
}

TEST_F(SchemaViolations, AValueOfAnotherTypeIsRefused) {
    CMPIInstance* const instance = thing();
    EXPECT_EQ(set(instance, "Size", CMPIUint64{1}, CMPI_uint64), CMPI_RC_ERR_TYPE_MISMATCH);
    EXPECT_EQ(CMSetProperty(instance, "Size", "1", CMPI_chars).rc, CMPI_RC_ERR_TYPE_MISMATCH);
    EXPECT_EQ(CMSetProperty(instance, "Made", "20000229123456.000007+000", CMPI_chars).rc,
              CMPI_RC_ERR_TYPE_MISMATCH);
    EXPECT_EQ(CMSetProperty(instance, "Tags", "one", CMPI_chars).rc, CMPI_RC_ERR_TYPE_MISMATCH);
    EXPECT_EQ(CMSetProperty(instance, "Size", nullptr, CMPI_sint32).rc, CMPI_RC_ERR_TYPE_MISMATCH);
    EXPECT_EQ(set(instance, "Codes", CMNewArray(mb, 1, CMPI_uint32, nullptr), CMPI_uint32A),
              CMPI_RC_ERR_TYPE_MISMATCH);
    EXPECT_EQ(CMGetPropertyCount(instance, nullptr), 0u);
    EXPECT_THAT(broker.violations(), ElementsAre("TEST_Thing.Size is uint32, not uint64",
                                                 "TEST_Thing.Size is uint32, not string",
                                                 "TEST_Thing.Made is datetime, not string",
                                                 "TEST_Thing.Tags is string[], not string",
                                                 "TEST_Thing.Size is uint32, not sint32",
                                                 "TEST_Thing.Codes is uint16[], not uint32[]"));
}

TEST_F(SchemaViolations, ValuesOfTheDeclaredTypesPass) {
    CMPIInstance* const instance = thing();
    CMPIString* const name = CMNewString(mb, "x", nullptr);
    EXPECT_EQ(set(instance, "name", name, CMPI_string), CMPI_RC_OK);
    EXPECT_EQ(set(instance, "Size", CMPIUint32{1}, CMPI_uint32), CMPI_RC_OK);
    EXPECT_EQ(set(instance, "Made", CMNewDateTime(mb, nullptr), CMPI_dateTime), CMPI_RC_OK);
    EXPECT_EQ(set(instance, "Tags", CMNewArray(mb, 1, CMPI_chars, nullptr), CMPI_charsA),
              CMPI_RC_OK);
    EXPECT_EQ(set(instance, "Tags", CMNewArray(mb, 1, CMPI_string, nullptr), CMPI_stringA),
              CMPI_RC_OK);
    EXPECT_EQ(set(instance, "Codes", CMNewArray(mb, 1, CMPI_uint16, nullptr), CMPI_uint16A),
              CMPI_RC_OK);
    EXPECT_EQ(set(instance, "Owner", otherPath(), CMPI_ref), CMPI_RC_OK);
    EXPECT_EQ(CMSetProperty(instance, "Size", nullptr, CMPI_uint32).rc, CMPI_RC_OK);
    EXPECT_EQ(CMSetProperty(instance, "Size", nullptr, CMPI_null).rc, CMPI_RC_OK);
    EXPECT_EQ(CMSetProperty(instance, "Owner", nullptr, CMPI_ref).rc, CMPI_RC_OK);
    EXPECT_EQ(CMReturnInstance(collector.cmpi(), instance).rc, CMPI_RC_OK);
    EXPECT_THAT(broker.violations(), IsEmpty());
}

TEST_F(SchemaViolations, AReferenceToAnotherClassIsRefused) {
    CMPIInstance* const instance = thing();
    EXPECT_EQ(set(instance, "Owner", thingPath(), CMPI_ref), CMPI_RC_OK)
        << "the superclass of TEST_Thing is not declared, so it may descend from TEST_Other";
    CMPIObjectPath* const link = CMNewObjectPath(mb, "root", "TEST_Link", nullptr);
    EXPECT_EQ(set(instance, "Owner", link, CMPI_ref), CMPI_RC_ERR_TYPE_MISMATCH);
    EXPECT_THAT(broker.violations(),
                ElementsAre("TEST_Thing.Owner refers to TEST_Other, not to TEST_Link"));
}

TEST_F(SchemaViolations, AReturnedPathHasExactlyTheKeysOfItsClass) {
    const CMPIUint64 number = 1;
    CMPIObjectPath* const none = CMNewObjectPath(mb, "root", "TEST_Thing", nullptr);
    CMPIObjectPath* const extra = thingPath();
    CMAddKey(extra, "Id", "1", CMPI_chars);
    CMPIObjectPath* const noKey = thingPath();
    CMAddKey(noKey, "Size", &number, CMPI_uint64);
    CMPIObjectPath* const wrongType = CMNewObjectPath(mb, "root", "TEST_Other", nullptr);
    CMAddKey(wrongType, "Id", &number, CMPI_uint64);
    for (const CMPIObjectPath* const path :
         {none, extra, noKey, wrongType, thingPath(), otherPath()}) {
        EXPECT_EQ(CMReturnObjectPath(collector.cmpi(), path).rc, CMPI_RC_OK);
    }
    EXPECT_EQ(collector.pathCount(), 6u);
    EXPECT_THAT(broker.violations(),
                ElementsAre("path of TEST_Thing without key Name",
                            "path of TEST_Thing with Id, which is no key of it",
                            "path of TEST_Thing with Size, which is no key of it",
                            "TEST_Other.Id is uint16, not uint64"));
}

TEST_F(SchemaViolations, APathOfAnUnknownClassIsNotForClients) {
    CMReturnObjectPath(collector.cmpi(), CMNewObjectPath(mb, "root", "TEST_Unknown", nullptr));
    EXPECT_THAT(broker.violations(),
                ElementsAre("path of TEST_Unknown, a class that is not declared"));
}

TEST_F(SchemaViolations, TheEndsOfAnAssociationNeedTheirKeysToo) {
    CMPIObjectPath* const left = CMNewObjectPath(mb, "root", "TEST_Thing", nullptr);
    CMPIObjectPath* const right = otherPath();
    CMPIObjectPath* const link = CMNewObjectPath(mb, "root", "TEST_Link", nullptr);
    CMAddKey(link, "Left", &left, CMPI_ref);
    CMAddKey(link, "Right", &right, CMPI_ref);
    CMReturnObjectPath(collector.cmpi(), link);
    CMReturnInstance(collector.cmpi(), CMNewInstance(mb, link, nullptr));
    EXPECT_THAT(broker.violations(), ElementsAre("path of TEST_Thing without key Name",
                                                 "path of TEST_Thing without key Name"));
}

TEST_F(SchemaViolations, KeysThatAreOnlyPropertiesCompleteThePath) {
    CMPIInstance* const instance =
        CMNewInstance(mb, CMNewObjectPath(mb, "root", "TEST_Thing", nullptr), nullptr);
    CMSetProperty(instance, "Name", "x", CMPI_chars);
    EXPECT_EQ(toString(valueOf(CMGetObjectPath(instance, nullptr))), "root:TEST_Thing.Name=\"x\"");
    CMReturnInstance(collector.cmpi(), instance);
    EXPECT_EQ(toString(collector.instance(0).path), "root:TEST_Thing.Name=\"x\"");
    EXPECT_EQ(valueOf(instance).path.keys.size(), 0u);
    EXPECT_THAT(broker.violations(), IsEmpty());
}

TEST_F(SchemaViolations, AnInstanceWithoutItsKeyIsOne) {
    CMReturnInstance(
        collector.cmpi(),
        CMNewInstance(mb, CMNewObjectPath(mb, "root", "TEST_Thing", nullptr), nullptr));
    EXPECT_THAT(broker.violations(), ElementsAre("path of TEST_Thing without key Name"));
}

TEST_F(SchemaViolations, AKeyPropertyThatDiffersFromThePathIsOne) {
    CMPIInstance* const instance = thing();
    CMSetProperty(instance, "Name", "y", CMPI_chars);
    CMReturnInstance(collector.cmpi(), instance);
    EXPECT_THAT(broker.violations(), ElementsAre("TEST_Thing.Name is y, in the path x"));
}

TEST_F(SchemaViolations, PathsThatOnlyTheProviderSeesAreNotChecked) {
    CMPIObjectPath* const partial = CMNewObjectPath(mb, "root", "TEST_Unknown", nullptr);
    CMAddKey(partial, "Anything", "x", CMPI_chars);
    CMGetKey(partial, "Anything", nullptr);
    CBEnumInstanceNames(mb, request.makeContext({}, "root"), partial, &status);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_CLASS);
    EXPECT_THAT(broker.violations(), IsEmpty());
}

TEST(Catalogue, TellsHowClassesAreRelated) {
    const TestCatalogue catalogue = testClasses();
    EXPECT_EQ(classRelation(&catalogue, "test_thing", "TEST_Thing"), ClassRelation::Same);
    EXPECT_EQ(classRelation(&catalogue, "TEST_SmallThing", "TEST_Thing"), ClassRelation::Subclass);
    EXPECT_EQ(classRelation(&catalogue, "TEST_SmallThing", "CIM_Thing"), ClassRelation::Subclass);
    EXPECT_EQ(classRelation(&catalogue, "TEST_SmallThing", "CIM_Base"), ClassRelation::Unknown);
    EXPECT_EQ(classRelation(&catalogue, "TEST_Other", "TEST_Thing"), ClassRelation::Unrelated);
    EXPECT_EQ(classRelation(&catalogue, "TEST_Unknown", "TEST_Thing"), ClassRelation::Unknown);
    EXPECT_EQ(classRelation(nullptr, "TEST_Thing", "test_thing"), ClassRelation::Same);
    EXPECT_EQ(classRelation(nullptr, "TEST_SmallThing", "TEST_Thing"), ClassRelation::Unknown);
}

}  // namespace
}  // namespace cmpihost
