// ConditionVariable: waits on a RecursiveMutex held through a scoped locker.
//
// Wait atomically releases the locker's mutex (which the caller must hold exactly once:
// a recursively held mutex is released one level only, so other threads could not take
// it), sleeps until woken and re-acquires it. There is no time-out. Spurious wake-ups
// are possible: callers loop on their own predicate. Waiting with a ScopedTryLock that
// did not get the lock is reported through the assert facility and returns at once (as
// a spurious wake-up). WakeOne and WakeAll may be called with or without the mutex held;
// a wake with no waiter is lost. The condition variable comes from a process-wide
// lock-free pool (emptied at exit); the constructor throws std::bad_alloc when none can
// be had.
#pragma once

#include <kelcore/Export.h>
#include <kelcore/threads/RecursiveMutex.h>

namespace kelcore::threads {

class KELCORE_API ConditionVariable {
 public:
  ConditionVariable();
  ~ConditionVariable();
  ConditionVariable(const ConditionVariable&) = delete;
  ConditionVariable& operator=(const ConditionVariable&) = delete;

  void Wait(const RecursiveMutex::ScopedLock& lock) const;
  void Wait(const RecursiveMutex::ScopedTryLock& lock) const;
  void WakeOne() const;
  void WakeAll() const;

  struct Node;

 private:
  Node* node_;
};

}  // namespace kelcore::threads
