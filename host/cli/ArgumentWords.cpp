#include "host/cli/ArgumentWords.h"

#include <algorithm>

#include "host/cli/Suggestion.h"

namespace cmpihost {

namespace {

std::string strip(const std::string& text) {
    constexpr const char* blanks = " \t\r\n";
    const std::size_t start = text.find_first_not_of(blanks);
    return start == std::string::npos
               ? std::string()
               : text.substr(start, text.find_last_not_of(blanks) - start + 1);
}

/// What a word stands for.
template <class Meaning>
struct Word {
    const char* text;
    Meaning meaning;
};

constexpr Word<Format> formats[] = {
    {"table", Format::Table}, {"mof", Format::Mof}, {"json", Format::Json}};
constexpr Word<LogLevel> logLevels[] = {
    {"failures", LogLevel::Failures}, {"3000", LogLevel::Calls}, {"4000", LogLevel::Everything}};
constexpr Word<LogChannel> logChannels[] = {
    {"log", LogChannel::Log}, {"trace", LogChannel::Trace}, {"cmpi", LogChannel::Cmpi}};

/// Throws UsageError for a word that the table does not have.
template <class Meaning, std::size_t count>
Meaning meaningOf(const std::string& word, const Word<Meaning> (&table)[count],
                  const char* option) {
    std::string known;
    std::vector<std::string> names;
    for (std::size_t index = 0; index < count; ++index) {
        if (word == table[index].text) return table[index].meaning;
        names.emplace_back(table[index].text);
        known += std::string(index == 0 ? "" : index + 1 < count ? ", " : " or ");
        known += table[index].text;
    }
    throw UsageError(std::string(option) + ": expected " + known + ", found '" + word + "'" +
                     didYouMean(word, names));
}

}  // namespace

std::vector<std::string> splitArguments(int argumentCount, const char* const* arguments) {
    std::vector<std::string> result;
    bool options = true;
    for (int index = 1; index < argumentCount; ++index) {
        std::string argument = arguments[index];
        options = options && argument != "--";
        const bool emptyValue = options && argument.compare(0, 2, "--") == 0 &&
                                argument.find('=') == argument.size() - 1;
        if (emptyValue) argument.pop_back();
        if (options && argument == "--log" && !emptyValue) argument = "--log=4000";
        result.push_back(std::move(argument));
        if (emptyValue) result.emplace_back();
    }
    std::reverse(result.begin(), result.end());
    return result;
}

void appendNames(const std::string& list, std::vector<std::string>& to) {
    std::size_t start = 0;
    while (start < list.size()) {
        const std::size_t comma = std::min(list.find(',', start), list.size());
        const std::string name = strip(list.substr(start, comma - start));
        if (!name.empty()) to.push_back(name);
        start = comma + 1;
    }
}

Format parseFormat(const std::string& word) {
    return meaningOf(word, formats, "--format");
}

bool beginsWithLogLevel(const std::string& text) {
    const std::string level = text.substr(0, text.find(','));
    return std::any_of(std::begin(logLevels), std::end(logLevels),
                       [&](const Word<LogLevel>& word) { return level == word.text; });
}

LogRequest parseLogRequest(const std::string& text) {
    const std::size_t comma = text.find(',');
    LogRequest request;
    request.level = meaningOf(text.substr(0, comma), logLevels, "--log");
    if (comma != std::string::npos)
        request.channel = meaningOf(text.substr(comma + 1), logChannels, "--log");
    return request;
}

}  // namespace cmpihost
