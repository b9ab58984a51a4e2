#ifndef VA_LINUX_PROCESSES_H
#define VA_LINUX_PROCESSES_H

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

namespace VA::Linux {

/// The processes that proc lists.
class Processes {
  public:
    /// Picks the folders of processes, the all-digit names, from the names in proc. Nothing where
    /// there are none: a host has at least the process that asks.
    static std::optional<Processes> among(const std::vector<std::string>& namesInProc);

    std::uint32_t count() const;
    bool contains(std::uint64_t pid) const;

  private:
    std::vector<std::uint64_t> sortedIds_;
};

}  // namespace VA::Linux

#endif
