// The system's high-resolution monotonic counter and conversions between its ticks and
// nanoseconds.
//
// The frequency is read once, when the library is loaded. On Linux the counter is
// CLOCK_MONOTONIC in nanoseconds (frequency 1000000000). Only the low 32 bits of the
// frequency serve as the ticks-per-second value of the conversions; this is deliberate and
// kept, so that every platform converts the same way.
//
// Conversions run in doubles: ticks / ticks-per-second * 1e9, and nanos / 1e9 *
// ticks-per-second, then truncated toward zero. A result outside the target type
// saturates: ConvertToNanos gives at most INT64_MAX; ConvertFromNanos gives 0 for negative
// input and at most UINT64_MAX. Doubles carry 53 bits, so tick counts above 2^53 lose
// their lowest bits.
//
// All functions are static, keep no mutable state and may be called from any thread.
#pragma once

#include <kelcore/Export.h>

#include <cstdint>

namespace kelcore::utility {

class KELCORE_API HighPrecisionTime {
 public:
  HighPrecisionTime() = delete;

  // The current counter value in ticks.
  static std::uint64_t GetTickCount();
  // The counter's full frequency in ticks per second.
  static double GetFrequency();
  // The smallest tick difference the counter reports: 1.
  static std::uint64_t GetMinimumDelta();

  static std::int64_t ConvertToNanos(std::uint64_t ticks);
  static std::uint64_t ConvertFromNanos(std::int64_t nanos);
  // ConvertToNanos(GetTickCount()).
  static std::int64_t GetCurrentTimeInNanos();
  // The signed time from tick `from` to tick `to`: +ConvertToNanos(to - from) when
  // from <= to, else -ConvertToNanos(from - to). So HostDeltaToNanos(a, b) ==
  // -HostDeltaToNanos(b, a).
  static std::int64_t HostDeltaToNanos(std::uint64_t from, std::uint64_t to);
  // ConvertToNanos of the absolute difference; never negative.
  static std::int64_t AbsoluteHostDeltaToNanos(std::uint64_t a, std::uint64_t b);

  static double ConvertNanosToSeconds(std::int64_t nanos);            // nanos / 1e9
  static double ConvertNanosToMilliSeconds(std::int64_t nanos);       // nanos / 1e6
  static double ConvertTimeStampToSeconds(std::uint64_t ticks);       // ConvertToNanos / 1e9
  static double ConvertTimeStampToMilliSeconds(std::uint64_t ticks);  // ConvertToNanos / 1e6
};

}  // namespace kelcore::utility
