// os-release, and any file of shell-like assignments.
#include "framework/instrumentation/Linux/Parsing.h"
#include "fuzz/Invariant.h"

using VA::Linux::envFileValue;

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const std::string_view text = fuzz::textOf(data, size);
    for (const char* name : {"NAME", "VERSION_ID", "BUILD_ID"}) {
        const auto value = envFileValue(text, name);
        if (!value) continue;
        fuzz::expect(value->size() < text.size(), "a value is shorter than its file");
        fuzz::expect(value->find('\n') == std::string::npos, "a value lies on one line");
        if (!VA::Linux::isPlainText(*value)) continue;
        fuzz::expect(value->size() <= 4 * 256, "plain text has at most 256 characters");
        fuzz::expect(value->find('\0') == std::string::npos, "plain text holds no NUL");
        // In single quotes nothing is escaped: what was read is found again.
        if (value->find('\'') != std::string::npos) continue;
        const std::string quoted = std::string(name) + "='" + *value + "'\n";
        fuzz::expect(envFileValue(quoted, name) == value, "a quoted value is read as it is");
        fuzz::expect(envFileValue(std::string(text) + '\n' + quoted, name) == value,
                     "the last assignment wins");
    }
    return 0;
}
