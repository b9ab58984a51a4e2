#ifndef VA_LINUX_INSTALL_DATE_H
#define VA_LINUX_INSTALL_DATE_H

#include <cstdint>
#include <optional>

namespace VA::Linux {

/// True for an instant at which this host may have been installed: after 1991, not after `boot`
/// where that is known, not after `now`. All in seconds since the epoch, UTC.
bool isPlausibleInstallDate(std::int64_t instant, std::optional<std::int64_t> boot,
                            std::int64_t now);

}  // namespace VA::Linux

#endif
