#include <kelcore/utility/NaturalCompare.h>

#include <gtest/gtest.h>

#include <random>
#include <string_view>

namespace {

using kelcore::UTF16String;
namespace ku = kelcore::utility;

UTF16String S(std::u16string_view text) {
  return UTF16String(text.begin(), text.end());
}

struct OrderCase {
  std::u16string_view a;
  std::u16string_view b;
  long sensitive;    // NaturalStringCompare(a, b)
  long insensitive;  // CaseInsensitive::NaturalStringCompare(a, b)
};

// Worked examples of the natural order, edge cases included.
const OrderCase kOrderCases[] = {
    {u"file2", u"file10", -1, -1},
    {u"a007", u"a7", 0, 0},
    {u"", u"a", -1, -1},
    {u"", u"", 0, 0},
    {u"a1", u"ab", -1, -1},            // the digit chunk ends the text chunk sooner
    {u"a\uFF11\uFF12", u"a12", 0, 0},  // full-width digits read as their ASCII twins
    {u"a\u0661\u0660", u"a9", 1, 1},   // Arabic-Indic 10 > 9
    {u"File10", u"file10", -1, 0},
    {u"file10", u"FILE9", 1, 1},
    {u"x 2", u"x 10", -1, -1},
    {u"v1.10", u"v1.9", 1, 1},
    {u"1", u"a", -1, -1},
    {u"\uFF11", u"a", -1, -1},  // a numeric chunk sorts as its ASCII digit
    {u"9", u"-", 1, 1},
    {u"abc", u"ab", 1, 1},
    {u"\u00E9", u"\u00C9", 1, 1},  // only A-Z are folded
    // Runs beyond 2^64-1 saturate and compare equal.
    {u"n18446744073709551615", u"n18446744073709551614", 1, 1},
    {u"n99999999999999999999", u"n18446744073709551615", 0, 0},
    {u"n000000000000000000000001", u"n1", 0, 0},
};

TEST(NaturalCompare, OrderTable) {
  for (const OrderCase& c : kOrderCases) {
    const UTF16String a = S(c.a);
    const UTF16String b = S(c.b);
    SCOPED_TRACE(testing::Message() << "case " << (&c - kOrderCases));
    EXPECT_EQ(ku::NaturalStringCompare(a, b), c.sensitive);
    EXPECT_EQ(ku::NaturalStringCompare(b, a), -c.sensitive);
    EXPECT_EQ(ku::NaturalStringLessThan(a, b), c.sensitive < 0);
    EXPECT_EQ(ku::CaseInsensitive::NaturalStringCompare(a, b), c.insensitive);
    EXPECT_EQ(ku::CaseInsensitive::NaturalStringEquals(a, b), c.insensitive == 0);
  }
}

// Random short texts over an alphabet that mixes every digit script, letters of both
// cases, punctuation on both sides of the digits and non-ASCII letters.
UTF16String RandomText(std::mt19937& random) {
  static constexpr char16_t kAlphabet[] = u"0019aAbB.-_ \u00E9\uFF10\uFF19\u0660\u0669zZ";
  std::uniform_int_distribution<int> length(0, 6);
  std::uniform_int_distribution<std::size_t> pick(0, std::size(kAlphabet) - 2);
  UTF16String text;
  for (int n = length(random); n > 0; --n) text.push_back(kAlphabet[pick(random)]);
  return text;
}

template <typename Compare>
void ExpectStrictWeakOrder(Compare compare) {
  std::mt19937 random(20240611);
  for (int round = 0; round < 200000; ++round) {
    const UTF16String x = RandomText(random);
    const UTF16String y = RandomText(random);
    const UTF16String z = RandomText(random);
    const long xy = compare(x, y);
    const long yz = compare(y, z);
    const long xz = compare(x, z);
    ASSERT_EQ(compare(y, x), -xy);
    ASSERT_EQ(compare(x, x), 0);
    // Transitivity of both "less" and "equivalent".
    if (xy <= 0 && yz <= 0) {
      ASSERT_LE(xz, 0);
      if (xy < 0 || yz < 0) {
        ASSERT_LT(xz, 0);
      }
    }
    if (xy >= 0 && yz >= 0) {
      ASSERT_GE(xz, 0);
      if (xy > 0 || yz > 0) {
        ASSERT_GT(xz, 0);
      }
    }
  }
}

TEST(NaturalCompare, IsAStrictWeakOrder) {
  ExpectStrictWeakOrder(
      [](const UTF16String& a, const UTF16String& b) { return ku::NaturalStringCompare(a, b); });
  ExpectStrictWeakOrder([](const UTF16String& a, const UTF16String& b) {
    return ku::CaseInsensitive::NaturalStringCompare(a, b);
  });
}

}  // namespace
