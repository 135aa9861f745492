#include <kelcore/utility/StringStreams.h>
#include <kelcore/utility/UnicodeConversion.h>

#include <gtest/gtest.h>

#include <cstdint>
#include <iomanip>
#include <limits>
#include <locale>

namespace kelcore::utility {
namespace {

UTF16String U16(const char* ascii) {
  return AsciiToUTF16(ascii, std::char_traits<char>::length(ascii));
}
UTF8String U8(const char* bytes) {
  return UTF8String(AsciiToUTF8Impl(bytes));
}

// Numbers as the classic locale's narrow stream writes them (std::ostringstream with
// the same settings is the reference).
TEST(StringStreamsTest, NumbersFormatLikeTheClassicLocale) {
  oUTF16StringStream wide;
  oUTF8StringStream narrow;
  auto both = [&](const auto& value) {
    wide << value << ' ';
    narrow << value << ' ';
  };
  both(0);
  both(-2147483647 - 1);
  both(std::numeric_limits<std::int64_t>::min());
  both(std::numeric_limits<std::uint64_t>::max());
  both(29.2334);
  both(1234567.0);
  both(1e-5);
  both(0.1f);
  both(true);
  wide << std::setprecision(17) << std::fixed << 0.5 << ' ' << std::hex << std::showbase << 255;
  narrow << std::setprecision(17) << std::fixed << 0.5 << ' ' << std::hex << std::showbase << 255;
  const char* expected =
      "0 -2147483648 -9223372036854775808 18446744073709551615 29.2334 1.23457e+06 1e-05 0.1 1 "
      "0.50000000000000000 0xff";
  EXPECT_EQ(wide.str(), U16(expected));
  EXPECT_EQ(narrow.str(), U8(expected));
}

TEST(StringStreamsTest, GlobalLocaleDoesNotChangeNumbers) {
  struct CommaDecimal : std::numpunct<char> {
    char do_decimal_point() const override { return ','; }
    std::string do_grouping() const override { return "\3"; }
    char do_thousands_sep() const override { return '.'; }
  };
  const std::locale saved =
      std::locale::global(std::locale(std::locale::classic(), new CommaDecimal));
  oUTF16StringStream out;
  out << 1234567 << ' ' << 1.5;
  std::locale::global(saved);
  EXPECT_EQ(out.str(), U16("1234567 1.5"));
}

TEST(StringStreamsTest, WidthFillAndAdjustment) {
  oUTF16StringStream out;
  out.fill(0x2022);  // a fill character outside 7-bit text
  out << std::setw(5) << 42 << '|' << std::left << std::setw(4) << U16("ab") << '|' << std::internal
      << std::setw(6) << -7 << '|' << std::setfill('*') << std::right << std::setw(3) << 'x' << 5;
  UTF16String expected = U16("...42|ab..|-....7|**x5");
  for (UTF16Char& unit : expected) {
    if (unit == '.') unit = 0x2022;
  }
  EXPECT_EQ(out.str(), expected);
}

TEST(StringStreamsTest, TextInsertionAppends) {
  oUTF8StringStream out(U8("start:"));
  out << "narrow" << std::string(" std") << static_cast<unsigned char>(0xC3) << U8("\xA9")
      << std::endl
      << std::ends;
  UTF8String expected = U8("start:narrow std\xC3\xA9\n");
  expected.push_back(0);
  EXPECT_EQ(out.str(), expected);
  out << static_cast<const char*>(nullptr) << 1;
  EXPECT_TRUE(out.bad());
  EXPECT_EQ(out.str(), expected);
}

// Extraction vectors: text, what one extraction of a double gives, the state after it
// and the rest of the text (std::istringstream behaves the same way).
TEST(StringStreamsTest, NumbersParseLikeTheClassicLocale) {
  const struct {
    const char* text;
    double value;
    bool fail;
    bool eof;
    const char* rest;
  } cases[] = {
      {"  29.2334", 29.2334, false, true, ""},
      {"1e3x", 1000, false, false, "x"},
      {"-0.5 7", -0.5, false, false, " 7"},
      {"abc", 0, true, false, "abc"},
      {"", -1, true, true, ""},  // nothing to read: the target is left alone
      {"   ", -1, true, true, ""},
      {"1,5", 1, false, false, ",5"},
  };
  for (const auto& c : cases) {
    iUTF16StringStream in(U16(c.text));
    double value = -1;
    in >> value;
    EXPECT_EQ(value, c.value) << c.text;
    EXPECT_EQ(in.fail(), c.fail) << c.text;
    EXPECT_EQ(in.eof(), c.eof) << c.text;
    in.clear();
    UTF16String rest;
    in.getline(rest, 0);
    EXPECT_EQ(rest, U16(c.rest)) << c.text;
  }
}

TEST(StringStreamsTest, ExtractionOfIntegersWordsAndCharacters) {
  UTF16StringStream stream(U16("300 -1 ff word"));
  UTF16String tail = U16(" ?tag");
  tail[1] = 0xE9;
  stream << tail << 12;
  int number = 0;
  unsigned int hex = 0;
  UTF16String word;
  UTF16Char unit = 0;
  short overflow = 0;
  stream >> number;
  EXPECT_EQ(number, 300);
  stream >> overflow;
  EXPECT_EQ(overflow, -1);
  stream >> std::hex >> hex >> std::dec >> word >> unit;
  EXPECT_EQ(hex, 0xffu);
  EXPECT_EQ(word, U16("word"));
  EXPECT_EQ(unit, 0xE9);
  stream >> word >> number;
  EXPECT_EQ(word, U16("tag12"));
  EXPECT_TRUE(stream.eof());
  EXPECT_TRUE(stream.fail());

  iUTF8StringStream big(U8("70000 9"));
  big >> overflow;
  EXPECT_TRUE(big.fail());
  EXPECT_EQ(overflow, std::numeric_limits<short>::max());
  number = 5;
  big >> number;
  EXPECT_EQ(number, 5) << "a failed stream extracts nothing";
}

TEST(StringStreamsTest, GetPeekAndLines) {
  iUTF8StringStream in(U8("ab\ncd"));
  EXPECT_EQ(in.peek(), 'a');
  EXPECT_EQ(in.get(), 'a');
  UTF8String line;
  in.getline(line);
  EXPECT_EQ(line, U8("b"));
  in.getline(line);
  EXPECT_EQ(line, U8("cd"));
  EXPECT_TRUE(in.eof());
  EXPECT_FALSE(in.fail());
  EXPECT_EQ(in.get(), UTF8CharTraits::eof());
  EXPECT_TRUE(in.fail());
}

}  // namespace
}  // namespace kelcore::utility
