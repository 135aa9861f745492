// SubExecutorImpl: the shared state of a sub-executor, a throttling and ordering layer
// that runs its functions on a parent executor, at most `maxConcurrent` at a time.
//
// Every function queued without delay gets the next serial number (the first is 1) and
// waits in the ready container; whenever fewer than maxConcurrent of its functions are
// started, the sub-executor hands the parent an "execute next" call, which takes the
// next function (oldest or newest first) and runs it. A parent thread that finishes one
// function goes on with the next one waiting, for up to about a millisecond, before it
// hands the slot back to the parent: the order and the limit are the same, with fewer
// trips through the parent. A serial queue-based sub-executor takes the waiting
// functions in batches under one lock; Pause and Terminate still stop it between two
// functions, and a Flush still returns as soon as its last function has finished. A
// delayed function waits on the parent's timer; when it falls due it runs at once if a
// slot is free, otherwise it joins the ready container.
//
// Flush waits until every serial up to the last one given out has finished (once
// terminated: until no function runs any more, since dropped ones never will); called
// from one of the sub-executor's own functions it returns at once. Pause stops the
// starting of functions; a start that finds the sub-executor paused leaves its function
// queued for Resume. Terminate refuses new work and drops (destroys) the functions
// still queued; running ones finish. A parent that refuses a start has been terminated
// for good: the sub-executor then terminates itself.
//
// An exception escaping a function is passed on to the parent's thread after the
// sub-executor's books are settled, so the parent reports it as its own.
//
// All state is guarded by one recursive mutex, which is never held while a function
// runs; it is held while handing starts to the parent (whose lock comes second).
// Functions are destroyed outside it, except in the destructor and when a call that
// could not be started is taken back.
#pragma once

#include <kelcore/threads/AsyncExecutor.h>
#include <kelcore/threads/Gate.h>
#include <kelcore/threads/RecursiveMutex.h>
#include <kelcore/utility/SmallBlockAllocator.h>

#include "threads/ReadyContainer.h"
#include "threads/RetirementRecord.h"

#include <boost/enable_shared_from_this.hpp>
#include <boost/function.hpp>
#include <boost/shared_ptr.hpp>

#include <atomic>
#include <cstdint>

namespace kelcore::threads::detail {

class SubExecutorImpl : public boost::enable_shared_from_this<SubExecutorImpl> {
 public:
  // `maxConcurrent` is the effective concurrency (>= 1).
  SubExecutorImpl(const boost::shared_ptr<AsyncExecutor>& parent, int maxConcurrent,
                  ReadyOrder order);
  virtual ~SubExecutorImpl();
  SubExecutorImpl(const SubExecutorImpl&) = delete;
  SubExecutorImpl& operator=(const SubExecutorImpl&) = delete;

  bool CallAsynchronously(const boost::function<void()>& fn, unsigned int delayMilliseconds);
  int GetThreadCount() const noexcept { return maxConcurrent_; }
  void Terminate();
  bool IsTerminated() const;
  bool IsCurrentThreadExecutorThread() const noexcept;
  void Flush();
  void Pause();
  void Resume();
  // The last facade is gone: delayed functions not yet due are dropped (queued ones
  // still run).
  void Abandon();

  // The calls handed to the parent: take and run the next ready function; run (or
  // queue) the delayed function with this number.
  void ExecuteNextForParent();
  void DelayedExecuteForParent(std::int64_t number);

 protected:
  // Runs one function; the wrapper kind overrides it.
  virtual void Invoke(const boost::function<void()>& fn) { fn(); }

 private:
  using Item = AllocatedFunctionWithSerialNumber;
  using DelayedMap = utility::SmallBlockAllocator::map<std::int64_t, boost::function<void()>>;
  struct Waiter {
    Gate* gate;
    std::int64_t serial;
  };

  // With the mutex held: hands the parent starts while functions wait, slots are free
  // and the sub-executor is neither paused nor terminated.
  void StartFunctions();
  // With the mutex held: marks `serial` finished and wakes the waiters it satisfies.
  void Retire(std::int64_t serial) noexcept;
  // With the mutex held: whether a Flush that waits for `serial` may return.
  bool FlushSatisfied(std::int64_t serial) const noexcept;
  void WakeSatisfiedWaiters() noexcept;
  // With the mutex held: one slot of running_ is free again.
  void ReleaseSlot() noexcept;
  // With the mutex held: terminated for good; returns the chain of dropped functions.
  Item* TerminateLocked() noexcept;
  // Runs the chain `batch` on this thread (its slot counted in running_), then the
  // functions that wait after it within the time budget; then hands the slot back.
  void RunFromThisThread(Item* batch);
  void WaitUntilRetired(std::int64_t serial);
  // With the mutex held: takes the next functions to run on one slot (a batch of up to
  // kMaxBatch for a serial sub-executor, one otherwise) and makes room to retire them.
  // Null when all ready functions are claimed by pending starts.
  Item* TakeBatchLocked();
  Item* TryTakeBatchLocked() noexcept;  // null instead of std::bad_alloc

  // A serial queue-based sub-executor takes its ready functions in batches under one
  // lock (they then run in serial order).
  static constexpr int kMaxBatch = 128;

  mutable RecursiveMutex mutex_;
  const boost::shared_ptr<AsyncExecutor> parent_;
  const int maxConcurrent_;
  const int batchLimit_;
  // Written under the mutex; a running batch reads them without it.
  std::atomic<bool> paused_{false};
  std::atomic<bool> terminated_{false};
  int running_ = 0;   // slots taken: starts handed to the parent plus functions running
  int starting_ = 0;  // starts handed to the parent that have not taken a function yet
  std::int64_t lastSerial_ = 0;
  ReadyContainer ready_;
  DelayedMap delayed_;
  std::int64_t lastDelayedNumber_ = 0;
  RetirementRecord retired_;  // room reserved for every function taken from ready_
  utility::SmallBlockAllocator::vector<Waiter> waiters_;
  std::atomic<int> waiting_{0};  // waiters_.size(), readable by a running batch
  // The serial of the last function a batch finished (batches only).
  std::atomic<std::int64_t> lastFinished_{0};
  Item* dropped_ = nullptr;  // dropped when the parent refused work; destroyed with this
};

// Runs each function as wrapper(fn), so that a client can set up context per call.
class SubExecutorWithFnWrapperImpl final : public SubExecutorImpl {
 public:
  SubExecutorWithFnWrapperImpl(const boost::shared_ptr<AsyncExecutor>& parent, int maxConcurrent,
                               const boost::function<void(const boost::function<void()>&)>& wrapper)
      : SubExecutorImpl(parent, maxConcurrent, ReadyOrder::kOldestFirst), wrapper_(wrapper) {}

 protected:
  void Invoke(const boost::function<void()>& fn) override { wrapper_(fn); }

 private:
  const boost::function<void(const boost::function<void()>&)> wrapper_;
};

}  // namespace kelcore::threads::detail
