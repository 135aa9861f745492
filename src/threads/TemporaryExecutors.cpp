#include <kelcore/threads/Executors.h>

#include "threads/ExecutorRegistry.h"

#include <algorithm>
#include <utility>

namespace kelcore::threads {
namespace {

// At most this many returned executors are kept paused for the next borrowers.
constexpr std::size_t kMaxSpares = 2;

}  // namespace

AsyncThreadedExecutorPtr BorrowTemporarySingleThreadedExecutor() {
  RecursiveMutex::ScopedLock lock(detail::ExecutorRegistryMutex(),
                                  "BorrowTemporarySingleThreadedExecutor");
  auto& spares = detail::SpareTemporaryExecutors();
  if (spares.empty()) {
    return CreateAsyncThreadedExecutor("Temporary Thread", 1, kThreadPriorityNormal, {}, {});
  }
  AsyncThreadedExecutorPtr borrowed = std::move(spares.back());
  spares.pop_back();
  borrowed->Resume();
  return borrowed;
}

void ReturnTemporarySingleThreadedExecutor(const AsyncThreadedExecutorPtr& executor) {
  if (!executor) return;
  // The caller's reference outlives the mutex, so a terminated executor is never
  // destroyed (and its worker joined) under it.
  RecursiveMutex::ScopedLock lock(detail::ExecutorRegistryMutex(),
                                  "ReturnTemporarySingleThreadedExecutor");
  auto& spares = detail::SpareTemporaryExecutors();
  if (std::find(spares.begin(), spares.end(), executor) != spares.end()) return;
  if (spares.size() >= kMaxSpares) {
    executor->Terminate();
  } else {
    executor->Pause();
    spares.push_back(executor);
  }
}

}  // namespace kelcore::threads
