#include <kelcore/threads/ConditionVariable.h>

#include <kelcore/debug/Assert.h>
#include <kelcore/utility/SmallBlockAllocator.h>

#include "threads/LockFreePool.h"

#if defined(_WIN32)
#include "win/RecursiveMutexNode.inc"
// The condition variable waits on the mutex node defined above.
#include "win/ConditionVariableNode.inc"
#else
#include "posix/RecursiveMutexNode.inc"
// The condition variable waits on the mutex node defined above.
#include "posix/ConditionVariableNode.inc"
#endif

namespace kelcore::threads {

using ConditionVariablePool = LockFreePool<ConditionVariable::Node>;

ConditionVariable::ConditionVariable() : node_(ConditionVariablePool::Take()) {}

ConditionVariable::~ConditionVariable() {
  ConditionVariablePool::Give(node_);
}

void ConditionVariable::Wait(const RecursiveMutex::ScopedLock& lock) const {
  node_->Wait(*lock.Mutex().node_);
}

void ConditionVariable::Wait(const RecursiveMutex::ScopedTryLock& lock) const {
  // Waiting without the lock would be undefined; returning at once is a spurious wake-up.
  if (!lock.IsLocked()) {
    debug::ReportAssertion("lock.IsLocked()", __FILE__, __LINE__,
                           "kelcore::threads::ConditionVariable::Wait",
                           "waiting with a ScopedTryLock that did not get the lock");
    return;
  }
  node_->Wait(*lock.Mutex().node_);
}

void ConditionVariable::WakeOne() const {
  node_->WakeOne();
}

void ConditionVariable::WakeAll() const {
  node_->WakeAll();
}

}  // namespace kelcore::threads
