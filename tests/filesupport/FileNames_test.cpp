#include <kelcore/filesupport/FileExceptions.h>
#include <kelcore/filesupport/FileNames.h>

#include <gtest/gtest.h>

#include <filesystem>
#include <vector>

namespace {

using kelcore::UTF16Char;
using kelcore::UTF16String;
using namespace kelcore::utility::FileUtils;

TEST(FileNames, IllegalCharactersAreTheNine) {
  EXPECT_EQ(GetIllegalFilenameCharacters(), u"\\/:*?\"<>|");
}

struct CleaningCase {
  const char16_t* name;
  UTF16Char replacement;
  const char16_t* expected;
};

// Vectors marked "reference" are the cases the rules were written against; the others pin
// each step and the order in which the steps act on one another.
const CleaningCase kCleaningCases[] = {
    {u"a?b", u'_', u"a_b"},          // reference
    {u"NUL", u'_', u"NUL_"},         // reference
    {u"nul.txt", u'_', u"nul_txt"},  // reference
    {u"name..", u'_', u"name._"},    // reference: only the last trailing dot
    {u"..a..", 0, u"a"},             // reference
    {u"<>:|", 0, u"-"},              // reference: nothing left
    {u"con", 0, u"con-"},            // reference
    {u"aux.txt", 0, u"-.txt"},       // reference
    {u"a?b", u'.', u"a-b"},          // reference: "." as replacement becomes "-"
    {u"a?b", u' ', u"a-b"},          // a space replacement too
    {u"a?b", u'*', u"a-b"},          // an illegal replacement too
    {u"a?b", u'\t', u"a-b"},         // a control replacement too
    {u"a\\b/c:d*e?f\"g<h>i|j", 0, u"abcdefghij"},
    {u"tab\there\x1F", u'_', u"tab_here_"},
    {u"tab\there\x1F", 0, u"tabhere"},
    {u"Com1", u'_', u"Com1_"},  // caseless match, original case kept
    {u"lPt9.tar.gz", u'_', u"lPt9_tar.gz"},
    {u"COM10", u'_', u"COM10"},  // longer names are not reserved
    {u"console", u'_', u"console"},
    {u"prn.", 0, u"-"},  // "-." then the trailing dot goes
    {u"prn.", u'_', u"prn_"},
    {u"con?", u'_', u"con_"},  // cleaned first, so no longer reserved
    {u"c?on", 0, u"con-"},     // cleaned first, then reserved
    {u"trail  ", u'_', u"trail _"},
    {u"trail . .", 0, u"trail"},
    {u".hidden", u'_', u"_hidden"},
    {u"...x", u'_', u"_..x"},
    {u"...x", 0, u"x"},
    {u".", u'_', u"_"},  // trailing step, then nothing leading is left
    {u"..", u'_', u"__"},
    {u"..", 0, u"-"},
    {u"   ", 0, u"-"},
    // Found by fuzzing: trimming uncovers a reserved name, which is treated again.
    {u"con ", 0, u"con-"},
    {u"..aux.txt", 0, u"-.txt"},
    {u".aux.\x1F.x", 0, u"-..x"},
    {u"co.", u'n', u"conn"},
    {u".ux.txt", u'a', u"auxatxt"},
    {u"clean name.txt", u'_', u"clean name.txt"},
    {u"caf\u00E9 \u65E5\u672C.txt", 0, u"caf\u00E9 \u65E5\u672C.txt"},
};

TEST(FileNames, ReplaceIllegalFileNameCharactersVectors) {
  for (const CleaningCase& c : kCleaningCases) {
    UTF16String name = c.name;
    const bool changed = ReplaceIllegalFileNameCharacters(name, c.replacement);
    const std::u16string expected = c.expected;
    EXPECT_EQ(name, expected) << "replacement " << int(c.replacement) << " case #"
                              << (&c - kCleaningCases);
    EXPECT_EQ(changed, expected != c.name) << "case #" << (&c - kCleaningCases);
  }
}

TEST(FileNames, ReplaceIllegalKeepsEmptyAndNulUnits) {
  UTF16String empty;
  EXPECT_FALSE(ReplaceIllegalFileNameCharacters(empty, 0));
  EXPECT_TRUE(empty.empty());
  UTF16String withNul(u"a\0b", 3);
  EXPECT_FALSE(ReplaceIllegalFileNameCharacters(withNul, u'_'));
  EXPECT_EQ(withNul.size(), 3u);
}

TEST(FileNames, ComparisonFormsFoldCaseButKeepEverythingElse) {
  const UTF16String composed = u"/m\u00FCsik";
  const UTF16String decomposed = u"/mu\u0308sik";
  EXPECT_EQ(NormalizePathForSaving(decomposed), decomposed);
  EXPECT_EQ(NormalizePathForStringComparison(u"/Tmp/\u03A3\u0391\u03A3"),
            NormalizePathForStringComparison(u"/tmp/\u03C3\u03B1\u03C2"));
  EXPECT_TRUE(PathsEqual(u"/Home/ABC.txt", u"/home/abc.TXT"));
  EXPECT_FALSE(PathsEqual(u"/home/a", u"/home/a/"));
  EXPECT_FALSE(PathsEqual(composed, decomposed));
  EXPECT_FALSE(PathsEqual(u"/a\uFF41", u"/aa"));  // width is not folded
}

TEST(FileNames, VolumesOfThisSystem) {
  UTF16String volume;
  ASSERT_TRUE(GetVolumePath(u"/", volume));
  EXPECT_EQ(volume, u"/");
  EXPECT_TRUE(IsRoot(u"/"));
  EXPECT_FALSE(GetVolumePath(u"not/absolute", volume));
  EXPECT_THROW(IsRoot(u"not/absolute"), kelcore::filesupport::create_fnf_exception);

  // Every listed mount point is its own volume; below it, or with a trailing separator,
  // a path is not a root.
  int checked = 0;
  for (auto it = kelcore::filesupport::Dir::BeginVolumes();
       it != kelcore::filesupport::Dir::EndVolumes() && checked < 8; ++it, ++checked) {
    const UTF16String mount = it->FullPath();
    EXPECT_TRUE(IsRoot(mount)) << checked;
    ASSERT_TRUE(GetVolumePath(mount + u"/no such entry", volume));
    EXPECT_EQ(volume, mount);
    if (mount != u"/") {
      ASSERT_TRUE(GetVolumePath(u"/" + mount + u"//x", volume));  // runs of "/" collapse
      EXPECT_EQ(volume, mount);
      ASSERT_TRUE(GetVolumePath(mount + u"x", volume));  // only at a component boundary
      EXPECT_NE(volume, mount);
      EXPECT_FALSE(IsRoot(mount + u"/"));
    }
  }
  EXPECT_GT(checked, 0);
}

TEST(FileNames, VolumeSpaceOfAnExistingPath) {
  VolumeSpace space;
  const UTF16String temp = std::filesystem::temp_directory_path().u16string();
  ASSERT_TRUE(GetVolumeSpace(temp, space));
  EXPECT_GT(space.total, 0u);
  EXPECT_LE(space.available, space.total);

  VolumeSpace untouched{1, 2};
  EXPECT_FALSE(GetVolumeSpace(temp + u"/no/such/entry", untouched));
  EXPECT_EQ(untouched.available, 1u);
  EXPECT_EQ(untouched.total, 2u);
}

}  // namespace
