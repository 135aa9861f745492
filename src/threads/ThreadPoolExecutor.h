// ThreadPoolExecutor: an executor over the library's thread pool; the CPU-bound and
// I/O-bound executors are of this kind.
//
// Calls without delay go straight to the pool's workers (the I/O set when the executor
// is for long functions); delayed calls wait on the pool's timer, never on a worker.
// GetThreadCount returns the count given at construction: it informs sub-executors and
// does not limit the pool. Terminate does nothing and IsTerminated is always false.
// Destroying the executor sets its shared cancellation flag: its delayed calls that are
// still pending are destroyed unrun (at once, or when they fall due if they are already
// on their way to a worker); calls queued without delay still run.
#pragma once

#include <kelcore/threads/AsyncExecutor.h>

#include "threads/ThreadPool.h"

#include <boost/shared_ptr.hpp>

#include <atomic>

namespace kelcore::threads::detail {

class ThreadPoolExecutor final : public AsyncExecutor {
 public:
  ThreadPoolExecutor(ThreadPool& pool, int threadCount, bool longFunctions);
  ~ThreadPoolExecutor() override;

  bool CallAsynchronously(const boost::function<void()>& fn,
                          unsigned int delayMilliseconds) override;
  int GetThreadCount() const override { return threadCount_; }
  void Terminate() override {}
  bool IsTerminated() const override { return false; }

 private:
  ThreadPool& pool_;
  const boost::shared_ptr<std::atomic<int>> cancelled_;  // 0 = live, 1 = destroyed
  const int threadCount_;
  const bool longFunctions_;
};

}  // namespace kelcore::threads::detail
