// The process's CPU-bound and I/O-bound executors and the thread pool behind them:
// the weak registry, delayed calls on a clock moved by hand, cancellation, growth of
// the I/O workers and exception reports.
#include <kelcore/threads/Executors.h>

#include "ExecutorTestSupport.h"
#include "threads/ThreadPool.h"
#include "threads/ThreadPoolExecutor.h"

#include <gtest/gtest.h>

#include <boost/make_shared.hpp>
#include <boost/weak_ptr.hpp>

#include <mutex>
#include <stdexcept>
#include <string>
#include <thread>
#include <vector>

namespace kelcore::threads {
namespace {

using testing::Countdown;
using testing::ManualClock;

// A previous test's executor may still be on its way out on a pool thread (the last
// closure that held it is destroyed after it ran): wait until it is gone.
void WaitUntilNoCPUBoundExecutor() {
  while (GetCPUBoundExecutor()) std::this_thread::yield();
}

TEST(ThreadPoolExecutor, CurrentExecutorsAreHeldWeakly) {
  WaitUntilNoCPUBoundExecutor();
  AsyncExecutorPtr first = CreateCPUBoundExecutor();
  EXPECT_EQ(CreateCPUBoundExecutor(), first);
  EXPECT_EQ(GetCPUBoundExecutor(), first);
  EXPECT_EQ(first->GetThreadCount(), CPUCount());
  first.reset();
  EXPECT_FALSE(GetCPUBoundExecutor());
  const AsyncExecutorPtr second = CreateCPUBoundExecutor();
  EXPECT_TRUE(second);
  EXPECT_EQ(GetCPUBoundExecutor(), second);
}

TEST(ThreadPoolExecutor, SetOnlyTakesEffectWhenNoneIsAlive) {
  const AsyncExecutorPtr io = CreateIOBoundExecutor();
  EXPECT_EQ(io->GetThreadCount(), 4);
  AsyncExecutorPtr mine = CreateAsyncThreadedExecutor("mine", 1, kThreadPriorityNormal, {}, {});
  SetIOBoundExecutor(mine);
  EXPECT_EQ(GetIOBoundExecutor(), io);

  WaitUntilNoCPUBoundExecutor();
  SetCPUBoundExecutor(mine);
  EXPECT_EQ(GetCPUBoundExecutor(), mine);
  EXPECT_EQ(CreateCPUBoundExecutor(), mine);
  mine.reset();
  EXPECT_FALSE(GetCPUBoundExecutor());
}

TEST(ThreadPoolExecutor, DestroyingItCancelsPendingDelayedCalls) {
  detail::ThreadPool pool(detail::SteadyClock(), {1, {1, 1, -1, 1000}});
  auto executor = boost::make_shared<detail::ThreadPoolExecutor>(pool, 1, false);
  auto token = boost::make_shared<int>(0);
  const boost::weak_ptr<int> watch = token;
  bool ran = false;
  executor->CallAsynchronously([token, &ran] { ran = true; }, 1000);
  token.reset();
  executor.reset();
  EXPECT_TRUE(watch.expired());  // destroyed unrun
  EXPECT_FALSE(ran);
}

// On a pool with one CPU worker and a clock moved by hand, delayed calls run in due
// order (ties in scheduling order) once the clock passes them, and not before.
TEST(ThreadPoolExecutor, DelayedCallsRunInDueOrderOnThePoolsClock) {
  ManualClock clock;
  detail::ThreadPool pool(clock, {1, {1, 1, -1, 1000}});
  detail::ThreadPoolExecutor executor(pool, 1, false);
  std::mutex mutex;
  std::vector<int> ran;
  Countdown due(3);
  for (const int delay : {30, 10, 20, 10}) {
    executor.CallAsynchronously(
        [&, delay] {
          std::lock_guard<std::mutex> lock(mutex);
          ran.push_back(delay);
          due.Arrive();
        },
        static_cast<unsigned int>(delay));
  }
  clock.AdvanceMilliseconds(20);
  pool.Timer().ClockChanged();
  due.Wait();
  EXPECT_EQ(pool.Timer().PendingCount(), 1u);
  std::lock_guard<std::mutex> lock(mutex);
  EXPECT_EQ(ran, (std::vector<int>{10, 10, 20}));
}

// Calls that block until all of them have started need more workers than the I/O
// set's base: it must grow.
TEST(ThreadPoolExecutor, IOWorkersGrowWhileTheirCallsAreStuck) {
  detail::ThreadPool pool(detail::SteadyClock(), {1, {1, 4, 60 * 1000 * 1000, 1000}});
  detail::ThreadPoolExecutor executor(pool, 1, true);
  Countdown started(4);
  Countdown finished(4);
  for (int i = 0; i < 4; ++i) {
    executor.CallAsynchronously(
        [&] {
          started.Arrive();
          started.Wait();
          finished.Arrive();
        },
        0);
  }
  finished.Wait();
  EXPECT_GE(pool.IOWorkers().LiveWorkers(), 4);
}

TEST(ThreadPoolExecutor, ExceptionsAreReportedAndLaterCallsRun) {
  detail::ThreadPool pool(detail::SteadyClock(), {1, {1, 1, -1, 1000}});
  detail::ThreadPoolExecutor executor(pool, 1, false);
  Countdown done(1);
  ::testing::internal::CaptureStderr();
  executor.CallAsynchronously([] { throw std::logic_error("bad state"); }, 0);
  executor.CallAsynchronously([&done] { done.Arrive(); }, 0);
  done.Wait();  // the one worker reported the exception first
  const std::string reports = ::testing::internal::GetCapturedStderr();
  EXPECT_NE(reports.find("WorkerMain(): caught std exception of type \"std::logic_error\", "
                         "what() returned \"bad state\". Continuing."),
            std::string::npos)
      << reports;
}

}  // namespace
}  // namespace kelcore::threads
