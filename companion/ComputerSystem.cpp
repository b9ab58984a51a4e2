#include "ComputerSystem.h"

#include "Instrumentation.h"
#include "ProviderUtilities.h"

namespace computersystem {
namespace {

using Utilities = VA::ProviderUtilities;

constexpr const char* className = "KORVA_ComputerSystem";

}  // namespace

std::optional<std::string> name() {
    VA::Instrumentation instrumentation;
    instrumentation.selectNode(VA::NodeLexicon::OperatingSystemNode);
    std::string host;
    if (!instrumentation.getComputerName(host)) return std::nullopt;
    return host;
}

CMPIObjectPath* makePath(const CMPIBroker* broker, const std::string& nameSpace,
                         const std::string& name) {
    CMPIObjectPath* path = Utilities::createObjectPath(broker, className, nameSpace);
    Utilities::setKeyProperty(path, "CreationClassName", className);
    Utilities::setKeyProperty(path, "Name", name);
    return path;
}

// Nobody measures the state of the computer system, its health or its purpose: those properties are
// left out.
CMPIInstance* makeInstance(const CMPIBroker* broker, const std::string& nameSpace,
                           const std::string& name) {
    CMPIInstance* instance = Utilities::createInstance(broker, makePath(broker, nameSpace, name));
    std::string elementName = name;
    std::string nameFormat = "Other";
    Utilities::setProperty(instance, "ElementName", elementName);
    Utilities::setProperty(instance, "NameFormat", nameFormat);
    return instance;
}

}  // namespace computersystem
