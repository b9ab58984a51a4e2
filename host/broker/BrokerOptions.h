// How a broker presents itself, so that tests can stand for object managers of several kinds.
#pragma once

#include <cmpi/cmpidt.h>

#include <cstddef>
#include <string>

namespace cmpihost {

/// The default is a complete broker of level 200.
struct BrokerOptions {
    std::string name = "cmpihost";
    /// Off: ftVersion 1 in the tables of objects and factories, brokerVersion 0.
    bool currentVersions = true;
    /// Off: `mft` is null.
    bool memoryTable = true;
    /// Off: the members that level 200 added to a table are null.
    bool level200 = true;
    /// Off: the four qualifier calls of an object path are null; on: they answer
    /// CMPI_RC_ERR_NOT_SUPPORTED.
    bool qualifierCalls = true;
    /// Off: joinThread, exitThread, cancelThread, threadSleep and signalCondition are null.
    bool allThreadCalls = true;
    /// Off: a request's context holds only CMPIInvocationFlags and CMPIPrincipal.
    bool fullContext = true;
    /// Off: key values come back with the state CMPI_goodValue instead of CMPI_keyValue.
    bool keyState = true;
    /// On: newInstance sets the keys of its path as properties.
    bool keysBecomeProperties = false;
    /// The status of a missing key, property, argument or context entry.
    CMPIrc missingItem = CMPI_RC_ERR_NO_SUCH_PROPERTY;
    /// How many shells of ended objects are kept to recognise a late use.
    std::size_t quarantine = 4096;

    /// The poorest broker that providers meet: everything that may be missing is missing.
    static BrokerOptions sparse();
};

}  // namespace cmpihost
