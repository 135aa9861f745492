#include <kelcore/threads/RecursiveMutex.h>

#include <kelcore/utility/SmallBlockAllocator.h>

#include "threads/LockFreePool.h"

#if defined(_WIN32)
#include "win/RecursiveMutexNode.inc"
#else
#include "posix/RecursiveMutexNode.inc"
#endif

namespace kelcore::threads {

using RecursiveMutexPool = LockFreePool<RecursiveMutex::Node>;

RecursiveMutex::RecursiveMutex() : node_(RecursiveMutexPool::Take()) {}

RecursiveMutex::~RecursiveMutex() {
  RecursiveMutexPool::Give(node_);
}

void RecursiveMutex::Lock(const char*) const {
  node_->Lock();
}

bool RecursiveMutex::TryLock(const char*) const {
  return node_->TryLock();
}

void RecursiveMutex::Unlock() const {
  node_->Unlock();
}

}  // namespace kelcore::threads
