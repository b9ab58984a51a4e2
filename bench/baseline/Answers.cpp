// What the provider gives for the plausible node, as constants: nothing is left to compute, so that
// the baseline costs what the broker costs.
#include "Answers.h"

#include <strings.h>

#include <array>
#include <iterator>

#include "support/Properties.h"

namespace baseline {
namespace {

template <unsigned keyCount>
constexpr Path path(const char* className, const Key (&keys)[keyCount]) {
    return {className, keys, keyCount};
}

template <unsigned keyCount, unsigned propertyCount>
constexpr Answer answer(const char* className, const Key (&keys)[keyCount],
                        const Property (&properties)[propertyCount]) {
    return {path(className, keys), properties, propertyCount};
}

constexpr Property text(const char* name, const char* value) {
    return {name, CMPI_chars, value};
}

constexpr Property number(const char* name, CMPIType type, unsigned long long value) {
    return {name, type, nullptr, value};
}

constexpr Property reference(const char* name, const Path& value) {
    return {name, CMPI_ref, nullptr, 0, &value};
}

constexpr unsigned short operationalStatus[] = {2, 11};

// The property of the list that all tests use, in the form in which it is set.
constexpr Property published(const PublishedProperty& property) {
    if (property.type == CMPI_uint16A)
        return {property.name, CMPI_uint16A, nullptr, 0, nullptr, operationalStatus, 2};
    if (property.isFlag()) return number(property.name, CMPI_boolean, property.value[0] == 't');
    if (property.isText())
        return {property.name, property.type == CMPI_string ? CMPIType{CMPI_chars} : property.type,
                property.value};
    unsigned long long value = 0;
    for (const char* digit = property.value; *digit != '\0'; ++digit)
        value = value * 10 + static_cast<unsigned long long>(*digit - '0');
    return number(property.name, property.type, value);
}

constexpr auto publishedProperties() {
    std::array<Property, std::size(operatingSystemProperties)> result{};
    for (std::size_t index = 0; index < result.size(); ++index)
        result[index] = published(operatingSystemProperties[index]);
    return result;
}

constexpr char computerName[] = "simulated.example";
constexpr char systemName[] = "Simulated Linux";

constexpr Key computerKeys[] = {
    {"CreationClassName", "KORVA_ComputerSystem", nullptr},
    {"Name", computerName, nullptr},
};
constexpr Property computerProperties[] = {
    text("CreationClassName", "KORVA_ComputerSystem"),
    text("Name", computerName),
};

constexpr Key systemKeys[] = {
    {"CSCreationClassName", "KORVA_ComputerSystem", nullptr},
    {"CSName", computerName, nullptr},
    {"CreationClassName", "KORVA_OperatingSystem", nullptr},
    {"Name", systemName, nullptr},
};
constexpr auto systemProperties = publishedProperties();

constexpr Key capabilitiesKeys[] = {{"InstanceID", systemName, nullptr}};
constexpr Property capabilitiesProperties[] = {
    text("InstanceID", systemName),
    text("ElementName", systemName),
    number("ElementNameEditSupported", CMPI_boolean, 0),
    number("HostShutdownBehavior", CMPI_uint16, 3),
};

constexpr Path computerPath = path("KORVA_ComputerSystem", computerKeys);
constexpr Path systemPath = path("KORVA_OperatingSystem", systemKeys);
constexpr Path capabilitiesPath = path("KORVA_OperatingSystemCapabilities", capabilitiesKeys);

constexpr Key installedKeys[] = {
    {"GroupComponent", nullptr, &computerPath},
    {"PartComponent", nullptr, &systemPath},
};
constexpr Property installedProperties[] = {
    reference("GroupComponent", computerPath),
    reference("PartComponent", systemPath),
};

constexpr Key runningKeys[] = {
    {"Antecedent", nullptr, &systemPath},
    {"Dependent", nullptr, &computerPath},
};
constexpr Property runningProperties[] = {
    reference("Antecedent", systemPath),
    reference("Dependent", computerPath),
};

constexpr Key elementKeys[] = {
    {"ManagedElement", nullptr, &systemPath},
    {"Capabilities", nullptr, &capabilitiesPath},
};
constexpr Property elementProperties[] = {
    reference("ManagedElement", systemPath),
    reference("Capabilities", capabilitiesPath),
};

constexpr Answer computer = answer("KORVA_ComputerSystem", computerKeys, computerProperties);
constexpr Answer served[] = {
    {path("KORVA_OperatingSystem", systemKeys), systemProperties.data(), systemProperties.size()},
    answer("KORVA_OperatingSystemCapabilities", capabilitiesKeys, capabilitiesProperties),
    answer("KORVA_InstalledOS", installedKeys, installedProperties),
    answer("KORVA_RunningOS", runningKeys, runningProperties),
    answer("KORVA_OSElementCapabilities", elementKeys, elementProperties),
};

struct Hop {
    const char* assocClass;
    const char* sourceClass;
    const Answer* farEnd;
};

constexpr Hop hops[] = {
    {"KORVA_InstalledOS", "KORVA_ComputerSystem", &served[0]},
    {"KORVA_InstalledOS", "KORVA_OperatingSystem", &computer},
    {"KORVA_RunningOS", "KORVA_ComputerSystem", &served[0]},
    {"KORVA_RunningOS", "KORVA_OperatingSystem", &computer},
    {"KORVA_OSElementCapabilities", "KORVA_OperatingSystem", &served[1]},
    {"KORVA_OSElementCapabilities", "KORVA_OperatingSystemCapabilities", &served[0]},
};

}  // namespace

const Answer* answerOf(const char* className) {
    for (const Answer& answer : served)
        if (strcasecmp(answer.path.className, className) == 0) return &answer;
    return nullptr;
}

const Answer* farEndOf(const char* sourceClass, const char* assocClass) {
    for (const Hop& hop : hops)
        if (strcasecmp(hop.assocClass, assocClass) == 0 &&
            strcasecmp(hop.sourceClass, sourceClass) == 0)
            return hop.farEnd;
    return nullptr;
}

}  // namespace baseline
