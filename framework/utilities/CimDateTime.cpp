#include "CimDateTime.h"

#include "base/CimDateTime.h"

namespace VA {

bool isCimDateTime(std::string_view text) {
    const auto parsed = base::parseCimDateTime(text);
    // Brokers know no interval but one that ends in digits.
    return parsed && (!parsed->isInterval || parsed->utcOffset);
}

}  // namespace VA
