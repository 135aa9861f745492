#include "threads/ExecutorRegistry.h"

namespace kelcore::threads::detail {
namespace {

struct Registry {
  RecursiveMutex mutex;
  boost::weak_ptr<AsyncExecutor> cpuBound;
  boost::weak_ptr<AsyncExecutor> ioBound;
  boost::weak_ptr<AsyncEventLoopAdaptor> mainThread;
  std::vector<boost::shared_ptr<AsyncThreadedExecutor>> spareTemporaries;
};

Registry& TheRegistry() {
  // Never destroyed: executors may be looked up while the process exits, and the spare
  // executors' threads end with the process.
  static Registry* const registry = new Registry;
  return *registry;
}

}  // namespace

RecursiveMutex& ExecutorRegistryMutex() {
  return TheRegistry().mutex;
}

boost::weak_ptr<AsyncExecutor>& CPUBoundExecutorSlot() {
  return TheRegistry().cpuBound;
}

boost::weak_ptr<AsyncExecutor>& IOBoundExecutorSlot() {
  return TheRegistry().ioBound;
}

boost::weak_ptr<AsyncEventLoopAdaptor>& MainThreadAdaptorSlot() {
  return TheRegistry().mainThread;
}

std::vector<boost::shared_ptr<AsyncThreadedExecutor>>& SpareTemporaryExecutors() {
  return TheRegistry().spareTemporaries;
}

}  // namespace kelcore::threads::detail
