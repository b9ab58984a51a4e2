// Written here since the C library's functions for characters go by the locale of the process,
// which is the object manager's.
#include "base/Ascii.h"

#include <algorithm>

namespace base {

std::string toLower(std::string_view text) {
    std::string result(text);
    for (char& c : result) c = toLower(c);
    return result;
}

bool equalsIgnoreCase(std::string_view left, std::string_view right) {
    return std::equal(left.begin(), left.end(), right.begin(), right.end(),
                      [](char a, char b) { return toLower(a) == toLower(b); });
}

}  // namespace base
