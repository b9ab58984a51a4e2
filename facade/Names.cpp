#include "Names.h"

namespace VA::OSStatusFacade {

std::string printable(std::string_view text, std::size_t most) {
    constexpr char digits[] = "0123456789ABCDEF";
    std::string result;
    for (const char letter : text.substr(0, most)) {
        const auto byte = static_cast<unsigned char>(letter);
        if (byte >= ' ' && byte <= '~')
            result += letter;
        else
            result.append("\\x").append(1, digits[byte / 16]).append(1, digits[byte % 16]);
    }
    if (text.size() > most) result += "...";
    return result;
}

}  // namespace VA::OSStatusFacade
