#ifndef OSSTATUS_LINUX_NODE_STATUS_H
#define OSSTATUS_LINUX_NODE_STATUS_H

namespace VA::OSStatusProvider {

/// What a status code means in the CIM value maps.
struct NodeStatus {
    unsigned short enabledState;
    unsigned short healthState;
    unsigned short operationalStatus[2];
    unsigned int operationalStatusCount;
};

/// The meaning of a status code.
inline const NodeStatus& meaningOf(unsigned int code) {
    static constexpr struct {
        unsigned int first;
        unsigned int last;
        NodeStatus meaning;
    } rows[] = {
        {0, 0, {0, 0, {0}, 1}},        // Unknown
        {1, 1, {2, 5, {2, 11}, 2}},    // Enabled; OK; OK, In Service
        {2, 2, {10, 0, {0}, 1}},       // Starting
        {8, 8, {9, 0, {0}, 1}},        // Quiesce
        {9, 9, {10, 0, {0}, 1}},       // Starting
        {12, 12, {6, 0, {0}, 1}},      // Enabled but Offline
        {16, 16, {3, 0, {0}, 1}},      // Disabled
        {20, 20, {5, 10, {3, 5}, 2}},  // Not Applicable; Degraded/Warning; Degraded, Predictive
                                       // Failure
        {21, 26, {5, 10, {3}, 1}},     // Not Applicable; Degraded/Warning; Degraded
    };
    static constexpr NodeStatus other = {5, 0, {0}, 1};  // Not Applicable
    for (const auto& row : rows)
        if (row.first <= code && code <= row.last) return row.meaning;
    return other;
}

}  // namespace VA::OSStatusProvider

#endif
