// SubExecutor: the executor object handed to clients for a sub-executor, a facade over
// the shared SubExecutorImpl. The implementation lives on while starts it handed to
// the parent are pending; destroying the last facade drops the delayed functions not
// yet due, and the functions already queued still run.
#pragma once

#include <kelcore/threads/AsyncExecutor.h>

#include "threads/SubExecutorImpl.h"

#include <boost/shared_ptr.hpp>

namespace kelcore::threads::detail {

class SubExecutor final : public AsyncThreadedExecutor {
 public:
  explicit SubExecutor(const boost::shared_ptr<SubExecutorImpl>& impl) : impl_(impl) {}
  ~SubExecutor() override;

  bool CallAsynchronously(const boost::function<void()>& fn,
                          unsigned int delayMilliseconds) override;
  int GetThreadCount() const override;
  void Terminate() override;
  bool IsTerminated() const override;
  bool IsCurrentThreadExecutorThread() const override;
  void Flush() override;
  void Pause() override;
  void Resume() override;
  // Does nothing: a sub-executor's pause holds back its own functions only.
  void WaitWhilePaused() override {}

 private:
  const boost::shared_ptr<SubExecutorImpl> impl_;
};

// The effective concurrency of a sub-executor over a parent of `parentThreads` threads
// for a requested `maxConcurrent`: min(n, t) for n >= 0, t * -n for n < 0 (at most
// INT_MAX); 0 means no sub-executor can be made.
int EffectiveConcurrency(int parentThreads, int maxConcurrent) noexcept;

}  // namespace kelcore::threads::detail
