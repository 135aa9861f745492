#include <kelcore/threads/EventLoopAdaptor.h>

#include <kelcore/debug/Assert.h>
#include <kelcore/threads/Executors.h>
#include <kelcore/utility/SmallBlockAllocator.h>

#include "threads/MessageQueue.h"
#include "threads/ReportingCall.h"

#include <boost/make_shared.hpp>

#include <deque>
#include <memory>
#include <mutex>
#include <thread>

namespace kelcore::threads {

AsyncEventLoopAdaptor::AsyncEventLoopAdaptor() = default;
AsyncEventLoopAdaptor::~AsyncEventLoopAdaptor() = default;

namespace {

using Function = boost::function<void()>;

constexpr const char* kWhere = "kelcore::threads::EventLoopAdaptor";

// The immediate calls accepted by an adaptor and not yet run, shared with the drain
// requests it posts so that they can outlive it.
class PendingCalls {
 public:
  void Append(const Function& fn) {
    std::lock_guard<std::mutex> lock(mutex_);
    calls_.push_back(fn);
  }

  // Takes back the call just appended when its drain request could not be posted.
  void RemoveLast() noexcept {
    Function last;
    std::lock_guard<std::mutex> lock(mutex_);
    if (calls_.empty()) return;
    last.swap(calls_.back());
    calls_.pop_back();
  }

  // Runs the calls one at a time, outside the lock, until none is left.
  void RunAll() {
    Function fn;
    while (TakeFirst(fn)) {
      CallReportingExceptions(fn, kWhere, "pending call");
      fn.clear();
    }
  }

 private:
  bool TakeFirst(Function& fn) {
    std::lock_guard<std::mutex> lock(mutex_);
    if (calls_.empty()) return false;
    fn.swap(calls_.front());
    calls_.pop_front();
    return true;
  }

  std::mutex mutex_;
  std::deque<Function, utility::SmallBlockAllocator::STLAllocator<Function>> calls_;
};

// What a live adaptor posts through: it stands for the adapted thread's loop as long as
// the adaptor is not terminated. Delayed calls hold it weakly and are dropped once it
// is gone.
struct LoopTarget {
  std::shared_ptr<MessageQueue> queue;
  AsyncExecutorPtr timer;  // spends the delays of delayed calls
};

class EventLoopAdaptor final : public AsyncEventLoopAdaptor {
 public:
  explicit EventLoopAdaptor(bool quitLoopOnTerminate)
      : thread_(std::this_thread::get_id()),
        quitLoopOnTerminate_(quitLoopOnTerminate),
        target_(std::make_shared<LoopTarget>(
            LoopTarget{MessageQueue::ForCurrentThread(), CreateCPUBoundExecutor()})),
        pending_(std::make_shared<PendingCalls>()) {}

  bool CallAsynchronously(const Function& fn, unsigned int delayMilliseconds) override {
    if (fn.empty()) return false;
    std::lock_guard<std::mutex> lock(mutex_);
    if (!target_) return false;
    if (delayMilliseconds == 0) return PostImmediate(fn);
    std::weak_ptr<LoopTarget> weakTarget = target_;
    return target_->timer->CallAsynchronously(
        [weakTarget, fn] {
          std::shared_ptr<MessageQueue> queue;
          if (std::shared_ptr<LoopTarget> target = weakTarget.lock()) queue = target->queue;
          if (queue) queue->Post(fn);
        },
        delayMilliseconds);
  }

  int GetThreadCount() const override { return 1; }

  void Terminate() override {
    std::shared_ptr<LoopTarget> target;
    {
      std::lock_guard<std::mutex> lock(mutex_);
      target.swap(target_);
    }
    if (target && quitLoopOnTerminate_) target->queue->PostQuit();
  }

  bool IsTerminated() const override {
    std::lock_guard<std::mutex> lock(mutex_);
    return !target_;
  }

  bool IsCurrentThreadExecutorThread() const override {
    return std::this_thread::get_id() == thread_;
  }

  void Flush() override {
    if (!IsCurrentThreadExecutorThread()) {
      debug::ReportAssertion("IsCurrentThreadExecutorThread()", __FILE__, __LINE__,
                             "kelcore::threads::EventLoopAdaptor::Flush",
                             "an event loop adaptor is flushed on its own thread only");
      return;
    }
    pending_->RunAll();
  }

 private:
  // Under the lock, with a live target.
  bool PostImmediate(const Function& fn) {
    pending_->Append(fn);
    std::shared_ptr<PendingCalls> pending = pending_;
    const Function drain = [pending] { pending->RunAll(); };
    bool posted = false;
    try {
      posted = IsCurrentThreadExecutorThread() ? target_->queue->Post(drain)
                                               : target_->queue->SendNotify(drain);
    } catch (...) {
      pending_->RemoveLast();
      throw;
    }
    if (!posted) pending_->RemoveLast();
    return posted;
  }

  const std::thread::id thread_;
  const bool quitLoopOnTerminate_;
  mutable std::mutex mutex_;
  std::shared_ptr<LoopTarget> target_;  // null once terminated
  const std::shared_ptr<PendingCalls> pending_;
};

}  // namespace

AsyncEventLoopAdaptorPtr AdaptCurrentEventLoopAsExecutor(bool quitLoopOnTerminate) {
  return boost::make_shared<EventLoopAdaptor>(quitLoopOnTerminate);
}

}  // namespace kelcore::threads
