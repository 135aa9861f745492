#include <kelcore/threads/EventLoopAdaptor.h>
#include <kelcore/threads/Executors.h>
#include <kelcore/threads/PlatformEventLoop.h>

#include <gtest/gtest.h>

#include <boost/make_shared.hpp>

#include <chrono>
#include <stdexcept>
#include <string>
#include <thread>
#include <vector>

#if !defined(_WIN32)
#include <poll.h>
#endif

#include "ManualTestExecutor.h"

namespace kelcore::threads {
namespace {

using testing::ManualTestExecutor;

// Each test adapts a thread of its own, so no queue outlives the test, and installs a
// manual executor as the CPU-bound executor, which times the delayed calls.
class EventLoopAdaptorTest : public ::testing::Test {
 protected:
  void SetUp() override {
    SetCPUBoundExecutor(timer_);
    ASSERT_EQ(GetCPUBoundExecutor(), timer_) << "another CPU-bound executor is alive";
  }

  template <class Body>
  static void OnFreshThread(Body body) {
    std::thread(body).join();
  }

  // Runs `fn` on another thread and waits for it.
  template <class Fn>
  static void FromOtherThread(Fn fn) {
    std::thread(fn).join();
  }

  boost::shared_ptr<ManualTestExecutor> timer_ = boost::make_shared<ManualTestExecutor>();
};

TEST_F(EventLoopAdaptorTest, ImmediateCallsRunOnTheLoopInAcceptanceOrder) {
  OnFreshThread([] {
    const AsyncEventLoopAdaptorPtr adaptor = AdaptCurrentEventLoopAsExecutor(true);
    const std::thread::id self = std::this_thread::get_id();
    std::vector<std::string> ran;
    bool allOnLoopThread = true;
    auto record = [&](const char* name) {
      return [&ran, &allOnLoopThread, self, name] {
        ran.push_back(name);
        allOnLoopThread = allOnLoopThread && std::this_thread::get_id() == self;
      };
    };
    EXPECT_TRUE(adaptor->CallAsynchronously(record("a"), 0));
    EXPECT_TRUE(adaptor->CallAsynchronously(record("b"), 0));
    FromOtherThread([&] {
      EXPECT_TRUE(adaptor->CallAsynchronously(record("c"), 0));
      EXPECT_TRUE(adaptor->CallAsynchronously(record("d"), 0));
    });
    EXPECT_TRUE(adaptor->CallAsynchronously(record("e"), 0));
    EXPECT_TRUE(ran.empty()) << "nothing runs before the loop does";
    EXPECT_TRUE(DispatchPlatformEventLoopMessages());
    EXPECT_EQ(ran, (std::vector<std::string>{"a", "b", "c", "d", "e"}));
    EXPECT_TRUE(allOnLoopThread);
    EXPECT_EQ(adaptor->GetThreadCount(), 1);
    EXPECT_FALSE(adaptor->CallAsynchronously({}, 0));
  });
}

// A fired delayed call is posted behind the thread's own messages; a call from another
// thread is taken ahead of them.
TEST_F(EventLoopAdaptorTest, CallsFromOtherThreadsOvertakeFiredDelayedCalls) {
  OnFreshThread([this] {
    const AsyncEventLoopAdaptorPtr adaptor = AdaptCurrentEventLoopAsExecutor(true);
    std::vector<std::string> ran;
    EXPECT_TRUE(adaptor->CallAsynchronously([&] { ran.push_back("delayed"); }, 50));
    EXPECT_EQ(timer_->Delays(), std::vector<unsigned int>{50});
    EXPECT_TRUE(DispatchPlatformEventLoopMessages());
    EXPECT_TRUE(ran.empty()) << "not before its delay has passed";
    ASSERT_TRUE(timer_->RunNext());
    FromOtherThread(
        [&] { EXPECT_TRUE(adaptor->CallAsynchronously([&] { ran.push_back("immediate"); }, 0)); });
    EXPECT_TRUE(DispatchPlatformEventLoopMessages());
    EXPECT_EQ(ran, (std::vector<std::string>{"immediate", "delayed"}));
  });
}

TEST_F(EventLoopAdaptorTest, TerminatedAdaptorRefusesWorkAndDropsFiringDelayedCalls) {
  OnFreshThread([this] {
    const AsyncEventLoopAdaptorPtr adaptor = AdaptCurrentEventLoopAsExecutor(false);
    bool ran = false;
    EXPECT_TRUE(adaptor->CallAsynchronously([&] { ran = true; }, 10));
    EXPECT_FALSE(adaptor->IsTerminated());
    adaptor->Terminate();
    EXPECT_TRUE(adaptor->IsTerminated());
    EXPECT_FALSE(adaptor->CallAsynchronously([&] { ran = true; }, 0));
    EXPECT_FALSE(adaptor->CallAsynchronously([&] { ran = true; }, 10));
    ASSERT_TRUE(timer_->RunNext());
    EXPECT_TRUE(DispatchPlatformEventLoopMessages()) << "no quit without quitLoopOnTerminate";
    EXPECT_FALSE(ran);
  });
}

TEST_F(EventLoopAdaptorTest, AdaptorOfAnEndedThreadRefusesWork) {
  AsyncEventLoopAdaptorPtr adaptor;
  OnFreshThread([&] { adaptor = AdaptCurrentEventLoopAsExecutor(true); });
  EXPECT_FALSE(adaptor->CallAsynchronously([] {}, 0));
  EXPECT_FALSE(adaptor->IsCurrentThreadExecutorThread());
}

// Terminate from another thread ends the loop after the calls accepted before it.
TEST_F(EventLoopAdaptorTest, TerminateEndsRunPlatformEventLoop) {
  OnFreshThread([] {
    const AsyncEventLoopAdaptorPtr adaptor = AdaptCurrentEventLoopAsExecutor(true);
    std::vector<int> ran;
    std::thread worker([&] {
      for (int i = 1; i <= 3; ++i) adaptor->CallAsynchronously([&ran, i] { ran.push_back(i); }, 0);
      adaptor->Terminate();
    });
    RunPlatformEventLoop();
    worker.join();
    EXPECT_EQ(ran, (std::vector<int>{1, 2, 3}));
  });
}

TEST_F(EventLoopAdaptorTest, EscapingExceptionsAreReportedAndTheLoopGoesOn) {
  OnFreshThread([] {
    const AsyncEventLoopAdaptorPtr adaptor = AdaptCurrentEventLoopAsExecutor(true);
    bool after = false;
    adaptor->CallAsynchronously([] { throw std::runtime_error("posted failure"); }, 0);
    adaptor->CallAsynchronously([&] { after = true; }, 0);
    adaptor->CallAsynchronously([&] { adaptor->Terminate(); }, 0);
    ::testing::internal::CaptureStderr();
    RunPlatformEventLoop();
    const std::string report = ::testing::internal::GetCapturedStderr();
    EXPECT_TRUE(after);
    EXPECT_NE(report.find("posted failure"), std::string::npos) << report;
  });
}

TEST_F(EventLoopAdaptorTest, FlushRunsPendingCallsOnTheAdaptedThreadOnly) {
  OnFreshThread([] {
    const AsyncEventLoopAdaptorPtr adaptor = AdaptCurrentEventLoopAsExecutor(true);
    int runs = 0;
    adaptor->CallAsynchronously([&] { ++runs; }, 0);
    ::testing::internal::CaptureStderr();
    FromOtherThread([&] { adaptor->Flush(); });
    EXPECT_NE(::testing::internal::GetCapturedStderr().find("IsCurrentThreadExecutorThread()"),
              std::string::npos);
    EXPECT_EQ(runs, 0);
    adaptor->Flush();
    EXPECT_EQ(runs, 1);
    EXPECT_TRUE(DispatchPlatformEventLoopMessages());
    EXPECT_EQ(runs, 1) << "the drain request finds nothing left";
  });
}

#if !defined(_WIN32)
// A host's own poll() loop: the descriptor is readable exactly while messages wait.
TEST_F(EventLoopAdaptorTest, HostPollLoopDrivesTheQueue) {
  OnFreshThread([] {
    const AsyncEventLoopAdaptorPtr adaptor = AdaptCurrentEventLoopAsExecutor(false);
    pollfd entry{GetPlatformEventLoopHandle(), POLLIN, 0};
    EXPECT_EQ(::poll(&entry, 1, 0), 0);
    int runs = 0;
    std::thread poster([&] {
      for (int i = 0; i < 3; ++i) adaptor->CallAsynchronously([&] { ++runs; }, 0);
    });
    while (runs < 3) {
      entry.revents = 0;
      ASSERT_EQ(::poll(&entry, 1, -1), 1);
      EXPECT_TRUE(entry.revents & POLLIN);
      EXPECT_TRUE(DispatchPlatformEventLoopMessages());
    }
    poster.join();
    EXPECT_TRUE(DispatchPlatformEventLoopMessages());  // drain requests left behind
    EXPECT_EQ(runs, 3);
    EXPECT_EQ(::poll(&entry, 1, 0), 0);
  });
}
#endif

TEST(EventLoopAdaptorRealTime, DelayedCallWaitsAtLeastItsDelay) {
  std::thread([] {
    const AsyncEventLoopAdaptorPtr adaptor = AdaptCurrentEventLoopAsExecutor(true);
    const auto start = std::chrono::steady_clock::now();
    std::chrono::steady_clock::duration waited{};
    adaptor->CallAsynchronously(
        [&] {
          waited = std::chrono::steady_clock::now() - start;
          adaptor->Terminate();
        },
        30);
    RunPlatformEventLoop();
    EXPECT_GE(waited, std::chrono::milliseconds(30));
  }).join();
}

}  // namespace
}  // namespace kelcore::threads
