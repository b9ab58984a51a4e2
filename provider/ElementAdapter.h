#ifndef PROVIDER_ELEMENT_ADAPTER_H
#define PROVIDER_ELEMENT_ADAPTER_H

#include <cmpi/cmpidt.h>
#include <cmpi/cmpift.h>

#include <string>
#include <tuple>
#include <variant>
#include <vector>

#include "base/Span.h"

namespace VA::OSStatusProvider {

class UnitLog;

/// A key of the paths that an adapter makes: its name, and the getter of its text.
template <class Element>
struct Key {
    const char* name;
    bool (Element::*getter)(std::string& value);
};

/// A key of a client's path that narrows an adapter's walk: its name, the name under which its
/// value is recorded, and the element's filter that it becomes.
template <class Element>
struct KeyFilter {
    const char* key;
    const char* variable;
    typename Element::FilterType type;
};

/// One value of each type that a property's getter supplies.
using PropertyValues =
    std::tuple<std::string, unsigned short, unsigned int, unsigned long long, short, bool,
               std::vector<unsigned short>, std::vector<std::string>>;

/// What a text is in CIM.
enum class TextForm { string, dateTime };

/// A property of the instances that an adapter makes: its name, and the getter of its value, whose
/// type decides the CIM type.
template <class Element>
struct Property {
    template <class Value>
    using Getter = bool (Element::*)(Value& value);

    const char* name;
    std::variant<Getter<std::string>, Getter<unsigned short>, Getter<unsigned int>,
                 Getter<unsigned long long>, Getter<short>, Getter<bool>,
                 Getter<std::vector<unsigned short>>, Getter<std::vector<std::string>>>
        getter;
    TextForm form = TextForm::string;
};

/// What one adapter has of its own. Tables are in the order in which paths and instances carry
/// their rows.
template <class Element>
struct ElementTraits {
    const char* className;
    const char* constructor;  ///< as records name it, and the destructor
    const char* destructor;
    base::Span<const KeyFilter<Element>> filters;
    base::Span<const Key<Element>> keys;
    base::Span<const Property<Element>> properties;
    bool valuesAreShared;  ///< a getter that writes nothing publishes what one before it wrote
    const UnitLog& log;
};

/// An adapter: turns the elements of one class, one at a time, into object paths and instances.
///
///     for (CMPIOperatingSystem adapter(broker, context, objectPath); adapter; ++adapter)
///         use(adapter.getObjectPath());
///
/// One object serves one request on one thread. Broker and context must outlive it; paths and
/// instances belong to the broker. What the framework throws passes through.
///
/// Adapters of associations are used in the same way, and lead to the far end too: see
/// ComputerSystemAssociation and CMPIOSElementCapabilities.
template <class Element>
class ElementAdapter {
  public:
    /// Throws what writing its record throws, unless it runs because of an exception.
    ~ElementAdapter() noexcept(false);
    ElementAdapter(const ElementAdapter&) = delete;
    ElementAdapter& operator=(const ElementAdapter&) = delete;

    /// Narrows the walk by the keys of the path that the class understands; a path without keys
    /// changes nothing. Called again, it narrows further.
    void setObjectPath(const CMPIObjectPath* objectPath);

    /// The current element's path, or null when the broker makes none. A key without a value is
    /// left out.
    CMPIObjectPath* getObjectPath();

    /// The current element's instance, or null when the broker makes none. It carries every
    /// property that has a value: `properties`, the client's list, is not applied.
    CMPIInstance* getCMPIInstance(const char** properties);

    /// True while the adapter stands on an element.
    operator bool();

    /// Whether the adapter was built to enumerate the class itself, as one of elements always is.
    bool enumerates() const { return true; }

    /// Moves to the next element.
    ElementAdapter& operator++();

  protected:
    /// Stands on the first element that the path names, or on the first of all for a path without
    /// keys; new paths are made in the path's namespace. The traits outlive the adapter.
    ElementAdapter(const ElementTraits<Element>& _traits, const CMPIBroker* _broker,
                   const CMPIContext* _context, const CMPIObjectPath* objectPath);

    /// Stands on the first element of all.
    ElementAdapter(const ElementTraits<Element>& _traits, const CMPIBroker* _broker,
                   const CMPIContext* _context, std::string _nameSpace);

  private:
    template <class Value>
    void publish(const Property<Element>& property, bool (Element::*getter)(Value&),
                 PropertyValues& values, CMPIInstance* instance);

    const ElementTraits<Element>& traits;
    const CMPIBroker* broker;
    const CMPIContext* context;
    std::string nameSpace;
    Element element;
};

}  // namespace VA::OSStatusProvider

#endif
