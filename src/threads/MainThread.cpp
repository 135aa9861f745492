#include <kelcore/threads/MainThread.h>

#include <kelcore/config/Errors.h>
#include <kelcore/debug/Assert.h>

#include "threads/ExecutorRegistry.h"

namespace kelcore::threads {
namespace {

constexpr const char* kLockLabel = "RegisterCurrentThreadAsMainThread";

}  // namespace

AsyncEventLoopAdaptorPtr RegisterCurrentThreadAsMainThread() {
  // The adaptor is made outside the registry mutex, then recorded unless another
  // registration won meanwhile; strong references are dropped outside the mutex too, so
  // that no adaptor or executor is destroyed under it.
  AsyncEventLoopAdaptorPtr candidate;
  AsyncEventLoopAdaptorPtr ret;
  for (;;) {
    {
      RecursiveMutex::ScopedLock lock(detail::ExecutorRegistryMutex(), kLockLabel);
      ret = detail::MainThreadAdaptorSlot().lock();
      if (!ret && candidate) {
        detail::MainThreadAdaptorSlot() = candidate;
        return candidate;
      }
    }
    if (ret) break;
    candidate = AdaptCurrentEventLoopAsExecutor(true);
  }
  if (ret->IsCurrentThreadExecutorThread()) return ret;
  // Another thread is registered. Reported and raised without the mutex held: the
  // error manager may run any code.
  debug::ReportAssertion("!ret || ret->IsCurrentThreadExecutorThread()",
                         "..\\..\\threads\\src\\SharedThreads", __LINE__,
                         "kelcore::threads::RegisterCurrentThreadAsMainThread");
  config::ThrowError(
      config::kErrorLevelFatal,
      "$$$/kelcore/utility/Error/Contract/InputContractViolation=An input contract violation "
      "has occurred!",
      105, 25, true);
  return AsyncEventLoopAdaptorPtr();
}

AsyncEventLoopAdaptorPtr GetRegisteredMainThread() {
  RecursiveMutex::ScopedLock lock(detail::ExecutorRegistryMutex(), "GetRegisteredMainThread");
  return detail::MainThreadAdaptorSlot().lock();
}

bool CurrentThreadIsMainThread() {
  const AsyncEventLoopAdaptorPtr mainThread = GetRegisteredMainThread();
  return mainThread && mainThread->IsCurrentThreadExecutorThread();
}

void AsyncCallFromMainThread(const boost::function<void()>& fn) {
  if (const AsyncEventLoopAdaptorPtr mainThread = GetRegisteredMainThread()) {
    mainThread->CallAsynchronously(fn, 0);
  }
}

}  // namespace kelcore::threads
