#include "SystemLogSink.h"

#include "RecordLine.h"

namespace ZBLog {

void SystemLogSink::write(const Record& record) noexcept {
    LineBuffer line;
    formatForSystemLog(line, record);
    surroundings_.writeSystemLog(systemLogPriority(record), line.nulTerminated());
}

}  // namespace ZBLog
