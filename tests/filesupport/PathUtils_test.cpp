#include <kelcore/filesupport/Dir.h>
#include <kelcore/filesupport/File.h>
#include <kelcore/filesupport/PathStrings.h>
#include <kelcore/filesupport/PathUtils.h>

#include <gtest/gtest.h>

#include <atomic>
#include <string_view>
#include <thread>
#include <vector>

#include "filesupport/PathLongForm.h"
#include "filesupport/PathRelativeWalk.h"

namespace {

using kelcore::UTF16String;
using namespace kelcore::filesupport;
namespace FU = kelcore::utility::FileUtils;

TEST(PathUtils, WindowsLongPathForm) {
  struct Case {
    const char16_t* path;
    const char16_t* expected;
  } cases[] = {
      {u"C:\\x", u"\\\\?\\C:\\x"},                     // reference
      {u"\\\\srv\\sh\\f", u"\\\\?\\UNC\\srv\\sh\\f"},  // reference
      {u"\\\\srv", u"\\\\?\\\\\\srv"},                 // no share: the plain prefix
      {u"", u"\\\\?\\"},
      {u"\\\\\\", u"\\\\?\\UNC\\\\"},  // a separator right at position 2
      {u"\\x\\y", u"\\\\?\\\\x\\y"},   // one leading backslash only
      {u"rel\\f", u"\\\\?\\rel\\f"},   // no length or form test
  };
  for (const auto& c : cases) {
    EXPECT_EQ(detail::WindowsLongPathName(c.path), c.expected) << "case #" << (&c - cases);
  }
#if !defined(_WIN32)
  EXPECT_EQ(PrepAsLongPathName(u"/a/b"), u"/a/b");
#endif
}

TEST(PathUtils, PathFormPredicates) {
  EXPECT_TRUE(IsPathDriveLetter(u"C:"));
  EXPECT_TRUE(IsPathDriveLetter(u"?:"));
  EXPECT_FALSE(IsPathDriveLetter(u"C:\\"));
  EXPECT_FALSE(IsPathDriveLetter(u"C"));
  EXPECT_FALSE(IsPathDriveLetter(u""));

  for (const char16_t* relative : {u"a", u"./a", u"../a/b", u"ab:", u"a/b:c"}) {
    EXPECT_TRUE(IsNormalizedRelativePath(relative)) << std::u16string_view(relative).size();
  }
  for (const char16_t* absolute : {u"", u"/a", u"\\a", u"C:", u"a:", u"C:rel", u"c:\\x"}) {
    EXPECT_FALSE(IsNormalizedRelativePath(absolute)) << std::u16string_view(absolute).size();
  }
}

TEST(PathUtils, CompareFileNamesIgnoresCaseAndWidthNotAccents) {
  EXPECT_EQ(CompareFileNames(u"Report.TXT", u"report.txt"), 0);
  EXPECT_EQ(CompareFileNames(u"\u00C9t\u00E9", u"\u00E9T\u00C9"), 0);  // accented case
  EXPECT_EQ(CompareFileNames(u"\uFF21\uFF22\uFF23", u"abc"), 0);       // full width
  EXPECT_EQ(CompareFileNames(u"\u30AB\u30CA", u"\u304B\u306A"), 0);    // kana type
  EXPECT_EQ(CompareFileNames(u"e\u0301", u"\u00E9"), 0);               // canonical
  EXPECT_NE(CompareFileNames(u"resume", u"r\u00E9sum\u00E9"), 0);      // accents
  EXPECT_EQ(CompareFileNames(u"a", u"b"), -1);
  EXPECT_EQ(CompareFileNames(u"B", u"a"), 1);
  EXPECT_EQ(CompareFileNames(u"file", u"file2"), -1);
  EXPECT_EQ(CompareFileNames(u"", u""), 0);
  EXPECT_EQ(CompareFileNames(u"", u"a"), -1);
  // The whole strings count, embedded NUL units included; lone surrogates do not break it.
  EXPECT_EQ(CompareFileNames(UTF16String(u"a\0b", 3), UTF16String(u"a\0c", 3)), -1);
  const UTF16String lone(1, char16_t(0xD800));
  EXPECT_EQ(CompareFileNames(lone, lone), 0);
}

// Each thread compares with a collator of its own; all must agree.
TEST(PathUtils, CompareFileNamesFromManyThreads) {
  const std::vector<UTF16String> names = {u"alpha", u"ALPHA", u"\uFF41lpha", u"B\u00E9ta"};
  const std::vector<int> expected = {0, 0, 0, -1, 0, 0, 0, -1, 0, 0, 0, -1, 1, 1, 1, 0};
  std::atomic<int> mismatches{0};
  std::vector<std::thread> threads;
  for (int t = 0; t < 4; ++t) {
    threads.emplace_back([&] {
      for (int round = 0; round < 200; ++round) {
        for (std::size_t i = 0; i < expected.size(); ++i) {
          if (CompareFileNames(names[i / 4], names[i % 4]) != expected[i]) ++mismatches;
        }
      }
    });
  }
  for (auto& thread : threads) thread.join();
  EXPECT_EQ(mismatches.load(), 0);
}

TEST(PathUtils, RelativePathsOnThisSystem) {
  const File f(u"/p/q/f.txt");
  EXPECT_EQ(MakeNormalizedRelativePath(f, Dir(u"/p/r")), u"../q/f.txt");
  EXPECT_EQ(MakeNormalizedRelativePath(f, Dir(u"/p/q")), u"f.txt");
  EXPECT_EQ(MakeNormalizedRelativePath(f, Dir(u"/p")), u"q/f.txt");
  EXPECT_EQ(MakeNormalizedRelativePath(f, Dir(u"/")), u"p/q/f.txt");
  EXPECT_EQ(MakeNormalizedRelativePath(f, Dir(u"/x/y/z")), u"../../../p/q/f.txt");
  EXPECT_EQ(MakeNormalizedRelativePath(f, Dir(u"/p/q/deeper")), u"../f.txt");
  EXPECT_EQ(MakeNormalizedRelativePath(File(u"/top.txt"), Dir(u"/a")), u"../top.txt");
  EXPECT_EQ(MakeNormalizedRelativePath(f, File(u"/p/r/doc.xml")), u"../q/f.txt");
  // Directory equality is by code unit: another case is another directory.
  EXPECT_EQ(MakeNormalizedRelativePath(f, Dir(u"/P/q")), u"../../p/q/f.txt");
}

TEST(PathUtils, FilesFromRelativePaths) {
  const Dir base(u"/base");
  EXPECT_EQ(MakeFileFromPath(u"./a/../b/f.txt", base), File(u"/base/b/f.txt"));  // reference
  EXPECT_EQ(MakeFileFromPath(u"f.txt", base), File(u"/base/f.txt"));
  EXPECT_EQ(MakeFileFromPath(u"a//b/./f", base), File(u"/base/a/b/f"));
  EXPECT_EQ(MakeFileFromPath(u"../../../../f", base), File(u"/f"));  // stops at the root
  EXPECT_EQ(MakeFileFromPath(u"a/b/", base), File());                // no file component
  EXPECT_EQ(MakeFileFromPath(u"/abs/f", base), File(u"/abs/f"));
  EXPECT_EQ(MakeFileFromPath(u"\\x", base), File(u"\\x"));
  EXPECT_EQ(MakeFileFromPath(u"c:f", base), File(u"c:f"));
  EXPECT_EQ(MakeFileFromPath(u"", base), File());
  EXPECT_EQ(MakeFileFromPath(u"q/f.txt", File(u"/base/doc.xml")), File(u"/base/q/f.txt"));
  EXPECT_EQ(MakeFileFromPath(u"back\\slash", base), File(u"/base/back\\slash"));

  // Each relative path leads back to its file.
  for (const char16_t* path : {u"/p/q/f.txt", u"/f", u"/base/x/y/z.bin", u"/p/r/s"}) {
    const File file(path);
    for (const char16_t* from : {u"/", u"/base", u"/p/r", u"/p/q/deep/er"}) {
      EXPECT_EQ(MakeFileFromPath(MakeNormalizedRelativePath(file, Dir(from)), Dir(from)), file);
    }
  }
}

// Windows paths held as strings, with the directory rules of that platform: a drive
// ("C:") or a share ("\\srv\sh") is a top-level directory, and nothing lies above it.
struct WindowsDirModel {
  static bool IsShareRoot(const UTF16String& d) {
    if (d.size() < 3 || d[0] != u'\\' || d[1] != u'\\') return false;
    const std::size_t server = d.find(u'\\', 2);
    return server != UTF16String::npos && d.find(u'\\', server + 1) == UTF16String::npos;
  }
  bool Same(const UTF16String& a, const UTF16String& b) const { return a == b; }
  bool IsTop(const UTF16String& d) const { return IsPathDriveLetter(d) || IsShareRoot(d); }
  bool Ascend(UTF16String& d) const {
    UTF16String parent;
    if (IsTop(d) || !FU::GetParentPath(d, parent, FU::PathStyle::kWindows)) return false;
    if (parent.size() >= d.size()) return false;
    d = parent;
    return true;
  }
  UTF16String Name(const UTF16String& d) const {
    return FU::GetPathFileName(d, FU::PathStyle::kWindows);
  }
  UTF16String Child(const UTF16String& d, const UTF16String& name) const {
    UTF16String child;
    FU::BuildPathSpec(d, name, child, FU::PathStyle::kWindows);
    return child;
  }
};

TEST(PathUtils, RelativePathsUnderWindowsRules) {
  const WindowsDirModel model;
  auto relative = [&](const char16_t* parent, const char16_t* base) {
    return detail::RelativePathOf(UTF16String(parent), UTF16String(u"f.txt"), UTF16String(base),
                                  model);
  };
  EXPECT_EQ(relative(u"C:\\p\\q", u"C:\\p\\r"), u"../q/f.txt");  // reference
  EXPECT_EQ(relative(u"C:\\p\\q", u"D:\\p\\r"), u"");            // another drive
  EXPECT_EQ(relative(u"C:\\p\\q", u"D:"), u"");
  EXPECT_EQ(relative(u"C:", u"C:\\a\\b"), u"../../f.txt");
  EXPECT_EQ(relative(u"\\\\srv\\sh\\d", u"\\\\srv\\sh"), u"d/f.txt");
  EXPECT_EQ(relative(u"\\\\srv\\sh\\d", u"\\\\srv\\other\\d"), u"");  // another share
  EXPECT_EQ(relative(u"\\\\srv\\sh\\d", u"C:\\d"), u"");

  const auto end = detail::WalkRelativePath(UTF16String(u"./a/../b/f.txt"),
                                            UTF16String(u"C:\\base"), model);  // reference
  EXPECT_EQ(end.dir, u"C:\\base\\b");
  EXPECT_EQ(end.name, u"f.txt");
  const auto clamped =
      detail::WalkRelativePath(UTF16String(u"../../x/"), UTF16String(u"C:\\a"), model);
  EXPECT_EQ(clamped.dir, u"C:\\x");
  EXPECT_EQ(clamped.name, u"");
}

}  // namespace
