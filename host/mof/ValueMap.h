#ifndef HOST_MOF_VALUE_MAP_H
#define HOST_MOF_VALUE_MAP_H

#include <cstdint>
#include <string>
#include <vector>

#include "host/mof/MofAst.h"

namespace cmpihost {

/// The names of the numbers of one property, from its qualifiers ValueMap and Values.
class ValueMap {
  public:
    /// Empty for a property without Values, and for one whose ValueMap lists no integers.
    /// Without ValueMap the Values count from 0. Throws std::runtime_error when the two lists
    /// differ in length or an entry of the ValueMap is neither an integer nor a range.
    static ValueMap of(const mof::Feature& property);

    bool empty() const { return entries_.empty(); }

    /// The name of the number, or null. A single number wins over a range ("11..32767", "0x8000..")
    /// and a range over the entry "..", which stands for all that is not listed.
    const std::string* find(std::int64_t number) const;

  private:
    struct Entry {
        std::int64_t lowest = 0;
        std::int64_t highest = 0;
        std::string name;
    };

    static Entry entry(const std::string& range, const std::string& name);

    std::vector<Entry> entries_;
};

}  // namespace cmpihost

#endif
