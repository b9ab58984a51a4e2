#ifndef PROVIDER_LINUX_OPERATING_SYSTEM_H
#define PROVIDER_LINUX_OPERATING_SYSTEM_H

#include <array>
#include <string>
#include <vector>

#include "Instrumentation.h"

namespace VA::OSStatusProvider {

/// The operating systems of the host, one at a time: a cursor over the instrumentation's nodes,
/// narrowed by key filters, with a getter for each property of KORVA_OperatingSystem.
///
/// Each getter writes the current node's value to its output and returns true; false means that
/// there is nothing to publish. Getters are to be called while the cursor stands on an element.
/// One object serves one request on one thread. What the framework throws passes through.
class OperatingSystem {
  public:
    /// What a key filter compares. Any other value may be set as well, and passes every node.
    enum FilterType : int {
        CSNameFilter = 0,  ///< the host's computer name
        NameFilter = 1,    ///< the node's name
    };

    /// A key filter: a node passes when its text equals `value`, letter case aside. Nothing is
    /// trimmed.
    struct Filter {
        FilterType type;
        std::string value;
    };

    /// Stands on the first operating system, if there is one.
    OperatingSystem();

    /// True while the cursor stands on an element; it then passes every filter.
    operator bool();

    /// Moves to the next element that passes every filter.
    OperatingSystem& operator++();

    /// Adds a filter, and moves to the first element, from the current one on, that passes all.
    void setFilter(FilterType type, std::string value);

    bool getCaption(std::string&) { return false; }
    /// A success without a value: what the output held is published.
    bool getDescription(std::string&) { return true; }
    bool getElementName(std::string&) { return false; }
    bool getInstallDate(std::string& value) { return getDateTime(NodeLexicon::InstallDate, value); }
    /// Appends; never clears the output.
    bool getOperationalStatus(std::vector<unsigned short>& value);
    bool getStatusDescriptions(std::vector<std::string>&) { return false; }
    bool getHealthState(unsigned short& value);
    bool getPrimaryStatus(unsigned short&) { return false; }
    bool getDetailedStatus(unsigned short&) { return false; }
    bool getOperatingStatus(unsigned short&) { return false; }
    bool getStatus(std::string& value);
    bool getCommunicationStatus(unsigned short&) { return false; }
    bool getEnabledState(unsigned short& value);
    bool getOtherEnabledState(std::string&) { return false; }
    bool getRequestedState(unsigned short&) { return false; }
    bool getEnabledDefault(unsigned short&) { return false; }
    bool getTimeOfLastStateChange(std::string&) { return false; }
    bool getAvailableRequestedStates(std::vector<unsigned short>&) { return false; }
    bool getTransitioningToState(unsigned short&) { return false; }
    bool getCSCreationClassName(std::string& value);
    bool getCSName(std::string& value);
    bool getCreationClassName(std::string& value);
    bool getName(std::string& value) {
        return instrumentation.getProperty(NodeLexicon::Name, value);
    }
    /// The framework's number as one of the CIM value map, which is shifted against it.
    bool getOSType(unsigned short& value);
    bool getOtherTypeDescription(std::string&) { return false; }
    bool getVersion(std::string& value) {
        return instrumentation.getProperty(NodeLexicon::Version, value);
    }
    bool getLastBootUpTime(std::string& value) {
        return getDateTime(NodeLexicon::LastBootUpTime, value);
    }
    bool getLocalDateTime(std::string&) { return false; }
    bool getCurrentTimeZone(short&) { return false; }
    bool getNumberOfLicensedUsers(unsigned int& value) {
        return instrumentation.getProperty(NodeLexicon::NumberOfLicensedUsers, value);
    }
    bool getNumberOfUsers(unsigned int& value) {
        return instrumentation.getProperty(NodeLexicon::NumberOfUsers, value);
    }
    bool getNumberOfProcesses(unsigned int& value) {
        return instrumentation.getProperty(NodeLexicon::NumberOfProcesses, value);
    }
    bool getMaxNumberOfProcesses(unsigned int& value) {
        return instrumentation.getProperty(NodeLexicon::MaxNumberOfProcesses, value);
    }
    /// Sizes are in kilobytes. Each writes its output, with 0 on failure, whatever it returns.
    bool getTotalSwapSpaceSize(unsigned long long& value) {
        return getSize(NodeLexicon::TotalSwapSpaceSize, value);
    }
    bool getTotalVirtualMemorySize(unsigned long long& value) {
        return getSize(NodeLexicon::TotalVirtualMemorySize, value);
    }
    bool getFreeVirtualMemory(unsigned long long& value) {
        return getSize(NodeLexicon::FreeVirtualMemory, value);
    }
    bool getFreePhysicalMemory(unsigned long long& value) {
        return getSize(NodeLexicon::FreePhysicalMemory, value);
    }
    bool getTotalVisibleMemorySize(unsigned long long& value) {
        return getSize(NodeLexicon::TotalVisibleMemorySize, value);
    }
    bool getSizeStoredInPagingFiles(unsigned long long& value) {
        return getSize(NodeLexicon::SizeStoredInPagingFiles, value);
    }
    bool getFreeSpaceInPagingFiles(unsigned long long& value) {
        return getSize(NodeLexicon::FreeSpaceInPagingFiles, value);
    }
    bool getMaxProcessMemorySize(unsigned long long& value) {
        return getSize(NodeLexicon::MaxProcessMemorySize, value);
    }
    bool isDistributed(bool& value) {
        return instrumentation.getProperty(NodeLexicon::Distributed, value);
    }
    bool getMaxProcessesPerUser(unsigned int&) { return false; }

  private:
    bool passesFilters();
    bool getDateTime(NodeLexicon::Properties id, std::string& value);
    bool getSize(NodeLexicon::Properties id, unsigned long long& value);

    bool filterSet = false;
    std::vector<Filter> filters;
    VA::Instrumentation instrumentation;
    std::array<char, 26> dateTimeBuffer = {};  // of a CIM datetime: 25 characters and the NUL
};

/// State changes of the operating system, which offers none: both do nothing and return false. Part
/// of the contract, though nothing here calls them.
bool executeReboot();
bool executeShutdown();

}  // namespace VA::OSStatusProvider

#endif
