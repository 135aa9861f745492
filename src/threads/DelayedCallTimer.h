// DelayedCallTimer: the thread pool's timer. One thread keeps the pool's delayed calls
// in a min-heap by due time and hands each call to the pool's workers when it falls
// due, so that a waiting call never occupies a worker. The timer thread runs no client
// code: it only moves calls (and runs the pool's own periodic worker check).
//
// Calls due at the same time are delivered in the order they were scheduled. A call is
// never delivered before its due time on the timer's clock; how late it is depends on
// the operating system's timer resolution and on how busy the machine is.
//
// The thread starts with the first Schedule or ArmWorkerCheck. All operations may be
// called from any thread. The destructor stops and joins the thread and destroys the
// calls still pending.
#pragma once

#include <kelcore/utility/SmallBlockAllocator.h>

#include "threads/Clock.h"
#include "threads/FunctionItems.h"

#include <atomic>
#include <cstdint>
#include <mutex>
#include <thread>

namespace kelcore::threads::detail {

class DelayedCallTimer {
 public:
  // Where due calls go. Both run on the timer thread and must not block.
  class Sink {
   public:
    virtual void DeliverDue(PoolFunction* call) = 0;
    // Called ArmWorkerCheck's interval after arming; returns whether to check again
    // after another interval.
    virtual bool CheckWorkers() = 0;

   protected:
    ~Sink() = default;
  };

  DelayedCallTimer(Clock& clock, Sink& sink);
  ~DelayedCallTimer();
  DelayedCallTimer(const DelayedCallTimer&) = delete;
  DelayedCallTimer& operator=(const DelayedCallTimer&) = delete;

  // Takes ownership of `call` and delivers it `delayMicroseconds` from now. Throws
  // std::bad_alloc (the call is then destroyed) or std::system_error when the timer
  // thread cannot be started.
  void Schedule(PoolFunction* call, std::int64_t delayMicroseconds);
  // Destroys every pending call that carries this cancellation flag.
  void Cancel(const std::atomic<int>* flag);
  // Makes the timer call the sink's CheckWorkers `intervalMicroseconds` (real time)
  // from now, unless a check is armed already.
  void ArmWorkerCheck(std::int64_t intervalMicroseconds);
  // For a clock moved by hand: look at it again now.
  void ClockChanged() noexcept;

  std::size_t PendingCount();

 private:
  struct Entry {
    std::int64_t due;
    std::uint64_t order;
    PoolFunction* call;
  };
  // Orders the heap so that the front is the earliest entry (earliest scheduled first).
  struct Later {
    bool operator()(const Entry& a, const Entry& b) const noexcept {
      return a.due != b.due ? a.due > b.due : a.order > b.order;
    }
  };

  void StartLocked();
  void Wake() noexcept;
  void ThreadMain();

  Clock& clock_;
  Sink& sink_;
  std::mutex mutex_;  // guards everything below except the wake word
  utility::SmallBlockAllocator::vector<Entry> heap_;
  std::uint64_t nextOrder_ = 0;
  std::int64_t checkDue_ = -1;  // real-time microseconds of the armed worker check
  std::int64_t checkInterval_ = 0;
  bool stopping_ = false;
  std::thread thread_;
  std::atomic<std::uint32_t> wakeWord_{0};
};

}  // namespace kelcore::threads::detail
