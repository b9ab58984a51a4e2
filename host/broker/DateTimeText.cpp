// The broker is strict where the grammar leaves a choice: it takes dates of the calendar from the
// year 1 on and no leap second, as what it hands out has to have a binary form.
#include "host/broker/DateTimeText.h"

#include "base/CimDateTime.h"
#include "base/CivilTime.h"

#include <array>
#include <cstdio>

namespace cmpihost {

namespace {

constexpr std::int64_t microsPerSecond = 1000000;
constexpr std::int64_t secondsPerDay = 86400;

/// The instant's seconds since 1970 UTC; none: it is not in the calendar.
std::optional<std::int64_t> secondsOf(const base::CimDateTime& text) {
    const base::CivilTime time = {text.year.value_or(1),   text.month.value_or(1),
                                  text.day.value_or(1),    text.hour.value_or(0),
                                  text.minute.value_or(0), text.second.value_or(0)};
    if (time.year == 0 || time.day > base::daysInMonth(time.year, time.month) || time.second > 59) {
        return std::nullopt;
    }
    return base::secondsFromCivil(time) - text.utcOffset.value_or(0) * 60;
}

}  // namespace

std::optional<DateTimeBinary> parseDateTime(std::string_view text) noexcept {
    const auto parsed = base::parseCimDateTime(text);
    if (!parsed) return std::nullopt;

    std::int64_t seconds = 0;
    if (parsed->isInterval) {
        seconds = parsed->days.value_or(0) * secondsPerDay + parsed->hour.value_or(0) * 3600 +
                  parsed->minute.value_or(0) * 60 + parsed->second.value_or(0);
    } else if (const auto instant = secondsOf(*parsed)) {
        seconds = *instant;
    } else {
        return std::nullopt;
    }
    DateTimeBinary result;
    result.interval = parsed->isInterval;
    if (seconds >= 0) {
        result.microseconds =
            static_cast<std::uint64_t>(seconds * microsPerSecond + parsed->microsecond.value_or(0));
    }
    return result;
}

std::optional<std::string> formatDateTime(std::uint64_t microseconds, bool interval) {
    const auto seconds = static_cast<std::int64_t>(microseconds / microsPerSecond);
    const auto micros = static_cast<int>(microseconds % microsPerSecond);
    const std::int64_t days = seconds / secondsPerDay;
    const base::CivilTime time = base::civilFromSeconds(seconds);
    if (interval ? days > 99999999 : time.year > 9999) return std::nullopt;

    std::array<char, 64> text{};
    if (interval) {
        std::snprintf(text.data(), text.size(), "%08d%02d%02d%02d.%06d:000", static_cast<int>(days),
                      time.hour, time.minute, time.second, micros);
    } else {
        std::snprintf(text.data(), text.size(), "%04d%02d%02d%02d%02d%02d.%06d+000",
                      static_cast<int>(time.year), time.month, time.day, time.hour, time.minute,
                      time.second, micros);
    }
    return text.data();
}

}  // namespace cmpihost
