#include <gtest/gtest.h>

#include <string>

#include <kelcore/filesupport/PathStrings.h>

namespace {

using kelcore::UTF16String;
using namespace kelcore::utility::FileUtils;

std::string Show(const char16_t* text) {
  return testing::PrintToString(UTF16String(text));
}

struct NormalizationCase {
  const char16_t* input;
  const char16_t* windows;
  const char16_t* posix;
};

// File-path normalisation. The Windows column follows the platform's documented rules
// (slashes to backslashes, \\?\ and \\?\UNC\ prefixes removed, runs collapsed from
// position 1); the POSIX column collapses every run of "/" and keeps "\".
const NormalizationCase kFileCases[] = {
    {u"", u"", u""},
    {u"C:/a//b/", u"C:\\a\\b\\", u"C:/a/b/"},
    {u"\\\\?\\C:\\x", u"C:\\x", u"\\\\?\\C:\\x"},
    {u"\\\\?\\UNC\\srv\\sh\\f", u"\\\\srv\\sh\\f", u"\\\\?\\UNC\\srv\\sh\\f"},
    {u"\\\\\\\\srv\\sh", u"\\\\srv\\sh", u"\\\\\\\\srv\\sh"},
    {u"//srv//share", u"\\\\srv\\share", u"/srv/share"},
    {u"///", u"\\\\", u"/"},
    {u"/a\\\\b", u"\\a\\b", u"/a\\\\b"},
    {u"//?/C:/x", u"C:\\x", u"/?/C:/x"},
    {u"a", u"a", u"a"},
};

TEST(PathNormalization, FilePathsInBothStyles) {
  for (const NormalizationCase& c : kFileCases) {
    EXPECT_EQ(NormalizeFilePath(c.input, PathStyle::kWindows), c.windows) << Show(c.input);
    EXPECT_EQ(NormalizeFilePath(c.input, PathStyle::kPosix), c.posix) << Show(c.input);
  }
}

// Directory paths lose one trailing separator after normalisation; the POSIX root keeps
// its "/".
const NormalizationCase kDirCases[] = {
    {u"C:/a//b/", u"C:\\a\\b", u"C:/a/b"},
    {u"/", u"", u"/"},
    {u"////", u"\\", u"/"},
    {u"C:\\", u"C:", u"C:\\"},
    {u"/a/b//", u"\\a\\b", u"/a/b"},
    {u"a\\", u"a", u"a\\"},
    {u"", u"", u""},
};

TEST(PathNormalization, DirectoryPathsInBothStyles) {
  for (const NormalizationCase& c : kDirCases) {
    EXPECT_EQ(NormalizeDirPath(c.input, PathStyle::kWindows), c.windows) << Show(c.input);
    EXPECT_EQ(NormalizeDirPath(c.input, PathStyle::kPosix), c.posix) << Show(c.input);
  }
}

struct SplitCase {
  const char16_t* path;
  PathStyle style;
  const char16_t* dir;
  const char16_t* title;
  const char16_t* ext;  // "?" when the extension must be left untouched
};

const SplitCase kSplitCases[] = {
    {u"C:\\d.x\\file", PathStyle::kWindows, u"C:\\d.x", u"file", u"?"},
    {u"C:\\a\\b.tar.gz", PathStyle::kWindows, u"C:\\a", u"b.tar", u".gz"},
    {u"C:/a\\b.txt", PathStyle::kWindows, u"C:/a", u"b", u".txt"},
    {u"/a\\b.c/d", PathStyle::kPosix, u"/a\\b.c", u"d", u"?"},
    {u"/a/x\\y.txt", PathStyle::kPosix, u"/a", u"x\\y", u".txt"},
    {u"name", PathStyle::kPosix, u"", u"name", u"?"},
    {u"/dir/.profile", PathStyle::kPosix, u"/dir", u"", u".profile"},
    {u"/dir/trailing.", PathStyle::kPosix, u"/dir", u"trailing", u"."},
    {u"", PathStyle::kPosix, u"", u"", u"?"},
};

TEST(SplitLongPath, SplitsAtLastSeparatorAndDot) {
  for (const SplitCase& c : kSplitCases) {
    UTF16String dir = u"unset", title = u"unset", ext = u"?";
    SplitLongPath(c.path, &dir, &title, &ext, c.style);
    EXPECT_EQ(dir, c.dir) << Show(c.path);
    EXPECT_EQ(title, c.title) << Show(c.path);
    EXPECT_EQ(ext, c.ext) << Show(c.path);
  }
  SplitLongPath(u"/a/b.c", nullptr, nullptr, nullptr);  // every output is optional
}

TEST(BuildPathSpec, AddsOneSeparatorOfTheStyle) {
  UTF16String out;
  BuildPathSpec(u"C:\\a", u"f", out, PathStyle::kWindows);
  EXPECT_EQ(out, u"C:\\a\\f");
  BuildPathSpec(u"C:\\a\\", u"f", out, PathStyle::kWindows);
  EXPECT_EQ(out, u"C:\\a\\f");
  BuildPathSpec(u"/a/", u"f", out, PathStyle::kWindows);
  EXPECT_EQ(out, u"/a/\\f");
  BuildPathSpec(u"/a", u"f", out, PathStyle::kPosix);
  EXPECT_EQ(out, u"/a/f");
  BuildPathSpec(u"/", u"f", out, PathStyle::kPosix);
  EXPECT_EQ(out, u"/f");
  BuildPathSpec(u"", u"f", out, PathStyle::kPosix);
  EXPECT_EQ(out, u"f");
}

TEST(GetPathFileName, OnlyTheStylesSeparatorCounts) {
  EXPECT_EQ(GetPathFileName(u"C:\\a\\b.txt", PathStyle::kWindows), u"b.txt");
  EXPECT_EQ(GetPathFileName(u"C:/a/b.txt", PathStyle::kWindows), u"");
  EXPECT_EQ(GetPathFileName(u"/a/b\\c", PathStyle::kPosix), u"b\\c");
  EXPECT_EQ(GetPathFileName(u"b.txt", PathStyle::kPosix), u"");
  EXPECT_EQ(GetPathFileName(u"/a/", PathStyle::kPosix), u"");
}

TEST(GetParentPath, WindowsAndPosixRules) {
  struct Case {
    const char16_t* path;
    PathStyle style;
    bool found;
    const char16_t* parent;
  };
  const Case cases[] = {
      {u"C:\\a\\b", PathStyle::kWindows, true, u"C:\\a"},
      {u"C:\\a\\\\b", PathStyle::kWindows, true, u"C:\\a"},
      {u"C:/a/b", PathStyle::kWindows, true, u"C:/a"},
      {u"\\a", PathStyle::kWindows, false, u"kept"},
      {u"a", PathStyle::kWindows, false, u"kept"},
      {u"/a/b", PathStyle::kPosix, true, u"/a"},
      {u"/a", PathStyle::kPosix, true, u"/"},
      {u"/", PathStyle::kPosix, false, u"kept"},
      {u"a//b", PathStyle::kPosix, true, u"a"},
      {u"a\\b", PathStyle::kPosix, false, u"kept"},
  };
  for (const Case& c : cases) {
    UTF16String out = u"kept";
    EXPECT_EQ(GetParentPath(c.path, out, c.style), c.found) << Show(c.path);
    EXPECT_EQ(out, c.parent) << Show(c.path);
  }
}

}  // namespace
