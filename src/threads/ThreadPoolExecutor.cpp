#include "threads/ThreadPoolExecutor.h"

#include <boost/make_shared.hpp>

namespace kelcore::threads::detail {

ThreadPoolExecutor::ThreadPoolExecutor(ThreadPool& pool, int threadCount, bool longFunctions)
    : pool_(pool),
      cancelled_(boost::make_shared<std::atomic<int>>(0)),
      threadCount_(threadCount),
      longFunctions_(longFunctions) {}

ThreadPoolExecutor::~ThreadPoolExecutor() {
  cancelled_->store(1, std::memory_order_release);
  pool_.CancelDelayed(cancelled_.get());
}

bool ThreadPoolExecutor::CallAsynchronously(const boost::function<void()>& fn,
                                            unsigned int delayMilliseconds) {
  if (fn.empty()) return false;
  auto* call = new PoolFunction(fn, longFunctions_);
  if (delayMilliseconds == 0) {
    pool_.Post(call);
  } else {
    call->cancelled = cancelled_;
    pool_.PostDelayed(call, static_cast<std::int64_t>(delayMilliseconds) * 1000);
  }
  return true;
}

}  // namespace kelcore::threads::detail
