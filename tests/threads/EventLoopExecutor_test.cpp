#include <kelcore/threads/EventLoopExecutor.h>
#include <kelcore/threads/Gate.h>

#include <gtest/gtest.h>

#include <atomic>
#include <fstream>
#include <memory>
#include <sstream>
#include <string>
#include <thread>
#include <vector>

namespace kelcore::threads {
namespace {

TEST(EventLoopExecutor, RunsFunctionsInOrderOnItsOwnThread) {
  std::thread::id startThread;
  std::atomic<bool> ended{false};
  AsyncEventLoopExecutorPtr executor = CreateAsyncEventLoopExecutor(
      "loop executor", kThreadPriorityNormal, [&] { startThread = std::this_thread::get_id(); },
      [&] { ended = true; });
  // The start function has run before the factory returns.
  EXPECT_NE(startThread, std::thread::id());
  EXPECT_NE(startThread, std::this_thread::get_id());
  EXPECT_EQ(executor->GetThreadCount(), 1);

  std::vector<int> ran;
  std::vector<std::thread::id> threads;
  std::string name;
  Gate done(false);
  for (int i = 1; i <= 3; ++i) {
    ASSERT_TRUE(executor->CallAsynchronously(
        [&, i] {
          ran.push_back(i);
          threads.push_back(std::this_thread::get_id());
        },
        0));
  }
  auto finish = [&] {
#if defined(__linux__)
    std::ifstream comm("/proc/thread-self/comm");
    std::getline(comm, name);
#endif
    done.Open();
  };
  ASSERT_TRUE(executor->CallAsynchronously(finish, 0));
  ASSERT_TRUE(done.PassThrough(-1));
  EXPECT_EQ(ran, (std::vector<int>{1, 2, 3}));
  EXPECT_EQ(threads, std::vector<std::thread::id>(3, startThread));
#if defined(__linux__)
  EXPECT_EQ(name, "loop executor");
#endif

  executor->Terminate();
  EXPECT_TRUE(executor->IsTerminated());
  EXPECT_FALSE(executor->CallAsynchronously([] {}, 0));
  executor.reset();
  EXPECT_TRUE(ended.load()) << "destruction waits for the thread";
}

TEST(EventLoopExecutor, DestroyedWithoutTerminateEndsItsThread) {
  std::atomic<bool> ended{false};
  {
    AsyncEventLoopExecutorPtr executor = CreateAsyncEventLoopExecutor(
        "loop executor", kThreadPriorityBelowNormal, {}, [&] { ended = true; });
    EXPECT_TRUE(executor->CallAsynchronously([] {}, 0));
  }
  EXPECT_TRUE(ended.load());
}

// The last reference may go in a function running on the executor's own thread.
TEST(EventLoopExecutor, LastReferenceReleasedOnItsOwnThread) {
  // Shared with the thread, which may still be leaving Open when the test goes on.
  auto ended = std::make_shared<Gate>(false);
  AsyncEventLoopExecutorPtr executor = CreateAsyncEventLoopExecutor(
      "self release", kThreadPriorityNormal, {}, [ended] { ended->Open(); });
  Gate posted(false);
  ASSERT_TRUE(executor->CallAsynchronously(
      [&posted, keep = executor]() mutable {
        posted.PassThrough(-1);
        keep.reset();
      },
      0));
  executor.reset();
  posted.Open();
  EXPECT_TRUE(ended->PassThrough(-1));
}

}  // namespace
}  // namespace kelcore::threads
