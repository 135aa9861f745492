// The filesupport.* commands. File times vary, so their lines are checked by label.
#include <kelcore/filesupport/CommonDirs.h>

#include <cstdlib>
#include <optional>
#include <sstream>
#include <vector>

#include "ConsoleTestSupport.h"

namespace kelcore::console::testing {
namespace {

using FileCommandsTest = ConsoleTest;

std::vector<std::string> Lines(const UTF16String& text) {
  const UTF8String utf8 = utility::UTF16to8(text);
  std::istringstream in(std::string(utf8.begin(), utf8.end()));
  std::vector<std::string> lines;
  for (std::string line; std::getline(in, line);) lines.push_back(line);
  return lines;
}

// Checks `lines` against `expected`, where an entry ending in "*" matches any line that
// starts with the text before it.
void ExpectLines(const std::vector<std::string>& lines, const std::vector<std::string>& expected) {
  ASSERT_EQ(lines.size(), expected.size());
  for (std::size_t i = 0; i < lines.size(); ++i) {
    const std::string& want = expected[i];
    if (!want.empty() && want.back() == '*') {
      EXPECT_EQ(lines[i].substr(0, want.size() - 1), want.substr(0, want.size() - 1)) << i;
      EXPECT_EQ(lines[i].find("Threw"), std::string::npos) << lines[i];
    } else {
      EXPECT_EQ(lines[i], want) << i;
    }
  }
}

TEST_F(FileCommandsTest, ExistingFileIsTestedAndLeftAsFound) {
  WriteFile("notes.TXT", "contents");
  const std::string path = RootBytes() + "/notes.TXT";
  ExpectLines(Lines(Run("filesupport.file   " + path + "  ")),
              {"File Path: " + path, " File found.", " Created: *", " Modified: *",
               " Name: notes.TXT", " Title: notes", " Extension: .TXT", " Copy: compares equal.",
               " Rename: " + RootBytes() + "/house", " Rename back: " + path});
  std::ifstream in(path);
  std::string text;
  std::getline(in, text);
  EXPECT_EQ(text, "contents");
  EXPECT_FALSE(OnDisk("house"));
}

TEST_F(FileCommandsTest, MissingFileIsCreatedForTheTestAndRemoved) {
  const std::string path = RootBytes() + "/with space.dat";
  ExpectLines(Lines(Run("filesupport.file " + path)),
              {"File Path: " + path, " File not found.", " Create: created the file.",
               " Created: *", " Modified: *", " Name: with space.dat", " Title: with space",
               " Extension: .dat", " Copy: compares equal.", " Rename: " + RootBytes() + "/house",
               " Rename back: " + path, " Delete: deleted the file."});
  EXPECT_FALSE(OnDisk("with space.dat"));
}

TEST_F(FileCommandsTest, FailingStepsReportThrew) {
  WriteFile("a.txt");
  WriteFile("house", "must survive");
  const std::string path = RootBytes() + "/a.txt";
  const std::vector<std::string> lines = Lines(Run("filesupport.file " + path));
  ASSERT_EQ(lines.size(), 9u);
  EXPECT_EQ(lines[8], " Rename: Threw file_exception");

  const std::string missing = RootBytes() + "/no/such/file";
  const std::vector<std::string> missingLines = Lines(Run("filesupport.file " + missing));
  ASSERT_GE(missingLines.size(), 4u);
  EXPECT_EQ(missingLines[2], " Create: Threw file_exception");
  EXPECT_EQ(missingLines[3], " Created: Threw file_exception");
  EXPECT_EQ(Run("filesupport.file"),
            u"filesupport.file <file path> - given a file name, echos the path and indicates if "
            u"the file exists\n");
}

TEST_F(FileCommandsTest, DirectoryIsTestedAndACreatedOneRemoved) {
  MakeDir("kept");
  const std::string kept = RootBytes() + "/kept";
  ExpectLines(
      Lines(Run("filesupport.dir " + kept)),
      {"Directory Path: " + kept, " Dir Name: kept", " Parent Path: " + RootBytes(),
       " Directory found.", " Created: *", " Modified: *", " Top Level: no",
       " Copy: compares equal.", " Rename: " + RootBytes() + "/house", " Rename back: " + kept});
  EXPECT_TRUE(OnDisk("kept"));

  const std::string made = RootBytes() + "/made";
  const std::vector<std::string> lines = Lines(Run("filesupport.dir " + made));
  ASSERT_EQ(lines.size(), 12u);
  EXPECT_EQ(lines[3], " Directory not found.");
  EXPECT_EQ(lines[4], " Create: created the directory.");
  EXPECT_EQ(lines[11], " Delete: deleted the directory.");
  EXPECT_FALSE(OnDisk("made"));

  const std::vector<std::string> root = Lines(Run("filesupport.dir /"));
  ASSERT_GE(root.size(), 7u);
  EXPECT_EQ(root[6], " Top Level: yes");
  EXPECT_EQ(root.back(), " Rename: Threw dir_exception");
}

// Points an environment variable elsewhere for one scope, so that folders the listing
// creates (documents, desktop, application data) land in the temporary directory.
class ScopedEnv {
 public:
  ScopedEnv(const char* name, const std::string& value) : name_(name) {
    if (const char* old = std::getenv(name)) old_ = old;
    ::setenv(name, value.c_str(), 1);
  }
  ~ScopedEnv() { old_ ? ::setenv(name_, old_->c_str(), 1) : ::unsetenv(name_); }

 private:
  const char* name_;
  std::optional<std::string> old_;
};

TEST_F(FileCommandsTest, ListDirsLabelsInOrder) {
  const ScopedEnv home("HOME", RootBytes());
  const ScopedEnv config("XDG_CONFIG_HOME", RootBytes() + "/config");
  const ScopedEnv data("XDG_DATA_HOME", RootBytes() + "/data");
  filesupport::commondirs::SetPluginsDirOverride(filesupport::Dir(RootPath()));
  const std::vector<std::string> lines = Lines(Run("filesupport.listdirs"));
  filesupport::commondirs::SetPluginsDirOverride(filesupport::Dir());
  ExpectLines(lines, {"commondirs Functions:",
                      "Main Executable File = \t*",
                      "Executable Dir = \t\t*",
                      "Resources Dir = \t\t*",
                      "Plugins Dir = \t\t" + RootBytes(),
                      "Required Plugins Dir = \t*",
                      "User Plugins Dir = \t\t*",
                      "All User Plugins Dir = \t*",
                      "User Documents Dir = \t*",
                      "All Users Documents Dir = \t*",
                      "User Desktop Dir = \t\t*",
                      "Current User Dir = \t\t*",
                      "Dir Methods:",
                      "App Dir = \t\t*",
                      "User Docs Dir = \t\t*",
                      "Temp Dir = \t\t*",
                      "Pref Dir = \t\t" + RootBytes(),
                      "Global Pref Dir = \t\t*",
                      "Package Dir = \t\t*",
                      "Common Files Dir = \t\t*"});
}

TEST_F(FileCommandsTest, ListVolsStartsWithTheRoot) {
  const std::vector<std::string> lines = Lines(Run("filesupport.listvols"));
  ASSERT_GE(lines.size(), 2u);
  EXPECT_EQ(lines[0], "List Volumes:");
  EXPECT_EQ(lines[1], "/");
}

}  // namespace
}  // namespace kelcore::console::testing
