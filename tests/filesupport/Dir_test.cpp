#include <gtest/gtest.h>
#include <unistd.h>

#include <filesystem>
#include <set>

#include <kelcore/filesupport/FileExceptions.h>

#include "TempDirFixture.h"

namespace {

using kelcore::UTF16String;
using namespace kelcore::filesupport;

class DirTest : public TempDirTest {};

TEST(Dir, PathsNamesParentsAndOrder) {
  const Dir dir(UTF16String(u"//a//b/"));
  EXPECT_EQ(dir.FullPath(), u"/a/b");
  EXPECT_EQ(dir.GetName(), u"b");
  EXPECT_EQ(dir.Parent(), Dir(UTF16String(u"/a")));
  EXPECT_EQ(dir.Parent().Parent(), Dir(UTF16String(u"/")));
  EXPECT_TRUE(Dir(UTF16String(u"///")).IsTopLevelDir());
  EXPECT_EQ(Dir(UTF16String(u"/")).GetName(), u"");
  EXPECT_EQ(Dir(UTF16String(u"/")).Parent(), Dir());
  EXPECT_EQ(Dir(UTF16String(u"rel")).Parent(), Dir());
  EXPECT_FALSE(Dir().IsTopLevelDir());
  EXPECT_EQ(Dir(Dir(UTF16String(u"/a")), u"b/"), dir);
  EXPECT_EQ(Dir(std::string("/a/b\xFF")).FullPathMultiByte(), "/a/b\xFF");
  const std::set<Dir> ordered = {Dir(UTF16String(u"/b")), Dir(UTF16String(u"/a")),
                                 Dir(UTF16String(u"/a/"))};
  EXPECT_EQ(ordered.size(), 2u);
  EXPECT_EQ(ordered.begin()->FullPath(), u"/a");
}

TEST_F(DirTest, CreateExistsDelete) {
  Dir dir(Root(), u"made");
  EXPECT_FALSE(dir.Exists());
  dir.Create();
  EXPECT_TRUE(dir.Exists());
  dir.Create();  // already there: nothing to do
  dir.Delete();
  EXPECT_FALSE(OnDisk("made"));
  Dir(Root(), u"lazy", true);
  EXPECT_TRUE(OnDisk("lazy"));
  WriteFile("file");
  EXPECT_FALSE(Dir(Root(), u"file").Exists());
}

TEST_F(DirTest, ErrorMapping) {
  try {
    Dir(Dir(Root(), u"absent"), u"child").Create();
    FAIL();
  } catch (const dir_not_found_exception& e) {
    EXPECT_EQ(e.GetDir(), Dir(Root(), u"absent"));  // the missing parent
  }
  WriteFile("file");
  EXPECT_THROW(Dir(Root(), u"file").Create(), dir_create_exception);
  EXPECT_THROW(Dir(Root(), u"absent").Delete(), dir_not_found_exception);
  EXPECT_THROW(Dir(Root(), u"file").Delete(), dir_not_found_exception);
  MakeDir("full/inner");
  EXPECT_THROW(Dir(Root(), u"full").Delete(), dir_delete_exception);
  EXPECT_THROW(Dir(Root(), u"absent").Modified(), dir_not_found_exception);
  EXPECT_THROW(Dir(Root(), u"file").Created(), dir_not_found_exception);
}

TEST_F(DirTest, CreateInAProtectedDirectoryFails) {
  Dir where;
  if (::geteuid() == 0) {
    if (!std::filesystem::is_directory("/sys/kernel")) GTEST_SKIP() << "no /sys to test with";
    where = Dir(std::string("/sys/kernel"));
  } else {
    MakeDir("locked");
    std::filesystem::permissions(RootBytes() + "/locked", std::filesystem::perms::owner_read |
                                                              std::filesystem::perms::owner_exec);
    where = Dir(Root(), u"locked");
  }
  EXPECT_THROW(Dir(where, u"kelcore-test").Create(), dir_create_exception);
}

TEST_F(DirTest, RenameNeverReplaces) {
  MakeDir("one/inner");
  MakeDir("two");
  Dir one(Root(), u"one");
  try {
    one.Rename(u"two");
    FAIL();
  } catch (const rename_dir_already_exists& e) {
    EXPECT_EQ(e.GetNewName(), u"two");
    EXPECT_EQ(e.GetDir(), Dir(Root(), u"one"));
  }
  WriteFile("plain");
  EXPECT_THROW(one.Rename(u"plain"), rename_dir_already_exists);
  EXPECT_EQ(one, Dir(Root(), u"one"));
  one.Rename(u"three");
  EXPECT_EQ(one, Dir(Root(), u"three"));
  EXPECT_TRUE(OnDisk("three/inner"));
  EXPECT_FALSE(OnDisk("one"));
  EXPECT_THROW(Dir(Root(), u"absent").Rename(u"x"), dir_not_found_exception);
  EXPECT_THROW(one.Rename(u"two/x"), rename_dir);
  EXPECT_THROW(Dir(UTF16String(u"/")).Rename(u"x"), rename_dir);
}

TEST(DirExceptions, KeysAreTheWhatTexts) {
  const Dir dir(UTF16String(u"/d"));
  EXPECT_STREQ(dir_exception(dir).what(),
               "$$$/kelcore/filesupport/Dir/error=Error with Directory: '@0'.");
  EXPECT_STREQ(dir_create_exception(dir).what(),
               "$$$/kelcore/filesupport/DirCreate=The directory '@0' could not be created. Please "
               "check the parent directory protection or permission rights.");
  EXPECT_STREQ(rename_dir_already_exists(dir, u"n").what(),
               "$$$/kelcore/filesupport/DirRename/exists=Could not rename the directory '@0' to "
               "'@1'. The directory already exists.");
  EXPECT_STREQ(file_exception(File(), nullptr).what(),
               "$$$/kelcore/filesupport/error=Error with file: '@0'.");
  EXPECT_STREQ(dir_delete_exception(dir, "custom").what(), "custom");
  const rename_file copy = rename_file(File(UTF16String(u"/f")), u"g");
  EXPECT_EQ(copy.GetNewName(), u"g");
  EXPECT_STREQ(copy.what(),
               "$$$/kelcore/filesupport/Rename=Could not rename the file '@0' to '@1'.");
}

}  // namespace
