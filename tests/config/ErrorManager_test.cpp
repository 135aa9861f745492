#include <kelcore/config/DeferredErrorReporter.h>
#include <kelcore/config/ErrorManager.h>
#include <kelcore/config/ExecuteTopLevelFunction.h>

#include <new>
#include <thread>

#include "ConfigTestSupport.h"

namespace kelcore::config::testing {
namespace {

constexpr const char* kKey = "$$$/kelcore/test/Error=Test ^1";

class ErrorManagerTest : public ConfigTest {
 protected:
  void SetUp() override {
    ConfigTest::SetUp();
    ErrorManager::Set(&manager_);
  }
  RecordingManager manager_;
};

TEST_F(ErrorManagerTest, GetFollowsTheSlot) {
  EXPECT_EQ(ErrorManager::Get(false), &manager_);
  ErrorManager::Set(nullptr);
  EXPECT_EQ(ErrorManager::Get(true), nullptr);
  EXPECT_THROW(ErrorManager::Get(false), std::logic_error);
  {
    RecordingManager other;
    ErrorManager::Set(&other);
  }
  EXPECT_EQ(ErrorManager::Get(true), nullptr) << "a destroyed manager uninstalls itself";
}

TEST_F(ErrorManagerTest, NestedReportersRecordInTheOutermostAndFinishRaisesOnce) {
  DeferredErrorReporter outer(true);
  {
    DeferredErrorReporter inner(true);
    EXPECT_EQ(manager_.GetCurrentErrorReporterForThisThread(), &outer);
    ThrowError(kErrorLevelNonFatal, kKey, 100, 1, true, 5);
    ThrowError(kErrorLevelFatal, kKey, 104, 2, true, U16("x"));
    inner.Finish();
    EXPECT_EQ(inner.GetErrorCount(), 0u);
  }
  EXPECT_EQ(manager_.raiseCount, 2) << "the manager is called even when the error is deferred";
  EXPECT_EQ(outer.GetErrorCount(), 2u);
  EXPECT_EQ(outer.GetLevel(), kErrorLevelFatal);
  EXPECT_EQ(outer.GetKey(), kKey);
  EXPECT_EQ(outer.GetComponent(), 104u);
  EXPECT_EQ(outer.GetValue(0).GetString(), U16("x"));
  EXPECT_EQ(outer.GetValue(7).GetKind(), kReplacementNone);

  try {
    outer.Finish();
    FAIL() << "Finish did not raise";
  } catch (const RaisedError& error) {
    EXPECT_EQ(error.errorNumber, 2);
    EXPECT_TRUE(error.deferral);
  }
  EXPECT_NO_THROW(outer.Finish());
  EXPECT_EQ(outer.GetFinishCount(), 2u);
  EXPECT_EQ(manager_.raiseCount, 3);
}

TEST_F(ErrorManagerTest, FreshReporterAndReportingOffRaiseNothing) {
  DeferredErrorReporter reporter(false);
  EXPECT_EQ(reporter.GetLevel(), static_cast<ErrorLevel>(-1));
  EXPECT_EQ(reporter.GetComponent(), 111u);
  reporter.Finish();
  ThrowError(kErrorLevelNonFatal, kKey, 100, 1, true);
  reporter.Finish();
  reporter.SetReportErrorWhenFinished(true);
  EXPECT_TRUE(reporter.GetReportErrorWhenFinished());
  EXPECT_THROW(reporter.Finish(), RaisedError);
}

TEST_F(ErrorManagerTest, DeferralNotAllowedRaisesAtOnceAndRecordsNothing) {
  DeferredErrorReporter reporter(true);
  EXPECT_THROW(ThrowError(kErrorLevelNonFatal, kKey, 100, 3, false), RaisedError);
  EXPECT_EQ(reporter.GetErrorCount(), 0u);
  EXPECT_EQ(manager_.raiseCount, 1);
}

TEST_F(ErrorManagerTest, ReportersBelongToTheirThread) {
  DeferredErrorReporter reporter(true);
  EXPECT_TRUE(manager_.IsErrorReportingDeferred());
  bool otherDeferred = true;
  bool otherRaised = false;
  std::thread other([&] {
    otherDeferred = manager_.IsErrorReportingDeferred();
    try {
      ThrowError(kErrorLevelNonFatal, kKey, 100, 4, true);
    } catch (const RaisedError&) {
      otherRaised = true;
    }
  });
  other.join();
  EXPECT_FALSE(otherDeferred);
  EXPECT_TRUE(otherRaised);
  EXPECT_EQ(reporter.GetErrorCount(), 0u);
}

TEST_F(ErrorManagerTest, ReporterReleasedOnAnotherThreadLeavesItsOwnThreadClean) {
  boost::intrusive_ptr<DeferredErrorReporter> reporter = manager_.NewDeferredErrorReporter(true);
  EXPECT_EQ(reporter->GetRefCount(), 1u);
  std::thread other([moved = std::move(reporter)]() mutable { moved.reset(); });
  other.join();
  EXPECT_FALSE(manager_.IsErrorReportingDeferred());
}

TEST_F(ErrorManagerTest, ReporterOutlivingItsManagerIsDetached) {
  auto manager = std::make_unique<RecordingManager>();
  ErrorManager::Set(manager.get());
  auto reporter = manager->NewDeferredErrorReporter(true);
  manager.reset();
  ErrorManager::Set(&manager_);
  EXPECT_FALSE(manager_.IsErrorReportingDeferred());
  EXPECT_NO_THROW(reporter.reset());
}

TEST_F(ErrorManagerTest, TopLevelFunctionReportsFailureWithAndWithoutManager) {
  for (const bool withManager : {true, false}) {
    ErrorManager::Set(withManager ? &manager_ : nullptr);
    bool failed = true;
    ExecuteTopLevelFunction<void>([] {}, &failed);
    EXPECT_FALSE(failed) << withManager;
    ExecuteTopLevelFunction<void>([] { throw 42; }, &failed);
    EXPECT_TRUE(failed) << withManager;
    failed = false;
    ExecuteTopLevelFunction<void>(boost::function0<void>(), &failed);
    EXPECT_TRUE(failed) << withManager;
    EXPECT_NO_THROW(ExecuteTopLevelFunction<void>([] { throw 1; }, nullptr));
  }
}

TEST_F(ErrorManagerTest, BaseHandlerReturnsTheResultOrOne) {
  EXPECT_EQ(manager_.ExecuteFunctionWithTopLevelExceptionHandler([] { return 7L; }), 7);
  EXPECT_EQ(manager_.ExecuteFunctionWithTopLevelExceptionHandler(
                []() -> long { throw std::runtime_error("x"); }),
            1);
  try {
    manager_.ExecuteFunctionWithTopLevelExceptionHandler(boost::function0<long>());
    FAIL() << "an empty function was called";
  } catch (const boost::bad_function_call& error) {
    EXPECT_STREQ(error.what(), "call to empty boost::function");
  }
}

TEST_F(ErrorManagerTest, NewHandlerAsksTheManagerToPurge) {
  {
    ErrorManager::NewHandlerInitializer initializer;
    const std::new_handler handler = std::get_new_handler();
    ASSERT_NE(handler, nullptr);
    manager_.purgeAnswer = true;
    EXPECT_NO_THROW(handler());
    manager_.purgeAnswer = false;
    EXPECT_THROW(handler(), std::bad_alloc);
    EXPECT_EQ(manager_.purgeCount, 2);
    ErrorManager::Set(nullptr);
    EXPECT_THROW(handler(), std::logic_error);
  }
  EXPECT_EQ(std::get_new_handler(), nullptr);
}

}  // namespace
}  // namespace kelcore::config::testing
