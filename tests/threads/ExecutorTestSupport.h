// Helpers for the executor tests: a clock moved by hand, a parent executor whose calls
// the test runs one by one, a countdown to wait on, and workload sizes that shrink in
// sanitizer builds.
#pragma once

#include <kelcore/threads/AsyncExecutor.h>
#include <kelcore/threads/Gate.h>

#include "threads/Clock.h"

#include <boost/function.hpp>

#include <atomic>
#include <cstdint>
#include <deque>
#include <mutex>
#include <thread>

namespace kelcore::threads::testing {

// Sanitizers slow the executors down ten times or more: keep the suite's run time
// modest there.
#if defined(KELCORE_TESTS_SANITIZED)
inline constexpr int kWorkScale = 20;
#else
inline constexpr int kWorkScale = 1;
#endif

inline constexpr int Scaled(int count) {
  return count / kWorkScale;
}

class ManualClock final : public detail::Clock {
 public:
  std::int64_t NowMicroseconds() const override { return now_.load(); }
  bool AdvancesByItself() const override { return false; }
  void AdvanceMilliseconds(std::int64_t milliseconds) { now_ += milliseconds * 1000; }

 private:
  std::atomic<std::int64_t> now_{1000000};
};

// Opens its gate when Arrive has been called `count` times. Wait also waits until the
// opening thread is out of Gate::Open, so the countdown may be destroyed right after.
class Countdown {
 public:
  explicit Countdown(std::int64_t count) : left_(count) {
    if (count == 0) Open();
  }
  void Arrive() {
    if (left_.fetch_sub(1) == 1) Open();
  }
  void Wait() {
    done_.PassThrough(-1);
    while (!opened_.load(std::memory_order_acquire)) std::this_thread::yield();
  }
  std::int64_t Left() const { return left_.load(); }

 private:
  void Open() {
    done_.Open();
    opened_.store(true, std::memory_order_release);
  }

  std::atomic<std::int64_t> left_;
  Gate done_{false};
  std::atomic<bool> opened_{false};
};

// A parent executor that only records calls; the test runs them on its own thread, in
// any order it likes, so that sub-executor scheduling is tested without timing.
class StepParent final : public AsyncExecutor {
 public:
  explicit StepParent(int threads) : threads_(threads) {}

  bool CallAsynchronously(const boost::function<void()>& fn, unsigned int delay) override {
    std::lock_guard<std::mutex> lock(mutex_);
    if (terminated_) return false;
    calls_.push_back(Call{fn, delay});
    return true;
  }
  int GetThreadCount() const override { return threads_; }
  void Terminate() override {
    std::lock_guard<std::mutex> lock(mutex_);
    terminated_ = true;
  }
  bool IsTerminated() const override {
    std::lock_guard<std::mutex> lock(mutex_);
    return terminated_;
  }

  std::size_t Pending() const {
    std::lock_guard<std::mutex> lock(mutex_);
    return calls_.size();
  }
  unsigned int DelayOf(std::size_t index) const {
    std::lock_guard<std::mutex> lock(mutex_);
    return calls_[index].delay;
  }
  // Runs (and forgets) the recorded call at `index`; exceptions pass to the caller.
  void Run(std::size_t index = 0) {
    boost::function<void()> fn;
    {
      std::lock_guard<std::mutex> lock(mutex_);
      fn.swap(calls_[index].fn);
      calls_.erase(calls_.begin() + static_cast<std::ptrdiff_t>(index));
    }
    fn();
  }
  // Runs recorded calls, oldest first, until none is left.
  void RunAll() {
    while (Pending() > 0) Run(0);
  }

 private:
  struct Call {
    boost::function<void()> fn;
    unsigned int delay;
  };

  const int threads_;
  mutable std::mutex mutex_;
  std::deque<Call> calls_;
  bool terminated_ = false;
};

}  // namespace kelcore::threads::testing
