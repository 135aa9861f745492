// The cost of raising an error while the thread defers its errors, against the lookup
// it is built on.
//
// With a deferred error reporter alive, ThrowError finds the thread's reporter (one map
// lookup under the manager's recursive mutex), records the error in it and calls the
// manager's DoThrowError, which returns because the error was recorded. The peer is
// that lookup alone: a std::map<uint32_t, ...> with one entry, searched under a
// std::recursive_mutex. The ratio shows what recording and dispatch add to it.
#include <kelcore/config/DefaultErrorManager.h>
#include <kelcore/config/DeferredErrorReporter.h>
#include <kelcore/config/Errors.h>

#include <benchmark/benchmark.h>

#include <cstdint>
#include <map>
#include <mutex>
#include <vector>

namespace {

using namespace kelcore::config;

constexpr const char* kKey =
    "$$$/kelcore/proplist/Error/PropListXMLHandler/VersionGreaterThan=Cannot read PropList "
    "data; version greater than expected.";

// DefaultErrorManager with its reporter lookup open to the benchmark of the lookup alone.
class BenchManager : public DefaultErrorManager {
 public:
  using ErrorManager::GetCurrentErrorReporterForThisThread;
};

void ThrowErrorDeferredKelcore(benchmark::State& state) {
  BenchManager manager;
  ErrorManager::Set(&manager);
  {
    DeferredErrorReporter reporter(false);
    for (auto _ : state) {
      ThrowError(kErrorLevelNonFatal, kKey, 104, 20, true);
    }
    benchmark::DoNotOptimize(reporter.GetErrorCount());
  }
  ErrorManager::Set(nullptr);
}

void ReporterLookupKelcore(benchmark::State& state) {
  BenchManager manager;
  ErrorManager::Set(&manager);
  {
    DeferredErrorReporter reporter(false);
    for (auto _ : state) {
      benchmark::DoNotOptimize(manager.GetCurrentErrorReporterForThisThread());
    }
  }
  ErrorManager::Set(nullptr);
}

// The peer: the same map shape, the same lock, the key already at hand.
void MapLookupUnderLock(benchmark::State& state) {
  std::recursive_mutex mutex;
  std::map<std::uint32_t, std::vector<void*>> map;
  int reporter = 0;
  std::uint32_t key = 4242;
  map[key].push_back(&reporter);
  for (auto _ : state) {
    benchmark::DoNotOptimize(key);
    const std::lock_guard<std::recursive_mutex> lock(mutex);
    const auto found = map.find(key);
    benchmark::DoNotOptimize(found == map.end() ? nullptr : found->second.front());
  }
}

BENCHMARK(ThrowErrorDeferredKelcore)->Name("throw_error_deferred@kelcore");
BENCHMARK(MapLookupUnderLock)->Name("throw_error_deferred@std_map_under_recursive_mutex");
BENCHMARK(ReporterLookupKelcore)->Name("reporter_lookup@kelcore");
BENCHMARK(MapLookupUnderLock)->Name("reporter_lookup@std_map_under_recursive_mutex");

}  // namespace
