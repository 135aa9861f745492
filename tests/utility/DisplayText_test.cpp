// Mnemonic markers, truncation and line endings.
#include <kelcore/utility/LineEndings.h>
#include <kelcore/utility/MnemonicMarkers.h>
#include <kelcore/utility/TextTruncation.h>

#include <gtest/gtest.h>

#include <cmath>
#include <stdexcept>
#include <string_view>
#include <vector>

namespace {

using kelcore::UTF16Char;
using kelcore::UTF16String;
namespace ku = kelcore::utility;

UTF16String S(std::u16string_view text) {
  return UTF16String(text.begin(), text.end());
}

TEST(MnemonicMarkers, StripDisplayString) {
  struct {
    std::u16string_view in;
    bool parenthesized;
    std::u16string_view out;
  } const cases[] = {
      {u"&File", false, u"File"},
      {u"Save && Exit", false, u"Save & Exit"},
      {u"&&x", false, u"&x"},
      {u"Open (&O)", true, u"Open "},
      {u"Open (&O)", false, u"Open (O)"},
      {u"Fish & Chips", false, u"Fish & Chips"},  // "& " is a literal ampersand
      {u"a&&&b", false, u"a&b"},
      {u"(&", true, u"(&"},  // a final "&" is left
  };
  for (const auto& c : cases) {
    UTF16String text = S(c.in);
    ku::StripDisplayString(text, c.parenthesized);
    EXPECT_EQ(text, S(c.out));
  }
}

TEST(MnemonicMarkers, LocateSingleAmpersand) {
  struct {
    std::u16string_view in;
    unsigned plain, counted;
  } const cases[] = {
      {u"a&&b&c", 4, 3},
      {u"a&", ku::kNoSingleAmpersand, ku::kNoSingleAmpersand},
      {u"", ku::kNoSingleAmpersand, ku::kNoSingleAmpersand},
      {u"Fish & &Chips", 7, 7},
      {u"&&", ku::kNoSingleAmpersand, ku::kNoSingleAmpersand},
  };
  for (const auto& c : cases) {
    EXPECT_EQ(ku::LocateSingleAmpersandInString(S(c.in), false), c.plain);
    EXPECT_EQ(ku::LocateSingleAmpersandInString(S(c.in), true), c.counted);
  }
}

TEST(TextTruncation, NumCharsNeverSplitsAPair) {
  const std::u16string_view withPair = u"ab\U0001F600cd";  // 6 units
  struct {
    unsigned limit;
    bool keepEnd;
    std::u16string_view out;
  } const cases[] = {
      {0, false, u""},
      {3, false, u"ab"},  // would end on the high surrogate
      {4, false, u"ab\U0001F600"},
      {9, true, withPair},
      {3, true, u"cd"},  // would start on the low surrogate
      {4, true, u"\U0001F600cd"},
  };
  for (const auto& c : cases) {
    EXPECT_EQ(ku::TruncateStringToNumChars(S(withPair), c.limit, c.keepEnd), S(c.out));
    const std::vector<UTF16Char> units(withPair.begin(), withPair.end());
    EXPECT_EQ(ku::TruncateStringToNumChars(units, c.limit, c.keepEnd),
              std::vector<UTF16Char>(c.out.begin(), c.out.end()));
  }
}

TEST(TextTruncation, UIStringInMiddle) {
  const UTF16String name = S(u"Beethoven Symphony 9.flac");  // 25 units
  struct {
    unsigned max;
    float position;
    std::u16string_view out;
  } const cases[] = {
      {25, 0.5f, u"Beethoven Symphony 9.flac"},
      {12, 0.5f, u"Beetho\u2026.flac"},
      {12, 1.0f, u"Beethoven S\u2026"},
      {12, 0.0f, u"\u2026hony 9.flac"},
      {12, 7.0f, u"Beethoven S\u2026"},
      {12, NAN, u"Beetho\u2026.flac"},
      {1, 0.5f, u"\u2026"},
      {0, 0.5f, u""},
  };
  for (const auto& c : cases) {
    EXPECT_EQ(ku::TruncateUIStringInMiddle(name, c.max, c.position), S(c.out)) << c.max;
  }
  // 4 units kept, 2 on each side: both pairs lose their halves at the cut.
  EXPECT_EQ(ku::TruncateUIStringInMiddle(S(u"a\U0001F600xyz\U0001F600b"), 5, 0.5f), S(u"a\u2026b"));
}

TEST(LineEndings, GetAndConvert) {
  EXPECT_EQ(ku::GetLineEnding(ku::kLineEndingCRLF), S(u"\r\n"));
  EXPECT_EQ(ku::GetLineEnding(static_cast<ku::LineEndingType>(7)), S(u""));
  struct {
    ku::LineEndingType type;
    std::u16string_view in, out;
  } const cases[] = {
      {ku::kLineEndingLF, u"a\r\nb\rc", u"a\nb\nc"},
      {ku::kLineEndingCRLF, u"a\nb\r\n\rc\n", u"a\r\nb\r\n\r\nc\r\n"},
      {ku::kLineEndingCR, u"\n\r\n", u"\r\r"},
      {ku::kLineEndingLF, u"\n\r", u"\n\n"},  // LF then a lone CR, not a pair
  };
  for (const auto& c : cases) {
    UTF16String text = S(c.in);
    ku::ConvertLineEndings(c.type, text);
    EXPECT_EQ(text, S(c.out));
  }
  UTF16String text = S(u"a\nb");
  EXPECT_THROW(ku::ConvertLineEndings(static_cast<ku::LineEndingType>(3), text),
               std::invalid_argument);
}

}  // namespace
