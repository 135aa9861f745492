#include <kelcore/xml/ReservedCharacters.h>

#include <string>

#include <gtest/gtest.h>

#include "RecordingHandler.h"

namespace kelcore::xml::utils {
namespace {

using test_support::Bytes;
using test_support::Wide;

// Vectors: the five characters of the XML 1.0 predefined entities, plus text that must
// pass through untouched.
TEST(ReservedCharactersTest, EncodeVectors) {
  const struct {
    std::string in;
    std::string out;
  } cases[] = {
      {"", ""},
      {"plain", "plain"},
      {"a\"b&c'd<e>f", "a&quot;b&amp;c&apos;d&lt;e&gt;f"},
      {"&amp;", "&amp;amp;"},
      {"\xC3\xA9<\xF0\x9F\x98\x80", "\xC3\xA9&lt;\xF0\x9F\x98\x80"},
  };
  for (const auto& c : cases) {
    UTF8String out8;
    EncodeReservedCharacters(Bytes(c.in), out8);
    EXPECT_EQ(out8, Bytes(c.out)) << c.in;
    UTF16String out16;
    EncodeReservedCharacters(Wide(c.in), out16);
    EXPECT_EQ(out16, Wide(c.out)) << c.in;
  }
}

TEST(ReservedCharactersTest, EncodeAppendsInUTF8AndReplacesInUTF16) {
  UTF8String out8 = Bytes("x=");
  EncodeReservedCharacters(Bytes("<"), out8);
  EXPECT_EQ(out8, Bytes("x=&lt;"));
  EncodeReservedCharacters(out8, out8);  // the same string on both sides
  EXPECT_EQ(out8, Bytes("x=&lt;x=&amp;lt;"));

  UTF16String out16 = u"x=";
  EncodeReservedCharacters(UTF16String(u"<"), out16);
  EXPECT_EQ(out16, u"&lt;");
}

// The UTF-16 form goes through UTF-8: lone surrogates survive, a NUL unit ends the text
// (or, in an input under four units, turns the rest into NULs).
TEST(ReservedCharactersTest, EncodeUTF16ThroughUTF8) {
  UTF16String out;
  EncodeReservedCharacters(UTF16String{u'<', 0xD800, u'>'}, out);
  EXPECT_EQ(out, (UTF16String{u'&', u'l', u't', u';', 0xD800, u'&', u'g', u't', u';'}));
  EncodeReservedCharacters(UTF16String(u"ab\0<d", 5), out);
  EXPECT_EQ(out, u"ab");
  EncodeReservedCharacters(UTF16String(u"a\0<", 3), out);
  EXPECT_EQ(out, UTF16String(u"a\0\0", 3));
}

// Vectors: the five named references, and every way a reference can fall short.
TEST(ReservedCharactersTest, DecodeVectors) {
  const struct {
    std::string in;
    std::string out;
  } cases[] = {
      {"", ""},
      {"&lt;&gt;&amp;&apos;&quot;", "<>&'\""},
      {"x&lt;y", "x<y"},
      {"&amp", "&amp"},
      {"&ltx", "&ltx"},
      {"&lt&gt;", "&lt>"},
      {"&&lt;", "&<"},
      {"&l&gt;", "&l>"},
      {"&#65;&#x41;", "&#65;&#x41;"},
      {"a & b", "a & b"},
      {"&", "&"},
      {"&&", "&&"},
      {"&;", "&;"},
      {"&LT;", "&LT;"},
      {"&nbsp;", "&nbsp;"},
      {"&abcd;", "&abcd;"},
      {"&quo", "&quo"},
      {"&quotx", "&quotx"},
      {"&amp;amp;", "&amp;"},
      {"&apos&amp;", "&apos&"},
      {"\xC3\xA9&gt;\xF0\x9F\x98\x80", "\xC3\xA9>\xF0\x9F\x98\x80"},
  };
  for (const auto& c : cases) {
    UTF8String out8 = Bytes("old");
    DecodeReservedCharacters(Bytes(c.in), out8);
    EXPECT_EQ(out8, Bytes(c.out)) << c.in;
    UTF16String out16 = u"old";
    DecodeReservedCharacters(Wide(c.in), out16);
    EXPECT_EQ(out16, Wide(c.out)) << c.in;
  }
}

}  // namespace
}  // namespace kelcore::xml::utils
