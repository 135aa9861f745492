#include "threads/Clock.h"

#include <chrono>

namespace kelcore::threads::detail {
namespace {

class SteadyClockImpl final : public Clock {
 public:
  std::int64_t NowMicroseconds() const override {
    return std::chrono::duration_cast<std::chrono::microseconds>(
               std::chrono::steady_clock::now().time_since_epoch())
        .count();
  }
};

}  // namespace

Clock& SteadyClock() {
  // Never destroyed: the pool's timer thread may still read it while the process exits.
  static Clock* const clock = new SteadyClockImpl;
  return *clock;
}

}  // namespace kelcore::threads::detail
