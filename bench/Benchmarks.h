// The groups of benchmarks; docs/benchmarks.md lists what each measures.
#ifndef BENCH_BENCHMARKS_H
#define BENCH_BENCHMARKS_H

#include "bench/Logging.h"
#include "bench/Setting.h"

namespace bench {

/// "request/…": every request of the list, by provider and baseline. "nodes/…": some of them with a
/// growing number of nodes. `setting` outlives the benchmarks.
void addRequestBenchmarks(Setting& setting);

/// "host/…": the parts of the Linux host's snapshot, each from a new one, and whole requests on the
/// real host.
void addHostBenchmarks(Setting& setting);

/// "logging/…": one record, filtered and written. They change the configuration.
void addLoggingBenchmarks(LoggingConfiguration& logging);

}  // namespace bench

#endif
