// Stands in for ZBLog::ZBLogger in a fuzz target: every record is checked, and those that quote
// clients or the host are formatted as lines of a log. A record that breaks a rule is a finding.
#ifndef TESTS_FUZZ_STRICT_LOG_H
#define TESTS_FUZZ_STRICT_LOG_H

#include <cstdint>

namespace fuzz {

/// How many records of a kind came since startRecords(), both channels counted.
struct RecordCounts {
    unsigned entries = 0;   ///< of the marker that opens a request
    unsigned exits = 0;     ///< of the one that closes it
    unsigned messages = 0;  ///< of caught exceptions
    unsigned all = 0;
};

/// Forgets what was counted. `throwFrom`: the number, from 1, of the first record that throws a
/// std::runtime_error out of the log, as every later one then does; 0: none does.
void startRecords(std::uint64_t throwFrom = 0);

RecordCounts countedRecords();

}  // namespace fuzz

#endif
