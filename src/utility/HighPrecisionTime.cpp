#include <kelcore/utility/HighPrecisionTime.h>

#include "HighPrecisionTimeConversion.h"

#if defined(_WIN32)
#include "win/HighPrecisionCounter.inc"
#else
#include "posix/HighPrecisionCounter.inc"
#endif

namespace kelcore::utility {

namespace {

struct CounterState {
  std::uint32_t ticksPerSecond;
  double frequency;
};

// Read once: when the library is loaded (kLoadedState), or earlier when a caller runs
// during static initialisation.
const CounterState& State() {
  static const CounterState state = [] {
    const std::uint64_t frequency = ReadCounterFrequency();
    return CounterState{static_cast<std::uint32_t>(frequency), static_cast<double>(frequency)};
  }();
  return state;
}
[[maybe_unused]] const CounterState& kLoadedState = State();

}  // namespace

std::uint64_t HighPrecisionTime::GetTickCount() {
  return ReadCounter();
}

double HighPrecisionTime::GetFrequency() {
  return State().frequency;
}

std::uint64_t HighPrecisionTime::GetMinimumDelta() {
  return 1;
}

std::int64_t HighPrecisionTime::ConvertToNanos(std::uint64_t ticks) {
  return detail::TicksToNanos(ticks, State().ticksPerSecond);
}

std::uint64_t HighPrecisionTime::ConvertFromNanos(std::int64_t nanos) {
  return detail::NanosToTicks(nanos, State().ticksPerSecond);
}

std::int64_t HighPrecisionTime::GetCurrentTimeInNanos() {
  return ConvertToNanos(GetTickCount());
}

std::int64_t HighPrecisionTime::HostDeltaToNanos(std::uint64_t from, std::uint64_t to) {
  return from <= to ? ConvertToNanos(to - from) : -ConvertToNanos(from - to);
}

std::int64_t HighPrecisionTime::AbsoluteHostDeltaToNanos(std::uint64_t a, std::uint64_t b) {
  return ConvertToNanos(a <= b ? b - a : a - b);
}

double HighPrecisionTime::ConvertNanosToSeconds(std::int64_t nanos) {
  return static_cast<double>(nanos) / 1e9;
}

double HighPrecisionTime::ConvertNanosToMilliSeconds(std::int64_t nanos) {
  return static_cast<double>(nanos) / 1e6;
}

double HighPrecisionTime::ConvertTimeStampToSeconds(std::uint64_t ticks) {
  return static_cast<double>(ConvertToNanos(ticks)) / 1e9;
}

double HighPrecisionTime::ConvertTimeStampToMilliSeconds(std::uint64_t ticks) {
  return static_cast<double>(ConvertToNanos(ticks)) / 1e6;
}

}  // namespace kelcore::utility
