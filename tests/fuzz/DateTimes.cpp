// The way of a date: an instant of the host, its text for the element model, the CIM datetime that
// the provider makes of it, and what brokers and the framework take for a datetime.
#include <fuzzer/FuzzedDataProvider.h>

#include <cstring>
#include <ctime>
#include <memory>

#include "Linux/OperatingSystem.h"
#include "base/CimDateTime.h"
#include "framework/instrumentation/Linux/Dates.h"
#include "fuzz/Invariant.h"
#include "host/broker/DateTimeText.h"
#include "support/SimulatedHost.h"

namespace {

constexpr std::int64_t startOfYear1000 = -30610224000;
constexpr std::int64_t endOfYear9999 = 253402300799;
constexpr std::int64_t secondsPerDay = 86400;
constexpr long mostSecondsWest = 168 * 3600;  // what a zone may be away from UTC

// The provider's conversion, from the text that a node gives.
std::string converted(const std::string& text) {
    const auto host = std::make_shared<VA::SimulatedHost>();
    VA::SimulatedHost::Node node;
    node.properties[VA::NodeLexicon::LastBootUpTime] = text;
    host->addNode(node);
    VA::setHostSource(host);
    std::string value;
    {
        VA::OSStatusProvider::OperatingSystem element;
        fuzz::expect(element.getLastBootUpTime(value), "a text becomes a datetime");
        VA::OSStatusProvider::OperatingSystem other;
        std::string again;
        other.getLastBootUpTime(again);
        fuzz::expect(again == value, "a text has one datetime");
    }
    VA::setHostSource(nullptr);
    return value;
}

std::int64_t secondsOf(const std::string& text) {
    std::tm date{};
    fuzz::expect(strptime(text.c_str(), "%Y-%m-%d-%H:%M:%S", &date) == text.c_str() + text.size(),
                 "the text of an instant is a date");
    return timegm(&date);
}

void checkInstant(std::int64_t seconds) {
    const auto text = VA::Linux::civilDateText(seconds);
    fuzz::expect(text.has_value() == (seconds >= -62167219200 && seconds <= endOfYear9999),
                 "an instant of the years 0 to 9999 has a text, no other has one");
    if (!text) return;
    fuzz::expect(text->size() == 19, "the text of an instant has 19 characters");
    fuzz::expect(secondsOf(*text) == seconds, "the text of an instant names that instant");

    const auto zoned = VA::Linux::zonedDateText(seconds, timezone);
    if (!zoned) return;
    fuzz::expect(secondsOf(*zoned) == seconds + timezone / 60 * 60, "a zone moves by minutes");
    const std::string value = converted(*zoned);
    if (seconds < startOfYear1000 + mostSecondsWest || seconds > endOfYear9999 - mostSecondsWest)
        return;
    if (std::abs(timezone) / 60 > 999) return;  // three digits do not hold it
    fuzz::expect(base::parseCimDateTime(value).has_value(),
                 "the host's dates become CIM datetimes");
    const auto read = cmpihost::parseDateTime(value);
    fuzz::expect(read.has_value(), "the broker knows the provider's datetimes");
    if (seconds >= mostSecondsWest * 2)
        fuzz::expect(read->microseconds == static_cast<std::uint64_t>(seconds) * 1000000U,
                     "the datetime names the instant of the host");
}

void checkText(const std::string& text) {
    const std::string value = converted(text);
    fuzz::expect(value.size() <= 25, "a datetime has at most 25 characters");
    fuzz::expect(value.find('\n') == std::string::npos, "a datetime is one line");

    const auto read = cmpihost::parseDateTime(text);
    if (read) {
        if (!read->microseconds) return;
        const auto written = cmpihost::formatDateTime(*read->microseconds, read->interval);
        if (!written) return;
        const auto again = cmpihost::parseDateTime(*written);
        fuzz::expect(
            again && again->microseconds == read->microseconds && again->interval == read->interval,
            "a datetime is read back as it was written");
    }
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    FuzzedDataProvider input(data, size);
    timezone = input.ConsumeIntegralInRange<long>(-mostSecondsWest, mostSecondsWest);
    if (input.ConsumeBool())
        checkInstant(input.ConsumeIntegral<std::int64_t>());
    else
        checkInstant(input.ConsumeIntegralInRange<std::int64_t>(-secondsPerDay * 800000,
                                                                secondsPerDay * 3000000));
    const auto microseconds = input.ConsumeIntegral<std::uint64_t>();
    const bool interval = input.ConsumeBool();
    if (const auto text = cmpihost::formatDateTime(microseconds, interval)) {
        const auto read = cmpihost::parseDateTime(*text);
        fuzz::expect(read && read->microseconds == microseconds && read->interval == interval,
                     "a datetime is read back as it was written");
    }
    checkText(input.ConsumeRemainingBytesAsString());
    return 0;
}
