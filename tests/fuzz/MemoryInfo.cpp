// proc/meminfo.
#include "framework/instrumentation/Linux/Kernel.h"

#include "fuzz/Invariant.h"

using VA::Linux::parseMemoryInfo;

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const std::string text(fuzz::textOf(data, size));
    const auto info = parseMemoryInfo(text);
    if (!info) return 0;
    fuzz::expect(text.find("MemTotal:") != std::string::npos, "meminfo tells the total memory");
    if (info->swapTotalKiB == 0U)
        fuzz::expect(info->swapFreeKiB == 0U, "without swap none of it is free");
    const auto again = parseMemoryInfo(text + "\nMemTotal: 1 kB\nMemAvailable: 1 kB\n");
    fuzz::expect(again && again->totalKiB == info->totalKiB, "the first MemTotal counts");
    return 0;
}
