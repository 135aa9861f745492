// Names, opening, rotating, writing and closing the console log.
#include "LogTestSupport.h"

#include <thread>
#include <vector>

namespace kelcore::console::testing {
namespace {

using LogFileTest = LogTest;

TEST_F(LogFileTest, NamesFollowTheApplicationTheSetNameOrTheNamingFunction) {
  EXPECT_EQ(ConsoleLogFile::GetDefaultLogFileName(false), u"Tester Log.txt");
  EXPECT_EQ(ConsoleLogFile::GetDefaultLogFileName(true), u"Tester Log-last.txt");
  ConsoleLogFile::SetDefaultLogFileName(u"Renderer");
  EXPECT_EQ(ConsoleLogFile::GetDefaultLogFileName(true), u"Renderer Log-last.txt");
  ConsoleLogFile::SetDefaultLogFileName(UTF16String());
  ConsoleLogFile::SetDefaultLogFileNameFn(&ConsoleLogFile::GetTimestampedLogFileName);
  EXPECT_EQ(ConsoleLogFile::GetDefaultLogFileName(true), u"Tester 20261122-075732_000123.txt");

  UTF8String last;
  ConsoleLogFile::SetDefaultLogFileNameFn({});
  ASSERT_TRUE(ConsoleLogFile::GetInstance().GetLogFilePath(last, true));
  EXPECT_EQ(last, U8(RootBytes() + "/logs/Tester Log-last.txt"));
  EXPECT_TRUE(OnDisk("logs"));
}

TEST_F(LogFileTest, NothingIsOpenedBeforeTheClientNameIsSet) {
  SetSwitch("CreateLogFilesThatDoNotExist", "true");
  ConsoleLogFile& log = ConsoleLogFile::GetInstance();
  log.WriteToLog(U8("early\n"), false);
  EXPECT_FALSE(log.Exists());
  EXPECT_FALSE(OnDisk("logs/Tester Log.txt"));
  // Once the name is known, the next write opens the log.
  config::SetClientName(u"Tester");
  log.WriteToLog(U8("later\n"), false);
  EXPECT_TRUE(log.Exists());
  EXPECT_EQ(ReadLog("Tester Log.txt"), std::string(kHeader) + "later\n");
}

TEST_F(LogFileTest, AMissingLogIsMadeOnlyWhenTheDebugDatabaseAsks) {
  config::SetClientName(u"Tester");
  ConsoleLogFile& log = ConsoleLogFile::GetInstance();
  log.WriteToLog(U8("lost\n"), false);
  EXPECT_FALSE(log.Exists());
  EXPECT_FALSE(OnDisk("logs/Tester Log.txt"));
  // The automatic open is tried once per instance; the command's open forces creation.
  SetSwitch("CreateLogFilesThatDoNotExist", "true");
  log.WriteToLog(U8("still lost\n"), false);
  EXPECT_FALSE(log.Exists());
  EXPECT_TRUE(log.OpenDefaultLogFile(false));
  log.WriteToLog(U8("kept\n"), false);
  EXPECT_EQ(ReadLog("Tester Log.txt"), std::string(kHeader) + "kept\n");
}

TEST_F(LogFileTest, OpeningRotatesThePreviousRunsLog) {
  MakeDir("logs");
  WriteFile("logs/Tester Log.txt", "previous run\n");
  WriteFile("logs/Tester Log-last.txt", "run before that\n");
  config::SetClientName(u"Tester");
  ConsoleLogFile& log = ConsoleLogFile::GetInstance();
  log.WriteToLog(U8("this run\n"), false);  // an existing log needs no switch
  EXPECT_EQ(ReadLog("Tester Log-last.txt"), "previous run\n");
  EXPECT_EQ(ReadLog("Tester Log.txt"), std::string(kHeader) + "this run\n");
  UTF8String path;
  ASSERT_TRUE(log.GetCurrentLogFilePath(path));
  EXPECT_EQ(path, U8(RootBytes() + "/logs/Tester Log.txt"));
}

TEST_F(LogFileTest, TimestampedNamesSwitchStartsAfreshWithoutRotating) {
  MakeDir("logs");
  WriteFile("logs/Tester Log.txt", "previous run\n");
  WriteFile("logs/Tester Log-last.txt", "run before that\n");
  SetSwitch("AddTimestampToLogFileNames", "true");
  ASSERT_TRUE(ConsoleLogFile::GetInstance().OpenDefaultLogFile(false));
  EXPECT_EQ(ReadLog("Tester Log-last.txt"), "run before that\n");
  EXPECT_EQ(ReadLog("Tester Log.txt"), kHeader);
}

TEST_F(LogFileTest, NamingFunctionWithOneNameForBothStartsAfresh) {
  ConsoleLogFile::SetDefaultLogFileNameFn([](const UTF16String& base) { return base + u".log"; });
  MakeDir("logs");
  WriteFile("logs/Tester.log", "previous run\n");
  ASSERT_TRUE(ConsoleLogFile::GetInstance().OpenDefaultLogFile(false));
  EXPECT_EQ(ReadLog("Tester.log"), kHeader);
}

TEST_F(LogFileTest, TicksPrefixFollowsTheFlags) {
  ConsoleLogFile& log = ConsoleLogFile::GetInstance();
  ASSERT_TRUE(log.OpenDefaultLogFile(true));
  log.WriteToLog(U8("a\n"), true);
  log.WriteToLog(U8("b\n"), false);
  log.UseTabDelimiter(true);
  log.WriteToLog(U8("c\n"), true);
  log.AddTimeInTicks(false);  // suppresses the prefix even when asked for
  log.WriteToLog(U8("d\n"), true);
  log.AddTimeInTicks(true);  // adds it even when not asked for
  log.WriteToLog(U8("e\n"), false);
  EXPECT_EQ(ReadLog("Tester Log.txt"), std::string(kHeader) +
                                           "Ticks = 4242      a\n"
                                           "b\n"
                                           "Ticks = 4242\tc\n"
                                           "d\n"
                                           "Ticks = 4242\te\n");
}

TEST_F(LogFileTest, CloseWritesTheFooterAndTerminateClosesToo) {
  ConsoleLogFile& log = ConsoleLogFile::GetInstance();
  ASSERT_TRUE(log.OpenDefaultLogFile(true));
  log.CloseLogFile();
  EXPECT_FALSE(log.Exists());
  UTF8String path = U8("unchanged");
  EXPECT_FALSE(log.GetCurrentLogFilePath(path));
  EXPECT_EQ(path, U8("unchanged"));
  log.CloseLogFile();  // nothing open: nothing written
  EXPECT_EQ(ReadLog("Tester Log.txt"), std::string(kHeader) + kFooter);

  // OpenLogFile replaces a file; Terminate closes, with the footer on a line of its own.
  WriteFile("own.txt", "old contents that must go");
  ASSERT_TRUE(ConsoleLogFile::GetInstance().OpenLogFile(U8(RootBytes() + "/own.txt")));
  ConsoleLogFile::GetInstance().WriteToLog(U8("x"), false);
  ConsoleLogFile::Terminate();
  EXPECT_EQ(ReadFile("own.txt"), std::string(kHeader) + "x\r\n" + kFooter);
  EXPECT_FALSE(ConsoleLogFile::GetInstance().Exists());
}

TEST_F(LogFileTest, FailedOpensLeaveNoLogAndRaiseNothing) {
  ConsoleLogFile& log = ConsoleLogFile::GetInstance();
  EXPECT_FALSE(log.OpenLogFile(U8(RootBytes() + "/missing/dir/log.txt")));
  EXPECT_FALSE(log.Exists());
  WriteFile("logs", "a file where the folder should be");
  EXPECT_FALSE(log.OpenDefaultLogFile(true));
  EXPECT_FALSE(log.Exists());
  config::SetClientName(u"Tester");
  EXPECT_NO_THROW(log.WriteToLog(U8("nowhere\n"), true));
}

// Lines written from several threads at once arrive whole.
TEST_F(LogFileTest, ConcurrentWritesNeverInterleave) {
  ConsoleLogFile& log = ConsoleLogFile::GetInstance();
  ASSERT_TRUE(log.OpenDefaultLogFile(true));
  constexpr int kThreads = 4;
  constexpr int kLines = 200;
  const std::string payload(100, 'p');
  std::vector<std::thread> threads;
  for (int t = 0; t < kThreads; ++t) {
    threads.emplace_back([&log, &payload, t] {
      for (int i = 0; i < kLines; ++i) {
        log.WriteToLog(U8(std::to_string(t) + ":" + payload + "\n"), true);
      }
    });
  }
  for (std::thread& thread : threads) thread.join();
  log.CloseLogFile();

  std::istringstream text(ReadLog("Tester Log.txt"));
  std::string line;
  int written = 0;
  while (std::getline(text, line)) {
    if (line.rfind("Log file", 0) == 0) continue;
    EXPECT_EQ(line.substr(0, 14), "Ticks = 4242  ");
    EXPECT_EQ(line.substr(line.size() - payload.size()), payload);
    ++written;
  }
  EXPECT_EQ(written, kThreads * kLines);
}

}  // namespace
}  // namespace kelcore::console::testing
