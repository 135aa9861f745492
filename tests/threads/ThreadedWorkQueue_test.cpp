// Threaded work queues: worker count, ordering, delayed functions on a clock moved by
// hand, exception reports, pausing, flushing, termination and self-destruction.
#include <kelcore/threads/Executors.h>

#include "ExecutorTestSupport.h"
#include "threads/ThreadedWorkQueue.h"

#include <gtest/gtest.h>

#include <boost/make_shared.hpp>
#include <boost/weak_ptr.hpp>

#include <chrono>
#include <climits>
#include <stdexcept>
#include <string>
#include <thread>
#include <vector>

namespace kelcore::threads {
namespace {

using testing::Countdown;
using testing::ManualClock;

AsyncThreadedExecutorPtr MakeQueue(int threads) {
  return CreateAsyncThreadedExecutor("work queue test", threads, kThreadPriorityNormal, {}, {});
}

TEST(ThreadedWorkQueue, NegativeCountMeansThreadsPerProcessor) {
  Countdown started(2 * CPUCount());
  const AsyncThreadedExecutorPtr queue = CreateAsyncThreadedExecutor(
      "per cpu", -2, kThreadPriorityNormal, [&started] { started.Arrive(); }, {});
  EXPECT_EQ(queue->GetThreadCount(), 2 * CPUCount());
  started.Wait();
}

TEST(ThreadedWorkQueue, RejectsImpossibleThreadCounts) {
  for (const int count : {0, 1025, INT_MIN, -100000}) {
    EXPECT_THROW(MakeQueue(count), std::invalid_argument) << count;
  }
}

TEST(ThreadedWorkQueue, OneWorkerRunsInQueueOrder) {
  const AsyncThreadedExecutorPtr queue = MakeQueue(1);
  std::vector<int> order;
  for (int i = 0; i < 1000; ++i) queue->CallAsynchronously([&order, i] { order.push_back(i); }, 0);
  queue->Flush();
  ASSERT_EQ(order.size(), 1000u);
  for (int i = 0; i < 1000; ++i) EXPECT_EQ(order[static_cast<std::size_t>(i)], i);
  EXPECT_FALSE(queue->CallAsynchronously(boost::function<void()>(), 0));
}

TEST(ThreadedWorkQueue, FlushWaitsForEveryWorker) {
  const AsyncThreadedExecutorPtr queue = MakeQueue(4);
  std::atomic<int> runs{0};
  for (int i = 0; i < 1000; ++i) {
    queue->CallAsynchronously(
        [&runs, i] {
          if (i % 100 == 0) std::this_thread::sleep_for(std::chrono::milliseconds(1));
          ++runs;
        },
        0);
  }
  queue->Flush();
  EXPECT_EQ(runs.load(), 1000);
}

// Delayed functions run in due order (ties in queuing order) and never before they are
// due; Flush moves what is due before it waits.
TEST(ThreadedWorkQueue, DelayedFunctionsRunInDueOrderOnTheQueuesClock) {
  ManualClock clock;
  // One worker: with two, functions due at the same moment start in order but may
  // finish in either order.
  detail::ThreadedWorkQueue queue("delays", 1, kThreadPriorityNormal, {}, {}, clock);
  std::mutex mutex;
  std::vector<std::string> ran;
  const auto record = [&](const char* name) {
    return [&, name] {
      std::lock_guard<std::mutex> lock(mutex);
      ran.push_back(name);
    };
  };
  queue.CallAsynchronously(record("30"), 30);
  queue.CallAsynchronously(record("10a"), 10);
  queue.CallAsynchronously(record("20"), 20);
  queue.CallAsynchronously(record("10b"), 10);
  queue.Flush();
  EXPECT_TRUE(ran.empty());
  clock.AdvanceMilliseconds(10);
  queue.Flush();
  EXPECT_EQ(ran, (std::vector<std::string>{"10a", "10b"}));
  clock.AdvanceMilliseconds(15);
  queue.ClockChanged();  // the workers find it by themselves, without a Flush
  while (true) {
    {
      std::lock_guard<std::mutex> lock(mutex);
      if (ran.size() == 3) break;
    }
    std::this_thread::yield();
  }
  EXPECT_EQ(ran.back(), "20");
  clock.AdvanceMilliseconds(5);
  queue.Flush();
  EXPECT_EQ(ran, (std::vector<std::string>{"10a", "10b", "20", "30"}));
}

TEST(ThreadedWorkQueue, DelayedFunctionWaitsAtLeastItsDelay) {
  const AsyncThreadedExecutorPtr queue = MakeQueue(2);
  Countdown done(1);
  const auto posted = std::chrono::steady_clock::now();
  std::chrono::steady_clock::time_point ran;
  queue->CallAsynchronously(
      [&] {
        ran = std::chrono::steady_clock::now();
        done.Arrive();
      },
      20);
  done.Wait();
  EXPECT_GE(ran - posted, std::chrono::milliseconds(20));
}

// The report texts are the system's own; the worker goes on after each.
TEST(ThreadedWorkQueue, ExceptionsAreReportedAndTheWorkerGoesOn) {
  const AsyncThreadedExecutorPtr queue = MakeQueue(1);
  bool later = false;
  ::testing::internal::CaptureStderr();
  queue->CallAsynchronously([] { throw std::runtime_error("disk on fire"); }, 0);
  queue->CallAsynchronously([] { throw 42; }, 0);
  queue->CallAsynchronously([&later] { later = true; }, 0);
  queue->Flush();
  const std::string reports = ::testing::internal::GetCapturedStderr();
  EXPECT_TRUE(later);
  const char* const expected[] = {
      "WorkerMain(): caught std exception of type \"std::runtime_error\", what() returned "
      "\"disk on fire\". Continuing.",
      "WorkerMain(): caught unknown exception. Continuing.",
      "kelcore::threads::`anonymous-namespace'::ThreadedWorkQueue::WorkerMain",
      "..\\..\\threads\\src\\ThreadedWorkQueue, line 412",
      "..\\..\\threads\\src\\ThreadedWorkQueue, line 419",
      "assertion failed: false",
  };
  for (const char* text : expected) EXPECT_NE(reports.find(text), std::string::npos) << text;
}

TEST(ThreadedWorkQueue, PauseHoldsFunctionsBackUntilResume) {
  const AsyncThreadedExecutorPtr queue = MakeQueue(2);
  std::atomic<int> runs{0};
  queue->Pause();
  for (int i = 0; i < 10; ++i) queue->CallAsynchronously([&runs] { ++runs; }, 0);
  std::this_thread::sleep_for(std::chrono::milliseconds(20));
  EXPECT_EQ(runs.load(), 0);
  std::thread waiter([&] { queue->WaitWhilePaused(); });
  queue->Resume();
  waiter.join();
  queue->Flush();
  EXPECT_EQ(runs.load(), 10);
}

TEST(ThreadedWorkQueue, TerminateRunsWhatIsQueuedAndRefusesMore) {
  Countdown ended(3);
  const AsyncThreadedExecutorPtr queue = CreateAsyncThreadedExecutor(
      "terminate", 3, kThreadPriorityNormal, {}, [&ended] { ended.Arrive(); });
  std::atomic<int> runs{0};
  queue->Pause();
  for (int i = 0; i < 50; ++i) queue->CallAsynchronously([&runs] { ++runs; }, 0);
  queue->Terminate();
  EXPECT_TRUE(queue->IsTerminated());
  EXPECT_FALSE(queue->CallAsynchronously([&runs] { ++runs; }, 0));
  queue->Flush();  // joins the workers
  EXPECT_EQ(ended.Left(), 0);
  EXPECT_EQ(runs.load(), 50);
  queue->Pause();  // does nothing once terminated
  queue->WaitWhilePaused();
}

TEST(ThreadedWorkQueue, DestroyingItDropsDelayedFunctionsNotYetDue) {
  AsyncThreadedExecutorPtr queue = MakeQueue(1);
  auto token = boost::make_shared<int>(0);
  const boost::weak_ptr<int> watch = token;
  queue->CallAsynchronously([token] {}, 60000);
  token.reset();
  queue.reset();
  EXPECT_TRUE(watch.expired());
}

// The last reference dropped on one of the queue's own workers must not make that
// worker join itself.
TEST(ThreadedWorkQueue, LastReferenceDroppedOnItsOwnWorker) {
  Countdown ended(2);
  Countdown released(1);
  Gate go(false);
  AsyncThreadedExecutorPtr queue = CreateAsyncThreadedExecutor(
      "self release", 2, kThreadPriorityNormal, {}, [&ended] { ended.Arrive(); });
  queue->CallAsynchronously(
      [&, owner = queue]() mutable {
        go.PassThrough(-1);
        owner.reset();  // the last reference
        released.Arrive();
      },
      0);
  queue.reset();
  go.Open();
  released.Wait();
  ended.Wait();
}

TEST(ThreadedWorkQueue, FlushFromItsOwnWorkerIsReportedAndReturns) {
  const AsyncThreadedExecutorPtr queue = MakeQueue(1);
  bool onWorker = false;
  ::testing::internal::CaptureStderr();
  queue->CallAsynchronously(
      [&] {
        queue->Flush();
        onWorker = queue->IsCurrentThreadExecutorThread();
      },
      0);
  queue->Flush();
  const std::string reports = ::testing::internal::GetCapturedStderr();
  EXPECT_TRUE(onWorker);
  EXPECT_FALSE(queue->IsCurrentThreadExecutorThread());
  EXPECT_NE(reports.find("!IsCurrentThreadExecutorThread()"), std::string::npos);
}

}  // namespace
}  // namespace kelcore::threads
