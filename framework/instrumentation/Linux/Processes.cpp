#include "Processes.h"

#include <algorithm>

#include "Numbers.h"

namespace VA::Linux {

std::optional<Processes> Processes::among(const std::vector<std::string>& namesInProc) {
    Processes processes;
    for (const std::string& name : namesInProc) {
        if (const auto id = parseDecimal(name)) processes.sortedIds_.push_back(*id);
    }
    if (processes.sortedIds_.empty()) return std::nullopt;
    std::sort(processes.sortedIds_.begin(), processes.sortedIds_.end());
    return processes;
}

std::uint32_t Processes::count() const {
    return saturated(sortedIds_.size());
}

bool Processes::contains(std::uint64_t pid) const {
    return std::binary_search(sortedIds_.begin(), sortedIds_.end(), pid);
}

}  // namespace VA::Linux
