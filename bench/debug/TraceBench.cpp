// The cost of asking whether to trace.
//
// disabled_category: TraceEnabled for a category stored with Enabled = false (the master
// passes, the category rejects). enabled_category: a stored, enabled category at a volume
// it accepts. Each runs on one thread and on two at once (/threads:2), for:
//   kelcore        TraceEnabled itself (the cached path);
//   locked_lookup  the same decision made the straightforward way, every test under one
//                  process-wide recursive mutex with a property-list lookup (what
//                  TraceEnabled would cost without its cache);
//   std_mutex      one uncontended std::mutex lock/unlock (each thread its own mutex);
//   atomic_load    one acquire load of an atomic int.
// The target: kelcore's disabled_category within twice std_mutex.
#include <kelcore/config/ClientIdentity.h>
#include <kelcore/debug/Trace.h>
#include <kelcore/proplist/PropList.h>

#include <benchmark/benchmark.h>

#include <atomic>
#include <cstdint>
#include <filesystem>
#include <mutex>
#include <string>

namespace {

namespace kd = kelcore::debug;
using kelcore::UTF8String;

const unsigned char kDisabled[] = "BenchDisabledCategory";
const unsigned char kEnabled[] = "BenchEnabledCategory";

void SetUpDatabase() {
  static const bool done = [] {
    // Never the real home: a preferences directory of the benchmark's own, no file writes.
    const std::string dir =
        (std::filesystem::temp_directory_path() / "kelcore-trace-bench").string();
    kelcore::config::SetClientPrefsDir(kelcore::UTF16String(dir.begin(), dir.end()));
    kd::SetDisableFileWrites(true);
    kd::SetTraceDatabaseFromString(UTF8String(reinterpret_cast<const unsigned char*>(
        "BenchDisabledCategory\t0\t5\nBenchEnabledCategory\t1\t5\n")));
    return true;
  }();
  (void)done;
}

// The decision made under one lock for every test, with the database in a PropList.
class LockedLookup {
 public:
  LockedLookup() {
    for (const unsigned char* name : {kDisabled, kEnabled}) {
      auto* record = database_.NewSubList(UTF8String(name));
      record->SetValue(Key("Enabled"), name == kEnabled);
      record->SetValue(Key("Volume"), std::int32_t{5});
    }
  }
  bool Enabled(const unsigned char* category, long volume) {
    std::lock_guard<std::recursive_mutex> hold(lock_);
    if (underWay_) return false;
    underWay_ = true;
    bool result = false;
    if (masterEnabled_ && volume <= masterVolume_) {
      bool enabled = true;
      std::int32_t categoryVolume = 5;
      if (const auto* record = database_.GetSubList(UTF8String(category))) {
        record->GetValue(enabledKey_, enabled);
        record->GetValue(volumeKey_, categoryVolume);
      }
      result = enabled && volume <= categoryVolume;
    }
    underWay_ = false;
    return result;
  }

 private:
  static UTF8String Key(const char* text) {
    return UTF8String(reinterpret_cast<const unsigned char*>(text));
  }
  std::recursive_mutex lock_;
  kelcore::proplist::PropList database_;
  const UTF8String enabledKey_ = Key("Enabled");
  const UTF8String volumeKey_ = Key("Volume");
  bool underWay_ = false;
  bool masterEnabled_ = true;
  long masterVolume_ = 10;
};

LockedLookup& Locked() {
  static LockedLookup locked;
  return locked;
}

void Kelcore(benchmark::State& state, const unsigned char* category) {
  SetUpDatabase();
  for (auto _ : state) benchmark::DoNotOptimize(kd::TraceEnabled(category, 3, false));
}

void LockedLookupLoop(benchmark::State& state, const unsigned char* category) {
  for (auto _ : state) benchmark::DoNotOptimize(Locked().Enabled(category, 3));
}

void StdMutex(benchmark::State& state) {
  std::mutex mutex;  // one per thread: uncontended
  for (auto _ : state) {
    mutex.lock();
    benchmark::ClobberMemory();
    mutex.unlock();
  }
}

std::atomic<int> flag{1};

void AtomicLoad(benchmark::State& state) {
  for (auto _ : state) benchmark::DoNotOptimize(flag.load(std::memory_order_acquire));
}

void Register(const char* figure, const unsigned char* category) {
  const std::string name(figure);
  for (int threads : {1, 2}) {
    benchmark::RegisterBenchmark((name + "@kelcore").c_str(), Kelcore, category)->Threads(threads);
    benchmark::RegisterBenchmark((name + "@locked_lookup").c_str(), LockedLookupLoop, category)
        ->Threads(threads);
    benchmark::RegisterBenchmark((name + "@std_mutex").c_str(), StdMutex)->Threads(threads);
    benchmark::RegisterBenchmark((name + "@atomic_load").c_str(), AtomicLoad)->Threads(threads);
  }
}

const bool registered = [] {
  Register("disabled_category", kDisabled);
  Register("enabled_category", kEnabled);
  return true;
}();

}  // namespace
