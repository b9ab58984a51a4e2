// The parts of values that the printers and the tree share. What is for people (sizes, instants,
// names) stands beside the exact value, never in its place.
#include "host/cli/ValueText.h"

#include <cstdio>
#include <ctime>

#include "base/Utf8.h"
#include "host/broker/DateTimeText.h"

namespace cmpihost {

namespace {

constexpr std::uint64_t microsecondsPerSecond = 1000000;

template <typename... Arguments>
std::string formatted(const char* format, Arguments... arguments) {
    char text[80];
    const int length = std::snprintf(text, sizeof text, format, arguments...);
    return length > 0 ? std::string(text, static_cast<std::size_t>(length)) : std::string();
}

std::string instantText(std::uint64_t seconds) {
    static_assert(sizeof(std::time_t) == 8, "an instant of any year is to be shown");
    const auto instant = static_cast<std::time_t>(seconds);
    std::tm local{};
    // In the zone of the reader: the offset of the provider says where the host stands.
    if (localtime_r(&instant, &local) == nullptr) return {};
    const long offset = local.tm_gmtoff / 60;
    const long minutes = offset < 0 ? -offset : offset;
    return formatted("%04d-%02d-%02d %02d:%02d:%02d %c%02ld:%02ld", local.tm_year + 1900,
                     local.tm_mon + 1, local.tm_mday, local.tm_hour, local.tm_min, local.tm_sec,
                     offset < 0 ? '-' : '+', minutes / 60, minutes % 60);
}

std::string intervalText(std::uint64_t seconds) {
    const unsigned days = static_cast<unsigned>(seconds / 86400);
    const unsigned rest = static_cast<unsigned>(seconds % 86400);
    return formatted("%u %s %02u:%02u:%02u", days, days == 1 ? "day" : "days", rest / 3600,
                     rest / 60 % 60, rest % 60);
}

}  // namespace

TypeCategory categoryOf(const Value& value) {
    if (value.isNull()) return TypeCategory::Null;
    if (value.isArray()) return TypeCategory::Array;
    switch (value.type()) {
        case CMPI_boolean:
            return TypeCategory::Boolean;
        case CMPI_uint8:
        case CMPI_uint16:
        case CMPI_uint32:
        case CMPI_uint64:
            return TypeCategory::Unsigned;
        case CMPI_sint8:
        case CMPI_sint16:
        case CMPI_sint32:
        case CMPI_sint64:
            return TypeCategory::Signed;
        case CMPI_real32:
        case CMPI_real64:
            return TypeCategory::Real;
        case CMPI_char16:
            return TypeCategory::Character;
        case CMPI_dateTime:
            return TypeCategory::DateTime;
        case CMPI_ref:
            return TypeCategory::Reference;
        case CMPI_instance:
            return TypeCategory::Instance;
        default:
            return value.isText() ? TypeCategory::Text : TypeCategory::Opaque;
    }
}

std::string humanReadableSize(std::uint64_t kibibytes) {
    constexpr const char* units[] = {"KiB", "MiB", "GiB", "TiB", "PiB", "EiB", "ZiB"};
    std::size_t unit = 0;
    std::uint64_t whole = kibibytes;
    std::uint64_t rest = 0;
    while (whole >= 1024) {
        rest = whole % 1024;
        whole /= 1024;
        ++unit;
    }
    if (unit == 0) return std::to_string(whole) + " KiB";
    // In integers, so that the digits are the same on every machine. What rounds up to 1024 is one
    // of the next unit.
    std::uint64_t tenths = whole * 10 + (rest * 10 + 512) / 1024;
    if (tenths >= 10240) {
        tenths = 10;
        ++unit;
    }
    return std::to_string(tenths / 10) + "." + std::to_string(tenths % 10) + " " + units[unit];
}

std::string humanReadableDateTime(const std::string& cimText) {
    // Asterisks leave open which instant it is: no shorter form would say the same.
    const auto parsed = parseDateTime(cimText);
    if (!parsed || !parsed->microseconds || cimText.find('*') != std::string::npos) return {};
    const std::uint64_t seconds = *parsed->microseconds / microsecondsPerSecond;
    return parsed->interval ? intervalText(seconds) : instantText(seconds);
}

std::string characterText(std::uint64_t code) {
    std::string text;
    base::appendUtf8(text, static_cast<char32_t>(code));
    return text;
}

}  // namespace cmpihost
