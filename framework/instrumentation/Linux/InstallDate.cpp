#include "InstallDate.h"

namespace VA::Linux {

bool isPlausibleInstallDate(std::int64_t instant, std::optional<std::int64_t> boot,
                            std::int64_t now) {
    constexpr std::int64_t startOf1992 = 694224000;  // images are often dated to the epoch
    return instant >= startOf1992 && (!boot || instant <= *boot) && instant <= now;
}

}  // namespace VA::Linux
