// The tables of a broker, cut to its options. Internal.
#pragma once

#include "host/broker/BrokerOptions.h"

#include <cmpi/cmpift.h>

namespace cmpihost {

/// The shape of the object tables: TableShape bits.
std::size_t shapeOf(const BrokerOptions& options) noexcept;

/// `options` outlives the table, which points to its name.
CMPIBrokerFT upcallsFor(const BrokerOptions& options);
CMPIBrokerEncFT factoriesFor(const BrokerOptions& options);
CMPIBrokerExtFT threadsFor(const BrokerOptions& options);

/// The complete tables.
CMPIBrokerFT upcallTable();
CMPIBrokerEncFT factoryTable();
CMPIBrokerExtFT threadTable();
CMPIBrokerMemFT memoryTable();

}  // namespace cmpihost
