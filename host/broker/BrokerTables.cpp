#include "host/broker/BrokerTables.h"

#include "host/broker/Entry.h"

namespace cmpihost {

BrokerOptions BrokerOptions::sparse() {
    BrokerOptions options;
    options.currentVersions = false;
    options.memoryTable = false;
    options.level200 = false;
    options.qualifierCalls = false;
    options.allThreadCalls = false;
    options.fullContext = false;
    options.keyState = false;
    options.missingItem = CMPI_RC_ERR_NOT_FOUND;
    return options;
}

namespace {

int tableVersion(const BrokerOptions& options) noexcept {
    return options.currentVersions ? CMPICurrentVersion : 1;
}

}  // namespace

std::size_t shapeOf(const BrokerOptions& options) noexcept {
    return (options.currentVersions ? TableShape::currentVersion : 0) |
           (options.level200 ? TableShape::level200 : 0) |
           (options.qualifierCalls ? TableShape::qualifiers : 0);
}

CMPIBrokerFT upcallsFor(const BrokerOptions& options) {
    static const CMPIBrokerFT complete = upcallTable();
    CMPIBrokerFT table = complete;
    table.brokerCapabilities = CMPI_MB_InstanceManipulation | CMPI_MB_AssociationTraversal;
    table.brokerVersion = options.currentVersions ? CMPICurrentVersion : 0;
    table.brokerName = options.name.c_str();
    return table;
}

CMPIBrokerEncFT factoriesFor(const BrokerOptions& options) {
    static const CMPIBrokerEncFT complete = factoryTable();
    CMPIBrokerEncFT table = complete;
    table.ftVersion = tableVersion(options);
    if (!options.level200) {
        table.newCMPIError = nullptr;
        table.openMessageFile = nullptr;
        table.closeMessageFile = nullptr;
        table.getMessage2 = nullptr;
    }
    return table;
}

CMPIBrokerExtFT threadsFor(const BrokerOptions& options) {
    static const CMPIBrokerExtFT complete = threadTable();
    CMPIBrokerExtFT table = complete;
    if (!options.allThreadCalls) {
        table.joinThread = nullptr;
        table.exitThread = nullptr;
        table.cancelThread = nullptr;
        table.threadSleep = nullptr;
        table.signalCondition = nullptr;
    }
    return table;
}

}  // namespace cmpihost
