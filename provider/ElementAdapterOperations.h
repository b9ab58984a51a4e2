#ifndef OSSTATUS_ELEMENT_ADAPTER_OPERATIONS_H
#define OSSTATUS_ELEMENT_ADAPTER_OPERATIONS_H

// The operations of ElementAdapter, for the units that instantiate it.

#include <utility>

#include "ElementAdapter.h"
#include "PropertyTable.h"
#include "ProviderUtilities.h"
#include "UnitLog.h"

namespace VA::OSStatusProvider {

template <class Design>
ElementAdapter<Design>::ElementAdapter(const CMPIBroker* _broker, const CMPIContext* _context,
                                       const CMPIObjectPath* objectPath)
    : broker(_broker),
      context(_context),
      nameSpace(VA::ProviderUtilities::getNamespace(objectPath)) {
    const ParameterList parameters(broker, context, objectPath);
    Design::records().entering(parameters, Caller::named(Design::constructor));
    setObjectPath(objectPath);
    Design::records().exiting(parameters, Caller::named(Design::constructor));
}

template <class Design>
ElementAdapter<Design>::ElementAdapter(const CMPIBroker* _broker, const CMPIContext* _context,
                                       std::string _nameSpace)
    : broker(_broker), context(_context), nameSpace(std::move(_nameSpace)) {
    Design::records().method(Caller::named(Design::constructor));
}

template <class Design>
ElementAdapter<Design>::~ElementAdapter() noexcept(false) {
    Design::records().destructor(Caller::named(Design::destructor));
}

template <class Design>
void ElementAdapter<Design>::setObjectPath(const CMPIObjectPath* objectPath) {
    const ParameterList parameters(" objectPath=", objectPath);
    Design::records().entering(parameters);
    if (VA::ProviderUtilities::getKeyCount(objectPath) != 0) {
        for (const KeyFilter<Element>& filter : Design::filters) {
            std::string value;
            if (!VA::ProviderUtilities::getKeyProperty(objectPath, filter.key, value)) continue;
            Design::records().variable(filter.variable, value.c_str());
            element.setFilter(filter.type, value);
        }
    }
    Design::records().exiting(parameters);
}

template <class Design>
CMPIObjectPath* ElementAdapter<Design>::getObjectPath() {
    Design::records().entering();
    CMPIObjectPath* path =
        VA::ProviderUtilities::createObjectPath(broker, Design::className, nameSpace);
    if (path != nullptr) {
        std::string value;
        for (const Key<Element>& key : Design::keys())
            if ((element.*key.getter)(value))
                VA::ProviderUtilities::setKeyProperty(path, key.name, value);
    }
    Design::records().exiting();
    return path;
}

template <class Design>
CMPIInstance* ElementAdapter<Design>::getCMPIInstance(const char** properties) {
    const ParameterList parameters(" properties=", properties);
    Design::records().entering(parameters);
    CMPIInstance* instance = VA::ProviderUtilities::createInstance(broker, getObjectPath());
    if (instance != nullptr) {
        PropertyValues values;
        for (const Property<Element>& row : Design::properties()) {
            if constexpr (!Design::valuesAreShared) values = {};
            row.publish(row.name, element, values, broker, instance);
        }
    }
    Design::records().exiting(parameters);
    return instance;
}

template <class Design>
ElementAdapter<Design>::operator bool() {
    Design::records().method();
    return element;
}

template <class Design>
ElementAdapter<Design>& ElementAdapter<Design>::operator++() {
    Design::records().method();
    ++element;
    return *this;
}

}  // namespace VA::OSStatusProvider

#endif
