// RecursiveMutex: a re-entrant lock with scoped lockers.
//
// The owning thread may lock again and must unlock as often. The name arguments label
// the call site for the caller's benefit and are not used. Locking does not change the
// logical state, so the operations are const. The lock behind a mutex comes from a
// process-wide lock-free pool and goes back to it on destruction (the pool is emptied at
// exit); the constructor throws std::bad_alloc when none can be had. Unlocking a mutex
// the caller does not hold, and destroying a held mutex, are caller errors.
//
// Memory ordering: everything written before an Unlock happens-before whatever the next
// owner does after its Lock or successful TryLock.
#pragma once

#include <kelcore/Export.h>

namespace kelcore::threads {

class KELCORE_API RecursiveMutex {
 public:
  RecursiveMutex();
  ~RecursiveMutex();
  RecursiveMutex(const RecursiveMutex&) = delete;
  RecursiveMutex& operator=(const RecursiveMutex&) = delete;

  void Lock(const char* name = nullptr) const;
  bool TryLock(const char* name = nullptr) const;
  void Unlock() const;

  // Locks in the constructor, unlocks in the destructor.
  class ScopedLock {
   public:
    explicit ScopedLock(const RecursiveMutex& mutex, const char* name = nullptr) : mutex_(&mutex) {
      mutex_->Lock(name);
    }
    ~ScopedLock() { mutex_->Unlock(); }
    ScopedLock(const ScopedLock&) = delete;
    ScopedLock& operator=(const ScopedLock&) = delete;
    const RecursiveMutex& Mutex() const { return *mutex_; }

   private:
    const RecursiveMutex* mutex_;
  };

  // Tries in the constructor; unlocks in the destructor only if it got the lock.
  class ScopedTryLock {
   public:
    explicit ScopedTryLock(const RecursiveMutex& mutex, const char* name = nullptr)
        : mutex_(&mutex), locked_(mutex.TryLock(name)) {}
    ~ScopedTryLock() {
      if (locked_) mutex_->Unlock();
    }
    ScopedTryLock(const ScopedTryLock&) = delete;
    ScopedTryLock& operator=(const ScopedTryLock&) = delete;
    bool IsLocked() const { return locked_; }
    const RecursiveMutex& Mutex() const { return *mutex_; }

   private:
    const RecursiveMutex* mutex_;
    bool locked_;
  };

  struct Node;

 private:
  friend class ConditionVariable;
  Node* node_;
};

}  // namespace kelcore::threads
