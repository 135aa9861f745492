// The code profiler: CodeProfiler times one section into a ProfileDataLog, and the
// process-wide CodeProfilerManager owns the logs by name and dumps them.
//
//   static auto log = CodeProfilerManager::Get().CreateNewProfileDataLog("Decode", 5);
//   { CodeProfiler timer(log); Decode(); }   // one section, timed into "Decode"
//
// A CodeProfiler costs two reads of HighPrecisionTime's clock and one AddTime; it never
// allocates. It belongs to one thread; its log may be shared by many.
//
// The manager stores the profiling volume (initially kDefaultVolume) and the
// conditional-profiling switch (initially the developer switch "CodeProfiler_AutoStart"
// of the DebugDatabase, off when absent); it does not act on them. Client code consults
// them before it creates profilers.
//
// Dump line, one per log with at least one section, in name order (byte order), numbers
// formatted as a default std::ostream in the classic locale formats them (6 significant
// digits), times in seconds:
//   "---Profile data log dump.  <ID> - Total calls: <n>   Total time: <t>   Average time:
//   <a>   Longest time: <l>   Shortest time: <s>\n"     (one line; wrapped here)
//
// Threads: every manager member may be called from any thread; the map is under the
// manager's mutex, the volume and the switch are atomics (relaxed: they are independent
// settings).
#pragma once

#include <kelcore/Export.h>
#include <kelcore/debug/ProfileDataLog.h>

#include <boost/intrusive_ptr.hpp>

#include <atomic>
#include <cstdint>
#include <functional>
#include <map>
#include <mutex>
#include <string>

namespace kelcore::debug {

class KELCORE_API CodeProfiler {
 public:
  // Starts timing into `log`; an empty pointer gives a profiler that does nothing.
  explicit CodeProfiler(boost::intrusive_ptr<ProfileDataLog> log);
  // Adds the time since the start to the log and lets the log go; later calls do
  // nothing.
  void StopProfiling();
  ~CodeProfiler() { StopProfiling(); }
  CodeProfiler(const CodeProfiler&) = delete;
  CodeProfiler& operator=(const CodeProfiler&) = delete;

 private:
  boost::intrusive_ptr<ProfileDataLog> log_;
  std::uint64_t start_ = 0;
};

class KELCORE_API CodeProfilerManager {
 public:
  static constexpr long kDefaultVolume = 5;
  using LogMap = std::map<std::string, boost::intrusive_ptr<ProfileDataLog>>;

  // The process's manager, made on first use (thread-safe); lives until exit.
  static CodeProfilerManager& Get();

  // The log named `id`, made with `volume` if there is none (an existing log keeps its
  // own volume). A null `id` names the log "".
  boost::intrusive_ptr<ProfileDataLog> CreateNewProfileDataLog(char const* id, long volume);
  // The log named `id`, or an empty pointer.
  boost::intrusive_ptr<ProfileDataLog> GetProfileDataLog(char const* id);
  // Replaces `logs` with every log by name.
  void GetAllProfileDataLogs(LogMap& logs);

  // Writes the dump lines (see above) to the debugger's output (DebugTrace).
  void DumpProfilingDataToDebugOut();
  // Hands each dump line to `write`, under the manager's mutex (so `write` must not call
  // the manager). Exceptions from `write` reach the caller.
  void DumpProfilingData(const std::function<void(const std::string& line)>& write);
  // The dump line of one log (even one without sections).
  static std::string FormatDumpLine(const ProfileDataLog& log);

  long GetProfilingVolume() const noexcept { return volume_.load(std::memory_order_relaxed); }
  void SetProfilingVolume(long volume) noexcept {
    volume_.store(volume, std::memory_order_relaxed);
  }
  bool IsConditionalProfiling() const noexcept {
    return conditional_.load(std::memory_order_relaxed);
  }
  void SetIsConditionalProfiling(bool on) noexcept {
    conditional_.store(on, std::memory_order_relaxed);
  }

  CodeProfilerManager(const CodeProfilerManager&) = delete;
  CodeProfilerManager& operator=(const CodeProfilerManager&) = delete;

 private:
  CodeProfilerManager();

  std::mutex lock_;
  LogMap logs_;
  std::atomic<bool> conditional_{false};
  std::atomic<long> volume_{kDefaultVolume};
};

}  // namespace kelcore::debug
