#ifndef ZBLOG_SYSTEM_LOG_SINK_H
#define ZBLOG_SYSTEM_LOG_SINK_H

#include "Sink.h"
#include "Surroundings.h"

namespace ZBLog {

/// Hands records to the system's log (see formatForSystemLog and systemLogPriority).
class SystemLogSink final : public Sink {
  public:
    explicit SystemLogSink(Surroundings& surroundings) : surroundings_(surroundings) {}
    void write(const Record& record) noexcept override;

  private:
    Surroundings& surroundings_;
};

}  // namespace ZBLog

#endif
