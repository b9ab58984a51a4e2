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
    /// Of the qualifiers Values and ValueMap of a property, null for one that is missing. Empty
    /// without Values, and for a property that is no integer. Without ValueMap the Values count
    /// from 0. Throws std::runtime_error when the two lists differ in length or an entry of the
    /// ValueMap is neither an integer nor a range.
    static ValueMap of(mof::Type type, const mof::Qualifier* values,
                       const mof::Qualifier* valueMap);

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
