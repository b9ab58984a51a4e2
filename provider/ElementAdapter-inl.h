#ifndef PROVIDER_ELEMENT_ADAPTER_INL_H
#define PROVIDER_ELEMENT_ADAPTER_INL_H

// The operations of ElementAdapter, for the units that instantiate it: whoever uses an adapter
// needs none of this.

#include <type_traits>
#include <utility>

#include "ElementAdapter.h"
#include "ProviderUtilities.h"
#include "UnitLog.h"

namespace VA::OSStatusProvider {

template <class Element>
ElementAdapter<Element>::ElementAdapter(const ElementTraits<Element>& _traits,
                                        const CMPIBroker* _broker, const CMPIContext* _context,
                                        const CMPIObjectPath* objectPath)
    : traits(_traits),
      broker(_broker),
      context(_context),
      nameSpace(VA::ProviderUtilities::getNamespace(objectPath)) {
    const ParameterList parameters(broker, context, objectPath);
    traits.log.entering(parameters, SourceLocation::named(traits.constructor));
    setObjectPath(objectPath);
    traits.log.exiting(parameters, SourceLocation::named(traits.constructor));
}

template <class Element>
ElementAdapter<Element>::ElementAdapter(const ElementTraits<Element>& _traits,
                                        const CMPIBroker* _broker, const CMPIContext* _context,
                                        std::string _nameSpace)
    : traits(_traits), broker(_broker), context(_context), nameSpace(std::move(_nameSpace)) {
    traits.log.method(SourceLocation::named(traits.constructor));
}

template <class Element>
ElementAdapter<Element>::~ElementAdapter() noexcept(false) {
    traits.log.destructor(SourceLocation::named(traits.destructor));
}

template <class Element>
void ElementAdapter<Element>::setObjectPath(const CMPIObjectPath* objectPath) {
    const ParameterList parameters(" objectPath=", objectPath);
    traits.log.entering(parameters);
    if (VA::ProviderUtilities::getKeyCount(objectPath) != 0) {
        for (const KeyFilter<Element>& filter : traits.filters) {
            std::string value;
            if (!VA::ProviderUtilities::getKeyProperty(objectPath, filter.key, value)) continue;
            traits.log.variable(filter.variable, value.c_str());
            element.setFilter(filter.type, value);
        }
    }
    traits.log.exiting(parameters);
}

template <class Element>
CMPIObjectPath* ElementAdapter<Element>::getObjectPath() {
    traits.log.entering();
    CMPIObjectPath* path =
        VA::ProviderUtilities::createObjectPath(broker, traits.className, nameSpace);
    if (path != nullptr) {
        std::string value;
        for (const Key<Element>& key : traits.keys) {
            if ((element.*key.getter)(value)) {
                VA::ProviderUtilities::setKeyProperty(path, key.name, value);
            }
        }
    }
    traits.log.exiting();
    return path;
}

template <class Element>
CMPIInstance* ElementAdapter<Element>::getCMPIInstance(const char** properties) {
    const ParameterList parameters(" properties=", properties);
    traits.log.entering(parameters);
    CMPIInstance* instance = VA::ProviderUtilities::createInstance(broker, getObjectPath());
    if (instance != nullptr) {
        PropertyValues values;
        for (const Property<Element>& property : traits.properties) {
            if (!traits.valuesAreShared) values = {};
            std::visit([&](auto getter) { publish(property, getter, values, instance); },
                       property.getter);
        }
    }
    traits.log.exiting(parameters);
    return instance;
}

// Sets the property if it has a value. Datetimes and arrays are made by the broker.
template <class Element>
template <class Value>
void ElementAdapter<Element>::publish(const Property<Element>& property,
                                      bool (Element::*getter)(Value&), PropertyValues& values,
                                      CMPIInstance* instance) {
    Value& value = std::get<Value>(values);
    if (!(element.*getter)(value)) return;
    if constexpr (std::is_same_v<Value, std::string>) {
        if (property.form == TextForm::dateTime) {
            VA::ProviderUtilities::setProperty(broker, instance, property.name, value, true);
        } else {
            VA::ProviderUtilities::setProperty(instance, property.name, value);
        }
    } else if constexpr (std::is_class_v<Value>) {
        VA::ProviderUtilities::setProperty(broker, instance, property.name, value);
    } else {
        VA::ProviderUtilities::setProperty(instance, property.name, value);
    }
}

template <class Element>
ElementAdapter<Element>::operator bool() {
    traits.log.method();
    return element;
}

template <class Element>
ElementAdapter<Element>& ElementAdapter<Element>::operator++() {
    traits.log.method();
    ++element;
    return *this;
}

}  // namespace VA::OSStatusProvider

#endif
