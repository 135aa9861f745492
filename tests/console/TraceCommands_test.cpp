// The trace.* commands against a fresh trace database in a temporary preferences folder.
#include <filesystem>

#include "ConsoleTestSupport.h"

namespace kelcore::console::testing {
namespace {

using TraceCommandsTest = ConsoleTest;

long Volume(const char* category) {
  return debug::GetTraceVolume(reinterpret_cast<const unsigned char*>(category));
}

TEST_F(TraceCommandsTest, SetAndGetACategory) {
  EXPECT_EQ(Run("trace.set FileIO 7"), u"trace category FileIO set to volume 7.\n");
  EXPECT_EQ(Volume("FileIO"), 7);
  EXPECT_EQ(Run("trace.set   FileIO     -2  "), u"trace category FileIO set to volume -2.\n");
  EXPECT_EQ(Volume("FileIO"), -2);
  EXPECT_EQ(Run("trace.set FileIO"), u"trace volume for category FileIO is -2\n");
  EXPECT_EQ(Run("trace.get FileIO"), u"trace volume for category FileIO is -2\n");
  // An absent category reads as the default volume.
  EXPECT_EQ(Run("trace.get Fresh"), u"trace volume for category Fresh is 5\n");
}

TEST_F(TraceCommandsTest, MalformedArgumentsGetTheHelpText) {
  const std::u16string setHelp =
      u"trace.set <category> <volume> - Sets the volume of this trace category.\n";
  for (const char* line : {"trace.set", "trace.set Cat x", "trace.set Cat 1.5",
                           "trace.set Cat 99999999999999999999", "trace.set Cat +-1"}) {
    EXPECT_EQ(Run(line), setHelp) << line;
  }
  EXPECT_EQ(Run("trace.get"), u"trace.get <category> - Gets the volume of this trace category.\n");
  EXPECT_EQ(Run("trace.set.master ten"),
            u"trace.set.master <volume> - Sets the master trace volume. This is the highest "
            u"volume that will be traced.\n");
  EXPECT_EQ(Volume("Cat"), 5);
  EXPECT_EQ(Run("trace.set Cat +3"), u"trace category Cat set to volume 3.\n");
}

TEST_F(TraceCommandsTest, MasterVolume) {
  EXPECT_EQ(Run("trace.get.master"), u"Master trace volume is 10\n");
  EXPECT_EQ(Run("trace.set.master 3"), u"Master trace volume set to 3\n");
  EXPECT_EQ(debug::GetMasterTraceVolume(), 3);
  EXPECT_EQ(Run("trace.get.master"), u"Master trace volume is 3\n");
}

TEST_F(TraceCommandsTest, CategoriesInDatabaseOrderAndSavedToTheFile) {
  Run("trace.set Zeta 1");
  Run("trace.set Alpha 2");
  const UTF16String listed = Run("trace.getcategories");
  std::list<UTF8String> categories;
  debug::GetTraceCategories(categories);
  UTF16String expected = u"Trace Categories:\n";
  for (const UTF8String& category : categories) expected += utility::UTF8to16(category) + u"\n";
  EXPECT_EQ(listed, expected);
  EXPECT_NE(listed.find(u"\nZeta\n"), UTF16String::npos);
  EXPECT_NE(listed.find(u"\nAlpha\n"), UTF16String::npos);
  EXPECT_TRUE(OnDisk("Trace Database.txt"));
}

TEST_F(TraceCommandsTest, CreateDefaultConsoleLogFile) {
  config::SetClientName(u"Tester");
  const UTF16String answer = Run("trace.createdefaultconsolelogfile");
  EXPECT_EQ(answer, U16("Console log file created: " + RootBytes() + "/logs/Tester Log.txt\n"));
  EXPECT_TRUE(ConsoleLogFile::GetInstance().Exists());
  EXPECT_TRUE(OnDisk("logs/Tester Log.txt"));

  ConsoleLogFile::Terminate();
  std::filesystem::remove_all(RootBytes() + "/logs");
  WriteFile("logs", "a file where the folder should be");
  EXPECT_EQ(Run("trace.createdefaultconsolelogfile"),
            u"The console log file could not be created.\n");
}

}  // namespace
}  // namespace kelcore::console::testing
