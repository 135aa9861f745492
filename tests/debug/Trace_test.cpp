// The process's trace database through the public functions, kept in
// "Trace Database.txt" in a temporary preferences directory.
#include "DebugTestSupport.h"

#include <kelcore/debug/DefaultTraceHandler.h>

namespace kelcore::debug {
namespace {

using testing::C;
using testing::Narrow;
using testing::RecordingHandler;
using testing::U8;

class TraceTest : public testing::TraceStateTest {};

TEST_F(TraceTest, TheDatabaseRoundTripsThroughItsFile) {
  SetTraceVolume(C("FileIO"), 7);
  SetMasterTraceVolume(10);
  SetTraceDatabaseFromString(U8("Net\t0\t-2\n"));
  const std::string expected = "FileIO\t1\t7\nMaster\t1\t10\nNet\t0\t-2\n";
  EXPECT_EQ(prefs_->ReadFile("Trace Database.txt"), expected);

  ShutdownTraceManager();
  prefs_->WriteFile("Trace Database.txt", expected + "Added\t1\t3\n");
  UTF8String text;
  GetTraceDatabaseAsString(text);
  EXPECT_EQ(Narrow(text), "Added\t1\t3\n" + expected);  // database order is byte order
  std::list<UTF8String> names;
  GetTraceCategories(names);
  EXPECT_EQ(names.size(), 4u);
  EXPECT_EQ(Narrow(names.front()), "Added");
  EXPECT_FALSE(TraceEnabled(C("Net"), -5, false));
}

TEST_F(TraceTest, AMissingOrJunkFileGivesTheDefaults) {
  EXPECT_TRUE(TraceEnabled(C("X"), 5, false));
  EXPECT_FALSE(prefs_->HasFile("Trace Database.txt"));
  ShutdownTraceManager();
  prefs_->WriteFile("Trace Database.txt", std::string("\x01\xff\tjunk", 7));
  EXPECT_TRUE(TraceEnabled(C("X"), 5, false));
  EXPECT_EQ(GetMasterTraceVolume(), 10);
}

TEST_F(TraceTest, ChangesCountAndFileWritesCanBeStopped) {
  const int start = TraceChangeCount();
  EXPECT_TRUE(TraceEnabled(C("New"), 1, true));
  EXPECT_EQ(TraceChangeCount(), start + 1);
  SetDisableFileWrites(true);
  EXPECT_TRUE(GetDisableFileWrites());
  const std::string saved = prefs_->ReadFile("Trace Database.txt");
  SetTraceVolume(C("New"), 2);
  ShutdownTraceManager();
  EXPECT_EQ(prefs_->ReadFile("Trace Database.txt"), saved);
  EXPECT_EQ(TraceChangeCount(), start + 2);
}

TEST_F(TraceTest, NullArgumentsAreHarmless) {
  EXPECT_FALSE(TraceEnabled(nullptr, 0, true));
  EXPECT_EQ(GetTraceVolume(nullptr), 0);
  SetTraceVolume(nullptr, 3);
  Trace(nullptr);
  DebugTrace(nullptr);
}

TEST_F(TraceTest, TraceGoesToTheMasterHandler) {
  EXPECT_EQ(GetMasterTraceHandler(), &DefaultTraceHandler::Instance());
  RecordingHandler recorder;
  InstallMasterTraceHandler(&recorder);
  EXPECT_EQ(GetMasterTraceHandler(), &recorder);
  Trace(C("one\n"));
  RemoveMasterTraceHandler();
  EXPECT_EQ(GetMasterTraceHandler(), &DefaultTraceHandler::Instance());
  Trace(C("two\n"));
  EXPECT_EQ(recorder.Messages(), std::vector<std::string>{"one\n"});
}

}  // namespace
}  // namespace kelcore::debug
