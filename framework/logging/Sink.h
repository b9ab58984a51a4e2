#ifndef ZBLOG_SINK_H
#define ZBLOG_SINK_H

#include "Record.h"

namespace ZBLog {

/// Where records end. Any number of threads may write at the same time.
class Sink {
  public:
    Sink() = default;
    virtual ~Sink() = default;
    Sink(const Sink&) = delete;
    Sink& operator=(const Sink&) = delete;

    /// Writes one record. What goes wrong stays inside: a sink never fails its caller.
    virtual void write(const Record& record) noexcept = 0;
};

}  // namespace ZBLog

#endif
