#include "threads/ThreadPool.h"

#include <kelcore/threads/NamedThread.h>

#include <algorithm>

namespace kelcore::threads::detail {
namespace {

// The I/O set keeps at least as many workers as the I/O-bound executor announces, and
// grows by one worker per check interval while its calls are stuck.
constexpr int kIOBaseThreads = 4;
constexpr int kIOMaxThreads = 256;
constexpr std::int64_t kIOIdleMicroseconds = 30 * 1000 * 1000;
constexpr std::int64_t kIOGrowthCheckMicroseconds = 15 * 1000;

}  // namespace

ThreadPool::Configuration ThreadPool::ProcessConfiguration() {
  return Configuration{CPUCount(),
                       WorkerSet::Limits{std::max(kIOBaseThreads, CPUCount()), kIOMaxThreads,
                                         kIOIdleMicroseconds, kIOGrowthCheckMicroseconds}};
}

ThreadPool& ThreadPool::Process() {
  // Never destroyed: its detached threads may run until the process ends.
  static ThreadPool* const pool = new ThreadPool(SteadyClock(), ProcessConfiguration());
  return *pool;
}

ThreadPool::ThreadPool(Clock& clock, const Configuration& configuration)
    : cpu_("kelcore CPU",
           WorkerSet::Limits{configuration.cpuThreads, configuration.cpuThreads, -1, 0}, nullptr),
      io_("kelcore I/O", configuration.io, &timer_),
      timer_(clock, *this) {}

ThreadPool::~ThreadPool() = default;

void ThreadPool::Post(PoolFunction* call) {
  if (call->isLong) {
    io_.Post(call);
  } else {
    cpu_.Post(call);
  }
}

void ThreadPool::PostDelayed(PoolFunction* call, std::int64_t delayMicroseconds) {
  timer_.Schedule(call, delayMicroseconds);
}

void ThreadPool::CancelDelayed(const std::atomic<int>* flag) {
  timer_.Cancel(flag);
}

}  // namespace kelcore::threads::detail
