#include <kelcore/filesupport/FileExceptions.h>
#include <kelcore/filesupport/FileUtils.h>

#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <random>
#include <stdexcept>
#include <string>
#include <system_error>

namespace {

using kelcore::UTF16String;
using kelcore::UTF8String;
using kelcore::filesupport::Dir;
using kelcore::filesupport::File;
using namespace kelcore::utility::FileUtils;
namespace fs = std::filesystem;

// Each test works in a fresh directory of its own, removed afterwards.
class FileUtilsTest : public ::testing::Test {
 protected:
  void SetUp() override {
    std::random_device random;
    root_ = fs::temp_directory_path() /
            ("kelcore-fileutils-" + std::to_string(random()) + "-" + std::to_string(random()));
    ASSERT_TRUE(fs::create_directory(root_));
  }
  void TearDown() override {
    std::error_code ignored;
    fs::remove_all(root_, ignored);
  }
  UTF16String Path(const std::string& relative) const { return (root_ / relative).u16string(); }

  fs::path root_;
};

TEST_F(FileUtilsTest, WriteThenReadGivesTheSameBytes) {
  const File file(Path("data.bin"));
  const UTF8String bytes(reinterpret_cast<const unsigned char*>("a\0\xFF\xC3\x28 z"), 7);
  SimpleWriteStringToFile(file, bytes);  // creates the file
  UTF8String back;
  SimpleReadFileToString(file, back);
  EXPECT_EQ(back, bytes);

  // A shorter content replaces the longer one entirely.
  SimpleWriteStringToFile(file, std::string("xy"));
  std::string narrow = "stale";
  SimpleReadFileToString(file, narrow);
  EXPECT_EQ(narrow, "xy");

  SimpleWriteStringToFile(file, std::string());
  SimpleReadFileToString(file, narrow);
  EXPECT_EQ(narrow, "");

  // More than one read buffer's worth.
  std::string big(300000, '\0');
  for (std::size_t i = 0; i < big.size(); ++i) big[i] = static_cast<char>(i * 7 + i / 251);
  SimpleWriteStringToFile(file, big);
  SimpleReadFileToString(file, narrow);
  EXPECT_EQ(narrow, big);
}

TEST_F(FileUtilsTest, WriteAndReadFailures) {
  EXPECT_THROW(SimpleWriteStringToFile(File(Path("missing/f.txt")), std::string("x")),
               kelcore::filesupport::create_exception);
  EXPECT_THROW(SimpleWriteStringToFile(File(), std::string("x")),
               kelcore::filesupport::create_exception);

  std::string kept = "kept";
  EXPECT_THROW(SimpleReadFileToString(File(Path("missing.txt")), kept),
               kelcore::filesupport::file_not_found_exception);
  EXPECT_THROW(SimpleReadFileToString(File(Path("missing/x")), kept),
               kelcore::filesupport::file_not_found_exception);
  EXPECT_THROW(SimpleReadFileToString(File(root_.u16string()), kept),
               kelcore::filesupport::file_not_found_exception);  // a directory
  EXPECT_EQ(kept, "kept");
}

TEST_F(FileUtilsTest, EnsureDirectoryExistsCreatesEveryLevel) {
  const Dir deep(Path("a/b/c"));
  EnsureDirectoryExists(deep);
  EXPECT_TRUE(fs::is_directory(root_ / "a/b/c"));
  EnsureDirectoryExists(deep);  // existing: nothing to do
  EnsureDirectoryExists(Dir(root_.u16string()));
}

TEST_F(FileUtilsTest, EnsureDirectoryExistsNamesTheLevelThatFailed) {
  std::ofstream(root_ / "blocker") << "a file in the way";
  try {
    EnsureDirectoryExists(Dir(Path("blocker/x/y")));
    FAIL() << "no exception";
  } catch (const kelcore::filesupport::dir_create_exception& e) {
    EXPECT_EQ(e.GetDir(), Dir(Path("blocker")));
  }
  EXPECT_FALSE(fs::exists(root_ / "blocker/x"));
  EXPECT_THROW(EnsureDirectoryExists(Dir()), kelcore::filesupport::dir_create_exception);
}

TEST_F(FileUtilsTest, UniqueFileNameCountsFromOne) {
  const UTF16String dir = root_.u16string();
  EXPECT_EQ(UniqueFileName(dir, u"Report", u".xml"), dir + u"/Report1.xml");
  EXPECT_EQ(UniqueFileName(dir + u"/", u"Report", u".xml"), dir + u"/Report1.xml");
  EXPECT_EQ(UniqueFileName(dir, u"Report.12.34", u""), dir + u"/Report.12.341");

  // Files, directories and dangling links all occupy a name; the name without a number
  // is never considered.
  std::ofstream(root_ / "Report.xml");
  std::ofstream(root_ / "Report1.xml");
  fs::create_directory(root_ / "Report2.xml");
  fs::create_symlink(root_ / "nowhere", root_ / "Report3.xml");
  EXPECT_EQ(UniqueFileName(dir, u"Report", u".xml"), dir + u"/Report4.xml");
  EXPECT_EQ(UniqueFileName(dir, u"Report", u".XML"), dir + u"/Report1.XML");
}

TEST_F(FileUtilsTest, UniqueFileNameNeedsAnExistingDirectory) {
  std::ofstream(root_ / "plain");
  EXPECT_THROW(UniqueFileName(Path("missing"), u"b", u".x"),
               kelcore::filesupport::dir_not_found_exception);
  EXPECT_THROW(UniqueFileName(Path("plain"), u"b", u".x"),
               kelcore::filesupport::dir_not_found_exception);
  EXPECT_THROW(UniqueFileName(root_.u16string(), UTF16String(u"a\0b", 3), u".x"),
               std::invalid_argument);
}

}  // namespace
