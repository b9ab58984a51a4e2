// The groups of benchmarks; docs/dev/benchmarks.md lists what each measures.
#ifndef BENCH_BENCHMARKS_H
#define BENCH_BENCHMARKS_H

#include "bench/BenchFixture.h"
#include "bench/Logging.h"

namespace bench {

/// "request/…": every request of the list, by provider and baseline. "nodes/…": some of them with a
/// growing number of nodes. `fixture` outlives the benchmarks.
void addRequestBenchmarks(BenchFixture& fixture);

/// "host/…": the parts of the Linux host's snapshot, each from a new one, and whole requests on the
/// real host.
void addHostBenchmarks(BenchFixture& fixture);

/// "logging/…": one record, filtered and written. They change the configuration.
void addLoggingBenchmarks(LoggingConfiguration& logging);

/// "schema/…": a generated schema of the size of the CIM schema, read and asked.
void addSchemaBenchmarks();

}  // namespace bench

#endif
