// Tick/nanosecond conversion for a given 32-bit ticks-per-second value, in doubles,
// truncated toward zero and saturated at the ends of the result type. A ticks-per-second
// value of 0 gives the saturated results (INT64_MAX nanoseconds for a non-zero tick count,
// 0 ticks).
#pragma once

#include <cmath>
#include <cstdint>
#include <limits>

namespace kelcore::utility::detail {

inline constexpr double kNanosPerSecond = 1000000000.0;

inline std::int64_t TicksToNanos(std::uint64_t ticks, std::uint32_t ticksPerSecond) {
  const double nanos = static_cast<double>(ticks) / ticksPerSecond * kNanosPerSecond;
  if (std::isnan(nanos)) return 0;
  // 2^63 is exactly representable; anything at or above it does not fit.
  if (nanos >= 9223372036854775808.0) return std::numeric_limits<std::int64_t>::max();
  return static_cast<std::int64_t>(nanos);
}

inline std::uint64_t NanosToTicks(std::int64_t nanos, std::uint32_t ticksPerSecond) {
  const double ticks = static_cast<double>(nanos) / kNanosPerSecond * ticksPerSecond;
  if (!(ticks > 0.0)) return 0;
  if (ticks >= 18446744073709551616.0) return std::numeric_limits<std::uint64_t>::max();
  return static_cast<std::uint64_t>(ticks);
}

}  // namespace kelcore::utility::detail
