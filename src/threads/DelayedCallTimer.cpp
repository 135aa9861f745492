#include "threads/DelayedCallTimer.h"

#include <kelcore/threads/NamedThread.h>

#include "threads/TimerPrecision.h"
#include "threads/WaitWord.h"

#include <algorithm>

namespace kelcore::threads::detail {

DelayedCallTimer::DelayedCallTimer(Clock& clock, Sink& sink) : clock_(clock), sink_(sink) {}

DelayedCallTimer::~DelayedCallTimer() {
  {
    std::lock_guard<std::mutex> lock(mutex_);
    stopping_ = true;
  }
  Wake();
  if (thread_.joinable()) thread_.join();
  for (const Entry& entry : heap_) delete entry.call;
}

void DelayedCallTimer::StartLocked() {
  if (thread_.joinable()) return;
  thread_ =
      CreateNamedThread("kelcore timer", kThreadPriorityNormal, {}, {}, [this] { ThreadMain(); });
}

void DelayedCallTimer::Wake() noexcept {
  wakeWord_.fetch_add(1, std::memory_order_release);
  WakeOneOnWord(wakeWord_);
}

void DelayedCallTimer::Schedule(PoolFunction* call, std::int64_t delayMicroseconds) {
  bool earliest = false;
  try {
    std::lock_guard<std::mutex> lock(mutex_);
    StartLocked();
    heap_.push_back(Entry{clock_.NowMicroseconds() + delayMicroseconds, nextOrder_++, call});
    std::push_heap(heap_.begin(), heap_.end(), Later());
    earliest = heap_.front().call == call;
  } catch (...) {
    delete call;
    throw;
  }
  if (earliest) Wake();
}

void DelayedCallTimer::Cancel(const std::atomic<int>* flag) {
  utility::SmallBlockAllocator::vector<PoolFunction*> cancelled;
  {
    std::lock_guard<std::mutex> lock(mutex_);
    const auto kept = std::partition(heap_.begin(), heap_.end(), [flag](const Entry& entry) {
      return entry.call->cancelled.get() != flag;
    });
    if (kept == heap_.end()) return;
    for (auto it = kept; it != heap_.end(); ++it) cancelled.push_back(it->call);
    heap_.erase(kept, heap_.end());
    std::make_heap(heap_.begin(), heap_.end(), Later());
  }
  // Destroyed outside the lock: a function's destructor is the client's code.
  for (PoolFunction* call : cancelled) delete call;
}

void DelayedCallTimer::ArmWorkerCheck(std::int64_t intervalMicroseconds) {
  {
    std::lock_guard<std::mutex> lock(mutex_);
    if (checkDue_ >= 0) return;
    StartLocked();
    checkInterval_ = intervalMicroseconds;
    checkDue_ = SteadyClock().NowMicroseconds() + intervalMicroseconds;
  }
  Wake();
}

void DelayedCallTimer::ClockChanged() noexcept {
  Wake();
}

std::size_t DelayedCallTimer::PendingCount() {
  std::lock_guard<std::mutex> lock(mutex_);
  return heap_.size();
}

void DelayedCallTimer::ThreadMain() {
  RequestPreciseTimedWaits();
  // Filled under the lock without allocating: at most its capacity per round.
  utility::SmallBlockAllocator::vector<PoolFunction*> due;
  due.reserve(256);
  for (;;) {
    const std::uint32_t key = wakeWord_.load(std::memory_order_acquire);
    std::int64_t timeout = -1;
    bool checkNow = false;
    {
      std::lock_guard<std::mutex> lock(mutex_);
      if (stopping_) return;
      const std::int64_t now = clock_.NowMicroseconds();
      while (!heap_.empty() && heap_.front().due <= now && due.size() < due.capacity()) {
        due.push_back(heap_.front().call);
        std::pop_heap(heap_.begin(), heap_.end(), Later());
        heap_.pop_back();
      }
      if (!heap_.empty()) timeout = clock_.RealWaitMicroseconds(heap_.front().due - now);
      if (checkDue_ >= 0) {
        const std::int64_t untilCheck = checkDue_ - SteadyClock().NowMicroseconds();
        if (untilCheck <= 0) {
          checkNow = true;
          checkDue_ = -1;
        } else if (timeout < 0 || untilCheck < timeout) {
          timeout = untilCheck;
        }
      }
    }
    if (!due.empty() || checkNow) {
      for (PoolFunction* call : due) {
        try {
          sink_.DeliverDue(call);
        } catch (...) {  // no memory to queue it: the call is lost, as it would be
          delete call;   // if it could not have been scheduled
        }
      }
      due.clear();
      if (checkNow && sink_.CheckWorkers()) ArmWorkerCheck(checkInterval_);
      continue;
    }
    WaitOnWord(wakeWord_, key, timeout);
  }
}

}  // namespace kelcore::threads::detail
