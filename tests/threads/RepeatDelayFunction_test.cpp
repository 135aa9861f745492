#include <kelcore/threads/EventLoopExecutor.h>
#include <kelcore/threads/Gate.h>
#include <kelcore/threads/RepeatDelayFunction.h>

#include <gtest/gtest.h>

#include <boost/make_shared.hpp>

#include <chrono>
#include <memory>
#include <vector>

#include "ManualTestExecutor.h"

namespace kelcore::threads {
namespace {

using testing::ManualTestExecutor;

// Runs every step the executor holds, including steps scheduled by steps.
int RunAll(ManualTestExecutor& executor) {
  int steps = 0;
  while (executor.RunNext()) ++steps;
  return steps;
}

TEST(CallConditionalRepeatDelayFunction, RepeatsWhileTheFunctionAsks) {
  auto executor = boost::make_shared<ManualTestExecutor>();
  std::vector<bool> answers = {true, true, false};
  int calls = 0;
  CallConditionalRepeatDelayFunctionAsynchronously(
      executor, [&] { return answers[calls++]; }, 100);
  EXPECT_EQ(calls, 0) << "the first call comes after one delay";
  EXPECT_EQ(RunAll(*executor), 3);
  EXPECT_EQ(calls, 3);
  EXPECT_EQ(executor->Delays(), (std::vector<unsigned int>{100, 100, 100}));
}

TEST(CallConditionalRepeatDelayFunction, EndsWhenTheExecutorRefusesTheNextStep) {
  auto executor = boost::make_shared<ManualTestExecutor>();
  int calls = 0;
  CallConditionalRepeatDelayFunctionAsynchronously(
      executor, [&] { return ++calls < 100; }, 5);
  ASSERT_TRUE(executor->RunNext());
  executor->Terminate();
  EXPECT_TRUE(executor->RunNext());
  EXPECT_FALSE(executor->RunNext());
  EXPECT_EQ(calls, 2);
}

// With real time, on a real executor: each call comes at least one delay after the
// previous one (the first, one delay after the start).
TEST(CallConditionalRepeatDelayFunction, RealDelaysSeparateTheCalls) {
  using Clock = std::chrono::steady_clock;
  AsyncEventLoopExecutorPtr executor =
      CreateAsyncEventLoopExecutor("repeat test", kThreadPriorityNormal, {}, {});
  std::vector<Clock::time_point> times;
  Gate done(false);
  const Clock::time_point start = Clock::now();
  CallConditionalRepeatDelayFunctionAsynchronously(
      executor,
      [&] {
        times.push_back(Clock::now());
        if (times.size() < 3) return true;
        done.Open();
        return false;
      },
      20);
  ASSERT_TRUE(done.PassThrough(-1));
  executor.reset();  // joins its thread: no call is left
  ASSERT_EQ(times.size(), 3u);
  EXPECT_GE(times[0] - start, std::chrono::milliseconds(20));
  EXPECT_GE(times[1] - times[0], std::chrono::milliseconds(20));
  EXPECT_GE(times[2] - times[1], std::chrono::milliseconds(20));
}

TEST(RepeatDelayFunction, CallsEveryDelayUntilStopped) {
  auto executor = boost::make_shared<ManualTestExecutor>();
  int calls = 0;
  RepeatDelayFunction repeat(
      executor, [&] { ++calls; }, 40);
  for (int i = 0; i < 4; ++i) ASSERT_TRUE(executor->RunNext());
  EXPECT_EQ(calls, 4);
  repeat.DoNotCallAgain();
  EXPECT_EQ(RunAll(*executor), 1) << "the scheduled step finds the function gone";
  EXPECT_EQ(calls, 4);
}

TEST(RepeatDelayFunction, StoppedBeforeTheFirstDelayNeverCalls) {
  auto executor = boost::make_shared<ManualTestExecutor>();
  int calls = 0;
  {
    RepeatDelayFunction repeat(
        executor, [&] { ++calls; }, 40);
    repeat.DoNotCallAgain();
  }
  {
    RepeatDelayFunction destroyed(
        executor, [&] { ++calls; }, 40);
  }
  EXPECT_EQ(RunAll(*executor), 2);
  EXPECT_EQ(calls, 0);
}

// A call already running when the owner stops the repetition finishes normally: the
// function object stays alive until it returns.
TEST(RepeatDelayFunction, RunningCallIsNotInterrupted) {
  auto executor = boost::make_shared<ManualTestExecutor>();
  int calls = 0;
  std::unique_ptr<RepeatDelayFunction> repeat;
  repeat = std::make_unique<RepeatDelayFunction>(
      executor,
      [&] {
        repeat->DoNotCallAgain();
        ++calls;
      },
      1);
  EXPECT_EQ(RunAll(*executor), 2);
  EXPECT_EQ(calls, 1);
}

}  // namespace
}  // namespace kelcore::threads
