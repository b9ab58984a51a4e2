#ifndef ZBLOG_STANDARD_ERROR_SINK_H
#define ZBLOG_STANDARD_ERROR_SINK_H

#include "LineSink.h"

namespace ZBLog {

/// Writes to the process's standard error, whatever that is at the moment of writing. A pipe or a
/// terminal that nobody takes from is waited for with patience only.
class StandardErrorSink final : public LineSink {
  public:
    explicit StandardErrorSink(Surroundings& surroundings);

  private:
    Output output(bool wait) noexcept override;
};

}  // namespace ZBLog

#endif
