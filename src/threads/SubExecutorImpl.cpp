#include "threads/SubExecutorImpl.h"

#include <boost/weak_ptr.hpp>

#include <algorithm>
#include <chrono>
#include <exception>

namespace kelcore::threads::detail {
namespace {

// How long a parent thread keeps running one sub-executor's functions back to back
// before it hands the slot back to the parent, and how often it looks at the clock.
constexpr std::chrono::microseconds kRunBudget{1000};

// The sub-executors whose functions the calling thread is running, innermost first: a
// sub-executor over another runs its functions inside the other's.
struct RunningFrame {
  explicit RunningFrame(const SubExecutorImpl* running);
  ~RunningFrame();
  RunningFrame(const RunningFrame&) = delete;
  RunningFrame& operator=(const RunningFrame&) = delete;

  const SubExecutorImpl* const impl;
  const RunningFrame* const outer;
};

thread_local const RunningFrame* innermostFrame = nullptr;

RunningFrame::RunningFrame(const SubExecutorImpl* running) : impl(running), outer(innermostFrame) {
  innermostFrame = this;
}

RunningFrame::~RunningFrame() {
  innermostFrame = outer;
}

// The call a sub-executor hands its parent for each start.
struct StartCall {
  void operator()() const { impl->ExecuteNextForParent(); }
  boost::shared_ptr<SubExecutorImpl> impl;
};

// The call a sub-executor hands its parent for a delayed function: it does not keep the
// sub-executor alive while the delay runs.
struct DelayedCall {
  void operator()() const {
    if (const boost::shared_ptr<SubExecutorImpl> strong = impl.lock()) {
      strong->DelayedExecuteForParent(number);
    }
  }
  boost::weak_ptr<SubExecutorImpl> impl;
  std::int64_t number;
};

template <class Call>
boost::function<void()> SmallBlockFunction(const Call& call) {
  boost::function<void()> function;
  function.assign(call, utility::SmallBlockAllocator::STLAllocator<Call>());
  return function;
}

}  // namespace

SubExecutorImpl::SubExecutorImpl(const boost::shared_ptr<AsyncExecutor>& parent, int maxConcurrent,
                                 ReadyOrder order)
    : parent_(parent),
      maxConcurrent_(maxConcurrent),
      batchLimit_(maxConcurrent == 1 && order == ReadyOrder::kOldestFirst ? kMaxBatch : 1),
      ready_(order) {}

SubExecutorImpl::~SubExecutorImpl() {
  ReadyContainer::DestroyChain(dropped_);
}

bool SubExecutorImpl::IsCurrentThreadExecutorThread() const noexcept {
  for (const RunningFrame* frame = innermostFrame; frame != nullptr; frame = frame->outer) {
    if (frame->impl == this) return true;
  }
  return false;
}

bool SubExecutorImpl::CallAsynchronously(const boost::function<void()>& fn,
                                         unsigned int delayMilliseconds) {
  if (fn.empty()) return false;
  RecursiveMutex::ScopedLock lock(mutex_, "SubExecutorImpl::CallAsynchronously");
  if (terminated_) return false;
  if (delayMilliseconds > 0) {
    const std::int64_t number = lastDelayedNumber_ + 1;
    delayed_.emplace(number, fn);
    try {
      if (!parent_->CallAsynchronously(SmallBlockFunction(DelayedCall{weak_from_this(), number}),
                                       delayMilliseconds)) {
        delayed_.erase(number);
        return false;
      }
    } catch (...) {
      delayed_.erase(number);
      throw;
    }
    lastDelayedNumber_ = number;
    return true;
  }

  auto* item = new Item(fn, lastSerial_ + 1);
  lastSerial_ = item->serialNumber;
  ready_.Put(item);
  try {
    StartFunctions();
  } catch (...) {
    if (running_ > 0) return true;  // a running function's end will start it
    // Nothing runs that would start it: take this function back (it is the newest, so
    // its serial can be given out again) and report the failure.
    delete ready_.TakeNewest();
    --lastSerial_;
    throw;
  }
  return !terminated_;
}

void SubExecutorImpl::StartFunctions() {
  while (!paused_ && !terminated_ && running_ < maxConcurrent_ && ready_.Size() > starting_) {
    ++running_;
    ++starting_;
    bool accepted = false;
    try {
      accepted = parent_->CallAsynchronously(SmallBlockFunction(StartCall{shared_from_this()}), 0);
    } catch (...) {
      --running_;
      --starting_;
      throw;
    }
    if (!accepted) {
      // A parent that refuses work has been terminated for good: nothing queued here
      // could ever start. The dropped functions are destroyed with the sub-executor.
      --running_;
      --starting_;
      Item* dropped = TerminateLocked();
      while (dropped != nullptr) {
        Item* next = dropped->link;
        dropped->link = dropped_;
        dropped_ = dropped;
        dropped = next;
      }
      return;
    }
  }
}

void SubExecutorImpl::Retire(std::int64_t serial) noexcept {
  if (retired_.Retire(serial)) WakeSatisfiedWaiters();
}

bool SubExecutorImpl::FlushSatisfied(std::int64_t serial) const noexcept {
  // Functions dropped by Terminate never retire: once terminated, everything is done
  // when nothing runs any more. A batch runs in serial order, so its last finished
  // serial is as good as retired.
  return retired_.RetiredThrough() >= serial || (terminated_ && running_ == 0) ||
         (batchLimit_ > 1 && lastFinished_.load(std::memory_order_seq_cst) >= serial);
}

void SubExecutorImpl::WakeSatisfiedWaiters() noexcept {
  for (std::size_t i = 0; i < waiters_.size();) {
    if (FlushSatisfied(waiters_[i].serial)) {
      waiters_[i].gate->Open();
      waiters_[i] = waiters_.back();
      waiters_.pop_back();
      waiting_.fetch_sub(1, std::memory_order_relaxed);
    } else {
      ++i;
    }
  }
}

void SubExecutorImpl::ReleaseSlot() noexcept {
  --running_;
  if (terminated_ && running_ == 0) WakeSatisfiedWaiters();
}

SubExecutorImpl::Item* SubExecutorImpl::TerminateLocked() noexcept {
  terminated_ = true;
  if (running_ == 0) WakeSatisfiedWaiters();
  return ready_.TakeAll();
}

SubExecutorImpl::Item* SubExecutorImpl::TakeBatchLocked() {
  const std::int64_t unclaimed = ready_.Size() - starting_;
  if (unclaimed <= 0) return nullptr;
  const std::int64_t count = std::min<std::int64_t>(unclaimed, batchLimit_);
  retired_.ReserveFor(static_cast<int>(count) + running_);
  return ready_.TakeUpTo(count);
}

SubExecutorImpl::Item* SubExecutorImpl::TryTakeBatchLocked() noexcept {
  try {
    return TakeBatchLocked();
  } catch (...) {  // hand the slot back; a later start tries again
    return nullptr;
  }
}

void SubExecutorImpl::ExecuteNextForParent() {
  Item* batch = nullptr;
  {
    RecursiveMutex::ScopedLock lock(mutex_, "SubExecutorImpl::OnThreadExecute1");
    --starting_;
    if (paused_ || terminated_ || ready_.Empty()) {
      // A paused start leaves its function queued: Resume starts it again.
      ReleaseSlot();
      return;
    }
    try {
      batch = TakeBatchLocked();
    } catch (...) {  // the functions stay queued for a later start
      ReleaseSlot();
      throw;
    }
    if (batch == nullptr) {
      ReleaseSlot();
      return;
    }
  }
  RunFromThisThread(batch);
}

void SubExecutorImpl::DelayedExecuteForParent(std::int64_t number) {
  boost::function<void()> fn;  // destroyed outside the lock if it does not run
  Item* item = nullptr;
  {
    RecursiveMutex::ScopedLock lock(mutex_, "SubExecutorImpl::OnThreadDelayedExecute1");
    const auto found = delayed_.find(number);
    if (found == delayed_.end()) return;
    fn.swap(found->second);
    delayed_.erase(found);
    if (!paused_ && !terminated_ && running_ < maxConcurrent_) {
      retired_.ReserveFor(running_ + 1);
      item = new Item(fn, lastSerial_ + 1);
      lastSerial_ = item->serialNumber;
      ++running_;
    }
  }
  if (item != nullptr) {
    fn.clear();
    RunFromThisThread(item);
  } else {
    CallAsynchronously(fn, 0);  // takes its place among the ready functions
  }
}

namespace {

// Destroys the functions of a chain that will not run, when it goes out of scope.
struct UnrunChain {
  ~UnrunChain() { ReadyContainer::DestroyChain(chain); }
  AllocatedFunctionWithSerialNumber* chain = nullptr;
};

}  // namespace

void SubExecutorImpl::RunFromThisThread(Item* batch) {
  const RunningFrame frame(this);
  const auto budgetEnd = std::chrono::steady_clock::now() + kRunBudget;
  std::exception_ptr failure;
  std::int64_t finished[kMaxBatch];  // not yet retired, in running (and serial) order
  int finishedCount = 0;
  for (;;) {
    // Run the batch in order; stop early when paused, terminated or failed.
    Item* rest = batch;
    bool first = true;
    while (rest != nullptr && !failure &&
           (first || !(paused_.load(std::memory_order_acquire) ||
                       terminated_.load(std::memory_order_acquire)))) {
      first = false;
      Item* item = rest;
      rest = rest->link;
      const std::int64_t serial = item->serialNumber;
      try {
        Invoke(item->fn);
      } catch (...) {
        failure = std::current_exception();
      }
      delete item;  // outside the lock: the function's destructor is the client's code
      finished[finishedCount++] = serial;
      if (batchLimit_ > 1) {
        lastFinished_.store(serial, std::memory_order_seq_cst);
        if (waiting_.load(std::memory_order_seq_cst) != 0) {  // a Flush waits: retire now
          RecursiveMutex::ScopedLock lock(mutex_, "SubExecutorImpl::OnThreadExecute2");
          for (int i = 0; i < finishedCount; ++i) Retire(finished[i]);
          finishedCount = 0;
        }
      }
    }
    const bool withinBudget = std::chrono::steady_clock::now() < budgetEnd;
    UnrunChain dropped;  // destroyed after the lock is released
    RecursiveMutex::ScopedLock lock(mutex_, "SubExecutorImpl::OnThreadExecute2");
    for (int i = 0; i < finishedCount; ++i) Retire(finished[i]);
    finishedCount = 0;
    if (terminated_) {
      dropped.chain = rest;
    } else {
      ready_.PutBack(rest);
    }
    batch = nullptr;
    if (!failure && withinBudget && !paused_ && !terminated_) batch = TryTakeBatchLocked();
    if (batch == nullptr) {
      ReleaseSlot();
      StartFunctions();
      break;
    }
  }
  if (failure) std::rethrow_exception(failure);
}

void SubExecutorImpl::WaitUntilRetired(std::int64_t serial) {
  Gate retired(false);
  {
    RecursiveMutex::ScopedLock lock(mutex_, "SubExecutorImpl::WaitUntilUpToThisFunctionIsRetired");
    // Counted before the check: a batch that finishes `serial` after the check sees
    // the count and retires at once.
    waiting_.fetch_add(1, std::memory_order_seq_cst);
    if (FlushSatisfied(serial)) {
      waiting_.fetch_sub(1, std::memory_order_relaxed);
      return;
    }
    try {
      waiters_.push_back(Waiter{&retired, serial});
    } catch (...) {
      waiting_.fetch_sub(1, std::memory_order_relaxed);
      throw;
    }
  }
  retired.PassThrough(-1);
  // The gate was opened under the mutex: once this thread holds it, Open has returned
  // and the gate may be destroyed.
  RecursiveMutex::ScopedLock lock(mutex_, "SubExecutorImpl::WaitUntilUpToThisFunctionIsRetired");
}

void SubExecutorImpl::Flush() {
  if (IsCurrentThreadExecutorThread()) return;  // it would wait for itself
  std::int64_t last = 0;
  {
    RecursiveMutex::ScopedLock lock(mutex_, "SubExecutorImpl::Flush");
    last = lastSerial_;
  }
  if (last > 0) WaitUntilRetired(last);
}

void SubExecutorImpl::Pause() {
  RecursiveMutex::ScopedLock lock(mutex_, "SubExecutorImpl::Pause");
  if (!terminated_) paused_ = true;
}

void SubExecutorImpl::Resume() {
  RecursiveMutex::ScopedLock lock(mutex_, "SubExecutorImpl::Resume");
  if (!paused_) return;
  paused_ = false;
  StartFunctions();
}

void SubExecutorImpl::Terminate() {
  Item* dropped = nullptr;
  DelayedMap delayed;
  {
    RecursiveMutex::ScopedLock lock(mutex_, "SubExecutorImpl::Terminate");
    if (terminated_) return;
    dropped = TerminateLocked();
    delayed.swap(delayed_);
  }
  ReadyContainer::DestroyChain(dropped);
}

bool SubExecutorImpl::IsTerminated() const {
  RecursiveMutex::ScopedLock lock(mutex_, "SubExecutorImpl::IsTerminated");
  return terminated_;
}

void SubExecutorImpl::Abandon() {
  DelayedMap delayed;
  RecursiveMutex::ScopedLock lock(mutex_, "SubExecutorImpl::Abandon");
  delayed.swap(delayed_);
}

}  // namespace kelcore::threads::detail
