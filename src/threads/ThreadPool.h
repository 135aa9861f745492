// ThreadPool: the library's own process-wide thread pool, behind the CPU-bound and
// I/O-bound executors.
//
// It has a fixed set of workers for short, CPU-bound calls (as many as processors), a
// growing set for long calls that may block on I/O, and one timer thread that holds
// the delayed calls in a min-heap and hands each to its worker set when it falls due.
// Threads start on first use; the process's pool is never destroyed (its threads end
// with the process). Pools made for tests are destroyed: the calls already posted run,
// then every worker ends.
#pragma once

#include "threads/Clock.h"
#include "threads/DelayedCallTimer.h"
#include "threads/FunctionItems.h"
#include "threads/WorkerSet.h"

#include <atomic>
#include <cstdint>

namespace kelcore::threads::detail {

class ThreadPool final : private DelayedCallTimer::Sink {
 public:
  struct Configuration {
    int cpuThreads;
    WorkerSet::Limits io;
  };

  // The process pool's configuration on this machine.
  static Configuration ProcessConfiguration();
  // The process's pool, made on first use.
  static ThreadPool& Process();

  ThreadPool(Clock& clock, const Configuration& configuration);
  ~ThreadPool();

  // Take ownership of `call` (destroying it if they throw). Calls with isLong set run
  // on the I/O set. A delayed call runs only if its cancellation flag is still 0 when a
  // worker takes it.
  void Post(PoolFunction* call);
  void PostDelayed(PoolFunction* call, std::int64_t delayMicroseconds);
  // Destroys the pending delayed calls that carry `flag`, which their executor has set.
  void CancelDelayed(const std::atomic<int>* flag);

  DelayedCallTimer& Timer() noexcept { return timer_; }
  const WorkerSet& IOWorkers() const noexcept { return io_; }

 private:
  void DeliverDue(PoolFunction* call) override { Post(call); }
  bool CheckWorkers() override { return io_.CheckGrowth(); }

  WorkerSet cpu_;
  WorkerSet io_;
  DelayedCallTimer timer_;  // last: stopped before the worker sets it feeds
};

}  // namespace kelcore::threads::detail
