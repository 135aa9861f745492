// The trace manager: the process's trace database, its master cache and counters, all
// under one recursive lock, with the lock-free decision cache in front of TraceEnabled.
// The public functions of <kelcore/debug/Trace.h> forward here.
#pragma once

#include "debug/TraceDatabaseStore.h"
#include "debug/TraceDecisionCache.h"

#include <kelcore/proplist/PropList.h>
#include <kelcore/utility/StringTypes.h>

#include <atomic>
#include <cstdint>
#include <list>
#include <memory>
#include <mutex>

namespace kelcore::debug {

class TraceManager {
 public:
  // The process's manager. Made on first use and never destroyed, so tracing keeps
  // working during static destruction.
  static TraceManager& Get();

  // A manager keeping its database in `store` (the process's manager uses
  // MakeTraceDatabaseFileStore()).
  explicit TraceManager(std::unique_ptr<TraceDatabaseStore> store);
  TraceManager(const TraceManager&) = delete;
  TraceManager& operator=(const TraceManager&) = delete;

  bool Enabled(const unsigned char* category, long volume, bool createIfMissing);
  long GetVolume(const unsigned char* category);
  void SetVolume(const unsigned char* category, long volume);
  long GetMasterVolume();
  void SetMasterVolume(long volume);
  void GetCategories(std::list<UTF8String>& categories);
  void GetAsString(UTF8String& text);
  void SetFromString(const UTF8String& text);
  int ChangeCount() const noexcept { return changeCount_.load(std::memory_order_acquire); }
  void Shutdown();
  bool FileWritesDisabled() const;
  void SetFileWritesDisabled(bool disabled);

 private:
  struct CategoryValues {
    bool stored;
    bool enabled;
    std::int32_t volume;
  };

  // Everything below runs under lock_.
  bool EnabledLocked(const unsigned char* category, long volume, bool createIfMissing);
  proplist::PropList& Database();
  void FillMasterCache();
  CategoryValues Lookup(const UTF8String& name, bool createIfMissing);
  // Counts a change, replaces the category's record and saves the file.
  void StoreCategory(const UTF8String& name, bool enabled, std::int32_t volume);
  void MergeText(const UTF8String& text);
  void Save();
  // Invalidates every cached decision; called after each change a decision depends on.
  void RaiseEpoch() { epoch_.fetch_add(1, std::memory_order_release); }

  mutable std::recursive_mutex lock_;
  const std::unique_ptr<TraceDatabaseStore> store_;
  std::unique_ptr<proplist::PropList> database_;
  bool masterCached_ = false;
  bool masterEnabled_ = true;
  std::int32_t masterVolume_ = 10;
  std::atomic<int> changeCount_{0};
  bool fileWritesDisabled_ = false;
  // The re-entrancy flag: set while a locked TraceEnabled test runs. Written under the
  // lock; read without it by the fast path, where only the thread that set it must see
  // it set (program order guarantees that) and any other thread may (it then takes the
  // locked path and waits).
  std::atomic<bool> testUnderWay_{false};
  std::atomic<std::uint64_t> epoch_{1};
  TraceDecisionCache cache_;
};

}  // namespace kelcore::debug
