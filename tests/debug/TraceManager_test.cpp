// The trace manager on a store in memory (white-box: the manager's sources are built
// into this program, so each test has a manager of its own).
#include "DebugTestSupport.h"

#include "debug/TraceManager.h"

#include <atomic>
#include <condition_variable>
#include <cstring>
#include <functional>
#include <thread>

namespace kelcore::debug {
namespace {

using testing::C;
using testing::Narrow;
using testing::U8;

class MemoryStore : public TraceDatabaseStore {
 public:
  struct Shared {
    std::string text;
    int writes = 0;
    std::function<void()> onRead;
  };
  explicit MemoryStore(Shared& shared) : shared_(shared) {}
  UTF8String Read() override {
    if (shared_.onRead) shared_.onRead();
    return U8(shared_.text);
  }
  void Write(const UTF8String& text) override {
    shared_.text = Narrow(text);
    ++shared_.writes;
  }

 private:
  Shared& shared_;
};

class TraceManagerTest : public ::testing::Test {
 protected:
  MemoryStore::Shared store_;
  TraceManager manager_{std::make_unique<MemoryStore>(store_)};
};

TEST_F(TraceManagerTest, AbsentCategoriesUseTheDefaults) {
  EXPECT_TRUE(manager_.Enabled(C("X"), 5, false));
  EXPECT_FALSE(manager_.Enabled(C("X"), 6, false));
  EXPECT_TRUE(manager_.Enabled(C("X"), -100, false));
  std::list<UTF8String> names;
  manager_.GetCategories(names);
  EXPECT_TRUE(names.empty());
  EXPECT_EQ(manager_.ChangeCount(), 0);

  EXPECT_TRUE(manager_.Enabled(C("X"), 5, true));
  EXPECT_EQ(manager_.ChangeCount(), 1);
  EXPECT_EQ(store_.text, "X\t1\t5\n");
  EXPECT_TRUE(manager_.Enabled(C("X"), 5, true));  // stored now: no further change
  EXPECT_EQ(manager_.ChangeCount(), 1);
  EXPECT_EQ(manager_.GetMasterVolume(), 10);
}

TEST_F(TraceManagerTest, TheMasterLimitsEveryCategory) {
  manager_.SetVolume(C("X"), 100);
  EXPECT_TRUE(manager_.Enabled(C("X"), 10, false));
  manager_.SetMasterVolume(3);
  EXPECT_FALSE(manager_.Enabled(C("X"), 4, false));
  EXPECT_TRUE(manager_.Enabled(C("X"), 3, false));
  // A test the master rejects creates nothing.
  const int before = manager_.ChangeCount();
  EXPECT_FALSE(manager_.Enabled(C("Y"), 4, true));
  EXPECT_EQ(manager_.ChangeCount(), before);
  EXPECT_EQ(manager_.GetMasterVolume(), 3);
  UTF8String text;
  manager_.GetAsString(text);
  EXPECT_EQ(Narrow(text), "Master\t1\t3\nX\t1\t100\n");
}

TEST_F(TraceManagerTest, MergingKeepsWhatTheTextDoesNotName) {
  manager_.SetVolume(C("Kept"), 2);
  const int before = manager_.ChangeCount();
  manager_.SetFromString(U8("A\t0\t9\nB\t1\t2"));
  EXPECT_EQ(manager_.ChangeCount(), before + 1);
  EXPECT_FALSE(manager_.Enabled(C("A"), 0, false));
  UTF8String text;
  manager_.GetAsString(text);
  EXPECT_EQ(Narrow(text), "A\t0\t9\nKept\t1\t2\n");

  manager_.SetFromString(U8("Kept\t2\t7\nNew\ttrue\t-1\n"));
  manager_.GetAsString(text);
  EXPECT_EQ(Narrow(text), "A\t0\t9\nKept\t0\t7\nNew\t0\t-1\n");
  EXPECT_EQ(store_.text, Narrow(text));
}

TEST_F(TraceManagerTest, SettersKeepTheSwitchAndWriteNegativeVolumes) {
  manager_.SetFromString(U8("Off\t0\t1\n"));
  manager_.SetVolume(C("Off"), 8);
  manager_.SetVolume(C("Cat"), -1);
  EXPECT_EQ(manager_.GetVolume(C("Cat")), -1);
  EXPECT_EQ(manager_.GetVolume(C("Fresh")), 5);  // created by the getter
  UTF8String text;
  manager_.GetAsString(text);
  EXPECT_EQ(Narrow(text), "Cat\t1\t-1\nFresh\t1\t5\nOff\t0\t8\n");
  EXPECT_FALSE(manager_.Enabled(C("Off"), 0, false));
  EXPECT_FALSE(manager_.Enabled(C("Cat"), 0, false));
  EXPECT_TRUE(manager_.Enabled(C("Cat"), -1, false));
}

TEST_F(TraceManagerTest, LoadsOnFirstUseAndAgainAfterShutdown) {
  store_.text = "Master\t1\t4\nNet\t0\t3\n";
  EXPECT_FALSE(manager_.Enabled(C("Net"), 1, false));
  EXPECT_EQ(manager_.GetMasterVolume(), 4);
  EXPECT_EQ(store_.writes, 0);
  manager_.Shutdown();
  EXPECT_EQ(store_.writes, 1);
  store_.text = "Net\t1\t3\n";  // edited while unloaded
  EXPECT_TRUE(manager_.Enabled(C("Net"), 1, false));
  EXPECT_EQ(manager_.GetMasterVolume(), 10);
}

TEST_F(TraceManagerTest, DisabledFileWritesStopEveryWrite) {
  manager_.SetFileWritesDisabled(true);
  manager_.SetVolume(C("A"), 1);
  manager_.SetFromString(U8("B\t1\t1\n"));
  manager_.Shutdown();
  EXPECT_EQ(store_.writes, 0);
}

TEST_F(TraceManagerTest, TheMasterInEffectChangesOnlyThroughItsSetter) {
  EXPECT_TRUE(manager_.Enabled(C("X"), 5, false));  // fills the master cache
  manager_.SetFromString(U8("Master\t0\t0\n"));
  EXPECT_TRUE(manager_.Enabled(C("X"), 5, false));
  manager_.SetMasterVolume(2);  // keeps the stored switch, which is now off
  EXPECT_FALSE(manager_.Enabled(C("X"), 0, false));
}

TEST_F(TraceManagerTest, ATestMadeDuringATestAnswersFalse) {
  // The store is read inside the first locked test; a test made from there is nested.
  std::vector<bool> nested;
  store_.onRead = [&] {
    nested.push_back(manager_.Enabled(C("X"), 0, false));
    nested.push_back(manager_.Enabled(C("X"), 0, true));
  };
  EXPECT_TRUE(manager_.Enabled(C("X"), 0, false));
  EXPECT_EQ(nested, (std::vector<bool>{false, false}));
  // The flag is cleared afterwards, also on the cached path.
  EXPECT_TRUE(manager_.Enabled(C("X"), 0, false));
  EXPECT_TRUE(manager_.Enabled(C("X"), 0, false));
}

TEST_F(TraceManagerTest, AnotherThreadWaitsForATestUnderWayInsteadOfSeeingItsFlag) {
  std::mutex lock;
  std::condition_variable changed;
  bool reading = false;
  bool release = false;
  store_.onRead = [&] {
    std::unique_lock<std::mutex> hold(lock);
    reading = true;
    changed.notify_all();
    changed.wait(hold, [&] { return release; });
  };
  std::thread first([&] { EXPECT_TRUE(manager_.Enabled(C("A"), 1, false)); });
  {
    std::unique_lock<std::mutex> hold(lock);
    changed.wait(hold, [&] { return reading; });
  }
  std::atomic<bool> secondAnswer{false};
  std::thread second([&] { secondAnswer = manager_.Enabled(C("B"), 1, false); });
  {
    std::lock_guard<std::mutex> hold(lock);
    release = true;
  }
  changed.notify_all();
  first.join();
  second.join();
  EXPECT_TRUE(secondAnswer.load());
}

TEST_F(TraceManagerTest, CachedAnswersFollowEveryChange) {
  // Each step is preceded by a test that fills the cache with the previous state.
  EXPECT_TRUE(manager_.Enabled(C("C"), 5, false));
  manager_.SetVolume(C("C"), 1);
  EXPECT_FALSE(manager_.Enabled(C("C"), 5, false));
  manager_.SetFromString(U8("C\t0\t9\n"));
  EXPECT_FALSE(manager_.Enabled(C("C"), 1, false));
  manager_.SetFromString(U8("C\t1\t9\n"));
  EXPECT_TRUE(manager_.Enabled(C("C"), 9, false));
  manager_.SetMasterVolume(8);
  EXPECT_FALSE(manager_.Enabled(C("C"), 9, false));
  manager_.Shutdown();
  store_.text = "C\t1\t2\n";
  EXPECT_FALSE(manager_.Enabled(C("C"), 3, false));
  // An absent category cached from a non-creating test is still created when asked.
  EXPECT_TRUE(manager_.Enabled(C("D"), 1, false));
  const int before = manager_.ChangeCount();
  EXPECT_TRUE(manager_.Enabled(C("D"), 1, true));
  EXPECT_EQ(manager_.ChangeCount(), before + 1);
}

TEST_F(TraceManagerTest, ANameIsReadAgainWhereverItLives) {
  // The cache remembers names by address too; the text at an address may change.
  manager_.SetFromString(U8("Long\t0\t5\nLo\t1\t5\nLonger\t1\t5\n"));
  unsigned char name[8] = "Long";
  EXPECT_FALSE(manager_.Enabled(name, 1, false));
  EXPECT_FALSE(manager_.Enabled(name, 1, false));
  name[2] = 0;  // "Lo"
  EXPECT_TRUE(manager_.Enabled(name, 1, false));
  std::memcpy(name, "Longer", 7);
  EXPECT_TRUE(manager_.Enabled(name, 1, false));
  std::memcpy(name, "Long", 5);
  EXPECT_FALSE(manager_.Enabled(name, 1, false));
  const unsigned char* const copy = C("Long");
  EXPECT_FALSE(manager_.Enabled(copy, 1, false));
}

TEST_F(TraceManagerTest, ConcurrentTestsSeeEachCompletedChange) {
  // Readers hammer the cached path while the main thread changes the volume; after each
  // change has returned, a reader started later must see it (lower bounds only).
  std::atomic<long> published{0};
  std::atomic<bool> stop{false};
  std::atomic<int> stale{0};
  std::vector<std::thread> readers;
  for (int t = 0; t < 2; ++t) {
    readers.emplace_back([&] {
      while (!stop.load()) {
        const long volume = published.load(std::memory_order_acquire);
        // The category's volume is at least `volume` now: the test must pass.
        if (!manager_.Enabled(C("Hot"), volume, false)) ++stale;
      }
    });
  }
  manager_.SetMasterVolume(1000000);
  for (long v = 1; v <= 2000; ++v) {
    manager_.SetVolume(C("Hot"), v);
    published.store(v, std::memory_order_release);
  }
  stop = true;
  for (auto& reader : readers) reader.join();
  EXPECT_EQ(stale.load(), 0);
}

}  // namespace
}  // namespace kelcore::debug
