#include <fcntl.h>
#include <gtest/gtest.h>
#include <sys/stat.h>
#include <unistd.h>

#include <boost/date_time/posix_time/posix_time_types.hpp>
#include <cstring>
#include <filesystem>
#include <typeinfo>

#include <kelcore/filesupport/FileExceptions.h>

#include "TempDirFixture.h"

namespace {

using kelcore::UTF16String;
using namespace kelcore::filesupport;

class FileTest : public TempDirTest {};

TEST(FileHelper, NormalisesEveryWayOfMakingAPath) {
  EXPECT_EQ(File(UTF16String(u"//a//b/c.txt")).FullPath(), u"/a/b/c.txt");
  EXPECT_EQ(File(std::string("/a//\xC3\xA9")).FullPath(), u"/a/\u00E9");
  EXPECT_EQ(File(Dir(UTF16String(u"/a/")), u"b").FullPath(), u"/a/b");
  EXPECT_EQ(File(Dir(UTF16String(u"/")), u"b").FullPath(), u"/b");
  EXPECT_EQ(File(Dir(), u"b").FullPath(), u"b");
  EXPECT_EQ(File(UTF16String(u"a\\b")).FullPath(), u"a\\b");
  EXPECT_EQ(File(std::string()).FullPath(), u"");
}

TEST(File, NameTitleExtensionAndParent) {
  const File file(UTF16String(u"/music/Album.v2/Track.MP3"));
  EXPECT_EQ(file.GetName(), u"Track.MP3");
  EXPECT_EQ(file.GetTitle(), u"Track");
  EXPECT_EQ(file.GetExtension(false), u".MP3");
  EXPECT_EQ(file.GetExtension(true), u".mp3");
  EXPECT_EQ(file.Parent(), Dir(UTF16String(u"/music/Album.v2")));
  EXPECT_EQ(File(UTF16String(u"/music/Album.v2/noext")).GetExtension(), u"");
  EXPECT_EQ(File(UTF16String(u"/x.txt")).Parent(), Dir(UTF16String(u"/")));
  EXPECT_EQ(File(UTF16String(u"x.txt")).Parent(), Dir());
  EXPECT_EQ(File(UTF16String(u"x.txt")).GetName(), u"x.txt");
  EXPECT_EQ(File(UTF16String(u"/a/\u00C9T\u00C9.\u00C9")).GetExtension(true), u".\u00E9");
}

TEST_F(FileTest, CreateExistsSizeDelete) {
  File file(Root(), u"new.bin");
  EXPECT_FALSE(file.Exists());
  file.Create(true);
  EXPECT_TRUE(file.Exists());
  EXPECT_EQ(file.Size(), 0);
  WriteFile("new.bin", std::string(5000, 'x'));
  EXPECT_EQ(file.Size(FileSizeSelector::kDataSize), 5000);
  EXPECT_GE(file.Size(FileSizeSelector::kAllocatedSize), 0);
  file.Create(false);  // truncates
  EXPECT_EQ(file.Size(), 0);
  file.Delete();
  EXPECT_FALSE(OnDisk("new.bin"));
  EXPECT_TRUE(File(RootPath()).Exists());  // a directory counts
}

TEST_F(FileTest, CreateFailuresSelectTheirException) {
  File existing(Root(), u"there");
  existing.Create(true);
  EXPECT_THROW(existing.Create(true), create_accessdenied_exception);
  EXPECT_THROW(File(Dir(Root(), u"absent"), u"f").Create(true), create_invalidpath_exception);
  WriteFile("plain");
  EXPECT_THROW(File(Dir(Root(), u"plain"), u"f").Create(true), create_invalidpath_exception);
  // A link into a missing directory: the link's own directory exists, so "not found".
  std::filesystem::create_symlink(RootBytes() + "/absent/x", RootBytes() + "/dangling");
  EXPECT_THROW(File(Root(), u"dangling").Create(false), create_fnf_exception);
  EXPECT_THROW(File(Root(), u"dangling").Create(true), create_accessdenied_exception);
  EXPECT_THROW(File(RootPath()).Create(false), create_accessdenied_exception);  // a directory
  try {
    File(std::string(RootBytes() + "/" + std::string(300, 'n'))).Create(true);
    FAIL();
  } catch (const create_exception& e) {
    EXPECT_EQ(typeid(e), typeid(create_exception));  // name too long: no special class
  }
  try {
    existing.Create(true);
    FAIL();
  } catch (const create_exception& e) {
    EXPECT_EQ(e.GetFile(), existing);
    EXPECT_STREQ(e.what(),
                 "$$$/kelcore/filesupport/Create/accessdenied=Could not create the file '@0'. "
                 "Access was denied.");
  }
}

TEST_F(FileTest, CreateInAProtectedDirectoryIsAccessDenied) {
  std::string where;
  if (::geteuid() == 0) {
    // Root ignores permission bits; sysfs refuses new files even to root.
    if (!std::filesystem::is_directory("/sys/kernel")) GTEST_SKIP() << "no /sys to test with";
    where = "/sys/kernel";
  } else {
    MakeDir("locked");
    where = RootBytes() + "/locked";
    ASSERT_EQ(::chmod(where.c_str(), 0555), 0);
  }
  EXPECT_THROW(File(Dir(where), u"kelcore-test").Create(true), create_accessdenied_exception);
  EXPECT_THROW(File(Dir(where), u"kelcore-test", true), create_accessdenied_exception);
}

TEST_F(FileTest, DeleteFailuresThrow) {
  EXPECT_THROW(File(Root(), u"missing").Delete(), file_delete_exception);
  EXPECT_THROW(File(RootPath()).Delete(), file_delete_exception);
  EXPECT_THROW(File().Delete(), file_delete_exception);
}

TEST_F(FileTest, RenameNeverReplaces) {
  WriteFile("a.txt", "A");
  WriteFile("b.txt", "B");
  File file(Root(), u"a.txt");
  try {
    file.Rename(u"b.txt");
    FAIL();
  } catch (const rename_file& e) {
    EXPECT_EQ(e.GetNewName(), u"b.txt");
    EXPECT_EQ(e.GetFile(), File(Root(), u"a.txt"));
  }
  EXPECT_EQ(file, File(Root(), u"a.txt"));
  EXPECT_EQ(File(Root(), u"b.txt").Size(), 1);
  file.Rename(u"c.txt");
  EXPECT_EQ(file, File(Root(), u"c.txt"));
  EXPECT_TRUE(OnDisk("c.txt"));
  EXPECT_FALSE(OnDisk("a.txt"));
  MakeDir("sub");
  EXPECT_THROW(file.Rename(u"sub/c.txt"), rename_file);  // never to another directory
  EXPECT_THROW(file.Rename(u".."), rename_file);
  EXPECT_THROW(file.Rename(u""), rename_file);
  EXPECT_THROW(File(Root(), u"missing").Rename(u"d.txt"), rename_file);
}

TEST_F(FileTest, QueriesOnAMissingFileThrowNotFound) {
  const File missing(Dir(Root(), u"nodir"), u"x");
  EXPECT_FALSE(missing.Exists());
  EXPECT_THROW(missing.Size(), file_not_found_exception);
  EXPECT_THROW(missing.IsReadOnly(), file_not_found_exception);
  EXPECT_THROW(missing.Created(), file_not_found_exception);
  EXPECT_THROW(missing.Modified(), file_not_found_exception);
  EXPECT_THROW(File(RootPath()).Size(), file_not_found_exception);
  EXPECT_FALSE(File(UTF16String(u"a\0b", 3)).Exists());
}

TEST_F(FileTest, TimesAreUtcToTheMicrosecond) {
  WriteFile("t");
  const File file(Root(), u"t");
  const std::string path = RootBytes() + "/t";
  const struct timespec times[2] = {{1000000000, 0}, {1700000000, 123456789}};
  ASSERT_EQ(::utimensat(AT_FDCWD, path.c_str(), times, 0), 0);
  const boost::posix_time::ptime expected =
      boost::posix_time::ptime(boost::gregorian::date(2023, 11, 14),
                               boost::posix_time::time_duration(22, 13, 20)) +
      boost::posix_time::microseconds(123456);
  EXPECT_EQ(file.Modified(), expected);
  EXPECT_FALSE(file.Created().is_not_a_date_time());
  EXPECT_EQ(Dir(RootPath()).Modified().is_not_a_date_time(), false);
}

TEST_F(FileTest, ReadOnlyFollowsTheCallersWriteAccess) {
  WriteFile("r");
  const File file(Root(), u"r");
  EXPECT_FALSE(file.IsReadOnly());
  if (::geteuid() == 0) GTEST_SKIP() << "root may write files whatever their permission bits";
  ASSERT_EQ(::chmod((RootBytes() + "/r").c_str(), 0444), 0);
  EXPECT_TRUE(file.IsReadOnly());
}

TEST_F(FileTest, CreateIfMissingLeavesAnExistingFileAlone) {
  WriteFile("keep", "data");
  EXPECT_EQ(File(Root(), u"keep", true).Size(), 4);
  EXPECT_TRUE(File(Root(), u"fresh", true).Exists());
  EXPECT_FALSE(File(Root(), u"lazy", false).Exists());
}

}  // namespace
