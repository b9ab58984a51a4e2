// The figures of a run, as Google Benchmark and callgrind leave them.
#ifndef BENCH_FIGURES_H
#define BENCH_FIGURES_H

#include <map>
#include <string>
#include <vector>

namespace bench {

/// One benchmark: the quickest of its repetitions, and what was counted beside.
struct Figure {
    double nanoseconds = 0;
    std::map<std::string, double> counts{};
};

/// Benchmarks by name, in the order of the list.
class Figures {
  public:
    /// Reads files of Google Benchmark's JSON, as repetitions of one run; throws
    /// std::runtime_error.
    explicit Figures(const std::vector<std::string>& files);

    const std::vector<std::string>& names() const noexcept { return names_; }
    bool has(const std::string& name) const { return figures_.count(name) != 0; }
    /// The benchmark of that name, which must be there.
    const Figure& at(const std::string& name) const { return figures_.at(name); }
    const std::string& machine() const noexcept { return machine_; }

  private:
    void add(const std::string& file);

    std::vector<std::string> names_;
    std::map<std::string, Figure> figures_;
    std::string machine_;
};

/// Instructions a request by name ("EnumerateInstances KORVA_RunningOS/baseline"): lines of the
/// name, a tab and the number. Throws std::runtime_error.
std::map<std::string, double> readInstructions(const std::string& file);

}  // namespace bench

#endif
