// What a result takes, and what the broker finds in it when it knows the classes.
#include "BrokerFixture.h"

#include "host/broker/ResultCollector.h"

namespace cmpihost {
namespace {

class ResultCollectors : public BrokerTest {
  protected:
    ResultCollector collector{request};
    const CMPIResult* result = collector.cmpi();
};

TEST_F(ResultCollectors, KeepWhatIsReturnedInOrder) {
    const CMPIUint32 number = 5;
    EXPECT_EQ(CMReturnObjectPath(result, newPath("TEST_A")).rc, CMPI_RC_OK);
    EXPECT_EQ(CMReturnObjectPath(result, newPath("TEST_B")).rc, CMPI_RC_OK);
    EXPECT_EQ(CMReturnInstance(result, newInstance("TEST_C")).rc, CMPI_RC_OK);
    EXPECT_EQ(CMReturnData(result, &number, CMPI_uint32).rc, CMPI_RC_OK);
    EXPECT_EQ(CMReturnDone(result).rc, CMPI_RC_OK);
    const Results results = collector.take();
    EXPECT_THAT(results.paths, ElementsAre(ObjectPathValue{"root/cimv2", "TEST_A"},
                                           ObjectPathValue{"root/cimv2", "TEST_B"}));
    EXPECT_THAT(results.instances, ElementsAre(InstanceValue{{"root/cimv2", "TEST_C"}}));
    EXPECT_THAT(results.data, ElementsAre(Value::fromUnsigned(5, CMPI_uint32)));
    EXPECT_EQ(results.doneCount, 1u);
    EXPECT_THAT(broker.violations(), IsEmpty());
    EXPECT_TRUE(collector.take().paths.empty());
}

TEST_F(ResultCollectors, AreNotChangedByWhatTheProviderDoesLater) {
    CMPIInstance* const instance = newInstance();
    CMPIObjectPath* const path = newPath();
    CMReturnInstance(result, instance);
    CMReturnObjectPath(result, path);
    CMSetProperty(instance, "Later", "x", CMPI_chars);
    CMAddKey(path, "Later", "x", CMPI_chars);
    CMReturnInstance(result, instance);
    const Results results = collector.take();
    EXPECT_EQ(results.instances.at(0).properties.size(), 0u);
    EXPECT_EQ(results.instances.at(1).properties.size(), 1u);
    EXPECT_EQ(results.paths.at(0).keys.size(), 0u);
    EXPECT_EQ(CMGetPropertyCount(instance, nullptr), 1u) << "taken while the request is open";
}

TEST_F(ResultCollectors, OutliveTheRequest) {
    CMPIInstance* const instance = newInstance();
    CMSetProperty(instance, "Name", "a text that does not fit into a small string", CMPI_chars);
    CMReturnInstance(result, instance);
    CMReturnObjectPath(result, newPath());
    request.end();
    const Results results = collector.take();
    ASSERT_EQ(results.instances.size(), 1u);
    EXPECT_EQ(results.instances[0].property("Name")->text(),
              "a text that does not fit into a small string");
    EXPECT_EQ(results.paths.size(), 1u);
}

TEST_F(ResultCollectors, TakeNothingAfterReturnDoneNorWhatIsNoObject) {
    CMPIError stranger = {nullptr, nullptr};
    const CMPIUint32 number = 1;
    const std::vector<CMPIrc> before = {
        CMReturnInstance(result, nullptr).rc, CMReturnObjectPath(result, nullptr).rc,
        CMReturnError(result, nullptr).rc, CMReturnError(result, &stranger).rc};
    EXPECT_THAT(before, ElementsAre(CMPI_RC_ERR_INVALID_PARAMETER, CMPI_RC_ERR_INVALID_PARAMETER,
                                    CMPI_RC_ERR_INVALID_PARAMETER, CMPI_RC_ERR_INVALID_HANDLE));
    EXPECT_EQ(CMReturnDone(result).rc, CMPI_RC_OK);
    const std::vector<CMPIrc> after = {
        CMReturnInstance(result, newInstance()).rc, CMReturnObjectPath(result, newPath()).rc,
        CMReturnData(result, &number, CMPI_uint32).rc, CMReturnDone(result).rc};
    EXPECT_EQ(after, std::vector<CMPIrc>(4, CMPI_RC_ERR_FAILED));
    const Results results = collector.take();
    EXPECT_EQ(results.instances.size() + results.paths.size() + results.data.size(), 0u);
    EXPECT_EQ(results.doneCount, 2u);
    EXPECT_THAT(broker.violations(),
                ElementsAre("CMPIResultFT.returnInstance: null CMPIInstance",
                            "CMPIResultFT.returnObjectPath: null CMPIObjectPath",
                            "CMPIResultFT.returnError: null CMPIError",
                            "CMPIResultFT.returnError: no CMPIError of this host",
                            "CMPIInstance of TEST_Thing returned after returnDone",
                            "CMPIObjectPath of TEST_Thing returned after returnDone",
                            "data returned after returnDone", "returnDone called twice"));
}

TEST_F(ResultCollectors, CanBeMadeToRefuseFromACallOn) {
    collector.failReturnInstance(2, CMPI_RC_ERR_ACCESS_DENIED);
    collector.failReturnObjectPath(1, CMPI_RC_ERR_FAILED);
    collector.failReturnDone(1, CMPI_RC_ERR_NOT_FOUND);
    EXPECT_EQ(CMReturnInstance(result, newInstance("TEST_A")).rc, CMPI_RC_OK);
    EXPECT_EQ(CMReturnInstance(result, newInstance("TEST_B")).rc, CMPI_RC_ERR_ACCESS_DENIED);
    EXPECT_EQ(CMReturnInstance(result, newInstance("TEST_C")).rc, CMPI_RC_ERR_ACCESS_DENIED);
    EXPECT_EQ(CMReturnObjectPath(result, newPath("TEST_D")).rc, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(CMReturnDone(result).rc, CMPI_RC_ERR_NOT_FOUND);
    const Results results = collector.take();
    EXPECT_THAT(results.instances, ElementsAre(InstanceValue{{"root/cimv2", "TEST_A"}}));
    EXPECT_THAT(results.refusedInstances, ElementsAre(InstanceValue{{"root/cimv2", "TEST_B"}},
                                                      InstanceValue{{"root/cimv2", "TEST_C"}}));
    EXPECT_THAT(results.paths, IsEmpty());
    EXPECT_THAT(results.refusedPaths, ElementsAre(ObjectPathValue{"root/cimv2", "TEST_D"}));
    EXPECT_EQ(results.doneCount, 1u);
    EXPECT_THAT(broker.violations(), IsEmpty());
}

class SchemaViolations : public ::testing::Test {
  protected:
    const TestCatalogue catalogue = testClasses();
    Broker broker{&catalogue};
    RequestScope request{broker};
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
    const CMPIUint64 number = 1;
    CMPIArray* const wide = CMNewArray(mb, 1, CMPI_uint32, nullptr);
    const struct {
        const char* name;
        const void* value;
        CMPIType type;
        const char* violation;
    } rows[] = {{"Size", &number, CMPI_uint64, "TEST_Thing.Size is uint32, not uint64"},
                {"Size", "1", CMPI_chars, "TEST_Thing.Size is uint32, not string"},
                {"Made", "20000229123456.000007+000", CMPI_chars,
                 "TEST_Thing.Made is datetime, not string"},
                {"Tags", "one", CMPI_chars, "TEST_Thing.Tags is string[], not string"},
                {"Size", nullptr, CMPI_sint32, "TEST_Thing.Size is uint32, not sint32"},
                {"Codes", &wide, CMPI_uint32A, "TEST_Thing.Codes is uint16[], not uint32[]"}};
    for (const auto& row : rows) {
        EXPECT_EQ(CMSetProperty(instance, row.name, row.value, row.type).rc,
                  CMPI_RC_ERR_TYPE_MISMATCH);
        EXPECT_THAT(broker.takeViolations(), ElementsAre(row.violation));
    }
    EXPECT_EQ(CMGetPropertyCount(instance, nullptr), 0u);
}

TEST_F(SchemaViolations, ValuesOfTheDeclaredTypesPass) {
    CMPIInstance* const instance = thing();
    CMPIString* const name = CMNewString(mb, "x", nullptr);
    CMPIDateTime* const now = CMNewDateTime(mb, nullptr);
    CMPIArray* const texts = CMNewArray(mb, 1, CMPI_string, nullptr);
    CMPIArray* const codes = CMNewArray(mb, 1, CMPI_uint16, nullptr);
    CMPIObjectPath* const owner = otherPath();
    const CMPIUint32 size = 1;
    const struct {
        const char* name;
        const void* value;
        CMPIType type;
    } rows[] = {{"name", &name, CMPI_string},   {"Size", &size, CMPI_uint32},
                {"Made", &now, CMPI_dateTime},  {"Tags", &texts, CMPI_charsA},
                {"Tags", &texts, CMPI_stringA}, {"Codes", &codes, CMPI_uint16A},
                {"Owner", &owner, CMPI_ref},    {"Size", nullptr, CMPI_uint32},
                {"Size", nullptr, CMPI_null},   {"Owner", nullptr, CMPI_ref}};
    for (const auto& row : rows) {
        EXPECT_EQ(CMSetProperty(instance, row.name, row.value, row.type).rc, CMPI_RC_OK)
            << row.name << ' ' << row.type;
    }
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
    CMPIObjectPath* const unknown = CMNewObjectPath(mb, "root", "TEST_Unknown", nullptr);
    for (const CMPIObjectPath* const path :
         {none, extra, noKey, wrongType, unknown, thingPath(), otherPath()}) {
        EXPECT_EQ(CMReturnObjectPath(collector.cmpi(), path).rc, CMPI_RC_OK);
    }
    EXPECT_EQ(collector.take().paths.size(), 7u);
    EXPECT_THAT(broker.violations(),
                ElementsAre("path of TEST_Thing without key Name",
                            "path of TEST_Thing with Id, which is no key of it",
                            "path of TEST_Thing with Size, which is no key of it",
                            "TEST_Other.Id is uint16, not uint64",
                            "path of TEST_Unknown, a class that is not declared"));
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
    EXPECT_EQ(toString(collector.take().instances.at(0).path), "root:TEST_Thing.Name=\"x\"");
    EXPECT_EQ(valueOf(instance).path.keys.size(), 0u);
    EXPECT_THAT(broker.violations(), IsEmpty());
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

}  // namespace
}  // namespace cmpihost
