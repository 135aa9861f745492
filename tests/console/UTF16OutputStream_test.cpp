#include <kelcore/console/UTF16OutputStream.h>

#include <gtest/gtest.h>

#include <climits>
#include <cmath>
#include <limits>
#include <string>
#include <vector>

#include "ConsoleTestSupport.h"

namespace kelcore::console::testing {
namespace {

template <class T>
UTF16String Format(const T& value) {
  UTF16String text;
  UTF16OutputStream out(text);
  out << value;
  return text;
}

TEST(UTF16OutputStream, IntegersAtTheLimitsOfEveryType) {
  EXPECT_EQ(Format(short{SHRT_MIN}), u"-32768");
  EXPECT_EQ(Format(static_cast<unsigned short>(USHRT_MAX)), u"65535");
  EXPECT_EQ(Format(INT_MIN), u"-2147483648");
  EXPECT_EQ(Format(UINT_MAX), u"4294967295");
  EXPECT_EQ(Format(std::numeric_limits<long>::min()),
            U16(std::to_string(std::numeric_limits<long>::min())));
  EXPECT_EQ(Format(LLONG_MIN), u"-9223372036854775808");
  EXPECT_EQ(Format(ULLONG_MAX), u"18446744073709551615");
  EXPECT_EQ(Format(0), u"0");
  EXPECT_EQ(Format(true), u"1");
  EXPECT_EQ(Format(false), u"0");
}

// Expected texts are those of printf("%g"), the classic stream's default notation.
TEST(UTF16OutputStream, DoublesInGeneralNotationOfSixDigits) {
  const std::vector<std::pair<double, const char16_t*>> cases = {
      {29.2334, u"29.2334"},
      {0.5, u"0.5"},
      {-2.0, u"-2"},
      {100000.0, u"100000"},
      {1e6, u"1e+06"},
      {1e20, u"1e+20"},
      {1.0 / 3.0, u"0.333333"},
      {1e-5, u"1e-05"},
      {123456789.0, u"1.23457e+08"},
      {0.0, u"0"},
      {HUGE_VAL, u"inf"},
      {-HUGE_VAL, u"-inf"},
  };
  for (const auto& [value, expected] : cases) EXPECT_EQ(Format(value), expected) << value;
  EXPECT_EQ(Format(2.5f), u"2.5");
  EXPECT_EQ(Format(std::nan("")), u"nan");
}

TEST(UTF16OutputStream, TextOfBothEncodings) {
  UTF16String text;
  UTF16OutputStream out(text);
  const UTF16String lone = {u'a', static_cast<char16_t>(0xD800), u'b'};
  out << u"wide " << UTF16String(u"string ") << "caf\xC3\xA9 " << std::string("\xF0\x9F\x98\x80")
      << UTF8String(reinterpret_cast<const unsigned char*>(" utf8")) << ' ' << u'!' << lone
      << static_cast<const char*>(nullptr) << static_cast<const UTF16Char*>(nullptr);
  EXPECT_EQ(text, UTF16String(u"wide string caf\u00E9 \U0001F600 utf8 !") + lone);
}

TEST(UTF16OutputStream, LineEndsAndUnsupportedManipulators) {
  UTF16String text;
  UTF16OutputStream out(text);
  out << 1 << endl << 2 << std::endl << 3 << std::flush << flush;
  EXPECT_EQ(text, u"1\n2\n3");
  EXPECT_THROW(out << std::ends, std::invalid_argument);
}

// A host target sees the text in order and a flush for every line end.
class RecordingTarget : public UTF16OutputStream::Target {
 public:
  explicit RecordingTarget(std::vector<UTF16String>& events) : events_(events) {}
  void Write(UTF16StringView text) override { events_.emplace_back(text); }
  void Flush() override { events_.emplace_back(u"<flush>"); }

 private:
  std::vector<UTF16String>& events_;
};

TEST(UTF16OutputStream, HostTargetsAndMoves) {
  std::vector<UTF16String> events;
  {
    UTF16OutputStream out(std::make_unique<RecordingTarget>(events));
    out << "a" << endl;
    UTF16OutputStream moved(std::move(out));
    out << "ignored";  // a moved-from stream writes nowhere
    moved << 7;
  }  // destruction flushes
  const std::vector<UTF16String> expected = {u"a", u"\n", u"<flush>", u"7", u"<flush>"};
  EXPECT_EQ(events, expected);
  EXPECT_THROW(UTF16OutputStream(std::unique_ptr<UTF16OutputStream::Target>()),
               std::invalid_argument);
}

TEST(UTF16OutputStream, TerminalGetsUTF8ALineAtATime) {
  ::testing::internal::CaptureStdout();
  {
    UTF16OutputStream out = UTF16OutputStream::Terminal();
    out << u"gr\u00FC\u00DF " << 42 << endl << "partial";
  }
  EXPECT_EQ(::testing::internal::GetCapturedStdout(), "gr\xC3\xBC\xC3\x9F 42\npartial");
}

using LogTargetTest = ConsoleTest;

TEST_F(LogTargetTest, LogFileGetsOneWritePerLine) {
  ConsoleLogFile& log = ConsoleLogFile::GetInstance();
  const std::string path = RootBytes() + "/console.txt";
  ASSERT_TRUE(log.OpenLogFile(UTF8String(path.begin(), path.end())));
  {
    UTF16OutputStream out = UTF16OutputStream::LogFile(true);
    out << "one\ntwo" << endl << "three";
  }
  ConsoleLogFile::Terminate();
  std::ifstream in(path, std::ios::binary);
  std::string line;
  std::vector<std::string> lines;
  while (std::getline(in, line)) lines.push_back(line);
  // Header, three lines with the ticks prefix, and the footer on a line of its own.
  ASSERT_EQ(lines.size(), 5u);
  EXPECT_EQ(lines[1].substr(0, 8), "Ticks = ");
  EXPECT_EQ(lines[1].substr(lines[1].size() - 9), "      one");
  EXPECT_EQ(lines[2].substr(lines[2].size() - 9), "      two");
  EXPECT_EQ(lines[3].substr(lines[3].size() - 12), "      three\r");
  EXPECT_EQ(lines[4].substr(0, 17), "Log file closed: ");
}

}  // namespace
}  // namespace kelcore::console::testing
