// The cost of timing one section with CodeProfiler: construction (first clock read) and
// StopProfiling (second clock read and AddTime), with the log reference copied in and
// dropped as client code does. Target: under 100 ns.
//   kelcore     CodeProfiler start/stop into a shared ProfileDataLog;
//   clock_pair  two HighPrecisionTime::GetTickCount reads alone (the floor).
#include <kelcore/debug/CodeProfiler.h>
#include <kelcore/utility/HighPrecisionTime.h>

#include <benchmark/benchmark.h>

namespace {

using kelcore::debug::CodeProfiler;
using kelcore::debug::ProfileDataLog;
using kelcore::utility::HighPrecisionTime;

void BM_StartStop(benchmark::State& state) {
  static const boost::intrusive_ptr<ProfileDataLog> log(new ProfileDataLog("bench", 5));
  for (auto _ : state) {
    CodeProfiler profiler(log);
    profiler.StopProfiling();
  }
  benchmark::DoNotOptimize(log->GetNumLogs());
}
BENCHMARK(BM_StartStop)->Name("start_stop@kelcore");

void BM_ClockPair(benchmark::State& state) {
  for (auto _ : state) {
    benchmark::DoNotOptimize(HighPrecisionTime::GetTickCount());
    benchmark::DoNotOptimize(HighPrecisionTime::GetTickCount());
  }
}
BENCHMARK(BM_ClockPair)->Name("start_stop@clock_pair");

}  // namespace
