// The lock-free queue and the completion port built on it: every packet is taken once,
// each producer's packets in its order, across many blocks; takers sleep and wake.
#include "threads/CompletionPort.h"
#include "threads/MPMCQueue.h"

#include "ExecutorTestSupport.h"

#include <gtest/gtest.h>

#include <atomic>
#include <chrono>
#include <cstdint>
#include <thread>
#include <vector>

namespace kelcore::threads {
namespace {

using testing::Scaled;

TEST(MPMCQueue, SingleThreadFifoAcrossBlocks) {
  detail::MPMCQueue<std::uintptr_t> queue;
  std::uintptr_t value = 0;
  EXPECT_FALSE(queue.TryPop(value));
  for (std::uintptr_t round = 0; round < 3; ++round) {
    for (std::uintptr_t i = 1; i <= 100; ++i) queue.Push(i);  // a little over three blocks
    for (std::uintptr_t i = 1; i <= 100; ++i) {
      ASSERT_TRUE(queue.TryPop(value));
      EXPECT_EQ(value, i);
    }
    EXPECT_TRUE(queue.Empty());
  }
  for (std::uintptr_t i = 1; i <= 40; ++i) queue.Push(i);  // left for the destructor
}

// Four producers and four consumers: each value is taken exactly once, and every
// consumer sees each producer's values in increasing order.
TEST(MPMCQueue, ManyProducersManyConsumers) {
  constexpr int kThreads = 4;
  const int perProducer = Scaled(200000);
  detail::MPMCQueue<std::uintptr_t> queue;
  std::vector<std::atomic<int>> taken(static_cast<std::size_t>(kThreads * perProducer));
  std::atomic<int> remaining{kThreads * perProducer};
  std::atomic<int> disorder{0};
  std::vector<std::thread> threads;
  for (int p = 0; p < kThreads; ++p) {
    threads.emplace_back([&, p] {
      for (int i = 0; i < perProducer; ++i) {
        queue.Push(static_cast<std::uintptr_t>(p) << 32 | static_cast<std::uintptr_t>(i));
      }
    });
  }
  for (int c = 0; c < kThreads; ++c) {
    threads.emplace_back([&] {
      std::int64_t last[kThreads] = {-1, -1, -1, -1};
      while (remaining.load() > 0) {
        std::uintptr_t value = 0;
        if (!queue.TryPop(value)) continue;
        const auto producer = static_cast<int>(value >> 32);
        const auto index = static_cast<std::int64_t>(value & 0xFFFFFFFF);
        if (index <= last[producer]) ++disorder;
        last[producer] = index;
        taken[static_cast<std::size_t>(producer * perProducer + index)].fetch_add(1);
        remaining.fetch_sub(1);
      }
    });
  }
  for (std::thread& thread : threads) thread.join();
  int wrong = 0;
  for (const auto& count : taken) wrong += count.load() != 1;
  EXPECT_EQ(wrong, 0);
  EXPECT_EQ(disorder.load(), 0);
}

TEST(CompletionPort, TakeTimesOutOnAnEmptyPort) {
  detail::CompletionPort port;
  EXPECT_EQ(port.Take(0), nullptr);
  const auto start = std::chrono::steady_clock::now();
  EXPECT_EQ(port.Take(20000), nullptr);
  EXPECT_GE(std::chrono::steady_clock::now() - start, std::chrono::milliseconds(20));
}

// Takers that went to sleep are woken by posts, one packet each.
TEST(CompletionPort, SleepingTakersAreWoken) {
  detail::CompletionPort port;
  constexpr int kTakers = 3;
  const int rounds = Scaled(20000);
  std::atomic<int> received{0};
  std::vector<std::thread> takers;
  for (int t = 0; t < kTakers; ++t) {
    takers.emplace_back([&] {
      while (port.Take(-1) != &port) received.fetch_add(1);
    });
  }
  static char packet;
  for (int i = 0; i < rounds; ++i) {
    port.Post(&packet);
    if (i % 64 == 0) std::this_thread::sleep_for(std::chrono::microseconds(200));
  }
  for (int t = 0; t < kTakers; ++t) port.Post(&port);  // one stop each
  for (std::thread& taker : takers) taker.join();
  EXPECT_EQ(received.load(), rounds);
}

}  // namespace
}  // namespace kelcore::threads
