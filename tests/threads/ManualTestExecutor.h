// An executor for tests that records every call and runs the recorded calls only when
// the test says so, so that delays and ordering are tested without waiting.
#pragma once

#include <kelcore/threads/AsyncExecutor.h>

#include <boost/function.hpp>

#include <cstddef>
#include <deque>
#include <mutex>
#include <vector>

namespace kelcore::threads::testing {

class ManualTestExecutor : public AsyncExecutor {
 public:
  bool CallAsynchronously(const boost::function<void()>& fn,
                          unsigned int delayMilliseconds) override {
    std::lock_guard<std::mutex> lock(mutex_);
    if (terminated_) return false;
    calls_.push_back({fn, delayMilliseconds});
    delays_.push_back(delayMilliseconds);
    return true;
  }
  int GetThreadCount() const override { return 1; }
  void Terminate() override {
    std::lock_guard<std::mutex> lock(mutex_);
    terminated_ = true;
  }
  bool IsTerminated() const override {
    std::lock_guard<std::mutex> lock(mutex_);
    return terminated_;
  }

  // Runs the oldest recorded call on the calling thread; false when there is none.
  bool RunNext() {
    boost::function<void()> fn;
    {
      std::lock_guard<std::mutex> lock(mutex_);
      if (calls_.empty()) return false;
      fn.swap(calls_.front().fn);
      calls_.pop_front();
    }
    fn();
    return true;
  }

  std::size_t PendingCount() const {
    std::lock_guard<std::mutex> lock(mutex_);
    return calls_.size();
  }

  // The delay of every call ever recorded, in order.
  std::vector<unsigned int> Delays() const {
    std::lock_guard<std::mutex> lock(mutex_);
    return delays_;
  }

 private:
  struct Call {
    boost::function<void()> fn;
    unsigned int delay;
  };

  mutable std::mutex mutex_;
  std::deque<Call> calls_;
  std::vector<unsigned int> delays_;
  bool terminated_ = false;
};

}  // namespace kelcore::threads::testing
