// The debug database singleton and its file, in a temporary preferences directory.
#include "DebugTestSupport.h"

#include <kelcore/debug/DebugDatabase.h>

namespace kelcore::debug {
namespace {

using testing::Narrow;
using testing::U8;

class DebugDatabaseTest : public ::testing::Test {
 protected:
  DebugDatabaseTest() {
    database_.SetFileWritesDisabled(false);
    database_.Clear();
  }
  ~DebugDatabaseTest() override {
    database_.SetFileWritesDisabled(true);
    database_.Clear();
  }

  testing::TempPrefsDir prefs_;
  DebugDatabase& database_ = DebugDatabase::Instance();
};

TEST_F(DebugDatabaseTest, EntriesKeepValueAndDefault) {
  EXPECT_EQ(Narrow(database_.GetEntry(U8("Absent"))), "");
  EXPECT_FALSE(database_.HasEntry(U8("Absent")));
  // An absent key given a default is created with it.
  EXPECT_EQ(Narrow(database_.GetEntry(U8("Level"), U8("3"))), "3");
  EXPECT_TRUE(database_.HasEntry(U8("Level")));
  database_.SetEntry(U8("Level"), U8("9"));
  EXPECT_EQ(Narrow(database_.GetEntry(U8("Level"), U8("4"))), "9");
  EXPECT_FALSE(database_.GetBoolEntry(U8("Flag"), false));
  database_.SetEntry(U8("Flag"), U8("true"));
  EXPECT_TRUE(database_.GetBoolEntry(U8("Flag"), false));
  database_.SetEntry(U8("Flag"), U8("TRUE"));
  EXPECT_FALSE(database_.GetBoolEntry(U8("Flag"), true));

  std::list<UTF8String> keys{U8("stale")};
  database_.GetDebugKeys(keys);
  ASSERT_EQ(keys.size(), 2u);
  EXPECT_EQ(Narrow(keys.front()), "Flag");
  database_.RemoveEntry(U8("Flag"));
  database_.RemoveEntry(U8("Flag"));
  EXPECT_FALSE(database_.HasEntry(U8("Flag")));
}

TEST_F(DebugDatabaseTest, SavesOneLinePerEntryUnlessDisabledOrEmpty) {
  database_.SaveDataBase();
  EXPECT_FALSE(prefs_.HasFile("Debug Database.txt"));
  database_.SetEntry(U8("B"), U8("x"));
  database_.GetEntry(U8("A"), U8("false"));
  database_.SetFileWritesDisabled(true);
  EXPECT_TRUE(database_.GetFileWritesDisabled());
  database_.SaveDataBase();
  EXPECT_FALSE(prefs_.HasFile("Debug Database.txt"));
  database_.SetFileWritesDisabled(false);
  database_.SaveDataBase();
  EXPECT_EQ(prefs_.ReadFile("Debug Database.txt"), "A\tfalse\tfalse\r\nB\tx\t\r\n");
}

}  // namespace
}  // namespace kelcore::debug
