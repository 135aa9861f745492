// Sub-executors over a parent whose calls the test runs by hand (scheduling, pausing,
// flushing, termination), then over real threads (ordering and exclusion under load).
#include <kelcore/threads/Executors.h>

#include "ExecutorTestSupport.h"

#include <gtest/gtest.h>

#include <boost/make_shared.hpp>
#include <boost/weak_ptr.hpp>

#include <chrono>
#include <stdexcept>
#include <thread>
#include <vector>

namespace kelcore::threads {
namespace {

using testing::Countdown;
using testing::Scaled;
using testing::StepParent;

// Effective concurrency from the parent's thread count and the requested value.
TEST(SubExecutor, EffectiveConcurrency) {
  struct Row {
    int parentThreads;
    int requested;
    int effective;  // 0: no sub-executor
  };
  const Row rows[] = {{8, 1, 1}, {8, 20, 8}, {8, 0, 0}, {2, -3, 6}, {0, 5, 0}, {0, -1, 0}};
  for (const Row& row : rows) {
    const auto parent = boost::make_shared<StepParent>(row.parentThreads);
    const AsyncThreadedExecutorPtr sub = CreateQueueBasedSubExecutor(parent, row.requested);
    EXPECT_EQ(sub ? sub->GetThreadCount() : 0, row.effective)
        << row.parentThreads << " threads, " << row.requested << " requested";
  }
  EXPECT_FALSE(CreateSubExecutor(AsyncExecutorPtr(), 1));
}

TEST(SubExecutor, StartsAtMostMaxConcurrentAndRunsInQueueOrder) {
  const auto parent = boost::make_shared<StepParent>(8);
  const AsyncThreadedExecutorPtr sub = CreateSubExecutor(parent, 2);
  std::vector<int> order;
  for (int i = 0; i < 5; ++i) sub->CallAsynchronously([&order, i] { order.push_back(i); }, 0);
  EXPECT_EQ(parent->Pending(), 2u);
  parent->RunAll();
  EXPECT_EQ(order, (std::vector<int>{0, 1, 2, 3, 4}));
}

TEST(SubExecutor, StackBasedStartsNewestFirst) {
  const auto parent = boost::make_shared<StepParent>(1);
  const AsyncExecutorPtr sub = CreateStackBasedSubExecutor(parent, 1);
  std::vector<int> order;
  for (int i = 0; i < 4; ++i) sub->CallAsynchronously([&order, i] { order.push_back(i); }, 0);
  parent->RunAll();
  EXPECT_EQ(order, (std::vector<int>{3, 2, 1, 0}));
}

TEST(SubExecutor, WrapperRunsAroundEachFunction) {
  const auto parent = boost::make_shared<StepParent>(1);
  std::vector<std::string> trace;
  const AsyncThreadedExecutorPtr sub =
      CreateSubExecutorWithFunctionWrapper(parent, 1, [&trace](const boost::function<void()>& fn) {
        trace.push_back("enter");
        fn();
        trace.push_back("leave");
      });
  sub->CallAsynchronously([&trace] { trace.push_back("a"); }, 0);
  sub->CallAsynchronously([&trace] { trace.push_back("b"); }, 0);
  parent->RunAll();
  EXPECT_EQ(trace, (std::vector<std::string>{"enter", "a", "leave", "enter", "b", "leave"}));
}

// A start that finds the sub-executor paused must leave its function for Resume.
TEST(SubExecutor, PauseThenResumeNeverStrandsAQueuedFunction) {
  const auto parent = boost::make_shared<StepParent>(1);
  const AsyncThreadedExecutorPtr sub = CreateSubExecutor(parent, 1);
  int runs = 0;
  sub->CallAsynchronously([&runs] { ++runs; }, 0);
  sub->Pause();
  parent->RunAll();  // the start finds the pause
  EXPECT_EQ(runs, 0);
  sub->CallAsynchronously([&runs] { ++runs; }, 0);  // queued while paused: no start
  EXPECT_EQ(parent->Pending(), 0u);
  sub->Resume();
  parent->RunAll();
  EXPECT_EQ(runs, 2);
  sub->Flush();  // every serial retired
}

// With two at a time, the last serial can finish first: Flush must still wait for the
// earlier one.
TEST(SubExecutor, FlushWaitsForEveryEarlierFunctionNotOnlyTheLast) {
  const auto parent = boost::make_shared<StepParent>(2);
  const AsyncThreadedExecutorPtr sub = CreateSubExecutor(parent, 2);
  std::atomic<bool> firstDone{false};
  std::atomic<bool> flushed{false};
  std::atomic<bool> flushedEarly{false};
  std::thread flusher;
  sub->CallAsynchronously(
      [&] {
        parent->Run(0);  // the second function runs and finishes inside the first
        flusher = std::thread([&] {
          sub->Flush();
          flushedEarly = !firstDone.load();
          flushed = true;
        });
        std::this_thread::sleep_for(std::chrono::milliseconds(20));
        EXPECT_FALSE(flushed.load());
        firstDone = true;
      },
      0);
  sub->CallAsynchronously([] {}, 0);
  parent->Run(0);
  flusher.join();
  EXPECT_FALSE(flushedEarly.load());
}

// A serial sub-executor runs waiting functions in batches: a Flush must still return
// once its own last function has finished, while a later one of the batch runs.
TEST(SubExecutor, FlushDoesNotWaitForTheRestOfABatch) {
  const auto parent = boost::make_shared<StepParent>(1);
  const AsyncThreadedExecutorPtr sub = CreateSubExecutor(parent, 1);
  std::atomic<bool> flushed{false};
  bool sawFlush = false;
  sub->CallAsynchronously([] {}, 0);
  std::thread flusher([&] {
    sub->Flush();
    flushed = true;
  });
  std::this_thread::sleep_for(std::chrono::milliseconds(200));  // the flush takes its target
  sub->CallAsynchronously(
      [&] {
        const auto giveUp = std::chrono::steady_clock::now() + std::chrono::seconds(10);
        while (!flushed.load() && std::chrono::steady_clock::now() < giveUp) {
          std::this_thread::yield();
        }
        sawFlush = flushed.load();
      },
      0);
  parent->RunAll();  // both functions in one batch
  flusher.join();
  EXPECT_TRUE(sawFlush);
}

TEST(SubExecutor, FlushFromItsOwnFunctionReturnsAtOnce) {
  const auto parent = boost::make_shared<StepParent>(1);
  const AsyncThreadedExecutorPtr sub = CreateSubExecutor(parent, 1);
  bool inside = false;
  sub->CallAsynchronously(
      [&] {
        sub->Flush();
        inside = sub->IsCurrentThreadExecutorThread();
      },
      0);
  parent->RunAll();
  EXPECT_TRUE(inside);
  EXPECT_FALSE(sub->IsCurrentThreadExecutorThread());
}

TEST(SubExecutor, DelayedFunctionRunsAtOnceOrJoinsTheQueue) {
  const auto parent = boost::make_shared<StepParent>(1);
  const AsyncThreadedExecutorPtr sub = CreateSubExecutor(parent, 1);
  std::vector<char> order;
  sub->CallAsynchronously([&order] { order.push_back('d'); }, 50);
  ASSERT_EQ(parent->Pending(), 1u);
  EXPECT_EQ(parent->DelayOf(0), 50u);
  parent->Run(0);  // due with a free slot: runs at once
  sub->CallAsynchronously([&order] { order.push_back('e'); }, 50);
  sub->CallAsynchronously([&order] { order.push_back('q'); }, 0);  // takes the slot
  parent->Run(0);  // due while the slot is taken: queued behind 'q'
  parent->RunAll();
  EXPECT_EQ(order, (std::vector<char>{'d', 'q', 'e'}));
}

TEST(SubExecutor, TerminateDropsQueuedFunctionsAndRefusesNewOnes) {
  const auto parent = boost::make_shared<StepParent>(1);
  const AsyncThreadedExecutorPtr sub = CreateSubExecutor(parent, 1);
  auto token = boost::make_shared<int>(0);
  const boost::weak_ptr<int> watch = token;
  int runs = 0;
  sub->CallAsynchronously([&runs, token] { ++runs; }, 0);
  sub->CallAsynchronously([&runs, token] { ++runs; }, 0);
  sub->CallAsynchronously([&runs, token] { ++runs; }, 5);
  token.reset();
  sub->Terminate();
  EXPECT_TRUE(watch.expired());
  EXPECT_TRUE(sub->IsTerminated());
  EXPECT_FALSE(sub->CallAsynchronously([&runs] { ++runs; }, 0));
  parent->RunAll();
  EXPECT_EQ(runs, 0);
  sub->Flush();
}

TEST(SubExecutor, TerminatesItselfWhenTheParentRefuses) {
  const auto parent = boost::make_shared<StepParent>(1);
  const AsyncThreadedExecutorPtr sub = CreateSubExecutor(parent, 1);
  parent->Terminate();
  EXPECT_FALSE(sub->CallAsynchronously([] {}, 0));
  EXPECT_TRUE(sub->IsTerminated());
  sub->Flush();
}

TEST(SubExecutor, ExceptionReachesTheParentAfterTheBooksAreSettled) {
  const auto parent = boost::make_shared<StepParent>(1);
  const AsyncThreadedExecutorPtr sub = CreateSubExecutor(parent, 1);
  bool later = false;
  sub->CallAsynchronously([] { throw std::runtime_error("boom"); }, 0);
  sub->CallAsynchronously([&later] { later = true; }, 0);
  EXPECT_THROW(parent->Run(0), std::runtime_error);
  parent->RunAll();  // the slot was handed back and the next function started
  EXPECT_TRUE(later);
  sub->Flush();
}

TEST(SubExecutor, DestroyingItDropsDelayedFunctionsButRunsQueuedOnes) {
  const auto parent = boost::make_shared<StepParent>(1);
  AsyncThreadedExecutorPtr sub = CreateSubExecutor(parent, 1);
  auto token = boost::make_shared<int>(0);
  const boost::weak_ptr<int> watch = token;
  bool queuedRan = false;
  sub->CallAsynchronously([token] {}, 1000);
  token.reset();
  sub->CallAsynchronously([&queuedRan] { queuedRan = true; }, 0);
  sub.reset();
  EXPECT_TRUE(watch.expired());
  parent->RunAll();
  EXPECT_TRUE(queuedRan);
}

// Over a parent of eight real threads: one at a time, in order, Flush after the last.
TEST(SubExecutor, ConcurrencyOneRunsStrictlyInOrderOnAThreadedParent) {
  const AsyncThreadedExecutorPtr parent =
      CreateAsyncThreadedExecutor("sub parent", 8, kThreadPriorityNormal, {}, {});
  const AsyncThreadedExecutorPtr sub = CreateSubExecutor(parent, 1);
  std::vector<int> order;
  std::atomic<int> inside{0};
  std::atomic<int> overlaps{0};
  for (int i = 0; i < 100; ++i) {
    sub->CallAsynchronously(
        [&, i] {
          if (inside.fetch_add(1) != 0) ++overlaps;
          order.push_back(i);
          inside.fetch_sub(1);
        },
        0);
  }
  sub->Flush();
  ASSERT_EQ(order.size(), 100u);
  for (int i = 0; i < 100; ++i) EXPECT_EQ(order[static_cast<std::size_t>(i)], i);
  EXPECT_EQ(overlaps.load(), 0);
}

// Pausing and resuming while another thread posts never loses a function.
TEST(SubExecutor, PauseResumeWhilePostingLosesNothing) {
  const AsyncExecutorPtr pool = CreateCPUBoundExecutor();
  const AsyncThreadedExecutorPtr sub = CreateSubExecutor(pool, -2);
  const int count = Scaled(100000);
  std::atomic<int> runs{0};
  std::atomic<bool> posting{true};
  std::thread toggler([&] {
    while (posting.load()) {
      sub->Pause();
      std::this_thread::yield();
      sub->Resume();
    }
  });
  for (int i = 0; i < count; ++i) sub->CallAsynchronously([&runs] { ++runs; }, 0);
  posting = false;
  toggler.join();
  sub->Flush();
  EXPECT_EQ(runs.load(), count);
}

}  // namespace
}  // namespace kelcore::threads
