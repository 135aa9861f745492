#include <kelcore/threads/SyncPoint.h>

#include <gtest/gtest.h>

#include <atomic>
#include <optional>
#include <string>
#include <system_error>
#include <thread>
#include <vector>

namespace kelcore::threads {
namespace {

TEST(SyncPoint, CountZeroIsAnInvalidArgument) {
  try {
    SyncPoint point(0);
    FAIL() << "no error";
  } catch (const std::system_error& error) {
    EXPECT_EQ(error.code().value(), 22);
    EXPECT_EQ(error.code().category(), std::generic_category());
    EXPECT_EQ(std::string(error.what()), "barrier constructor: count cannot be zero.");
  }
}

TEST(SyncPoint, SinglePartyAlwaysCompletesItsPhase) {
  SyncPoint point(1);
  for (int i = 0; i < 5; ++i) EXPECT_TRUE(point.Wait());
}

// Three parties over many phases: exactly one true per phase, and a party that runs
// ahead cannot complete a phase on its own (the fourth call starts the next phase).
TEST(SyncPoint, ExactlyOneWinnerPerPhase) {
  constexpr int kParties = 3;
  constexpr int kPhases = 50;
  SyncPoint point(kParties);
  std::atomic<int> winners{0};
  std::atomic<int> arrivals{0};
  std::atomic<int> lateArrivals{0};
  std::vector<std::thread> threads;
  for (int t = 0; t < kParties; ++t) {
    threads.emplace_back([&] {
      for (int phase = 0; phase < kPhases; ++phase) {
        ++arrivals;
        if (point.Wait()) ++winners;
        // Every party of this phase has arrived before anyone leaves it.
        if (arrivals.load() < (phase + 1) * kParties) ++lateArrivals;
      }
    });
  }
  for (std::thread& thread : threads) thread.join();
  EXPECT_EQ(winners.load(), kPhases);
  EXPECT_EQ(lateArrivals.load(), 0);
}

// Copies share the barrier, and a wait keeps it alive after every copy is gone.
TEST(SyncPoint, CopiesShareOneBarrierThatOutlivesThem) {
  std::optional<SyncPoint> original(std::in_place, 2);
  SyncPoint copy(1);
  copy = *original;
  SyncPoint handshake(2);
  std::atomic<bool> result{true};
  std::thread waiter([&, mine = *original]() mutable {
    handshake.Wait();
    result = mine.Wait();
  });
  handshake.Wait();
  original.reset();
  const bool mine = copy.Wait();
  waiter.join();
  EXPECT_NE(mine, result.load());
}

}  // namespace
}  // namespace kelcore::threads
