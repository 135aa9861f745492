// SafeTraceStream's pieces and formats, and the UTF-16 standard output stream buffer.
#include "DebugTestSupport.h"

#include <kelcore/debug/DebugStreamBuffers.h>
#include <kelcore/debug/SafeTraceStream.h>

#include <climits>
#include <ostream>

namespace kelcore::debug {
namespace {

struct Pieces {
  std::vector<std::u16string> texts;
  bool terminated = true;

  static void Write(const UTF16Char* piece, std::uint32_t length, void* context) {
    auto* self = static_cast<Pieces*>(context);
    self->texts.emplace_back(piece, length);
    self->terminated = self->terminated && piece[length] == 0;
  }
  std::string Joined() const {
    std::string all;
    for (const auto& text : texts) {
      for (char16_t unit : text) all.push_back(static_cast<char>(unit));
    }
    return all;
  }
};

TEST(SafeTraceStreamTest, WritesPiecesOf511UnitsAndTheRestAtTheEnd) {
  Pieces pieces;
  const std::string text(600, 'x');
  {
    SafeTraceStream stream(&Pieces::Write, &pieces);
    stream << text.c_str();
    ASSERT_EQ(pieces.texts.size(), 1u);
    EXPECT_EQ(pieces.texts[0].size(), 511u);
    EXPECT_EQ(stream.Count(), 89u);
  }
  ASSERT_EQ(pieces.texts.size(), 2u);
  EXPECT_EQ(pieces.texts[1].size(), 89u);
  EXPECT_TRUE(pieces.terminated);

  // Pieces split wherever the 511th unit falls, also inside one inserted UTF-16 text.
  Pieces wide;
  {
    SafeTraceStream stream(&Pieces::Write, &wide);
    const std::u16string units(1022, u'\u00e9');
    stream << "ab" << units.c_str();
  }
  ASSERT_EQ(wide.texts.size(), 3u);
  EXPECT_EQ(wide.texts[0].size(), 511u);
  EXPECT_EQ(wide.texts[1].size(), 511u);
  EXPECT_EQ(wide.texts[2], u"\u00e9\u00e9");
}

TEST(SafeTraceStreamTest, FormatsNumbersAndWidensBytes) {
  Pieces pieces;
  {
    SafeTraceStream stream(&Pieces::Write, &pieces);
    // No char insertion exists: a char would print as its number.
    stream << -5 << " " << 7u << " " << LONG_MIN << " " << ULONG_MAX << " " << LLONG_MIN << " "
           << ULLONG_MAX << " " << 2.5 << " " << 1e300 << " " << static_cast<const char*>(nullptr)
           << static_cast<const UTF16Char*>(nullptr) << u"\u20ac";
    stream << "\xe9";
  }
  ASSERT_EQ(pieces.texts.size(), 1u);
  const std::u16string& text = pieces.texts[0];
  EXPECT_EQ(text.substr(0, text.size() - 2),
            u"-5 7 -9223372036854775808 18446744073709551615 -9223372036854775808 "
            u"18446744073709551615 2.5 1e+300 ");
  EXPECT_EQ(text[text.size() - 2], u'\u20ac');
  EXPECT_EQ(text.back(), u'\u00e9');  // one byte, one unit: no UTF-8 decoding
}

TEST(SafeTraceStreamTest, EmptyStreamsWriteNothing) {
  Pieces pieces;
  { SafeTraceStream stream(&Pieces::Write, &pieces); }
  {
    SafeTraceStream discarding(nullptr, nullptr);
    discarding << "dropped";
  }
  EXPECT_TRUE(pieces.texts.empty());
}

TEST(DebugStreamBuffersTest, StandardOutputGetsOneLinePerPiece) {
  ::testing::internal::CaptureStdout();
  {
    UTF16StdOutStreamBuffer<UTF16Char> buffer;
    std::basic_ostream<UTF16Char> out(&buffer);
    out << u"line \u00e9\u20ac" << u'\n' << u"partial";
    out.flush();  // ends the unfinished line on the console
  }
  EXPECT_EQ(::testing::internal::GetCapturedStdout(), "line \xc3\xa9\xe2\x82\xac\npartial\n");
}

}  // namespace
}  // namespace kelcore::debug
