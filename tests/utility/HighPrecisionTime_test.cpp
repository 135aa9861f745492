#include <kelcore/utility/HighPrecisionTime.h>

#include <gtest/gtest.h>

#include <cstdint>
#include <limits>

#include "utility/HighPrecisionTimeConversion.h"

namespace {

using kelcore::utility::HighPrecisionTime;
using kelcore::utility::detail::NanosToTicks;
using kelcore::utility::detail::TicksToNanos;

constexpr std::int64_t kInt64Max = std::numeric_limits<std::int64_t>::max();
constexpr std::uint64_t kUint64Max = std::numeric_limits<std::uint64_t>::max();

// Conversion vectors, worked out by hand from ticks / rate * 1e9 (and back) with
// truncation toward zero.
struct ConversionVector {
  std::uint32_t ticksPerSecond;
  std::uint64_t ticks;
  std::int64_t nanos;
};

const ConversionVector kRoundTrips[] = {
    {10000000, 10000000, 1000000000},  // a 10 MHz counter: one second
    {10000000, 1, 100},
    {1000000000, 123456789, 123456789},
    {3000000, 1, 333},                            // 333.33... truncated
    {3579545, 3579545ull * 3600, 3600000000000},  // an hour on the ACPI timer rate
};

TEST(HighPrecisionTimeTest, ConvertsTicksToNanosAndBack) {
  for (const ConversionVector& vector : kRoundTrips) {
    SCOPED_TRACE(vector.ticksPerSecond);
    EXPECT_EQ(TicksToNanos(vector.ticks, vector.ticksPerSecond), vector.nanos);
  }
  EXPECT_EQ(NanosToTicks(1000000000, 10000000), 10000000u);
  EXPECT_EQ(NanosToTicks(123456789, 1000000000), 123456789u);
  EXPECT_EQ(NanosToTicks(99, 10000000), 0u);  // 0.99 ticks truncated
}

TEST(HighPrecisionTimeTest, ResultsOutsideTheTypeSaturate) {
  EXPECT_EQ(TicksToNanos(kUint64Max, 1000000000), kInt64Max);
  EXPECT_EQ(TicksToNanos(kUint64Max, 1), kInt64Max);
  EXPECT_EQ(TicksToNanos(5, 0), kInt64Max);
  EXPECT_EQ(TicksToNanos(0, 0), 0);
  EXPECT_EQ(NanosToTicks(-5, 1000000000), 0u);
  EXPECT_EQ(NanosToTicks(std::numeric_limits<std::int64_t>::min(), 1000000000), 0u);
  EXPECT_EQ(NanosToTicks(kInt64Max, 4000000000u), kUint64Max);
}

TEST(HighPrecisionTimeTest, LinuxCounterIsNanoseconds) {
  EXPECT_EQ(HighPrecisionTime::GetFrequency(), 1e9);
  EXPECT_EQ(HighPrecisionTime::GetMinimumDelta(), 1u);
  EXPECT_EQ(HighPrecisionTime::ConvertToNanos(987654321), 987654321);
  EXPECT_EQ(HighPrecisionTime::ConvertFromNanos(987654321), 987654321u);
  EXPECT_DOUBLE_EQ(HighPrecisionTime::ConvertTimeStampToSeconds(2500000000), 2.5);
  EXPECT_DOUBLE_EQ(HighPrecisionTime::ConvertTimeStampToMilliSeconds(2500000), 2.5);
  EXPECT_DOUBLE_EQ(HighPrecisionTime::ConvertNanosToSeconds(-1500000000), -1.5);
  EXPECT_DOUBLE_EQ(HighPrecisionTime::ConvertNanosToMilliSeconds(1500000), 1.5);
}

TEST(HighPrecisionTimeTest, DeltasAreSignedAndAbsoluteDeltasAreNot) {
  const std::uint64_t pairs[][2] = {{0, 0}, {10, 2000}, {kUint64Max, 0}, {5, kUint64Max - 1}};
  for (const auto& pair : pairs) {
    const std::int64_t forward = HighPrecisionTime::HostDeltaToNanos(pair[0], pair[1]);
    EXPECT_EQ(forward, -HighPrecisionTime::HostDeltaToNanos(pair[1], pair[0]));
    EXPECT_EQ(HighPrecisionTime::AbsoluteHostDeltaToNanos(pair[0], pair[1]),
              forward < 0 ? -forward : forward);
    EXPECT_GE(HighPrecisionTime::AbsoluteHostDeltaToNanos(pair[1], pair[0]), 0);
  }
  EXPECT_EQ(HighPrecisionTime::HostDeltaToNanos(2000, 10), -1990);
}

TEST(HighPrecisionTimeTest, CounterNeverGoesBack) {
  std::uint64_t previous = HighPrecisionTime::GetTickCount();
  for (int i = 0; i < 1000; ++i) {
    const std::uint64_t now = HighPrecisionTime::GetTickCount();
    ASSERT_GE(now, previous);
    previous = now;
  }
  EXPECT_GE(HighPrecisionTime::GetCurrentTimeInNanos(),
            HighPrecisionTime::ConvertToNanos(previous));
}

}  // namespace
