#include <kelcore/threads/Executors.h>

#include "threads/Clock.h"
#include "threads/ExecutorRegistry.h"
#include "threads/ThreadPool.h"
#include "threads/ThreadPoolExecutor.h"
#include "threads/ThreadedWorkQueue.h"

#include <boost/make_shared.hpp>

#include <cstdint>
#include <stdexcept>
#include <string>

namespace kelcore::threads {
namespace {

// The most workers one threaded work queue may have.
constexpr std::int64_t kMaxQueueThreads = 1024;
// The I/O-bound executor announces this many threads to its sub-executors.
constexpr int kIOBoundThreadCount = 4;

AsyncExecutorPtr CurrentOrNew(boost::weak_ptr<AsyncExecutor>& slot, int threadCount,
                              bool longFunctions) {
  RecursiveMutex::ScopedLock lock(detail::ExecutorRegistryMutex(), "CreateExecutor");
  if (AsyncExecutorPtr current = slot.lock()) return current;
  AsyncExecutorPtr created = boost::make_shared<detail::ThreadPoolExecutor>(
      detail::ThreadPool::Process(), threadCount, longFunctions);
  slot = created;
  return created;
}

AsyncExecutorPtr Current(const boost::weak_ptr<AsyncExecutor>& slot) {
  RecursiveMutex::ScopedLock lock(detail::ExecutorRegistryMutex(), "GetExecutor");
  return slot.lock();
}

void SetIfNoneAlive(boost::weak_ptr<AsyncExecutor>& slot, const AsyncExecutorPtr& executor) {
  RecursiveMutex::ScopedLock lock(detail::ExecutorRegistryMutex(), "SetExecutor");
  if (slot.expired()) slot = executor;
}

}  // namespace

AsyncExecutorPtr CreateCPUBoundExecutor() {
  return CurrentOrNew(detail::CPUBoundExecutorSlot(), CPUCount(), false);
}

AsyncExecutorPtr CreateIOBoundExecutor() {
  return CurrentOrNew(detail::IOBoundExecutorSlot(), kIOBoundThreadCount, true);
}

AsyncExecutorPtr GetCPUBoundExecutor() {
  return Current(detail::CPUBoundExecutorSlot());
}

AsyncExecutorPtr GetIOBoundExecutor() {
  return Current(detail::IOBoundExecutorSlot());
}

void SetCPUBoundExecutor(const AsyncExecutorPtr& executor) {
  SetIfNoneAlive(detail::CPUBoundExecutorSlot(), executor);
}

void SetIOBoundExecutor(const AsyncExecutorPtr& executor) {
  SetIfNoneAlive(detail::IOBoundExecutorSlot(), executor);
}

AsyncThreadedExecutorPtr CreateAsyncThreadedExecutor(const std::string& name, int threadCount,
                                                     ThreadPriority priority,
                                                     const boost::function<void()>& threadStart,
                                                     const boost::function<void()>& threadEnd) {
  const std::int64_t count =
      threadCount < 0 ? -static_cast<std::int64_t>(threadCount) * CPUCount() : threadCount;
  if (count < 1 || count > kMaxQueueThreads) {
    throw std::invalid_argument("CreateAsyncThreadedExecutor: the thread count " +
                                std::to_string(threadCount) + " gives " + std::to_string(count) +
                                " workers; from 1 to " + std::to_string(kMaxQueueThreads) +
                                " are possible");
  }
  return boost::make_shared<detail::ThreadedWorkQueue>(name, static_cast<int>(count), priority,
                                                       threadStart, threadEnd);
}

}  // namespace kelcore::threads
