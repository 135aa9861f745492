// The debug.* commands.
#include "ConsoleTestSupport.h"

namespace kelcore::console::testing {
namespace {

using DebugCommandsTest = ConsoleTest;

UTF8String Key(const char* text) {
  return UTF8String(reinterpret_cast<const unsigned char*>(text));
}

TEST_F(DebugCommandsTest, SetGetListClear) {
  EXPECT_EQ(Run("debug.set  Render/Threads =  4 "), u"Render/Threads = 4\n");
  EXPECT_EQ(debug::DebugDatabase::Instance().GetEntry(Key("Render/Threads")), Key("4"));
  EXPECT_EQ(Run("debug.set Log/Path = /tmp/a b = c"), u"Log/Path = /tmp/a b = c\n");
  EXPECT_EQ(Run("debug.set Empty ="), u"Empty = \n");
  EXPECT_EQ(Run("debug.get Render/Threads"), u"Render/Threads = 4\n");
  EXPECT_EQ(Run("debug.get Missing"), u"Missing is not in the debug database.\n");
  EXPECT_EQ(Run("debug.list"),
            u"Debug Database:\nEmpty = \nLog/Path = /tmp/a b = c\nRender/Threads = 4\n");
  EXPECT_EQ(Run("debug.clear"), u"Debug database cleared.\n");
  EXPECT_EQ(Run("debug.list"), u"Debug Database:\n");
}

TEST_F(DebugCommandsTest, MalformedArgumentsGetTheHelpText) {
  const UTF16String setHelp =
      u"debug.set <variable path> = <value> - Sets the value of the debug variable in the "
      u"debug database.\n";
  EXPECT_EQ(Run("debug.set"), setHelp);
  EXPECT_EQ(Run("debug.set NoEquals 3"), setHelp);
  EXPECT_EQ(Run("debug.set = 3"), setHelp);
  EXPECT_EQ(Run("debug.get"),
            u"debug.get <variable path> - Gets the value of the debug variable from the debug "
            u"database.\n");
  EXPECT_EQ(Run("debug.list"), u"Debug Database:\n");
}

}  // namespace
}  // namespace kelcore::console::testing
