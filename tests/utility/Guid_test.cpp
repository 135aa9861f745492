#include <kelcore/utility/Guid.h>
#include <kelcore/utility/StringStreams.h>

#include <gtest/gtest.h>

#include <algorithm>
#include <iomanip>
#include <sstream>
#include <stdexcept>
#include <string>
#include <unordered_set>
#include <vector>

namespace {

using kelcore::UTF16String;
using kelcore::UTF8CharTraits;
using kelcore::UTF8String;
using kelcore::utility::Guid;

const Guid kSample(0x12345678, 0x9abc, 0xdef0, 1, 2, 3, 4, 5, 6, 7, 8);
constexpr char kSampleText[] = "12345678-9abc-def0-0102-030405060708";

std::vector<unsigned char> BytesOf(const Guid& guid) {
  std::vector<unsigned char> bytes(16);
  Guid::GuidToBytes(guid, bytes.data());
  return bytes;
}

// Parsing vectors: the documented example, then the lenient rules (any separator, any
// non-digit reads as 0, only the first 36 characters count).
struct ParseVector {
  const char* text;
  Guid expected;
};

const ParseVector kParseVectors[] = {
    {"12345678-9abc-def0-0102-030405060708", kSample},
    {"12345678-9ABC-DEF0-0102-030405060708", kSample},
    {"12345678x9abc_def0 0102\t030405060708", kSample},
    {"12345678-9abc-def0-0102-030405060708-trailing text", kSample},
    {"", Guid()},
    {"00000000-0000-0000-0000-000000000000", Guid()},
    {"ffffffff-FFFF-ffff-FfFf-ffffffffffff",
     Guid(0xffffffff, 0xffff, 0xffff, 0xff, 0xff, 0xff, 0xff, 0xff, 0xff, 0xff, 0xff)},
    // 'g', 'G', 'z', '~' and '@' are no digits and read as 0.
    {"g2345678-9abc-def0-0102-03040506070z",
     Guid(0x02345678, 0x9abc, 0xdef0, 1, 2, 3, 4, 5, 6, 7, 0)},
    {"1G3@5678-9a~c-def0-0102-030405060708",
     Guid(0x10305678, 0x9a0c, 0xdef0, 1, 2, 3, 4, 5, 6, 7, 8)},
    // A byte above 0x7f (here the first of two UTF-8 bytes) reads as 0 too.
    {"\xc3\xa9"
     "345678-9abc-def0-0102-030405060708",
     Guid(0x00345678, 0x9abc, 0xdef0, 1, 2, 3, 4, 5, 6, 7, 8)},
};

TEST(GuidTest, ParsesTextFormVectors) {
  for (const ParseVector& vector : kParseVectors) {
    SCOPED_TRACE(vector.text);
    EXPECT_EQ(Guid(vector.text), vector.expected);
    EXPECT_EQ(Guid(std::string(vector.text)), vector.expected);
    Guid parsed(0xdead, 1, 1, 1, 1, 1, 1, 1, 1, 1, 1);
    EXPECT_TRUE(Guid::Parse(vector.text, parsed));
    EXPECT_EQ(parsed, vector.expected);
  }
}

TEST(GuidTest, Utf16TextIsParsedAsItsUtf8Bytes) {
  EXPECT_EQ(Guid(UTF16String(u"12345678-9abc-def0-0102-030405060708")), kSample);
  // "é" takes two UTF-8 positions, so the digits after it shift by one.
  EXPECT_EQ(Guid(UTF16String(u"\u00e9345678-9abc-def0-0102-030405060708")),
            Guid(0x00345678, 0x9abc, 0xdef0, 1, 2, 3, 4, 5, 6, 7, 8));
  EXPECT_EQ(Guid(UTF16String()), Guid());
}

TEST(GuidTest, NullTextIsZeroAndShortTextIsRefused) {
  EXPECT_EQ(Guid(static_cast<const char*>(nullptr)), Guid());
  const std::string shortText(kSampleText, 35);
  EXPECT_THROW(Guid{shortText}, std::invalid_argument);
  EXPECT_THROW(Guid("1"), std::invalid_argument);
  EXPECT_THROW(Guid(UTF16String(u"12345678")), std::invalid_argument);
  Guid unchanged = kSample;
  EXPECT_FALSE(Guid::Parse(shortText, unchanged));
  EXPECT_EQ(unchanged, kSample);
}

TEST(GuidTest, TextForms) {
  EXPECT_EQ(kSample.AsUTF8String(),
            UTF8String(reinterpret_cast<const unsigned char*>(kSampleText)));
  EXPECT_EQ(kSample.AsString(), UTF16String(u"12345678-9abc-def0-0102-030405060708"));
  EXPECT_EQ(Guid().AsString(), UTF16String(u"00000000-0000-0000-0000-000000000000"));
}

TEST(GuidTest, ByteFormIsBigEndianAndRoundTrips) {
  const std::vector<unsigned char> expected = {0x12, 0x34, 0x56, 0x78, 0x9a, 0xbc, 0xde, 0xf0,
                                               1,    2,    3,    4,    5,    6,    7,    8};
  EXPECT_EQ(BytesOf(kSample), expected);
  Guid back;
  Guid::GuidFromBytes(back, expected.data());
  EXPECT_EQ(back, kSample);
}

TEST(GuidTest, ComponentsRoundTrip) {
  std::uint32_t d1 = 0;
  std::uint16_t d2 = 0, d3 = 0;
  unsigned char b[8] = {};
  Guid::GuidToComponents(kSample, d1, d2, d3, b[0], b[1], b[2], b[3], b[4], b[5], b[6], b[7]);
  EXPECT_EQ(Guid(d1, d2, d3, b[0], b[1], b[2], b[3], b[4], b[5], b[6], b[7]), kSample);
  EXPECT_EQ(d1, 0x12345678u);
  EXPECT_EQ(b[7], 8);
}

TEST(GuidTest, OrderFollowsByteFormAndHashSeparates) {
  std::vector<Guid> guids = {kSample, Guid(),
                             Guid(0x12345678, 0x9abc, 0xdef0, 1, 2, 3, 4, 5, 6, 7, 9),
                             Guid(0x12345677, 0xffff, 0xffff, 9, 9, 9, 9, 9, 9, 9, 9),
                             Guid(0x12345678, 0x9abd, 0, 0, 0, 0, 0, 0, 0, 0, 0)};
  std::sort(guids.begin(), guids.end());
  for (std::size_t i = 1; i < guids.size(); ++i) {
    EXPECT_LT(BytesOf(guids[i - 1]), BytesOf(guids[i]));
  }
  std::unordered_set<Guid> set(guids.begin(), guids.end());
  set.insert(Guid(kSampleText));
  EXPECT_EQ(set.size(), guids.size());
}

TEST(GuidTest, CreateUniqueMakesDistinctVersion4Guids) {
  std::unordered_set<Guid> seen;
  for (int i = 0; i < 64; ++i) {
    const Guid guid = Guid::CreateUnique();
    const std::vector<unsigned char> bytes = BytesOf(guid);
    EXPECT_EQ(bytes[6] >> 4, 4);
    EXPECT_EQ(bytes[8] & 0xC0, 0x80);
    EXPECT_EQ(Guid(guid.AsString()), guid);
    EXPECT_TRUE(seen.insert(guid).second);
  }
}

TEST(GuidTest, NarrowStreams) {
  std::ostringstream out;
  out << std::setw(38) << std::left << std::setfill('*') << kSample << '|' << Guid();
  EXPECT_EQ(out.str(), std::string(kSampleText) + "**|00000000-0000-0000-0000-000000000000");

  std::istringstream in(std::string("  ") + kSampleText +
                        "\n\tffffffff-ffff-ffff-ffff-ffffffffffff");
  Guid first, second;
  in >> first >> second;
  EXPECT_EQ(first, kSample);
  EXPECT_EQ(second,
            Guid(0xffffffff, 0xffff, 0xffff, 0xff, 0xff, 0xff, 0xff, 0xff, 0xff, 0xff, 0xff));
  EXPECT_TRUE(in.eof());

  std::istringstream shortWord("12345678-9abc rest");
  Guid unchanged = kSample;
  shortWord >> unchanged;
  EXPECT_TRUE(shortWord.fail());
  EXPECT_EQ(unchanged, kSample);
}

TEST(GuidTest, Utf16AndUnsignedStandardStreams) {
  std::basic_stringbuf<char16_t> utf16Buffer;
  std::basic_ostream<char16_t> utf16Out(&utf16Buffer);
  utf16Out << kSample;
  EXPECT_EQ(utf16Buffer.str(), std::u16string(u"12345678-9abc-def0-0102-030405060708"));
  std::basic_stringbuf<char16_t> utf16Source(u" \u00e9345678-9abc-def0-0102-030405060708 x");
  std::basic_istream<char16_t> utf16In(&utf16Source);
  Guid parsed;
  utf16In >> parsed;
  EXPECT_FALSE(utf16In.fail());
  EXPECT_EQ(parsed, Guid(0x00345678, 0x9abc, 0xdef0, 1, 2, 3, 4, 5, 6, 7, 8));
  utf16In >> parsed;  // "x" is too short
  EXPECT_TRUE(utf16In.fail());

  std::basic_stringbuf<unsigned char, UTF8CharTraits> byteBuffer;
  std::basic_iostream<unsigned char, UTF8CharTraits> bytes(&byteBuffer);
  bytes << kSample;
  EXPECT_EQ(byteBuffer.str(), kSample.AsUTF8String());
  Guid back;
  bytes >> back;
  EXPECT_EQ(back, kSample);
  EXPECT_TRUE(bytes.eof());
}

TEST(GuidTest, LibraryStringStreams) {
  kelcore::utility::UTF16StringStream utf16;
  utf16 << u"id " << kSample;
  EXPECT_EQ(utf16.str(), UTF16String(u"id 12345678-9abc-def0-0102-030405060708"));
  UTF16String word;
  Guid parsed;
  utf16 >> word >> parsed;
  EXPECT_EQ(parsed, kSample);

  kelcore::utility::UTF8StringStream utf8;
  utf8 << kSample << " 1234";
  Guid first, second = kSample;
  utf8 >> first >> second;
  EXPECT_EQ(first, kSample);
  EXPECT_TRUE(utf8.fail());
  EXPECT_EQ(second, kSample);
}

}  // namespace
