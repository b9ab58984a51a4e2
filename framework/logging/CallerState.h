#ifndef ZBLOG_CALLER_STATE_H
#define ZBLOG_CALLER_STATE_H

#include <pthread.h>

#include <cerrno>

namespace ZBLog {

/// Leaves a thread as it was found: errno keeps its value, and while this object lives the thread
/// is not cancelled (a cancellation would unwind through code that promises not to throw, with
/// locks held; it takes effect at the thread's next cancellation point instead).
class CallerState {
  public:
    CallerState() noexcept : error_(errno) {
        ::pthread_setcancelstate(PTHREAD_CANCEL_DISABLE, &cancellation_);
    }
    ~CallerState() {
        int ours{};
        ::pthread_setcancelstate(cancellation_, &ours);
        errno = error_;
    }
    CallerState(const CallerState&) = delete;
    CallerState& operator=(const CallerState&) = delete;

  private:
    int error_;
    int cancellation_ = PTHREAD_CANCEL_ENABLE;
};

}  // namespace ZBLog

#endif
