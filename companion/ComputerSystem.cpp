#include "ComputerSystem.h"

#include <charconv>
#include <cstdlib>
#include <cstring>

#include "Instrumentation.h"
#include "ProviderUtilities.h"

namespace computersystem {
namespace {

using Utilities = VA::ProviderUtilities;

constexpr const char* className = "KORVA_ComputerSystem";

constexpr unsigned short enabled = 2;
constexpr unsigned short statusOk = 2;
constexpr unsigned short healthOk = 5;
constexpr unsigned short notDedicated = 0;

unsigned int demonstrationCount() {
    constexpr unsigned int most = 1000;
    const char* const text = std::getenv("KORVA_COMPUTER_SYSTEMS");
    unsigned int count = 1;
    if (text == nullptr) return count;
    const char* const end = text + std::strlen(text);
    const auto [rest, error] = std::from_chars(text, end, count);
    return error == std::errc() && rest == end && count <= most ? count : 1;
}

}  // namespace

std::vector<std::string> names() {
    VA::Instrumentation instrumentation;
    instrumentation.selectNode(VA::NodeLexicon::OperatingSystemNode);
    std::string host;
    if (!instrumentation.getComputerName(host)) return {};
    std::vector<std::string> result;
    const unsigned int count = demonstrationCount();
    for (unsigned int number = 1; number <= count; ++number)
        result.push_back(number == 1 ? host : host + "-" + std::to_string(number));
    return result;
}

CMPIObjectPath* makePath(const CMPIBroker* broker, const std::string& nameSpace,
                         const std::string& name) {
    CMPIObjectPath* path = Utilities::createObjectPath(broker, className, nameSpace);
    Utilities::setKeyProperty(path, "CreationClassName", className);
    Utilities::setKeyProperty(path, "Name", name);
    return path;
}

CMPIInstance* makeInstance(const CMPIBroker* broker, const std::string& nameSpace,
                           const std::string& name) {
    CMPIInstance* instance = Utilities::createInstance(broker, makePath(broker, nameSpace, name));
    std::string elementName = name;
    std::string nameFormat = "Other";
    std::vector<unsigned short> dedicated = {notDedicated};
    std::vector<unsigned short> operationalStatus = {statusOk};
    Utilities::setProperty(instance, "ElementName", elementName);
    Utilities::setProperty(instance, "NameFormat", nameFormat);
    Utilities::setProperty(broker, instance, "Dedicated", dedicated);
    Utilities::setProperty(instance, "EnabledState", enabled);
    Utilities::setProperty(broker, instance, "OperationalStatus", operationalStatus);
    Utilities::setProperty(instance, "HealthState", healthOk);
    return instance;
}

}  // namespace computersystem
