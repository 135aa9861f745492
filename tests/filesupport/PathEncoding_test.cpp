#include <gtest/gtest.h>

#include <random>
#include <string>

#include "filesupport/PathEncoding.h"

namespace {

using kelcore::UTF16String;
using kelcore::filesupport::detail::DecodePath;
using kelcore::filesupport::detail::EncodePath;

struct DecodeCase {
  std::string bytes;
  UTF16String units;
};

// Well-formed UTF-8 decodes as usual; every byte of an ill-formed sequence becomes
// U+DC00 + byte. Ill-formed forms from the Unicode standard's table of maximal subparts.
const DecodeCase kDecodeCases[] = {
    {"a.txt", u"a.txt"},
    {"\xC3\xA9t\xC3\xA9", u"\u00E9t\u00E9"},
    {"\xF0\x9F\x8E\xB5", u"\U0001F3B5"},
    {"a\xFF\xFE.txt", u"a\xDCFF\xDCFE.txt"},
    {"\xC0\xAF", u"\xDCC0\xDCAF"},                      // overlong "/"
    {"\xE0\x80\xAF", u"\xDCE0\xDC80\xDCAF"},            // overlong, three bytes
    {"\xED\xA0\x80", u"\xDCED\xDCA0\xDC80"},            // an encoded surrogate
    {"\xF4\x90\x80\x80", u"\xDCF4\xDC90\xDC80\xDC80"},  // above U+10FFFF
    {"\xE2\x82"
     "a",
     u"\xDCE2\xDC82"
     "a"},                          // cut short by an ASCII byte
    {"\xE2\x82", u"\xDCE2\xDC82"},  // cut short by the end
    {"\x80", u"\xDC80"},            // a stray continuation byte
};

TEST(PathEncoding, DecodesAndEncodesBackTheSameBytes) {
  for (const DecodeCase& c : kDecodeCases) {
    EXPECT_EQ(DecodePath(c.bytes), c.units) << "bytes " << testing::PrintToString(c.bytes);
    EXPECT_EQ(EncodePath(c.units), c.bytes) << "bytes " << testing::PrintToString(c.bytes);
  }
}

TEST(PathEncoding, RandomByteStringsRoundTrip) {
  std::mt19937 random(20261122);
  std::uniform_int_distribution<int> byte(1, 255);
  std::uniform_int_distribution<int> length(0, 24);
  for (int round = 0; round < 5000; ++round) {
    std::string bytes(static_cast<std::size_t>(length(random)), '\0');
    for (char& b : bytes) b = static_cast<char>(byte(random));
    ASSERT_EQ(EncodePath(DecodePath(bytes)), bytes) << testing::PrintToString(bytes);
  }
}

TEST(PathEncoding, LoneSurrogatesOutsideTheEscapeRangeUseTheirOwnValue) {
  EXPECT_EQ(EncodePath(u"\xD800"), "\xED\xA0\x80");
  EXPECT_EQ(EncodePath(u"\xDC7F"), "\xED\xB1\xBF");
  EXPECT_EQ(EncodePath(u"x\xDBFF"), "x\xED\xAF\xBF");  // a high surrogate at the end
  EXPECT_EQ(EncodePath(u"\xD83C\xDFB5"), "\xF0\x9F\x8E\xB5");
}

}  // namespace
