#pragma once

#include <string>
#include <string_view>
#include <unordered_set>

namespace cmpihost {

/// The name with its ASCII letters in lower case, the form in which CIM names compare.
std::string lowered(std::string_view name);

/// Names seen so far.
class NameSet {
  public:
    /// Adds the name; false when it was there before, in whatever case.
    bool add(std::string_view name) { return names_.insert(lowered(name)).second; }

    bool contains(std::string_view name) const { return names_.count(lowered(name)) != 0; }

  private:
    std::unordered_set<std::string> names_;
};

}  // namespace cmpihost
