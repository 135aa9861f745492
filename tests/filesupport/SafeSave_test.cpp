#include <kelcore/filesupport/FileExceptions.h>
#include <kelcore/filesupport/FileUtils.h>
#include <kelcore/filesupport/SafeSave.h>

#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

#include <filesystem>
#include <fstream>
#include <sstream>
#include <string>

#include "TempDirFixture.h"

namespace kelcore::filesupport {
namespace {

using utility::FileUtils::SimpleWriteStringToFile;

UTF16String U16(const std::string& ascii) {
  return UTF16String(ascii.begin(), ascii.end());
}

class SafeSaveTest : public TempDirTest {
 protected:
  File FileAt(const std::string& name) const { return File(Root(), U16(name)); }
  std::string Content(const std::string& name) const {
    std::ifstream in(RootBytes() + "/" + name, std::ios::binary);
    std::ostringstream content;
    content << in.rdbuf();
    return content.str();
  }
  std::size_t EntryCount() const {
    std::size_t count = 0;
    for ([[maybe_unused]] const auto& entry : std::filesystem::directory_iterator(RootBytes())) {
      ++count;
    }
    return count;
  }
  // Writes `text` through a SafeSave of `target` and commits.
  static void Save(const File& target, const std::string& text) {
    SafeSave save(target);
    SimpleWriteStringToFile(save.GetTempFile(), text);
    save.Commit();
  }
};

TEST_F(SafeSaveTest, TemporaryNameRunsTheCounterOnFromTheThreadId) {
  const std::string ids = "." + std::to_string(::getpid()) + "." + std::to_string(::gettid());
  SafeSave report(FileAt("Report.XML"));
  EXPECT_EQ(report.GetTempFile().FullPath(), RootPath() + U16("/Report" + ids + "1.xml"));
  EXPECT_FALSE(report.GetTempFile().Exists()) << "nothing is created";

  SafeSave bare(FileAt("Makefile"));
  EXPECT_EQ(bare.GetTempFile().FullPath(), RootPath() + U16("/Makefile" + ids + "1"));

  // A second save of the same target takes the next number once the first file exists.
  SimpleWriteStringToFile(report.GetTempFile(), "first");
  SafeSave second(FileAt("Report.XML"));
  EXPECT_EQ(second.GetTempFile().FullPath(), RootPath() + U16("/Report" + ids + "2.xml"));

  EXPECT_THROW(SafeSave(File(Root(), U16("missing/x.txt"))), dir_not_found_exception);
}

TEST_F(SafeSaveTest, CommitReplacesOrCreatesTheTarget) {
  Save(FileAt("new.txt"), "created");
  EXPECT_EQ(Content("new.txt"), "created");

  WriteFile("doc.txt", "old content");
  SafeSave save(FileAt("doc.txt"));
  SimpleWriteStringToFile(save.GetTempFile(), "new content");
  EXPECT_EQ(Content("doc.txt"), "old content") << "untouched until the commit";
  save.Commit();
  EXPECT_EQ(Content("doc.txt"), "new content");
  EXPECT_EQ(save.GetTempFile(), FileAt("doc.txt"));
  EXPECT_EQ(EntryCount(), 2u) << "no temporary file left";
}

TEST_F(SafeSaveTest, UncommittedSavesLeaveTheTargetAlone) {
  WriteFile("doc.txt", "old");
  { SafeSave neverWritten(FileAt("doc.txt")); }
  {
    SafeSave abandoned(FileAt("doc.txt"));
    SimpleWriteStringToFile(abandoned.GetTempFile(), "discarded");
  }
  EXPECT_EQ(Content("doc.txt"), "old");
  EXPECT_EQ(EntryCount(), 1u);

  // Committing a temporary file that was never written fails and keeps the target.
  SafeSave unwritten(FileAt("doc.txt"));
  try {
    unwritten.Commit();
    FAIL() << "no exception";
  } catch (const rename_file& error) {
    EXPECT_EQ(error.GetFile(), unwritten.GetTempFile());
    EXPECT_EQ(error.GetNewName(), U16("doc.txt"));
  }
  EXPECT_EQ(Content("doc.txt"), "old");
}

TEST_F(SafeSaveTest, ReplacedFileKeepsItsPermissions) {
  WriteFile("private.txt", "old");
  ASSERT_EQ(::chmod((RootBytes() + "/private.txt").c_str(), 0640), 0);
  Save(FileAt("private.txt"), "new");
  struct stat status;
  ASSERT_EQ(::stat((RootBytes() + "/private.txt").c_str(), &status), 0);
  EXPECT_EQ(status.st_mode & 07777, 0640u);
}

TEST_F(SafeSaveTest, SymbolicLinkStaysALinkToTheReplacedFile) {
  MakeDir("real");
  WriteFile("real/data.cfg", "old");
  // A relative link to a relative link: both are followed.
  std::filesystem::create_symlink("real/data.cfg", RootBytes() + "/hop");
  std::filesystem::create_symlink("hop", RootBytes() + "/link.cfg");
  Save(FileAt("link.cfg"), "new");
  EXPECT_TRUE(std::filesystem::is_symlink(RootBytes() + "/link.cfg"));
  EXPECT_TRUE(std::filesystem::is_symlink(RootBytes() + "/hop"));
  EXPECT_EQ(Content("real/data.cfg"), "new");
  EXPECT_EQ(EntryCount(), 3u);

  // A dangling link gets its file created.
  std::filesystem::create_symlink("real/later.cfg", RootBytes() + "/dangling");
  Save(FileAt("dangling"), "made");
  EXPECT_TRUE(std::filesystem::is_symlink(RootBytes() + "/dangling"));
  EXPECT_EQ(Content("real/later.cfg"), "made");
}

// Run in a child process, as an unprivileged user when the tests run as root (root
// ignores permission bits).
TEST_F(SafeSaveTest, ReadOnlyDirectoryFailsCleanly) {
  MakeDir("ro");
  WriteFile("ro/doc.txt", "old");
  const std::string dir = RootBytes() + "/ro";
  constexpr uid_t kNobody = 65534;
  if (::geteuid() == 0) {
    ASSERT_EQ(::chmod(RootBytes().c_str(), 0755), 0);
    ASSERT_EQ(::chown(dir.c_str(), kNobody, kNobody), 0);
  }
  ASSERT_EQ(::chmod(dir.c_str(), 0555), 0);
  const pid_t child = ::fork();
  ASSERT_GE(child, 0);
  if (child == 0) {
    if (::geteuid() == 0 && (::setgid(kNobody) != 0 || ::setuid(kNobody) != 0)) ::_exit(3);
    try {
      Save(File(U16(dir + "/doc.txt")), "new");
      ::_exit(1);  // the save went through
    } catch (const create_accessdenied_exception&) {
      ::_exit(0);
    } catch (...) {
      ::_exit(2);
    }
  }
  int status = 0;
  ASSERT_EQ(::waitpid(child, &status, 0), child);
  ASSERT_TRUE(WIFEXITED(status));
  if (WEXITSTATUS(status) == 3) GTEST_SKIP() << "cannot drop root privileges";
  EXPECT_EQ(WEXITSTATUS(status), 0) << "1: saved anyway, 2: another exception";
  EXPECT_EQ(Content("ro/doc.txt"), "old");
  EXPECT_EQ(std::distance(std::filesystem::directory_iterator(dir), {}), 1);
}

}  // namespace
}  // namespace kelcore::filesupport
