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
    Publish publish;
};

namespace detail {

// The CIM type follows from the value's: arrays need the broker, the others do not.
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
        return {name, publish<Element, Value, getter>};
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
    return {name, detail::publishDateTime<Element, getter>};
}

/// One row of a class's key table: the key's name, and the getter of its text.
template <class Element>
struct Key {
    const char* name;
    bool (Element::*getter)(std::string& value);
};

/// Sets every key that the element can supply; one text serves all.
template <class Element, std::size_t count>
void setKeys(const Key<Element> (&keys)[count], Element& element, CMPIObjectPath* path) {
    std::string value;
    for (const Key<Element>& key : keys)
        if ((element.*key.getter)(value))
            VA::ProviderUtilities::setKeyProperty(path, key.name, value);
}

}  // namespace VA::OSStatusProvider

#endif
