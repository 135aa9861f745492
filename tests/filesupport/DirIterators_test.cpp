#include <fcntl.h>
#include <gtest/gtest.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <boost/make_shared.hpp>
#include <filesystem>
#include <typeinfo>
#include <vector>

#include <kelcore/filesupport/FileExceptions.h>

#include "TempDirFixture.h"

namespace {

using kelcore::UTF16String;
using namespace kelcore::filesupport;
using NameList = std::vector<UTF16String>;

class DirIteratorTest : public TempDirTest {
 protected:
  template <class Iterator>
  static std::vector<UTF16String> Names(Iterator it, Iterator end) {
    std::vector<UTF16String> names;
    for (; it != end; ++it) names.push_back(it->GetName());
    return names;
  }
};

TEST_F(DirIteratorTest, FilesInNaturalCaseInsensitiveOrder) {
  for (const char* name : {"file10", "File2", "file1", "b", "B", "a.txt", ".hidden"}) {
    WriteFile(name);
  }
  MakeDir("adir");
  EXPECT_EQ(Names(Root().BeginFiles(), Root().EndFiles()),
            (NameList{u"a.txt", u"B", u"b", u"file1", u"File2", u"file10"}));
  EXPECT_EQ(Names(Root().BeginFiles(true), Root().EndFiles()),
            (NameList{u".hidden", u"a.txt", u"B", u"b", u"file1", u"File2", u"file10"}));
  EXPECT_EQ(Names(Root().BeginSubdirs(), Root().EndSubdirs()), (NameList{u"adir"}));
  EXPECT_EQ(Root().BeginFiles()->Parent(), Root());
}

TEST_F(DirIteratorTest, FilterAbortAndCopies) {
  for (const char* name : {"1.mp3", "2.wav", "3.mp3", "4.mp3"}) WriteFile(name);
  const NameFilter mp3Only = boost::make_shared<const NameFilterFunction>(
      [this](const UTF16String& name, const UTF16String& path) {
        EXPECT_EQ(path, RootPath() + u"/" + name);
        return name.size() > 4 && name.substr(name.size() - 4) == u".mp3";
      });
  EXPECT_EQ(Names(Root().BeginFiles(false, nullptr, true, mp3Only), Root().EndFiles()),
            (NameList{u"1.mp3", u"3.mp3", u"4.mp3"}));

  // Copies of a listing step independently over the same snapshot.
  Dir::FileIterator first = Root().BeginFiles();
  Dir::FileIterator second = first;
  ++second;
  EXPECT_EQ(first->GetName(), u"1.mp3");
  EXPECT_EQ((second++)->GetName(), u"2.wav");
  EXPECT_EQ(second->GetName(), u"3.mp3");
  EXPECT_NE(first, second);

  int calls = 0;
  const AbortQueryFunction stopAfterFive = [&calls] { return ++calls > 5; };
  Dir::FileIterator stopped = Root().BeginFiles(false, &stopAfterFive);
  // Reading the directory asks for every entry (4 files, ".", "..", the end): abort.
  EXPECT_EQ(stopped, Root().EndFiles());
  calls = -100;
  std::size_t seen = 0;
  for (Dir::FileIterator it = Root().BeginFiles(false, &stopAfterFive); it != Root().EndFiles();
       ++it) {
    if (++seen == 2) calls = 5;  // the next step aborts
  }
  EXPECT_EQ(seen, 2u);
  EXPECT_THROW(*Root().EndFiles(), std::out_of_range);
}

TEST_F(DirIteratorTest, SymbolicLinks) {
  MakeDir("real");
  WriteFile("target.txt");
  std::filesystem::create_directory_symlink(RootBytes() + "/real", RootBytes() + "/linkdir");
  std::filesystem::create_symlink(RootBytes() + "/target.txt", RootBytes() + "/linkfile");
  std::filesystem::create_symlink(RootBytes() + "/gone", RootBytes() + "/dangling");
  EXPECT_EQ(Names(Root().BeginFiles(), Root().EndFiles()),
            (NameList{u"dangling", u"linkfile", u"target.txt"}));
  EXPECT_EQ(Names(Root().BeginFiles(false, nullptr, false), Root().EndFiles()),
            (NameList{u"dangling", u"linkdir", u"linkfile", u"target.txt"}));
  EXPECT_EQ(Names(Root().BeginSubdirs(), Root().EndSubdirs()), (NameList{u"linkdir", u"real"}));
}

TEST_F(DirIteratorTest, ListingAMissingOrUnreadableDirectory) {
  EXPECT_THROW(Dir(Root(), u"absent").BeginFiles(), dir_not_found_exception);
  WriteFile("file");
  EXPECT_THROW(Dir(Root(), u"file").BeginSubdirs(), dir_not_found_exception);
  EXPECT_THROW(RecursiveFileIterator(Dir(Root(), u"absent")), dir_not_found_exception);
  if (::geteuid() == 0) GTEST_SKIP() << "root reads every directory whatever its permissions";
  MakeDir("closed");
  ASSERT_EQ(::chmod((RootBytes() + "/closed").c_str(), 0), 0);
  try {
    Dir(Root(), u"closed").BeginFiles();
    FAIL();
  } catch (const dir_exception& e) {
    EXPECT_EQ(typeid(e), typeid(dir_exception));
  }
}

TEST_F(DirIteratorTest, RecursiveWalkIsDepthFirstInListingOrder) {
  WriteFile("z.txt");
  MakeDir("b/deep");
  MakeDir("a");
  MakeDir("empty");
  MakeDir(".git");
  WriteFile("a/1");
  WriteFile("b/2");
  WriteFile("b/deep/3");
  WriteFile(".git/config");
  WriteFile("b/.hidden");
  std::filesystem::create_directory_symlink(RootBytes() + "/b", RootBytes() + "/loop");

  std::vector<UTF16String> visited;
  std::vector<UTF16String> dirs;
  for (RecursiveFileIterator it(Root()); it != RecursiveFileIterator(); ++it) {
    visited.push_back(it->FullPath().substr(RootPath().size()));
    dirs.push_back(it.CurrentDir().FullPath().substr(RootPath().size()));
  }
  EXPECT_EQ(visited, (NameList{u"/z.txt", u"/a/1", u"/b/2", u"/b/deep/3"}));
  EXPECT_EQ(dirs, (NameList{u"", u"/a", u"/b", u"/b/deep"}));

  visited.clear();
  for (RecursiveFileIterator it(Root(), true); it != RecursiveFileIterator(); ++it) {
    visited.push_back(it->GetName());
  }
  EXPECT_EQ(visited, (NameList{u"z.txt", u"config", u"1", u".hidden", u"2", u"3"}));
}

TEST_F(DirIteratorTest, RecursiveCopiesShareOneWalkAndAbort) {
  for (const char* name : {"1", "2", "3", "4"}) WriteFile(name);
  RecursiveFileIterator it(Root());
  RecursiveFileIterator copy = it;
  EXPECT_EQ((it++).GetName(), u"1");
  EXPECT_EQ(copy->GetName(), u"2");
  EXPECT_EQ(copy, it);
  bool stop = false;
  copy.SetAbortQueryCallback([&stop] { return stop; });
  ++it;
  EXPECT_EQ(it->GetName(), u"3");
  stop = true;
  ++it;
  EXPECT_EQ(copy, RecursiveFileIterator());
  EXPECT_THROW(copy.CurrentDir(), std::out_of_range);
}

// A name that is not UTF-8 on disk is found, used and renamed without losing a byte.
TEST_F(DirIteratorTest, InvalidUtf8NamesRoundTrip) {
  const std::string name = "a\xFF\xFE.txt";
  const std::string path = RootBytes() + "/" + name;
  const int fd = ::open(path.c_str(), O_CREAT | O_WRONLY | O_EXCL, 0644);
  ASSERT_GE(fd, 0);
  ASSERT_EQ(::write(fd, "abc", 3), 3);
  ::close(fd);

  Dir::FileIterator it = Root().BeginFiles();
  ASSERT_NE(it, Root().EndFiles());
  File file = *it;
  EXPECT_EQ(file.FullPathMultiByte(), path);
  EXPECT_EQ(file.GetExtension(), u".txt");
  EXPECT_TRUE(file.Exists());
  EXPECT_EQ(file.Size(), 3);
  file.Create(false);
  EXPECT_EQ(std::filesystem::file_size(path), 0u);

  UTF16String newName = file.GetTitle() + u"\xDC80.bin";  // another raw byte, 0x80
  file.Rename(newName);
  const std::string renamed = RootBytes() + "/a\xFF\xFE\x80.bin";
  EXPECT_EQ(file.FullPathMultiByte(), renamed);
  struct stat info;
  EXPECT_EQ(::lstat(renamed.c_str(), &info), 0);
  EXPECT_NE(::lstat(path.c_str(), &info), 0);
  EXPECT_EQ(Names(Root().BeginFiles(), Root().EndFiles()), (NameList{newName}));
  file.Delete();
  EXPECT_NE(::lstat(renamed.c_str(), &info), 0);
}

TEST(DirVolumes, ListsTheRootOnceAndFiltersByType) {
  std::vector<Dir> volumes(Dir::BeginVolumes(), Dir::EndVolumes());
  ASSERT_FALSE(volumes.empty());
  EXPECT_TRUE(volumes.front().IsTopLevelDir());
  EXPECT_TRUE(std::is_sorted(volumes.begin(), volumes.end()));
  EXPECT_EQ(std::adjacent_find(volumes.begin(), volumes.end()), volumes.end());
  const NameFilter procOnly = boost::make_shared<const NameFilterFunction>(
      [](const UTF16String& type, const UTF16String&) { return type == u"proc"; });
  for (auto it = Dir::BeginVolumes(procOnly); it != Dir::EndVolumes(); ++it) {
    EXPECT_NE(it->FullPath().find(u"proc"), UTF16String::npos) << it->FullPathMultiByte();
  }
}

}  // namespace
