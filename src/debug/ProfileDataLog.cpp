#include <kelcore/debug/ProfileDataLog.h>

#include <kelcore/utility/HighPrecisionTime.h>

namespace kelcore::debug {

namespace {

double TicksToSeconds(std::uint64_t ticks) {
  using utility::HighPrecisionTime;
  return HighPrecisionTime::ConvertNanosToSeconds(HighPrecisionTime::ConvertToNanos(ticks));
}

}  // namespace

ProfileDataLog::ProfileDataLog(char const* id, long volume)
    : id_(id == nullptr ? "" : id), volume_(volume) {}

ProfileDataLog::~ProfileDataLog() = default;

void ProfileDataLog::ClearAllData() noexcept {
  totalTicks_.store(0, std::memory_order_relaxed);
  numLogs_.store(0, std::memory_order_relaxed);
  shortestTicks_.store(kNoShortest, std::memory_order_relaxed);
  longestTicks_.store(0, std::memory_order_relaxed);
}

ProfileDataLog::ProfileData ProfileDataLog::GetProfileData() const {
  ProfileData data;
  data.numLogs = GetNumLogs();
  const std::uint64_t total = totalTicks_.load(std::memory_order_relaxed);
  data.totalTime = TicksToSeconds(total);
  if (data.numLogs != 0) {
    data.averageTime = TicksToSeconds(total / static_cast<std::uint64_t>(data.numLogs));
    data.longestTime = TicksToSeconds(longestTicks_.load(std::memory_order_relaxed));
    data.shortestTime = TicksToSeconds(shortestTicks_.load(std::memory_order_relaxed));
  }
  return data;
}

double ProfileDataLog::GetAverageTime() const {
  return GetProfileData().averageTime;
}
double ProfileDataLog::GetLongestTime() const {
  return GetProfileData().longestTime;
}
double ProfileDataLog::GetShortestTime() const {
  return GetProfileData().shortestTime;
}
double ProfileDataLog::GetTotalTime() const {
  return GetProfileData().totalTime;
}

}  // namespace kelcore::debug
