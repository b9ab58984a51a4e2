// A file that somebody wrote by hand at three in the morning: each error is given with its line and
// with what would have been right, and none of it is guessed at, because a log that is half
// configured is found out when it is needed.
#include "Configuration.h"

#include <algorithm>
#include <charconv>

#include "LineBuffer.h"

namespace ZBLog {

namespace {

constexpr std::string_view blanks = " \t";

bool matches(std::string_view pattern, std::string_view category) {
    if (pattern.empty() || pattern.back() != '*') return category == pattern;
    pattern.remove_suffix(1);
    return category.substr(0, pattern.size()) == pattern;
}

std::string_view trimmed(std::string_view text) {
    const std::size_t first = text.find_first_not_of(blanks);
    if (first == std::string_view::npos) return {};
    return text.substr(first, text.find_last_not_of(blanks) - first + 1);
}

/// Takes the part before the next separator off `text`, and the separator.
std::string_view takeUntil(char separator, std::string_view& text) {
    const std::size_t end = std::min(text.find(separator), text.size());
    const std::string_view part = text.substr(0, end);
    text.remove_prefix(std::min(end + 1, text.size()));
    return part;
}

std::string quoted(std::string_view text) {
    constexpr std::size_t room = 64;
    LineBuffer printable;
    printable.putEscaped(text, room);
    return "\"" + std::string(printable.text()) + "\"";
}

bool isControl(char character) {
    const auto byte = static_cast<unsigned char>(character);
    return byte == 0x7F || (byte < 0x20 && character != '\t');
}

constexpr const char* sinkForm = "off, stderr, syslog or file:/PATH";

/// What the path of a file must be; null if this is one.
const char* pathProblem(std::string_view path) {
    constexpr std::size_t longestPath = 4095;
    if (path.empty()) return sinkForm;
    if (path.front() != '/') return "file:/PATH with a path that begins with /";
    if (path.back() == '/') return "file:/PATH with a path that does not end in /";
    return path.size() > longestPath ? "file:/PATH with a path of at most 4095 bytes" : nullptr;
}

/// Each sets one thing from its text; null, or what the text must be and is not.
const char* setSink(ChannelConfiguration& channel, std::string_view value) {
    constexpr std::string_view filePrefix = "file:";
    constexpr std::pair<std::string_view, Destination> words[] = {
        {"off", Destination::off},
        {"stderr", Destination::standardError},
        {"syslog", Destination::systemLog},
    };
    for (const auto& [word, destination] : words) {
        if (value != word) continue;
        channel.destination = destination;
        return nullptr;
    }
    if (value.substr(0, filePrefix.size()) != filePrefix) return sinkForm;
    value.remove_prefix(filePrefix.size());
    channel.destination = Destination::file;
    channel.path = value;
    return pathProblem(value);
}

const char* setLevel(ChannelConfiguration& channel, std::string_view value) {
    constexpr const char* form = "a number from 0 to 999999";
    constexpr std::size_t mostDigits = 6;
    if (value.size() > mostDigits || value.substr(0, 1) == "-") return form;
    const char* const end = value.data() + value.size();
    const auto [stop, error] = std::from_chars(value.data(), end, channel.level);
    return error == std::errc() && stop == end ? nullptr : form;
}

const char* setRecords(ChannelConfiguration& channel, std::string_view value) {
    channel.failuresOnly = value == "failures";
    return channel.failuresOnly || value == "all" ? nullptr : "all or failures";
}

bool isPattern(std::string_view text) {
    if (text.empty() || text.find_first_of(blanks) != std::string_view::npos) return false;
    return text.find('*') >= text.size() - 1;
}

const char* setCategory(ChannelConfiguration& channel, std::string_view value) {
    std::size_t items = 1 + static_cast<std::size_t>(std::count(value.begin(), value.end(), ','));
    for (; items > 0; --items) {
        const std::string_view pattern = trimmed(takeUntil(',', value));
        if (!isPattern(pattern)) return "NAME or BEGINNING*, separated by commas";
        channel.categories.add(pattern);
    }
    return nullptr;
}

struct Setting {
    std::string_view key;
    Channel channel;
    const char* (*set)(ChannelConfiguration&, std::string_view);
};

constexpr Setting settings[] = {
    {"log.sink", Channel::log, setSink},           {"log.level", Channel::log, setLevel},
    {"log.records", Channel::log, setRecords},     {"log.category", Channel::log, setCategory},
    {"trace.sink", Channel::trace, setSink},       {"trace.level", Channel::trace, setLevel},
    {"trace.records", Channel::trace, setRecords}, {"trace.category", Channel::trace, setCategory},
};

/// Reads one line after the other into a configuration.
class LineReader {
  public:
    explicit LineReader(Configuration& configuration) : configuration_(configuration) {}

    /// What is wrong with the line, empty if nothing is.
    std::string read(std::string_view line) {
        if (!line.empty() && line.back() == '\r') line.remove_suffix(1);
        line = trimmed(line);
        if (line.empty() || line.front() == '#') return {};
        if (std::any_of(line.begin(), line.end(), isControl)) {
            return "control character in " + quoted(line);
        }
        if (line.find('=') == std::string_view::npos) {
            return "not of the form KEY = VALUE: " + quoted(line);
        }
        const std::string_view key = trimmed(takeUntil('=', line));
        return assign(key, trimmed(line));
    }

  private:
    std::string assign(std::string_view key, std::string_view value) {
        const auto* const setting =
            std::find_if(std::begin(settings), std::end(settings),
                         [&](const Setting& candidate) { return candidate.key == key; });
        if (setting == std::end(settings)) return "unknown key " + quoted(key);
        bool& given = given_[static_cast<std::size_t>(setting - std::begin(settings))];
        if (given) return std::string(key) + " is given twice";
        given = true;
        const char* const form = setting->set(configuration_.of(setting->channel), value);
        if (form == nullptr) return {};
        return std::string(key) + " must be " + form + ", not " + quoted(value);
    }

    Configuration& configuration_;
    std::array<bool, std::size(settings)> given_{};
};

}  // namespace

void CategoryFilter::add(std::string_view pattern) {
    patterns_.emplace_back(pattern);
}

bool CategoryFilter::passes(std::string_view category) const noexcept {
    if (patterns_.empty()) return true;
    return std::any_of(patterns_.begin(), patterns_.end(),
                       [&](const std::string& pattern) { return matches(pattern, category); });
}

Configuration::Configuration() {
    ChannelConfiguration& log = of(Channel::log);
    log.destination = Destination::systemLog;
    log.level = 3000;
    log.failuresOnly = true;
}

ParsedConfiguration parseConfiguration(std::string_view text) {
    ParsedConfiguration result;
    if (text.size() > configurationSizeLimit) {
        result.errors.push_back(
            {0, "longer than " + std::to_string(configurationSizeLimit) + " bytes"});
        return result;
    }
    Configuration configuration;
    LineReader reader(configuration);
    for (unsigned line = 1; !text.empty(); ++line) {
        std::string problem = reader.read(takeUntil('\n', text));
        if (problem.empty()) continue;
        if (result.errors.size() == configurationErrorLimit) {
            result.errors.push_back({line, "further errors are not told"});
            break;
        }
        result.errors.push_back({line, std::move(problem)});
    }
    if (result.errors.empty()) result.configuration = std::move(configuration);
    return result;
}

}  // namespace ZBLog
