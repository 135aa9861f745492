// A million functions (fewer in sanitizer builds) posted from two threads to each kind
// of executor all run exactly once; a concurrency-1 sub-executor runs them strictly in
// order, one at a time.
#include <kelcore/threads/Executors.h>

#include "ExecutorTestSupport.h"

#include <gtest/gtest.h>

#include <atomic>
#include <functional>
#include <memory>
#include <string>
#include <thread>
#include <vector>

namespace kelcore::threads {
namespace {

using testing::Countdown;
using testing::Scaled;

constexpr int kPosters = 2;

// Posts `perPoster` functions from each of two threads; function i of poster p marks
// slot p * perPoster + i. Waits until all ran, then checks each ran once.
void PostFromTwoThreads(AsyncExecutor& executor, int perPoster,
                        const std::function<void(int poster, int index)>& extra = {}) {
  const auto total = static_cast<std::size_t>(perPoster) * kPosters;
  std::unique_ptr<std::atomic<unsigned char>[]> runs(new std::atomic<unsigned char>[total]);
  for (std::size_t i = 0; i < total; ++i) runs[i].store(0);
  Countdown done(static_cast<std::int64_t>(total));
  std::vector<std::thread> posters;
  for (int p = 0; p < kPosters; ++p) {
    posters.emplace_back([&, p] {
      for (int i = 0; i < perPoster; ++i) {
        const bool accepted = executor.CallAsynchronously(
            [&, p, i] {
              if (extra) extra(p, i);
              runs[static_cast<std::size_t>(p) * static_cast<std::size_t>(perPoster) +
                   static_cast<std::size_t>(i)]
                  .fetch_add(1);
              done.Arrive();
            },
            0);
        EXPECT_TRUE(accepted);
        if (!accepted) done.Arrive();
      }
    });
  }
  for (std::thread& poster : posters) poster.join();
  done.Wait();
  std::size_t wrong = 0;
  for (std::size_t i = 0; i < total; ++i) wrong += runs[i].load() != 1;
  EXPECT_EQ(wrong, 0u);
}

constexpr int kPerPoster = Scaled(500000);

TEST(NoLostWork, CPUBoundExecutor) {
  PostFromTwoThreads(*CreateCPUBoundExecutor(), kPerPoster);
}

TEST(NoLostWork, IOBoundExecutor) {
  PostFromTwoThreads(*CreateIOBoundExecutor(), kPerPoster);
}

TEST(NoLostWork, ThreadedWorkQueue) {
  PostFromTwoThreads(*CreateAsyncThreadedExecutor("lost work", 2, kThreadPriorityNormal, {}, {}),
                     kPerPoster);
}

TEST(NoLostWork, StackBasedSubExecutor) {
  PostFromTwoThreads(*CreateStackBasedSubExecutor(CreateCPUBoundExecutor(), -1), kPerPoster);
}

// Each poster's functions run in its posting order, never two at once. The order check
// reads plain variables: each function must happen-before the next one.
TEST(NoLostWork, SerialSubExecutorKeepsOrder) {
  const AsyncThreadedExecutorPtr serial = CreateSubExecutor(CreateCPUBoundExecutor(), 1);
  int next[kPosters] = {0, 0};
  int outOfOrder = 0;
  std::atomic<int> inside{0};
  std::atomic<int> overlaps{0};
  PostFromTwoThreads(*serial, kPerPoster, [&](int poster, int index) {
    if (inside.fetch_add(1) != 0) ++overlaps;
    if (next[poster] != index) ++outOfOrder;
    next[poster] = index + 1;
    inside.fetch_sub(1);
  });
  serial->Flush();
  EXPECT_EQ(outOfOrder, 0);
  EXPECT_EQ(overlaps.load(), 0);
}

}  // namespace
}  // namespace kelcore::threads
