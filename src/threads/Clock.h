// Clock: the time scale on which delayed calls fall due.
//
// The executors read due times from a Clock so that tests can put a clock of their own
// in place of the real one and order delayed calls without sleeping. A clock that real
// time does not move (AdvancesByItself() false) is never waited on with a time-out:
// whoever moves it tells the executor, which then looks at it again.
#pragma once

#include <cstdint>

namespace kelcore::threads::detail {

class Clock {
 public:
  virtual ~Clock() = default;
  // Microseconds on a monotonic scale with an arbitrary origin.
  virtual std::int64_t NowMicroseconds() const = 0;
  virtual bool AdvancesByItself() const { return true; }

  // How long to sleep in real time for a deadline `untilDue` microseconds away on this
  // clock: `untilDue` itself (at least 0) for a real clock; no limit (-1) otherwise.
  std::int64_t RealWaitMicroseconds(std::int64_t untilDue) const {
    if (!AdvancesByItself()) return -1;
    return untilDue < 0 ? 0 : untilDue;
  }
};

// The process's monotonic clock.
Clock& SteadyClock();

}  // namespace kelcore::threads::detail
