#ifndef PROVIDER_LINUX_OPERATING_SYSTEM_CAPABILITIES_H
#define PROVIDER_LINUX_OPERATING_SYSTEM_CAPABILITIES_H

#include <string>
#include <vector>

#include "Instrumentation.h"

namespace VA::OSStatusProvider {

/// The capabilities of the host's operating systems, one at a time: a cursor over the same nodes as
/// OperatingSystem, with a getter for each property of KORVA_OperatingSystemCapabilities.
///
/// Each getter writes its output and returns true; false means that there is nothing to publish.
/// One object serves one request on one thread. What the framework throws passes through.
class OperatingSystemCapabilities {
  public:
    enum FilterType : int {
        InstanceIDFilter = 0,  ///< the capabilities' identifier
    };

    struct Filter {
        FilterType type;
        std::string value;
    };

    /// Stands on the first element, if there is one.
    OperatingSystemCapabilities();

    /// True while the cursor stands on an element.
    operator bool();

    /// Moves to the next element.
    OperatingSystemCapabilities& operator++();

    /// Accepts any filter and applies none: every request sees every element.
    void setFilter(FilterType, const std::string&) {}

    bool getInstanceID(std::string& value);
    /// The identifier itself.
    bool getElementName(std::string& value);
    /// Editable is what is not read-only.
    bool getElementNameEditSupported(bool& value);
    bool getMaxElementNameLen(unsigned short&) { return false; }
    bool getRequestedStatesSupported(std::vector<unsigned short>&) { return false; }
    /// Always 3: shutting down the operating system has no effect on a host of it.
    bool getHostShutdownBehavior(unsigned short& value);

  protected:
    /// Part of the contract: what operator++ applies once a derived class has set it. This class
    /// leaves it alone.
    bool filterSet = false;
    std::vector<Filter> filters;

  private:
    bool passesFilters();

    VA::Instrumentation instrumentation;
};

}  // namespace VA::OSStatusProvider

#endif
