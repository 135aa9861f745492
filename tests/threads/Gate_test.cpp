#include <kelcore/threads/Gate.h>
#include <kelcore/threads/SyncPoint.h>

#include <gtest/gtest.h>

#include <atomic>
#include <chrono>
#include <thread>
#include <vector>

namespace kelcore::threads {
namespace {

// State transitions on one thread, each row a sequence of operations and the expected
// answer of PassThrough(0) at the end.
TEST(Gate, OpenAndCloseAreIdempotent) {
  enum Op { kOpen, kClose };
  struct Row {
    bool initial;
    std::vector<Op> ops;
    bool passes;
  };
  const Row rows[] = {
      {true, {}, true},
      {false, {}, false},
      {false, {kOpen}, true},
      {false, {kOpen, kOpen, kClose}, false},
      {true, {kClose, kClose}, false},
      {true, {kClose, kOpen}, true},
      {false, {kClose, kOpen, kOpen}, true},
  };
  for (const Row& row : rows) {
    Gate gate(row.initial);
    for (Op op : row.ops) op == kOpen ? gate.Open() : gate.Close();
    EXPECT_EQ(gate.PassThrough(0), row.passes);
    EXPECT_EQ(gate.PassThrough(0), row.passes) << "a pass must not change the state";
  }
}

// Nodes are recycled: a node left open or closed by its last gate must still serve a new
// gate in the requested state.
TEST(Gate, RecycledNodesTakeTheRequestedState) {
  for (int round = 0; round < 100; ++round) {
    const bool previous = round % 2 == 0;
    { Gate old(previous); }
    Gate fresh(!previous);
    EXPECT_EQ(fresh.PassThrough(0), !previous) << round;
  }
}

TEST(Gate, ClosedGateTimesOutAfterAtLeastTheGivenTime) {
  Gate gate(false);
  const auto start = std::chrono::steady_clock::now();
  EXPECT_FALSE(gate.PassThrough(30));
  EXPECT_GE(std::chrono::steady_clock::now() - start, std::chrono::milliseconds(30));
}

TEST(Gate, WaitersWithoutLimitPassOnlyAfterOpen) {
  constexpr int kWaiters = 4;
  Gate gate(false);
  SyncPoint started(kWaiters + 1);
  std::atomic<int> passed{0};
  int published = 0;  // written before Open, read by the waiters after they pass
  std::atomic<int> seen{0};
  std::vector<std::thread> waiters;
  for (int i = 0; i < kWaiters; ++i) {
    waiters.emplace_back([&] {
      started.Wait();
      if (gate.PassThrough(-5)) {
        seen += published;
        ++passed;
      }
    });
  }
  started.Wait();
  EXPECT_EQ(passed.load(), 0);
  published = 1;
  gate.Open();
  for (std::thread& waiter : waiters) waiter.join();
  EXPECT_EQ(passed.load(), kWaiters);
  EXPECT_EQ(seen.load(), kWaiters);
}

// Open, Close and PassThrough racing on one gate, while other threads churn the pool.
// The gate must end in the state of the last call, and gates made concurrently must
// never share a node (a corrupted pool would hand one node to two gates).
TEST(Gate, ConcurrentUseKeepsGatesApart) {
  constexpr int kThreads = 4;
  constexpr int kRounds = 2000;
  Gate shared(false);
  std::atomic<int> wrongState{0};
  SyncPoint start(kThreads);
  std::vector<std::thread> threads;
  for (int t = 0; t < kThreads; ++t) {
    threads.emplace_back([&, t] {
      start.Wait();
      for (int i = 0; i < kRounds; ++i) {
        (i + t) % 2 == 0 ? shared.Open() : shared.Close();
        shared.PassThrough(0);
        Gate mine(false);
        if (mine.PassThrough(0)) ++wrongState;
        mine.Open();
        if (!mine.PassThrough(0)) ++wrongState;
      }
    });
  }
  for (std::thread& thread : threads) thread.join();
  EXPECT_EQ(wrongState.load(), 0);
  shared.Open();
  EXPECT_TRUE(shared.PassThrough(0));
  shared.Close();
  EXPECT_FALSE(shared.PassThrough(0));
}

}  // namespace
}  // namespace kelcore::threads
