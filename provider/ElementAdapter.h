#ifndef OSSTATUS_ELEMENT_ADAPTER_H
#define OSSTATUS_ELEMENT_ADAPTER_H

#include <cmpi/cmpidt.h>
#include <cmpi/cmpift.h>

#include <string>

namespace VA::OSStatusProvider {

/// A key of a path that narrows an adapter's walk: its name, the name under which its value is
/// recorded, and the element's filter that it becomes.
template <class Element>
struct KeyFilter {
    const char* key;
    const char* variable;
    typename Element::FilterType type;
};

/// An adapter: turns the elements of one class, one at a time, into object paths and instances.
///
///     for (CMPIOperatingSystem adapter(broker, context, objectPath); adapter; ++adapter)
///         use(adapter.getObjectPath());
///
/// `Design` says what is the class's own: its element, its keys, its properties, its records. One
/// object serves one request on one thread. Broker and context must outlive it; paths and instances
/// belong to the broker. What the framework throws passes through.
template <class Design>
class ElementAdapter {
  public:
    using Element = typename Design::Element;

    /// Stands on the first element that the path names, or on the first of all for a path without
    /// keys; new paths are made in the path's namespace.
    ElementAdapter(const CMPIBroker* _broker, const CMPIContext* _context,
                   const CMPIObjectPath* objectPath);

    /// Stands on the first element of all.
    ElementAdapter(const CMPIBroker* _broker, const CMPIContext* _context, std::string _nameSpace);

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

  private:
    const CMPIBroker* broker;
    const CMPIContext* context;
    std::string nameSpace;
    Element element;
};

}  // namespace VA::OSStatusProvider

#endif
