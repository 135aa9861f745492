#include <kelcore/debug/CodeProfiler.h>
#include <kelcore/debug/GlobalTimeMeasurement.h>
#include <kelcore/utility/HighPrecisionTime.h>

#include "DebugTestSupport.h"

#include <gtest/gtest.h>

#include <locale>
#include <sstream>
#include <string>
#include <vector>

namespace kelcore::debug {
namespace {

using testing::C;
using utility::HighPrecisionTime;

std::uint64_t Millis(int ms) {
  return HighPrecisionTime::ConvertFromNanos(ms * 1000000LL);
}
double Seconds(std::uint64_t ticks) {
  return HighPrecisionTime::ConvertTimeStampToSeconds(ticks);
}

class CodeProfilerTest : public testing::TraceStateTest {
 protected:
  CodeProfilerTest() {
    CodeProfilerManager::LogMap logs;
    CodeProfilerManager::Get().GetAllProfileDataLogs(logs);
    for (auto& entry : logs) entry.second->ClearAllData();
  }
};

TEST_F(CodeProfilerTest, LogAccumulatesCountTotalAverageExtremes) {
  ProfileDataLog log("acc", 2);
  ProfileDataLog::ProfileData fresh = log.GetProfileData();
  EXPECT_EQ(fresh.numLogs, 0);
  EXPECT_EQ(fresh.totalTime, 0.0);
  EXPECT_EQ(fresh.averageTime, 0.0);
  EXPECT_EQ(fresh.longestTime, 0.0);
  EXPECT_EQ(fresh.shortestTime, 0.0);

  for (int ms : {2, 1, 3}) log.AddTime(Millis(ms));
  const ProfileDataLog::ProfileData data = log.GetProfileData();
  EXPECT_EQ(data.numLogs, 3);
  EXPECT_EQ(log.GetNumLogs(), 3);
  EXPECT_NEAR(data.totalTime, 0.006, 1e-9);
  EXPECT_NEAR(data.averageTime, 0.002, 1e-9);
  EXPECT_NEAR(data.longestTime, 0.003, 1e-9);
  EXPECT_NEAR(data.shortestTime, 0.001, 1e-9);
  EXPECT_EQ(log.GetAverageTime(), data.averageTime);
  EXPECT_EQ(log.GetTotalTime(), data.totalTime);
  EXPECT_EQ(log.GetLongestTime(), data.longestTime);
  EXPECT_EQ(log.GetShortestTime(), data.shortestTime);
  EXPECT_EQ(log.GetID(), "acc");
  EXPECT_EQ(log.GetVolume(), 2);

  // The average is the integer tick average.
  ProfileDataLog odd("odd", 0);
  odd.AddTime(1);
  odd.AddTime(2);
  EXPECT_EQ(odd.GetAverageTime(), Seconds(1));

  log.ClearAllData();
  EXPECT_EQ(log.GetNumLogs(), 0);
  EXPECT_EQ(log.GetShortestTime(), 0.0);
  log.AddTime(Millis(5));
  EXPECT_NEAR(log.GetShortestTime(), 0.005, 1e-9);
}

TEST_F(CodeProfilerTest, ProfilerLogsOnceAndEmptyProfilerDoesNothing) {
  boost::intrusive_ptr<ProfileDataLog> log(new ProfileDataLog("once", 5));
  {
    CodeProfiler profiler(log);
    profiler.StopProfiling();
    profiler.StopProfiling();
  }
  EXPECT_EQ(log->GetNumLogs(), 1);
  { CodeProfiler scoped(log); }
  EXPECT_EQ(log->GetNumLogs(), 2);
  EXPECT_EQ(log->GetRefCount(), 1u);
  CodeProfiler empty{boost::intrusive_ptr<ProfileDataLog>()};
  empty.StopProfiling();
}

TEST_F(CodeProfilerTest, ManagerKeepsOneLogPerNameAndSettings) {
  CodeProfilerManager& manager = CodeProfilerManager::Get();
  auto a = manager.CreateNewProfileDataLog("A", 3);
  auto again = manager.CreateNewProfileDataLog("A", 7);
  EXPECT_EQ(a.get(), again.get());
  EXPECT_EQ(again->GetVolume(), 3);
  EXPECT_EQ(manager.GetProfileDataLog("A").get(), a.get());
  EXPECT_FALSE(manager.GetProfileDataLog("no such log"));
  CodeProfilerManager::LogMap all;
  manager.GetAllProfileDataLogs(all);
  EXPECT_EQ(all.count("A"), 1u);

  EXPECT_EQ(CodeProfilerManager::kDefaultVolume, 5);
  const long volume = manager.GetProfilingVolume();
  manager.SetProfilingVolume(9);
  EXPECT_EQ(manager.GetProfilingVolume(), 9);
  manager.SetProfilingVolume(volume);
  const bool conditional = manager.IsConditionalProfiling();
  manager.SetIsConditionalProfiling(!conditional);
  EXPECT_EQ(manager.IsConditionalProfiling(), !conditional);
  manager.SetIsConditionalProfiling(conditional);
}

TEST_F(CodeProfilerTest, DumpWritesOneExactLinePerLogWithDataInNameOrder) {
  CodeProfilerManager& manager = CodeProfilerManager::Get();
  auto b = manager.CreateNewProfileDataLog("dump B", 5);
  auto a = manager.CreateNewProfileDataLog("dump A", 5);
  manager.CreateNewProfileDataLog("dump empty", 5);
  std::vector<std::string> lines;
  manager.DumpProfilingData([&](const std::string& line) { lines.push_back(line); });
  EXPECT_TRUE(lines.empty());
  manager.DumpProfilingDataToDebugOut();  // nothing to write, and no debugger anyway

  for (int ms : {1, 2, 3}) a->AddTime(Millis(ms));
  b->AddTime(Millis(250));
  manager.DumpProfilingData([&](const std::string& line) { lines.push_back(line); });
  ASSERT_EQ(lines.size(), 2u);
  auto expected = [](const char* id, long n, const ProfileDataLog::ProfileData& d) {
    std::ostringstream text;
    text.imbue(std::locale::classic());
    text << "---Profile data log dump.  " << id << " - Total calls: " << n
         << "   Total time: " << d.totalTime << "   Average time: " << d.averageTime
         << "   Longest time: " << d.longestTime << "   Shortest time: " << d.shortestTime << "\n";
    return text.str();
  };
  EXPECT_EQ(lines[0], expected("dump A", 3, a->GetProfileData()));
  EXPECT_EQ(lines[1], expected("dump B", 1, b->GetProfileData()));
  // With a whole-nanosecond clock the figures print as plain decimals.
  if (HighPrecisionTime::GetFrequency() == 1e9) {
    EXPECT_EQ(lines[1],
              "---Profile data log dump.  dump B - Total calls: 1   Total time: 0.25   Average "
              "time: 0.25   Longest time: 0.25   Shortest time: 0.25\n");
  }
}

struct Captured {
  std::mutex lock;
  std::string text;
};

void Capture(const UTF16Char* piece, std::uint32_t length, void* context) {
  auto* captured = static_cast<Captured*>(context);
  std::lock_guard<std::mutex> hold(captured->lock);
  for (std::uint32_t i = 0; i < length; ++i) captured->text += static_cast<char>(piece[i]);
}

class GlobalTimeMeasurementTest : public testing::TraceStateTest {
 protected:
  GlobalTimeMeasurementTest() { GlobalTimeMeasurement::SetLineWriter(&Capture, &captured_); }
  ~GlobalTimeMeasurementTest() override { GlobalTimeMeasurement::SetLineWriter(nullptr, nullptr); }
  std::string Text() {
    std::lock_guard<std::mutex> hold(captured_.lock);
    return captured_.text;
  }
  Captured captured_;
};

TEST_F(GlobalTimeMeasurementTest, LinesFollowTheCategoryVolume) {
  SetTraceVolume(C("GTM.On"), 8);
  SetTraceVolume(C("GTM.Quiet"), 2);
  GlobalTimeMeasurement::BeginMeasurement("GTM.On", "start", true, 6);
  GlobalTimeMeasurement::IntermediateMeasurement("GTM.On", "middle", true, 7);
  GlobalTimeMeasurement::IntermediateMeasurement("GTM.On", "too detailed", true, 9);
  GlobalTimeMeasurement::EndMeasurement("GTM.On", "finish", true);
  GlobalTimeMeasurement::EndMeasurement("GTM.On", "not open", true);
  GlobalTimeMeasurement::BeginMeasurement("GTM.Quiet", "hidden", true, 6);
  GlobalTimeMeasurement::EndMeasurement("GTM.Quiet", "hidden end", true);
  GlobalTimeMeasurement::BeginMeasurement("GTM.On", "disabled", false, 6);

  const std::string text = Text();
  const std::string start = "start 0.0ms\n";
  ASSERT_EQ(text.compare(0, start.size(), start), 0) << text;
  EXPECT_NE(text.find("] middle "), std::string::npos) << text;
  EXPECT_NE(text.find("] finish "), std::string::npos) << text;
  EXPECT_EQ(text.find("too detailed"), std::string::npos) << text;
  EXPECT_EQ(text.find("not open"), std::string::npos) << text;
  EXPECT_EQ(text.find("hidden"), std::string::npos) << text;
  EXPECT_EQ(text.find("disabled"), std::string::npos) << text;
  // Every elapsed line: "> [thread] label <number>ms".
  std::istringstream lines(text.substr(start.size()));
  std::string line;
  int count = 0;
  while (std::getline(lines, line)) {
    ++count;
    EXPECT_EQ(line.compare(0, 3, "> ["), 0) << line;
    EXPECT_EQ(line.compare(line.size() - 2, 2, "ms"), 0) << line;
  }
  EXPECT_EQ(count, 2);
}

TEST_F(GlobalTimeMeasurementTest, FullTableReportsTheFailedBegin) {
  SetTraceVolume(C("GlobalTimeMeasurement"), 6);
  std::vector<std::string> names;
  for (std::size_t i = 0; i <= GlobalTimeMeasurement::kMaxMeasurements; ++i) {
    names.push_back("GTM.Slot" + std::to_string(i));
  }
  for (const std::string& name : names) {
    GlobalTimeMeasurement::BeginMeasurement(name.c_str(), "begin", true, 6);
  }
  EXPECT_NE(Text().find("> GlobalTimeMeasurement begin: BeginMeasurement failed to aquire token "
                        "when trying with GTM.Slot16\n"),
            std::string::npos)
      << Text();
  for (const std::string& name : names)
    GlobalTimeMeasurement::EndMeasurement(name.c_str(), "e", true);
}

}  // namespace
}  // namespace kelcore::debug
