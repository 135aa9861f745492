#include <kelcore/config/DefaultErrorManager.h>
#include <kelcore/config/DefaultLocalizer.h>
#include <kelcore/config/LocalizedError.h>
#include <kelcore/threads/MainThread.h>
#include <kelcore/threads/PlatformEventLoop.h>
#include <kelcore/threads/SyncPoint.h>

#include <gtest/gtest.h>

#include <string>
#include <thread>
#include <vector>

namespace kelcore::threads {
namespace {

// Each test plays the main thread on a thread of its own and releases the registration
// before it ends.
template <class Body>
void AsMainThread(Body body) {
  std::thread(body).join();
}

bool IsMainThreadElsewhere() {
  bool isMain = true;
  std::thread([&] { isMain = CurrentThreadIsMainThread(); }).join();
  return isMain;
}

TEST(MainThread, CallsBeforeRegistrationAreDropped) {
  AsMainThread([] {
    EXPECT_FALSE(GetRegisteredMainThread());
    EXPECT_FALSE(CurrentThreadIsMainThread());
    bool ran = false;
    AsyncCallFromMainThread([&] { ran = true; });
    const AsyncEventLoopAdaptorPtr mainThread = RegisterCurrentThreadAsMainThread();
    EXPECT_TRUE(DispatchPlatformEventLoopMessages());
    EXPECT_FALSE(ran);
  });
}

TEST(MainThread, RegistrationIsWeakAndPerThread) {
  AsMainThread([] {
    AsyncEventLoopAdaptorPtr mainThread = RegisterCurrentThreadAsMainThread();
    ASSERT_TRUE(mainThread);
    EXPECT_EQ(RegisterCurrentThreadAsMainThread(), mainThread) << "registering twice is harmless";
    EXPECT_EQ(GetRegisteredMainThread(), mainThread);
    EXPECT_TRUE(CurrentThreadIsMainThread());
    EXPECT_FALSE(IsMainThreadElsewhere());
    mainThread.reset();
    EXPECT_FALSE(GetRegisteredMainThread());
    EXPECT_FALSE(CurrentThreadIsMainThread());
  });
  // The lapsed registration leaves room for another thread.
  AsMainThread([] {
    const AsyncEventLoopAdaptorPtr mainThread = RegisterCurrentThreadAsMainThread();
    EXPECT_TRUE(CurrentThreadIsMainThread());
  });
}

TEST(MainThread, CallsFromAWorkerRunInOrderOnTheMainThread) {
  AsMainThread([] {
    const AsyncEventLoopAdaptorPtr mainThread = RegisterCurrentThreadAsMainThread();
    std::vector<int> ran;
    bool onMainThread = true;
    std::thread worker([&] {
      for (int i = 1; i <= 3; ++i) {
        AsyncCallFromMainThread([&ran, &onMainThread, i] {
          ran.push_back(i);
          onMainThread = onMainThread && CurrentThreadIsMainThread();
        });
      }
      AsyncCallFromMainThread([] { GetRegisteredMainThread()->Terminate(); });
    });
    RunPlatformEventLoop();
    worker.join();
    EXPECT_EQ(ran, (std::vector<int>{1, 2, 3}));
    EXPECT_TRUE(onMainThread);
  });
}

// A second thread registering while the first registration lives is reported and
// raised as an input contract violation.
TEST(MainThread, SecondMainThreadIsAContractViolation) {
  config::DefaultLocalizer localizer;
  config::DefaultErrorManager manager;
  config::Localizer* previousLocalizer =
      config::Localizer::Initialized() ? config::Localizer::Get() : nullptr;
  config::ErrorManager* previousManager = config::ErrorManager::Get(true);
  config::Localizer::Set(&localizer);
  config::ErrorManager::Set(&manager);

  SyncPoint registered(2);
  SyncPoint checked(2);
  std::thread mainThread([&] {
    const AsyncEventLoopAdaptorPtr adaptor = RegisterCurrentThreadAsMainThread();
    registered.Wait();
    checked.Wait();
  });
  registered.Wait();
  ::testing::internal::CaptureStderr();
  try {
    RegisterCurrentThreadAsMainThread();
    ADD_FAILURE() << "no error raised";
  } catch (const config::LocalizedError& error) {
    EXPECT_EQ(error.GetKey(),
              "$$$/kelcore/utility/Error/Contract/InputContractViolation=An input contract "
              "violation has occurred!");
    EXPECT_EQ(error.GetLevel(), config::kErrorLevelFatal);
    EXPECT_EQ(error.GetComponent(), 105u);
    EXPECT_EQ(error.GetErrorNumber(), 25);
    EXPECT_STREQ(error.what(), "An input contract violation has occurred!");
  }
  const std::string report = ::testing::internal::GetCapturedStderr();
  EXPECT_FALSE(CurrentThreadIsMainThread());
  checked.Wait();
  mainThread.join();

  config::ErrorManager::Set(previousManager);
  config::Localizer::Set(previousLocalizer);
  for (const char* text :
       {"!ret || ret->IsCurrentThreadExecutorThread()", "..\\..\\threads\\src\\SharedThreads",
        "kelcore::threads::RegisterCurrentThreadAsMainThread"}) {
    EXPECT_NE(report.find(text), std::string::npos) << text << " in " << report;
  }
}

}  // namespace
}  // namespace kelcore::threads
