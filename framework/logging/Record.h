#ifndef ZBLOG_RECORD_H
#define ZBLOG_RECORD_H

#include <array>
#include <cstddef>
#include <string_view>

namespace ZBLog {

/// The two ways that a record takes.
enum class Channel : std::size_t { log, trace };
constexpr std::array allChannels{Channel::log, Channel::trace};
constexpr std::size_t channelCount = allChannels.size();

constexpr std::size_t indexOf(Channel channel) {
    return static_cast<std::size_t>(channel);
}

/// One call of the logging library, as the sinks see it. It refers to the caller's texts and is
/// valid only while that call lasts. Null names count as empty.
struct Record {
    Channel channel;
    const char* function;
    const char* file;
    int line;
    std::string_view category;
    int level;
    std::string_view text;
};

/// True for the text of a message record: the kind that reports a failure.
inline bool isFailure(std::string_view text) {
    constexpr std::string_view start = "MESSAGE [";
    return text.substr(0, start.size()) == start;
}

}  // namespace ZBLog

#endif
