// The parts of values that the printers and the tree share. What is for people (sizes, instants,
// names) stands beside the exact value, never in its place.
#include "host/cli/ValueText.h"

#include <algorithm>
#include <cstdio>
#include <ctime>
#include <limits>

#include "base/Ascii.h"
#include "base/CimDateTime.h"
#include "base/CivilTime.h"
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

/// The microseconds behind a count of seconds, if any.
std::string fractionText(int microseconds) {
    return microseconds == 0 ? std::string() : formatted(".%06d", microseconds);
}

std::string isoInstant(const base::CimDateTime& text) {
    const base::CivilTime written = {*text.year, *text.month,  *text.day,
                                     *text.hour, *text.minute, *text.second};
    if (written.day > base::daysInMonth(written.year, written.month)) return {};
    const base::CivilTime utc =
        base::civilFromSeconds(base::secondsFromCivil(written) - *text.utcOffset * 60);
    if (utc.year < 1 || utc.year > 9999) return {};
    return formatted("%04d-%02d-%02dT%02d:%02d:%02d", static_cast<int>(utc.year), utc.month,
                     utc.day, utc.hour, utc.minute, utc.second) +
           fractionText(*text.microsecond) + "Z";
}

std::string isoDuration(const base::CimDateTime& text) {
    const std::string seconds =
        *text.second == 0 && *text.microsecond == 0
            ? std::string()
            : std::to_string(*text.second) + fractionText(*text.microsecond) + "S";
    const auto part = [](int count, const char* letter) {
        return count == 0 ? std::string() : std::to_string(count) + letter;
    };
    const std::string days = part(*text.days, "D");
    const std::string time = part(*text.hour, "H") + part(*text.minute, "M") + seconds;
    if (days.empty() && time.empty()) return "PT0S";
    return "P" + days + (time.empty() ? "" : "T" + time);
}

constexpr struct {
    const char* power;
    const char* prefix;
} prefixes[] = {{"10^3", "kilo"},   {"10^6", "mega"},   {"10^9", "giga"},  {"10^12", "tera"},
                {"10^-3", "milli"}, {"10^-6", "micro"}, {"10^-9", "nano"}, {"2^10", "kibi"},
                {"2^20", "mebi"},   {"2^30", "gibi"},   {"2^40", "tebi"}};

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

std::optional<SizeUnit> sizeUnit(const std::string& units) {
    constexpr struct {
        const char* words;
        SizeUnit unit;
    } rows[] = {{"Bytes", SizeUnit::Bytes},         {"byte", SizeUnit::Bytes},
                {"KiloBytes", SizeUnit::Kibibytes}, {"kibibyte", SizeUnit::Kibibytes},
                {"MegaBytes", SizeUnit::Mebibytes}, {"mebibyte", SizeUnit::Mebibytes}};
    for (const auto& row : rows)
        if (base::equalsIgnoreCase(units, row.words)) return row.unit;
    return std::nullopt;
}

std::string humanReadableSize(std::uint64_t count, SizeUnit counted) {
    constexpr const char* units[] = {"B", "KiB", "MiB", "GiB", "TiB", "PiB", "EiB", "ZiB", "YiB"};
    auto unit = static_cast<std::size_t>(counted);
    std::uint64_t whole = count;
    std::uint64_t rest = 0;
    while (whole >= 1024) {
        rest = whole % 1024;
        whole /= 1024;
        ++unit;
    }
    if (whole == count) return std::to_string(whole) + ' ' + units[unit];
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

std::string isoDateTime(const std::string& cimText) {
    const auto parsed = base::parseCimDateTime(cimText);
    if (!parsed || cimText.find('*') != std::string::npos) return {};
    return parsed->isInterval ? isoDuration(*parsed) : isoInstant(*parsed);
}

const std::string* nameOf(const Value& value, const ValueMap& names) {
    const TypeCategory category = categoryOf(value);
    if (category == TypeCategory::Signed) return names.find(value.signedInteger());
    if (category != TypeCategory::Unsigned) return nullptr;
    const std::uint64_t number = value.unsignedInteger();
    const bool named =
        number <= static_cast<std::uint64_t>(std::numeric_limits<std::int64_t>::max());
    return named ? names.find(static_cast<std::int64_t>(number)) : nullptr;
}

std::string unitWords(const std::string& programmatic) {
    std::string dense = programmatic;
    dense.erase(std::remove(dense.begin(), dense.end(), ' '), dense.end());
    const std::size_t times = dense.find('*');
    if (times == std::string::npos) return programmatic;
    for (const auto& row : prefixes) {
        if (dense.substr(times + 1) == row.power) return row.prefix + dense.substr(0, times);
    }
    return programmatic;
}

std::string unitsOf(const Schema& schema, const std::string& className,
                    const std::string& propertyName) {
    const auto text = [&](const char* qualifierName) {
        const mof::Qualifier* const qualifier =
            schema.propertyQualifier(className, propertyName, qualifierName);
        return qualifier == nullptr ? std::string() : mof::text({*qualifier}, qualifierName);
    };
    const std::string units = text("Units");
    return units.empty() ? unitWords(text("PUnit")) : units;
}

std::string characterText(std::uint64_t code) {
    std::string text;
    base::appendUtf8(text, static_cast<char32_t>(code));
    return text;
}

}  // namespace cmpihost
