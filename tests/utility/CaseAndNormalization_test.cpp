#include <kelcore/utility/CaseMapping.h>
#include <kelcore/utility/Normalization.h>

#include <gtest/gtest.h>

#include <string_view>

namespace {

using kelcore::UTF16String;
namespace ku = kelcore::utility;

UTF16String S(std::u16string_view text) {
  return UTF16String(text.begin(), text.end());
}

TEST(CaseMapping, SimpleMappings) {
  // Expected values from the Unicode character database's simple mappings.
  struct {
    std::u16string_view in, fold, lower, upper;
  } const cases[] = {
      {u"Hello, World", u"hello, world", u"hello, world", u"HELLO, WORLD"},
      {u"\u00DF\u00C9", u"\u00DF\u00E9", u"\u00DF\u00E9", u"\u00DF\u00C9"},
      {u"\u03A3\u03C2\u03C3", u"\u03C3\u03C3\u03C3", u"\u03C3\u03C2\u03C3", u"\u03A3\u03A3\u03A3"},
      {u"\u0130i\u0131", u"\u0130i\u0131", u"ii\u0131", u"\u0130II"},
      {u"\u01C5", u"\u01C6", u"\u01C6", u"\u01C4"},
      // Surrogate pairs stay as they are, even where the character has case.
      {u"\U00010400\U00010428\xDC00", u"\U00010400\U00010428\xDC00", u"\U00010400\U00010428\xDC00",
       u"\U00010400\U00010428\xDC00"},
  };
  for (const auto& c : cases) {
    EXPECT_EQ(ku::FoldCase(S(c.in)), S(c.fold));
    EXPECT_EQ(ku::LowerCase(S(c.in)), S(c.lower));
    EXPECT_EQ(ku::UpperCase(S(c.in)), S(c.upper));
  }
}

TEST(CaseMapping, TitleCaseWords) {
  const std::u16string_view cases[][2] = {
      {u"o'NEIL's 3D world", u"O'neil's 3d World"}, {u"\u01C6emal", u"\u01C5emal"},
      {u"rock 'n' roll", u"Rock 'N' Roll"},         {u"\u00E9T\u00C9-ICI", u"\u00C9t\u00E9-Ici"},
      {u"a\U00010428B", u"A\U00010428b"},  // a surrogate pair continues the word
  };
  for (const auto& c : cases) {
    UTF16String text = S(c[0]);
    ku::ToTitleCase(text);
    EXPECT_EQ(text, S(c[1]));
  }
}

TEST(Normalization, Forms) {
  // Samples from the Unicode normalization charts.
  struct {
    std::u16string_view in;
    int form;
    std::u16string_view out;
  } const cases[] = {
      {u"e\u0301", ku::kNormalizationFormC, u"\u00E9"},
      {u"\u00E9", ku::kNormalizationFormD, u"e\u0301"},
      {u"\uFB01", ku::kNormalizationFormC, u"\uFB01"},
      {u"\uFB01", ku::kNormalizationFormKC, u"fi"},
      {u"\u1E9B\u0323", ku::kNormalizationFormKD, u"s\u0323\u0307"},
      {u"e\u0301", ku::kNormalizationNone, u"e\u0301"},
      {u"e\u0301", ku::kNormalizationNoneAlt, u"e\u0301"},
      {u"e\u0301", 9, u"\u00E9"},  // larger values are form C
      {u"a\xD800"
       u"e\u0301",
       ku::kNormalizationFormC, u"a\xD800\u00E9"},
  };
  for (const auto& c : cases) {
    EXPECT_EQ(ku::NormalizedString(S(c.in), static_cast<ku::UnicodeNormalizationForm>(c.form)),
              S(c.out));
  }
  UTF16String withNul = S(u"e\u0301");
  withNul += UTF16String(1, 0) + S(u"x");
  EXPECT_EQ(ku::NormalizedString(withNul, ku::kNormalizationFormC), S(u"\u00E9"));
  EXPECT_EQ(ku::NormalizedString(withNul, ku::kNormalizationNone), withNul);
}

}  // namespace
