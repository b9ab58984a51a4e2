// The configuration of the log and the trace.
#include "base/Utf8.h"
#include "framework/logging/Configuration.h"
#include "fuzz/Invariant.h"

namespace {

bool isPrintable(std::string_view text) {
    while (!text.empty()) {
        if (!base::isPrintable(base::takeUtf8(text))) return false;
    }
    return true;
}

void check(const ZBLog::ChannelConfiguration& channel) {
    fuzz::expect(channel.level >= 0 && channel.level <= 999999, "a level is in its range");
    fuzz::expect(channel.path.empty() == (channel.destination != ZBLog::Destination::file),
                 "a file has a path, nothing else has one");
    if (!channel.path.empty())
        fuzz::expect(channel.path.front() == '/' && channel.path.back() != '/' &&
                         channel.path.size() <= 4095 &&
                         channel.path.find('\0') == std::string::npos,
                     "a path is absolute and names a file");
    channel.categories.passes("Zumbrel.OperatingSystemProvider");
    channel.categories.passes("");
}

void checkErrors(const ZBLog::ParsedConfiguration& parsed) {
    fuzz::expect(parsed.errors.size() <= ZBLog::configurationErrorLimit + 1,
                 "the errors that are told are few");
    for (const ZBLog::ConfigurationError& error : parsed.errors) {
        fuzz::expect(!error.message.empty() && isPrintable(error.message),
                     "an error is one printable line");
        fuzz::expect(error.message.size() < 512, "an error is short");
    }
    const ZBLog::Configuration standard;
    for (const ZBLog::Channel channel : {ZBLog::Channel::log, ZBLog::Channel::trace}) {
        const ZBLog::ChannelConfiguration& found = parsed.configuration.of(channel);
        const ZBLog::ChannelConfiguration& expected = standard.of(channel);
        fuzz::expect(found.destination == expected.destination && found.path == expected.path &&
                         found.level == expected.level &&
                         found.failuresOnly == expected.failuresOnly,
                     "half a configuration is none");
    }
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const std::string text(fuzz::textOf(data, size));
    const ZBLog::ParsedConfiguration parsed = ZBLog::parseConfiguration(text);
    check(parsed.configuration.of(ZBLog::Channel::log));
    check(parsed.configuration.of(ZBLog::Channel::trace));
    if (!parsed.errors.empty()) {
        checkErrors(parsed);
        return 0;
    }
    if (size < ZBLog::configurationSizeLimit - 16)
        fuzz::expect(ZBLog::parseConfiguration("# comment\n" + text + "\n\n").errors.empty(),
                     "comments and empty lines change nothing");
    return 0;
}
