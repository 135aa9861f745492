// ProfileDataLog: a named log that accumulates the number and durations of timed
// sections (see CodeProfiler), in ticks of HighPrecisionTime.
//
// Shared through boost::intrusive_ptr (the count lives in RefCountedObject).
//
// Threads. Any thread may add to and read a log. Only the count is updated atomically:
// concurrent AddTime calls may lose an addition to the total or an update of the
// shortest or longest time, which a profiler accepts. Those three are relaxed atomics,
// so such losses are the only effect (no torn values). Readers get each figure as some
// thread last stored it; the figures of one GetProfileData call may be from different
// moments while other threads add.
#pragma once

#include <kelcore/Export.h>
#include <kelcore/utility/RefCountedObject.h>

#include <boost/intrusive_ptr.hpp>

#include <atomic>
#include <cstdint>
#include <string>

namespace kelcore::debug {

class KELCORE_API ProfileDataLog : public utility::RefCountedObject {
 public:
  // Figures in seconds. With no section logged, every time is 0.0.
  struct ProfileData {
    long numLogs = 0;
    double totalTime = 0.0;
    double averageTime = 0.0;
    double longestTime = 0.0;
    double shortestTime = 0.0;
  };

  // A null `id` gives an empty name.
  ProfileDataLog(char const* id, long volume);
  ~ProfileDataLog() override;
  ProfileDataLog(const ProfileDataLog&) = delete;
  ProfileDataLog& operator=(const ProfileDataLog&) = delete;

  // Counts one section of `ticks` ticks.
  void AddTime(unsigned long long ticks) noexcept {
    numLogs_.fetch_add(1, std::memory_order_relaxed);
    totalTicks_.store(totalTicks_.load(std::memory_order_relaxed) + ticks,
                      std::memory_order_relaxed);
    if (ticks < shortestTicks_.load(std::memory_order_relaxed)) {
      shortestTicks_.store(ticks, std::memory_order_relaxed);
    }
    if (ticks > longestTicks_.load(std::memory_order_relaxed)) {
      longestTicks_.store(ticks, std::memory_order_relaxed);
    }
  }
  // Back to no sections.
  void ClearAllData() noexcept;

  // The average, longest and shortest times are those of the integer tick values
  // (total / count, integer division), converted to seconds.
  ProfileData GetProfileData() const;
  double GetAverageTime() const;
  double GetLongestTime() const;
  double GetShortestTime() const;
  double GetTotalTime() const;
  long GetNumLogs() const noexcept { return numLogs_.load(std::memory_order_relaxed); }
  std::string const& GetID() const noexcept { return id_; }
  long GetVolume() const noexcept { return volume_; }

 private:
  static constexpr std::uint64_t kNoShortest = ~std::uint64_t{0};

  std::string id_;
  long volume_;
  std::atomic<std::uint64_t> totalTicks_{0};
  std::atomic<long> numLogs_{0};
  std::atomic<std::uint64_t> shortestTicks_{kNoShortest};
  std::atomic<std::uint64_t> longestTicks_{0};
};

}  // namespace kelcore::debug
