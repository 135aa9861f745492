// Digits of other scripts, locale separators, number parsing and formatting.
#include <kelcore/utility/LocaleSeparators.h>
#include <kelcore/utility/NumberFormatting.h>
#include <kelcore/utility/NumberParsing.h>
#include <kelcore/utility/NumericText.h>

#include <gtest/gtest.h>

#include <climits>
#include <cmath>
#include <limits>
#include <random>
#include <stdexcept>
#include <string_view>

namespace {

using kelcore::UTF16Char;
using kelcore::UTF16String;
namespace ku = kelcore::utility;

UTF16String S(std::u16string_view text) {
  return UTF16String(text.begin(), text.end());
}

// Sets the separator pair for one scope and puts the previous pair back.
class SeparatorsOverride {
 public:
  SeparatorsOverride(UTF16Char decimal, UTF16Char thousands) : saved_(ku::GetLocaleSeparators()) {
    ku::SetLocaleSeparators(decimal, thousands);
  }
  ~SeparatorsOverride() { ku::SetLocaleSeparators(saved_.decimal, saved_.thousands); }

 private:
  ku::LocaleSeparators saved_;
};

TEST(NumericText, DigitsAndNumericCase) {
  // Range edges of the ASCII, full-width and Arabic-Indic digits.
  for (UTF16Char unit :
       {u'0', u'9', UTF16Char(0xFF10), UTF16Char(0xFF19), UTF16Char(0x0660), UTF16Char(0x0669)}) {
    EXPECT_TRUE(ku::IsNumericChar(unit, true)) << unsigned(unit);
    EXPECT_EQ(ku::IsNumericChar(unit, false), unit <= u'9') << unsigned(unit);
  }
  for (UTF16Char unit : {u'/', u':', UTF16Char(0xFF0F), UTF16Char(0xFF1A), UTF16Char(0x066A)}) {
    EXPECT_FALSE(ku::IsNumericChar(unit, true)) << unsigned(unit);
  }
  EXPECT_TRUE(ku::HasNumericChars(S(u"ab\uFF15"), 0));
  EXPECT_FALSE(ku::HasNumericChars(S(u"ab\uFF15"), ku::kNumberPlainASCII));

  UTF16String text = S(u"\u2212\uFF11\u3001\u0662\u3002\u0665\u3000x\uFF41");
  EXPECT_TRUE(ku::ToNumericCase(text));
  EXPECT_EQ(text, S(u"-1,2.5 xa"));
  EXPECT_FALSE(ku::ToNumericCase(text));
}

TEST(LocaleSeparators, InternationalizeAndBack) {
  SeparatorsOverride german(u',', u'.');
  const std::u16string_view cases[][2] = {
      {u"1.5", u"1,5"},
      {u"1.", u"1."},  // the last unit is never changed
      {u"1,234.5", u"1.234,5"},
      {u"a.b,c", u"a.b,c"},
  };
  for (const auto& c : cases) {
    UTF16String text = S(c[0]);
    ku::InternationalizeNum(text);
    EXPECT_EQ(text, S(c[1]));
  }
  UTF16String local = S(u"\uFF11.234,5");
  ku::DeInternationalizeNum(local);
  EXPECT_EQ(local, S(u"1,234.5"));
  {
    SeparatorsOverride same(u'\'', u'\'');  // the decimal test comes first
    UTF16String text = S(u"1'000'5");
    ku::DeInternationalizeNum(text);
    EXPECT_EQ(text, S(u"1.000.5"));
  }
  EXPECT_THROW(ku::SetLocaleSeparators(0, u','), std::invalid_argument);
}

TEST(StringToNumber, DoubleFormWithAndWithoutFlags) {
  SeparatorsOverride german(u',', u'.');
  struct {
    std::u16string_view text;
    unsigned short flags;
    double expected;
  } const cases[] = {
      {u"1.234,5", 0, 1234.5},
      {u"\u2212\uFF11\uFF12,\u0665", 0, -12.5},
      {u"1.5", ku::kNumberPlainASCII, 1.5},
      {u"1,234.5", ku::kNumberPlainASCII, 1234.5},
      {u"  7.25 apples", ku::kNumberPlainASCII, 7.25},
      {u"apples", 0, 0},
  };
  for (const auto& c : cases) {
    EXPECT_DOUBLE_EQ(ku::StringToNumber(S(c.text), c.flags), c.expected);
  }
}

TEST(StringToNumber, TypedOverloadsSaturateOutOfRange) {
  long l = 5;
  EXPECT_TRUE(ku::StringToNumber(S(u"1,234"), l));
  EXPECT_EQ(l, 1234);
  EXPECT_TRUE(ku::StringToNumber(S(u"1,234"), l, ku::kNumberKeepCommas));
  EXPECT_EQ(l, 1);
  EXPECT_FALSE(ku::StringToNumber(S(u"x"), l));
  EXPECT_EQ(l, 0);
  long long ll = 0;
  EXPECT_FALSE(ku::StringToNumber(S(u"-99999999999999999999"), ll));
  EXPECT_EQ(ll, LLONG_MIN);
  unsigned long long ull = 0;
  EXPECT_FALSE(ku::StringToNumber(S(u"18446744073709551616"), ull));
  EXPECT_EQ(ull, ULLONG_MAX);
  EXPECT_TRUE(ku::StringToNumber(S(u"-1"), ull));  // wraps as strtoull does
  EXPECT_EQ(ull, ULLONG_MAX);
  unsigned long ul = 0;
  EXPECT_TRUE(ku::StringToNumber(S(u"\uFF14\uFF12"), ul));
  EXPECT_EQ(ul, 42u);
  float f = 0;
  EXPECT_FALSE(ku::StringToNumber(S(u"1e39"), f));
  EXPECT_EQ(f, std::numeric_limits<float>::max());
  double d = 0;
  EXPECT_FALSE(ku::StringToNumber(S(u"-1e400"), d));
  EXPECT_EQ(d, -std::numeric_limits<double>::max());
}

TEST(HexStringToNumber, StrtolRulesAndValidateForHex) {
  long l = 1;
  ku::HexStringToNumber(l, S(u"  0x1fz"));
  EXPECT_EQ(l, 0x1f);
  ku::HexStringToNumber(l, S(u"-FF"));
  EXPECT_EQ(l, -255);
  ku::HexStringToNumber(l, S(u"FFFFFFFFFFFFFFFFFFFF"));
  EXPECT_EQ(l, LONG_MAX);
  unsigned long ul = 0;
  ku::HexStringToNumber(ul, S(u"DEADbeef"));
  EXPECT_EQ(ul, 0xDEADBEEFul);

  UTF16String text = S(u"0x1f-Ag \uFF21z");
  ku::ValidateForHex(text);
  EXPECT_EQ(text, S(u"01FA"));
}

TEST(NumberToString, Examples) {
  SeparatorsOverride english(u'.', u',');
  struct {
    double value;
    unsigned min, max;
    unsigned short flags;
    long width;
    std::u16string_view expected;
  } const cases[] = {
      {1234.5, 0, 2, ku::kNumberGroupThousands, 0, u"1,234.5"},
      {1234.5, 2, 2, 0, 0, u"1234.50"},
      {0.125, 0, 2, 0, 0, u"0.12"},  // an exact tie goes to the even digit
      {0.375, 0, 2, 0, 0, u"0.38"},
      {-0.001, 0, 2, 0, 0, u"0"},  // all-zero digits carry no sign
      {-1234567.891, 1, 1, ku::kNumberGroupThousands, 0, u"-1,234,567.9"},
      {123, 0, 0, ku::kNumberGroupThousands, 5, u"00,123"},
      {2.5, 3, 1, 0, 0, u"2.500"},  // max below min counts as min
  };
  for (const auto& c : cases) {
    EXPECT_EQ(ku::NumberToString(c.value, c.min, c.max, c.flags, c.width), S(c.expected));
  }
  EXPECT_THROW(ku::NumberToString(std::nan(""), 0, 2, 0, 0), std::domain_error);
}

TEST(NumberToString, RoundTripsThroughStringToNumber) {
  SeparatorsOverride swiss(u',', 0x2019);
  std::mt19937_64 random(7);
  std::uniform_int_distribution<long long> thousandths(-1'000'000'000'000LL, 1'000'000'000'000LL);
  for (int i = 0; i < 2000; ++i) {
    const double value = static_cast<double>(thousandths(random)) / 1000.0;
    for (unsigned short flags : {0, 8, 2, 10}) {
      const UTF16String text = ku::NumberToString(value, 0, 3, flags, 0);
      double back = 0;
      ASSERT_TRUE(ku::StringToNumber(text, back, flags & ku::kNumberPlainASCII));
      ASSERT_EQ(back, value) << i << " " << flags;
    }
  }
  const double third = 1.0 / 3.0;  // seventeen significant digits bring any double back
  EXPECT_EQ(ku::StringToNumber(ku::NumberToString(third, 0, 17, 0, 0)), third);
}

}  // namespace
