// The handler chain: time stamps, roll-over by an injected clock, the asynchronous
// handler under many threads, and the installer's chain.
#include "DebugTestSupport.h"

#include <kelcore/debug/AsyncTraceHandler.h>
#include <kelcore/debug/DebugDatabase.h>
#include <kelcore/debug/DefaultTraceHandler.h>
#include <kelcore/debug/RollingTraceHandler.h>
#include <kelcore/debug/TimestampTraceHandler.h>
#include <kelcore/debug/TraceHandlerInstaller.h>

#include <boost/date_time/posix_time/posix_time.hpp>

#include <thread>

namespace kelcore::debug {
namespace {

using boost::posix_time::ptime;
using boost::posix_time::time_from_string;
using testing::C;
using testing::RecordingHandler;
using testing::U8;

class TraceHandlersTest : public testing::TraceStateTest {};

// A log that only counts: its size is set by the test, each roll empties it.
class FakeLog : public RollingTraceHandler::Log {
 public:
  bool IsOpen() override { return open; }
  std::uint64_t Size() override { return size; }
  void Roll() override {
    ++rolls;
    open = true;
    size = 0;
  }
  bool open = true;
  std::uint64_t size = 0;
  int rolls = 0;
};

TEST_F(TraceHandlersTest, TimestampsAreUtcIsoWithMicroseconds) {
  RecordingHandler recorder;
  TimestampTraceHandler stamping(recorder,
                                 [] { return time_from_string("2026-11-22 07:05:09.000042"); });
  stamping.HandleTrace(U8("hello\n"));
  EXPECT_EQ(recorder.Messages(), std::vector<std::string>{"2026-11-22T07:05:09.000042Z hello\n"});
}

TEST_F(TraceHandlersTest, RollsBySizeBeforeTheMessageThatFindsTheLogFull) {
  RecordingHandler master;
  InstallMasterTraceHandler(&master);
  RecordingHandler next;
  auto log = std::make_shared<FakeLog>();
  RollingTraceHandler::Options options;
  options.maxLogSize = 100;
  RollingTraceHandler rolling(next, options, log,
                              [] { return time_from_string("2026-01-01 10:00:00"); });
  log->size = 99;
  rolling.HandleTrace(U8("a"));
  EXPECT_EQ(log->rolls, 0);
  log->size = 100;
  rolling.HandleTrace(U8("b"));
  EXPECT_EQ(log->rolls, 1);
  EXPECT_EQ(next.Messages(), (std::vector<std::string>{"a", "b"}));
  // Without unique names the roll is announced, in its category, before the message.
  ASSERT_EQ(master.Messages().size(), 1u);
  EXPECT_EQ(master.Messages()[0],
            "Warning: Rolling the log file without using unique timestamped log file names. "
            "This may result in overwritten log files!\r\n");
  // A closed log is not rolled by size.
  log->open = false;
  log->size = 1000;
  rolling.HandleTrace(U8("c"));
  EXPECT_EQ(log->rolls, 1);
}

TEST_F(TraceHandlersTest, RollsDailyByTheInjectedClock) {
  RecordingHandler master;
  InstallMasterTraceHandler(&master);
  RecordingHandler next;
  auto log = std::make_shared<FakeLog>();
  ptime now = time_from_string("2026-03-01 23:59:59");
  RollingTraceHandler::Options options;
  options.rollDaily = true;
  options.timestampedLogNames = true;
  RollingTraceHandler rolling(next, options, log, [&] { return now; });
  rolling.HandleTrace(U8("1"));
  now = time_from_string("2026-03-01 23:59:59.999999");
  rolling.HandleTrace(U8("2"));
  EXPECT_EQ(log->rolls, 0);
  now = time_from_string("2026-03-02 00:00:00");
  rolling.HandleTrace(U8("3"));
  rolling.HandleTrace(U8("4"));
  EXPECT_EQ(log->rolls, 1);
  // No log open: no roll, unless missing logs are to be created.
  log->open = false;
  now = time_from_string("2026-03-05 08:00:00");
  rolling.HandleTrace(U8("5"));
  EXPECT_EQ(log->rolls, 1);
  EXPECT_TRUE(master.Messages().empty());  // unique names: no warning

  options.createMissingLogs = true;
  RollingTraceHandler creating(next, options, log, [&] { return now; });
  creating.HandleTrace(U8("6"));
  now = time_from_string("2026-03-06 08:00:00");
  creating.HandleTrace(U8("7"));
  EXPECT_EQ(log->rolls, 2);
  EXPECT_EQ(next.Messages().size(), 7u);
}

TEST_F(TraceHandlersTest, ManyThreadsLoseNoMessageAndKeepTheirOrder) {
  RecordingHandler recorder;
  constexpr int kThreads = 6;
  constexpr int kEach = 1500;
  {
    AsyncTraceHandler async(recorder);
    std::vector<std::thread> threads;
    for (int t = 0; t < kThreads; ++t) {
      threads.emplace_back([&async, t] {
        for (int i = 0; i < kEach; ++i) {
          async.HandleTrace(U8(std::to_string(t) + ":" + std::to_string(i)));
        }
      });
    }
    for (auto& thread : threads) thread.join();
  }  // destruction passes on everything handed over
  const auto messages = recorder.Messages();
  ASSERT_EQ(messages.size(), static_cast<std::size_t>(kThreads * kEach));
  std::vector<int> next(kThreads, 0);
  for (const std::string& message : messages) {
    const std::size_t colon = message.find(':');
    const int t = std::stoi(message.substr(0, colon));
    ASSERT_EQ(std::stoi(message.substr(colon + 1)), next[t]) << "thread " << t;
    ++next[t];
  }
}

TEST_F(TraceHandlersTest, TheInstallerBuildsTheChainFromTheDebugDatabase) {
  DebugDatabase& database = DebugDatabase::Instance();
  database.SetFileWritesDisabled(true);
  database.SetEntry(U8("TraceAsync"), U8("true"));
  database.SetEntry(U8("AddUTCTimestampToTraces"), U8("true"));
  database.SetEntry(U8("MaxLogSize"), U8("1000000000"));
  RecordingHandler recorder;
  InstallMasterTraceHandler(&recorder);
  {
    TraceHandlerInstaller installer;
    TraceHandlerInstaller copy = installer;
    EXPECT_TRUE(installer.InstalledAny());
    auto* async = dynamic_cast<AsyncTraceHandler*>(GetMasterTraceHandler());
    ASSERT_NE(async, nullptr);
    auto* stamping = dynamic_cast<TimestampTraceHandler*>(&async->Next());
    ASSERT_NE(stamping, nullptr);
    auto* rolling = dynamic_cast<RollingTraceHandler*>(&stamping->Next());
    ASSERT_NE(rolling, nullptr);
    EXPECT_EQ(rolling->GetOptions().maxLogSize, 1000000000u);
    EXPECT_EQ(&rolling->Next(), &recorder);
    Trace(C("through\n"));
    async->Flush();
  }  // the last copy removes the chain
  EXPECT_EQ(GetMasterTraceHandler(), &DefaultTraceHandler::Instance());
  const auto messages = recorder.Messages();
  ASSERT_EQ(messages.size(), 1u);
  ASSERT_GT(messages[0].size(), 10u);
  EXPECT_EQ(messages[0].substr(messages[0].size() - 10), "Z through\n");

  database.Clear();
  TraceHandlerInstaller nothing;
  EXPECT_FALSE(nothing.InstalledAny());
}

}  // namespace
}  // namespace kelcore::debug
