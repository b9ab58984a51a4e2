#ifndef OSSTATUS_FACADE_NAMES_H
#define OSSTATUS_FACADE_NAMES_H

#include <string>
#include <string_view>

namespace VA::OSStatusFacade {

/// An ASCII letter in lower case, any other byte as it is: no locale plays a part.
constexpr char lowered(char letter) {
    return letter >= 'A' && letter <= 'Z' ? static_cast<char>(letter - 'A' + 'a') : letter;
}

inline std::string lowered(std::string_view text) {
    std::string result(text);
    for (char& letter : result) letter = lowered(letter);
    return result;
}

/// Whether two CIM names, of classes, keys, properties or roles, are the same.
constexpr bool equalNames(std::string_view left, std::string_view right) {
    if (left.size() != right.size()) return false;
    for (std::size_t index = 0; index < left.size(); ++index)
        if (lowered(left[index]) != lowered(right[index])) return false;
    return true;
}

/// A client's text as it may stand in answers and records: bytes other than printable ASCII become
/// \xNN, and what is longer than `most` bytes is cut, which three dots tell.
std::string printable(std::string_view text, std::size_t most = 64);

}  // namespace VA::OSStatusFacade

#endif
