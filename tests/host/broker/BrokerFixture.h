#ifndef TESTS_HOST_BROKER_BROKER_FIXTURE_H
#define TESTS_HOST_BROKER_BROKER_FIXTURE_H

#include "base/Ascii.h"
#include "host/broker/Broker.h"
#include "host/broker/RequestScope.h"

#include <cmpi/cmpift.h>
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <list>
#include <string>
#include <vector>

/// What the tests of the broker share.
namespace cmpihost {

using ::testing::ElementsAre;
using ::testing::IsEmpty;

/// What a CMPIString holds; "(null)" for none.
inline std::string textOf(const CMPIString* string) {
    if (string == nullptr) return "(null)";
    const char* const text = string->ft->getCharPtr(string, nullptr);
    return text == nullptr ? "(no characters)" : text;
}

/// A CMPIData as text: "uint16 5", "key string x", "null uint32", "missing" or "bad".
inline std::string shown(const CMPIData& data) {
    if ((data.state & CMPI_badValue) != 0) return "bad";
    if ((data.state & CMPI_notFound) != 0) return data.type == CMPI_null ? "missing" : "odd";
    if ((data.state & CMPI_nullValue) != 0) return "null " + cimTypeName(data.type);
    const std::string type = (data.state & CMPI_keyValue) != 0 ? "key " + cimTypeName(data.type)
                                                               : cimTypeName(data.type);
    const auto text = [&](const Value& value) { return type + ' ' + value.toText(); };
    switch (data.type) {
        case CMPI_boolean:
            return text(Value::fromBoolean(data.value.boolean == 1));
        case CMPI_char16:
            return text(Value::fromUnsigned(data.value.char16));
        case CMPI_uint8:
            return text(Value::fromUnsigned(data.value.uint8));
        case CMPI_uint16:
            return text(Value::fromUnsigned(data.value.uint16));
        case CMPI_uint32:
            return text(Value::fromUnsigned(data.value.uint32));
        case CMPI_uint64:
            return text(Value::fromUnsigned(data.value.uint64));
        case CMPI_sint8:
            return text(Value::fromSigned(data.value.sint8));
        case CMPI_sint16:
            return text(Value::fromSigned(data.value.sint16));
        case CMPI_sint32:
            return text(Value::fromSigned(data.value.sint32));
        case CMPI_sint64:
            return text(Value::fromSigned(data.value.sint64));
        case CMPI_real32:
            return text(Value::fromReal(data.value.real32, CMPI_real32));
        case CMPI_real64:
            return text(Value::fromReal(data.value.real64));
        case CMPI_string:
            return text(textOf(data.value.string));
        case CMPI_dateTime:
            return text(textOf(CMGetStringFormat(data.value.dateTime, nullptr)));
        case CMPI_ref:
            return text(toString(valueOf(data.value.ref)));
        case CMPI_instance:
            return text(toString(valueOf(data.value.inst).path));
        default:
            return type;
    }
}

/// Classes given by the test.
class TestCatalogue final : public ClassCatalogue {
  public:
    TestCatalogue& add(ClassDeclaration declaration) {
        classes_.push_back(std::move(declaration));
        return *this;
    }
    const ClassDeclaration* find(std::string_view className) const override {
        for (const ClassDeclaration& declaration : classes_) {
            if (base::equalsIgnoreCase(declaration.name, className)) return &declaration;
        }
        return nullptr;
    }

  private:
    std::list<ClassDeclaration> classes_;
};

/// TEST_Thing (key Name), TEST_SmallThing below it, TEST_Other (key Id), TEST_Link between them.
inline TestCatalogue testClasses() {
    TestCatalogue catalogue;
    const std::vector<PropertyDeclaration> thing = {
        {"Name", CMPI_string, true}, {"Size", CMPI_uint32},
        {"Made", CMPI_dateTime},     {"Tags", CMPI_stringA},
        {"Codes", CMPI_uint16A},     {"Owner", CMPI_ref, false, "TEST_Other"}};
    catalogue.add({"TEST_Thing", "CIM_Thing", false, thing});
    catalogue.add({"TEST_SmallThing", "TEST_Thing", false, thing});
    catalogue.add({"TEST_Other", "", false, {{"Id", CMPI_uint16, true}}});
    catalogue.add(
        {"TEST_Link",
         "",
         true,
         {{"Left", CMPI_ref, true, "TEST_Thing"}, {"Right", CMPI_ref, true, "TEST_Other"}}});
    return catalogue;
}

/// A broker without schema and an open request.
class BrokerTest : public ::testing::Test {
  protected:
    Broker broker;
    RequestScope request{broker};
    const CMPIBroker* mb = broker.cmpi();
    CMPIStatus status = {CMPI_RC_ERROR, nullptr};

    CMPIObjectPath* newPath(const char* className = "TEST_Thing") {
        return CMNewObjectPath(mb, "root/cimv2", className, &status);
    }
    CMPIArray* newArray(CMPIType type, CMPICount size = 1) {
        return CMNewArray(mb, size, type, &status);
    }
    CMPIInstance* newInstance(const char* className = "TEST_Thing") {
        return CMNewInstance(mb, newPath(className), &status);
    }
};

}  // namespace cmpihost

#endif
