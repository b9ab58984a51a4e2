#ifndef OSSTATUS_FACADE_CLASSES_H
#define OSSTATUS_FACADE_CLASSES_H

#include <cstddef>
#include <string_view>

namespace VA::OSStatusFacade {

/// The rows of a constant table.
template <class Row>
class Rows {
  public:
    template <std::size_t size>
    constexpr Rows(const Row (&rows)[size]) : begin_(rows), end_(rows + size) {}

    constexpr const Row* begin() const { return begin_; }
    constexpr const Row* end() const { return end_; }

  private:
    const Row* begin_;
    const Row* end_;
};

/// A key of a class.
struct Key {
    const char* name;
    bool isReference;
};

/// A class, as the schema spells it. Nobody is asked about ancestors.
struct Class {
    const char* name;
    Rows<const char*> ancestors;
    Rows<Key> keys;     ///< in the schema's order
    bool isOfProvider;  ///< the provider behind the facade serves its instances

    /// Whether `other` is the class itself or one of its ancestors.
    bool isA(std::string_view other) const;

    bool isAssociation() const { return keys.begin()->isReference; }

    /// The key of that name, null if there is none.
    const Key* key(std::string_view name) const;
};

/// An end of an association: the reference that points to it, and the class of its elements.
struct End {
    const char* role;
    const Class& elements;
};

struct Association {
    const Class& itself;
    End ends[2];
};

/// The class of that name, null if it is none that is known here.
const Class* findClass(std::string_view name);

Rows<Association> associations();

}  // namespace VA::OSStatusFacade

#endif
