#ifndef OSSTATUS_PROPERTY_TABLE_H
#define OSSTATUS_PROPERTY_TABLE_H

#include <cmpi/cmpidt.h>

#include <cstddef>
#include <string>
#include <tuple>
#include <vector>

#include "ProviderUtilities.h"

namespace VA::OSStatusProvider {

/// One value of each type that a getter supplies.
using PropertyValues =
    std::tuple<std::string, unsigned short, unsigned int, unsigned long long, short, bool,
               std::vector<unsigned short>, std::vector<std::string>>;

/// One row of a class's property table: the CIM name, and how the element's value gets into an
/// instance. The getter goes through the value of its own type in `values`.
template <class Element>
struct Property {
    using Publish = void (*)(const char* name, Element& element, PropertyValues& values,
                             const CMPIBroker* broker, CMPIInstance* instance);
    const char* name;
    CMPIType type;  ///< the CIM type, with CMPI_ARRAY for an array
    Publish publish;
};

/// The rows of a table, in order.
template <class Row>
class Rows {
  public:
    template <std::size_t count>
    constexpr Rows(const Row (&rows)[count]) : begin_(rows), end_(rows + count) {}
    constexpr const Row* begin() const { return begin_; }
    constexpr const Row* end() const { return end_; }

  private:
    const Row* begin_;
    const Row* end_;
};

namespace detail {

// The CIM type follows from the value's.
template <class Value>
inline constexpr CMPIType cimType = CMPI_null;
template <>
inline constexpr CMPIType cimType<std::string> = CMPI_string;
template <>
inline constexpr CMPIType cimType<unsigned short> = CMPI_uint16;
template <>
inline constexpr CMPIType cimType<unsigned int> = CMPI_uint32;
template <>
inline constexpr CMPIType cimType<unsigned long long> = CMPI_uint64;
template <>
inline constexpr CMPIType cimType<short> = CMPI_sint16;
template <>
inline constexpr CMPIType cimType<bool> = CMPI_boolean;
template <class Element>
inline constexpr CMPIType cimType<std::vector<Element>> = cimType<Element> | CMPI_ARRAY;

// Arrays need the broker, the others do not.
template <class Value>
void setProperty(const CMPIBroker*, CMPIInstance* instance, const char* name, Value& value) {
    VA::ProviderUtilities::setProperty(instance, name, value);
}

template <class Value>
void setProperty(const CMPIBroker* broker, CMPIInstance* instance, const char* name,
                 std::vector<Value>& value) {
    VA::ProviderUtilities::setProperty(broker, instance, name, value);
}

template <class Element, class Value, bool (Element::*getter)(Value&)>
void publish(const char* name, Element& element, PropertyValues& values, const CMPIBroker* broker,
             CMPIInstance* instance) {
    Value& value = std::get<Value>(values);
    if ((element.*getter)(value)) setProperty(broker, instance, name, value);
}

template <class Element, bool (Element::*getter)(std::string&)>
void publishDateTime(const char* name, Element& element, PropertyValues& values,
                     const CMPIBroker* broker, CMPIInstance* instance) {
    auto& text = std::get<std::string>(values);
    if ((element.*getter)(text))
        VA::ProviderUtilities::setProperty(broker, instance, name, text, true);
}

template <auto getter>
struct Getter;

template <class Element, class Value, bool (Element::*getter)(Value&)>
struct Getter<getter> {
    static constexpr Property<Element> property(const char* name) {
        return {name, cimType<Value>, publish<Element, Value, getter>};
    }
};

}  // namespace detail

/// The row of a property whose CIM type is that of the getter's output.
template <auto getter>
constexpr auto property(const char* name) {
    return detail::Getter<getter>::property(name);
}

/// The row of a datetime property, whose getter supplies a CIM datetime as text.
template <class Element, bool (Element::*getter)(std::string&)>
constexpr Property<Element> dateTime(const char* name) {
    return {name, CMPI_dateTime, detail::publishDateTime<Element, getter>};
}

/// One row of a class's key table: the key's name, and the getter of its text.
template <class Element>
struct Key {
    const char* name;
    bool (Element::*getter)(std::string& value);
};

}  // namespace VA::OSStatusProvider

#endif
