// proc/stat, and the files of proc that hold one number.
#include "framework/instrumentation/Linux/Dates.h"
#include "framework/instrumentation/Linux/Parsing.h"
#include "fuzz/Invariant.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const std::string text(fuzz::textOf(data, size));
    if (const auto boot = VA::Linux::parseBootTime(text)) {
        fuzz::expect(*boot > 0, "a host was booted after the epoch");
        const std::string line = "btime " + std::to_string(*boot) + '\n';
        fuzz::expect(VA::Linux::parseBootTime(line) == boot, "the boot time is read back");
        fuzz::expect(VA::Linux::parseBootTime(line + "btime 1\n") == boot,
                     "the first btime counts");
        fuzz::expect(VA::Linux::parseBootTime(text + "\nbtime 1\n") == boot,
                     "lines after the first btime do not count");
    }
    if (const auto number = VA::Linux::parseNumberFile(text)) {
        fuzz::expect(*number > 0, "a limit is positive");
        fuzz::expect(VA::Linux::parseNumberFile(std::to_string(*number) + '\n') == number,
                     "a number is read back");
    }
    return 0;
}
