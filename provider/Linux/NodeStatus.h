#ifndef OSSTATUS_LINUX_NODE_STATUS_H
#define OSSTATUS_LINUX_NODE_STATUS_H

#include <algorithm>
#include <iterator>

namespace VA::OSStatusProvider {

/// What the status codes from `first` to `last` mean in the CIM value maps.
struct NodeStatus {
    unsigned int first;
    unsigned int last;
    unsigned short enabledState;
    unsigned short healthState;
    unsigned short operationalStatus[2];
    unsigned int operationalStatusCount;
};

/// The meaning of a status code.
inline const NodeStatus& meaningOf(unsigned int code) {
    static constexpr NodeStatus statuses[] = {
        {0, 0, 0, 0, {0}, 1},        // Unknown
        {1, 1, 2, 5, {2, 11}, 2},    // Enabled; OK; OK, In Service
        {2, 2, 10, 0, {0}, 1},       // Starting
        {8, 8, 9, 0, {0}, 1},        // Quiesce
        {9, 9, 10, 0, {0}, 1},       // Starting
        {12, 12, 6, 0, {0}, 1},      // Enabled but Offline
        {16, 16, 3, 0, {0}, 1},      // Disabled
        {20, 20, 5, 10, {3, 5}, 2},  // Not Applicable; Degraded/Warning; Degraded, Predictive
                                     // Failure
        {21, 26, 5, 10, {3}, 1},     // Not Applicable; Degraded/Warning; Degraded
    };
    static constexpr NodeStatus other = {0, 0xFFFFFFFF, 5, 0, {0}, 1};  // Not Applicable
    const auto* row = std::find_if(
        std::begin(statuses), std::end(statuses),
        [code](const NodeStatus& status) { return status.first <= code && code <= status.last; });
    return row == std::end(statuses) ? other : *row;
}

}  // namespace VA::OSStatusProvider

#endif
