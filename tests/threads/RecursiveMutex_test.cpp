#include <kelcore/threads/ConditionVariable.h>
#include <kelcore/threads/RecursiveMutex.h>

#include <gtest/gtest.h>

#include <thread>
#include <vector>

namespace kelcore::threads {
namespace {

bool TryLockElsewhere(const RecursiveMutex& mutex) {
  bool locked = false;
  std::thread([&] {
    RecursiveMutex::ScopedTryLock attempt(mutex, "TryLockElsewhere");
    locked = attempt.IsLocked();
  }).join();
  return locked;
}

TEST(RecursiveMutex, OwnerRelocksAndOthersWaitForTheLastUnlock) {
  RecursiveMutex mutex;
  mutex.Lock("outer");
  EXPECT_TRUE(mutex.TryLock("inner"));
  EXPECT_FALSE(TryLockElsewhere(mutex));
  mutex.Unlock();
  EXPECT_FALSE(TryLockElsewhere(mutex)) << "still held once";
  mutex.Unlock();
  EXPECT_TRUE(TryLockElsewhere(mutex));
}

// Every waiter is inside Wait (it released the mutex there) before WakeAll; all of them
// wake, see the flag and leave.
TEST(ConditionVariable, WakeAllReleasesEveryWaiter) {
  constexpr int kWaiters = 3;
  RecursiveMutex mutex;
  ConditionVariable changed;
  int waiting = 0;
  bool go = false;
  int woken = 0;
  std::vector<std::thread> threads;
  for (int t = 0; t < kWaiters; ++t) {
    threads.emplace_back([&] {
      RecursiveMutex::ScopedLock lock(mutex);
      ++waiting;
      changed.WakeAll();  // tells the main thread; it waits on the same variable
      while (!go) changed.Wait(lock);
      ++woken;
    });
  }
  {
    RecursiveMutex::ScopedLock lock(mutex);
    while (waiting < kWaiters) changed.Wait(lock);
    go = true;
    changed.WakeAll();
  }
  for (std::thread& thread : threads) thread.join();
  EXPECT_EQ(woken, kWaiters);
}

TEST(ConditionVariable, HandsItemsFromProducerToConsumerWithTryLock) {
  constexpr int kItems = 1000;
  RecursiveMutex mutex;
  ConditionVariable ready;
  std::vector<int> items;
  long sum = 0;
  std::thread consumer([&] {
    int taken = 0;
    while (taken < kItems) {
      RecursiveMutex::ScopedTryLock lock(mutex);
      if (!lock.IsLocked()) continue;
      while (items.empty()) ready.Wait(lock);
      for (int item : items) sum += item;
      taken += static_cast<int>(items.size());
      items.clear();
    }
  });
  for (int i = 1; i <= kItems; ++i) {
    RecursiveMutex::ScopedLock lock(mutex);
    items.push_back(i);
    ready.WakeOne();
  }
  consumer.join();
  EXPECT_EQ(sum, long{kItems} * (kItems + 1) / 2);
}

}  // namespace
}  // namespace kelcore::threads
