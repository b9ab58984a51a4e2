#include "SystemState.h"

namespace VA::Linux {

unsigned int nodeStatusOf(std::string_view systemState) {
    struct Row {
        std::string_view state;
        unsigned int status;
    };
    constexpr Row rows[] = {
        {"running", 1},     {"initializing", 2}, {"starting", 2}, {"degraded", 21},
        {"maintenance", 8}, {"stopping", 16},    {"offline", 12},
    };
    for (const Row& row : rows) {
        if (row.state == systemState) return row.status;
    }
    return 0;
}

}  // namespace VA::Linux
