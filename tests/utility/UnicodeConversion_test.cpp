#include <kelcore/utility/UnicodeConversion.h>

#include <gtest/gtest.h>

#include <initializer_list>
#include <random>
#include <vector>

namespace kelcore::utility {
namespace {

UTF16String U16(std::initializer_list<unsigned> units) {
  UTF16String s;
  for (unsigned u : units) s.push_back(static_cast<UTF16Char>(u));
  return s;
}

UTF8String U8(std::initializer_list<unsigned> bytes) {
  UTF8String s;
  for (unsigned b : bytes) s.push_back(static_cast<unsigned char>(b));
  return s;
}

struct Utf16To8Case {
  UTF16String units;
  UTF8String bytes;
};

// Standard encodings at the length boundaries, pairs, lone and misordered surrogates,
// and the NUL rules (a short input keeps its length, a longer one ends at the NUL).
TEST(UTF16to8, Vectors) {
  const std::vector<Utf16To8Case> cases = {
      {U16({}), U8({})},
      {U16({0x41, 0x7F}), U8({0x41, 0x7F})},
      {U16({0x80, 0x7FF}), U8({0xC2, 0x80, 0xDF, 0xBF})},
      {U16({0x800, 0xFFFF}), U8({0xE0, 0xA0, 0x80, 0xEF, 0xBF, 0xBF})},
      {U16({0xD83D, 0xDE00}), U8({0xF0, 0x9F, 0x98, 0x80})},
      {U16({0xDBFF, 0xDFFF}), U8({0xF4, 0x8F, 0xBF, 0xBF})},
      {U16({0x41, 0xD800, 0x42}), U8({0x41, 0xED, 0xA0, 0x80, 0x42})},
      {U16({0xDC00}), U8({0xED, 0xB0, 0x80})},
      {U16({0xDE00, 0xD83D}), U8({0xED, 0xB8, 0x80, 0xED, 0xA0, 0xBD})},
      {U16({0xD800, 0xD800, 0xDC00}), U8({0xED, 0xA0, 0x80, 0xF0, 0x90, 0x80, 0x80})},
      {U16({0x61, 0x62, 0, 0x63, 0x64}), U8({0x61, 0x62})},
      {U16({0x61, 0, 0x62}), U8({0x61, 0, 0})},
      {U16({0}), U8({0})},
      {U16({0xE9, 0}), U8({0xC3, 0xA9, 0})},
      {U16({0, 0x41, 0x42, 0x43}), U8({})},
      {U16({0x61, 0x62, 0x63, 0}), U8({0x61, 0x62, 0x63})},
  };
  for (const auto& c : cases) {
    EXPECT_EQ(UTF16to8(c.units), c.bytes) << "units: " << c.units.size();
  }
  // The pointer form ends at the NUL, so the short-input rule never pads it.
  EXPECT_EQ(UTF16to8(U16({0x61, 0, 0x62}).c_str()), U8({0x61}));
  EXPECT_EQ(UTF16to8(U16({0x41, 0xD800, 0x42}).c_str()), U8({0x41, 0xED, 0xA0, 0x80, 0x42}));
  EXPECT_EQ(UTF16to8(static_cast<const UTF16Char*>(nullptr)), U8({}));
}

struct Utf8To16Case {
  UTF8String bytes;
  UTF16String units;
  UnicodeErrorCode code;
};

// Legal forms, surrogate encodings (accepted), and every kind of stop: truncation
// (checked before legality), overlong forms, out-of-range leads, bad continuations.
TEST(UTF8to16, Vectors) {
  const std::vector<Utf8To16Case> cases = {
      {U8({}), U16({}), kUnicodeNoError},
      {U8({0x61, 0, 0x62}), U16({0x61, 0, 0x62}), kUnicodeNoError},
      {U8({0xC3, 0xA9, 0xE4, 0xB8, 0xAD}), U16({0xE9, 0x4E2D}), kUnicodeNoError},
      {U8({0xE0, 0xA0, 0x80, 0xEF, 0xBF, 0xBF}), U16({0x800, 0xFFFF}), kUnicodeNoError},
      {U8({0x41, 0xED, 0xA0, 0x80, 0x42}), U16({0x41, 0xD800, 0x42}), kUnicodeNoError},
      {U8({0xED, 0xBF, 0xBF}), U16({0xDFFF}), kUnicodeNoError},
      {U8({0xF0, 0x90, 0x80, 0x80}), U16({0xD800, 0xDC00}), kUnicodeNoError},
      {U8({0xF4, 0x8F, 0xBF, 0xBF}), U16({0xDBFF, 0xDFFF}), kUnicodeNoError},
      {U8({0x61, 0xC3}), U16({0x61}), kUnicodeSourceExhausted},
      {U8({0xE4, 0xB8}), U16({}), kUnicodeSourceExhausted},
      {U8({0xC0}), U16({}), kUnicodeSourceExhausted},
      {U8({0xF8, 0x88, 0x80, 0x80}), U16({}), kUnicodeSourceExhausted},
      {U8({0x61, 0x80, 0x62}), U16({0x61}), kUnicodeSourceIllegal},
      {U8({0xC0, 0x80}), U16({}), kUnicodeSourceIllegal},
      {U8({0xC1, 0xBF}), U16({}), kUnicodeSourceIllegal},
      {U8({0xE0, 0x9F, 0xBF}), U16({}), kUnicodeSourceIllegal},
      {U8({0xF0, 0x8F, 0xBF, 0xBF}), U16({}), kUnicodeSourceIllegal},
      {U8({0xF4, 0x90, 0x80, 0x80}), U16({}), kUnicodeSourceIllegal},
      {U8({0xF4, 0x41, 0x80, 0x80}), U16({}), kUnicodeSourceIllegal},
      {U8({0xF5, 0x80, 0x80, 0x80}), U16({}), kUnicodeSourceIllegal},
      {U8({0xF8, 0x88, 0x80, 0x80, 0x80}), U16({}), kUnicodeSourceIllegal},
      {U8({0x7A, 0xC3, 0x41}), U16({0x7A}), kUnicodeSourceIllegal},
      {U8({0xE4, 0x41, 0xAD}), U16({}), kUnicodeSourceIllegal},
      {U8({0xE4, 0xB8, 0x41}), U16({}), kUnicodeSourceIllegal},
      {U8({0xE9, 0xF0, 0x9F, 0x98, 0x41}), U16({}), kUnicodeSourceIllegal},
      {U8({0xF0, 0x9F, 0x98, 0x80, 0xF0, 0x9F, 0x98, 0x41}), U16({0xD83D, 0xDE00}),
       kUnicodeSourceIllegal},
  };
  for (const auto& c : cases) {
    UnicodeErrorCode code = kUnicodeTargetExhausted;
    unsigned int length = 12345;
    EXPECT_EQ(UTF8to16(c.bytes, &code, &length), c.units) << "bytes: " << c.bytes.size();
    EXPECT_EQ(code, c.code) << "bytes: " << c.bytes.size();
    EXPECT_EQ(length, c.units.size());
  }
  EXPECT_EQ(UTF8to16(U8({0xC3, 0xA9})), U16({0xE9}));  // both out-pointers may be null
}

// Any UTF-16 text without NUL units, lone surrogates included, survives a round trip.
TEST(UTF16to8, RoundTripOfRandomText) {
  std::mt19937 rng(20240611);
  // Weighted towards ASCII runs so that the block paths and their exits are exercised.
  const unsigned ranges[][2] = {{1, 0x7F},       {1, 0x7F},        {0x80, 0x7FF},
                                {0x800, 0xD7FF}, {0xD800, 0xDBFF}, {0xDC00, 0xDFFF},
                                {0xE000, 0xFFFF}};
  for (int round = 0; round < 400; ++round) {
    UTF16String text(rng() % 300, u'a');
    const unsigned rangeCount = 2 + rng() % 6;
    for (auto& unit : text) {
      const auto& range = ranges[rng() % rangeCount];
      unit = static_cast<UTF16Char>(range[0] + rng() % (range[1] - range[0] + 1));
    }
    UnicodeErrorCode code = kUnicodeSourceIllegal;
    ASSERT_EQ(UTF8to16(UTF16to8(text), &code), text) << "round " << round;
    ASSERT_EQ(code, kUnicodeNoError);
    ASSERT_EQ(UTF16to8(text.c_str()), UTF16to8(text));
  }
}

// One multi-unit character at every position of ASCII text of every length around the
// 16-unit blocks, in both directions; also a stop at every position.
TEST(UTF16to8, EveryPositionAcrossBlocks) {
  const Utf16To8Case specials[] = {
      {U16({0xE9}), U8({0xC3, 0xA9})},
      {U16({0x4E2D}), U8({0xE4, 0xB8, 0xAD})},
      {U16({0xD83D, 0xDE00}), U8({0xF0, 0x9F, 0x98, 0x80})},
      {U16({0xDC00}), U8({0xED, 0xB0, 0x80})},
  };
  for (std::size_t length = 0; length <= 70; ++length) {
    for (std::size_t at = 0; at <= length; ++at) {
      for (const auto& special : specials) {
        const UTF16String units =
            UTF16String(at, u'x') + special.units + UTF16String(length - at, u'y');
        const UTF8String bytes = UTF8String(at, 'x') + special.bytes + UTF8String(length - at, 'y');
        ASSERT_EQ(UTF16to8(units), bytes) << length << " at " << at;
        ASSERT_EQ(UTF8to16(bytes), units) << length << " at " << at;
      }
      UTF8String broken(length + 1, 'z');
      broken[at] = 0x80;
      UnicodeErrorCode code = kUnicodeNoError;
      ASSERT_EQ(UTF8to16(broken, &code), UTF16String(at, u'z'));
      ASSERT_EQ(code, kUnicodeSourceIllegal);
    }
  }
}

// The UTF-8 form of one unit taken alone (lone surrogates included).
UTF8String EncodeUnit(unsigned u) {
  if (u < 0x80) return U8({u});
  if (u < 0x800) return U8({0xC0 | (u >> 6), 0x80 | (u & 0x3F)});
  return U8({0xE0 | (u >> 12), 0x80 | ((u >> 6) & 0x3F), 0x80 | (u & 0x3F)});
}

// Runs of two-byte, three-byte (E0 forms and surrogates included) and mixed characters
// of every length up to 40, at every offset within a block, in both directions.
TEST(UTF16to8, RunsOfMultiByteCharacters) {
  using Generator = unsigned (*)(unsigned);
  const Generator generators[] = {
      [](unsigned i) { return 0x80 + (i * 37) % 0x780; },
      [](unsigned i) { return 0x800 + (i * 977) % 0xD000; },  // 0800-D7FF, E0 leads too
      [](unsigned i) { return 0xE000 + (i * 131) % 0x2000; },
      [](unsigned i) { return 0xD800 + (i * 101) % 0x400; },  // lone high surrogates
      [](unsigned i) { return 0xDC00 + (i * 101) % 0x400; },  // lone low surrogates
      [](unsigned i) { return i % 3 == 0 ? 0x400 + i : 0x4E00 + i; },
  };
  for (const Generator generator : generators) {
    for (unsigned run = 1; run <= 40; ++run) {
      for (unsigned offset = 0; offset <= 17; ++offset) {
        UTF16String units(offset, u'p');
        UTF8String bytes(offset, 'p');
        for (unsigned i = 0; i < run; ++i) {
          units.push_back(static_cast<UTF16Char>(generator(i + offset)));
          bytes += EncodeUnit(units.back());
        }
        units += u'!';
        bytes += '!';
        ASSERT_EQ(UTF16to8(units), bytes) << "run " << run << " offset " << offset;
        ASSERT_EQ(UTF8to16(bytes), units) << "run " << run << " offset " << offset;
      }
    }
  }
}

// A broken sequence anywhere inside a run of two- or three-byte sequences stops the
// conversion right before it.
TEST(UTF8to16, StopsInsideRuns) {
  const UTF8String brokenForms[] = {U8({0xE0, 0x80, 0x80}), U8({0xE4, 0xB8, 0x41}),
                                    U8({0xC1, 0xBF}), U8({0xC3, 0x41}), U8({0x80})};
  for (const UTF8String& broken : brokenForms) {
    for (const unsigned unit : {0xE9u, 0x4E2Du}) {
      for (unsigned at = 0; at < 40; ++at) {
        UTF8String bytes;
        for (unsigned i = 0; i < at; ++i) bytes += EncodeUnit(unit);
        bytes += broken;
        for (unsigned i = 0; i < 40; ++i) bytes += EncodeUnit(unit);
        UnicodeErrorCode code = kUnicodeNoError;
        ASSERT_EQ(UTF8to16(bytes, &code), UTF16String(at, static_cast<UTF16Char>(unit)));
        ASSERT_EQ(code, kUnicodeSourceIllegal) << "at " << at;
      }
    }
  }
}

TEST(AsciiToUTF16, WidensExactlyCountBytesWithSignExtension) {
  EXPECT_EQ(AsciiToUTF16("A\0\x7F\x80\xE9", 5), U16({0x41, 0, 0x7F, 0xFF80, 0xFFE9}));
  EXPECT_EQ(AsciiToUTF16("abc", 0), U16({}));
  EXPECT_EQ(AsciiToUTF16(nullptr, 3), U16({}));
}

// h, é, l, l, o, plus leads F8-FF, truncated sequences and the null/zero arguments.
TEST(UTF8Counting, Vectors) {
  const auto* hello = AsciiToUTF8Impl("h\xC3\xA9llo");
  EXPECT_EQ(GetUTF8ByteCount(hello, 2), 3);
  EXPECT_EQ(GetUTF8ByteCount(hello, 3), 4);
  EXPECT_EQ(GetUTF8ByteCount(hello, 99), 6);
  EXPECT_EQ(GetUTF8ByteCount(hello, -1), 6);
  EXPECT_EQ(GetUTF8ByteCount(hello, 0), 0);
  EXPECT_EQ(GetUTF8ByteCount(nullptr, 2), 0);
  EXPECT_EQ(GetUTF8ByteCount(AsciiToUTF8Impl("a\xE4\xB8"), 2), 3);  // stops at the NUL
  EXPECT_EQ(GetUTF8CharacterCount(hello, 2), 2);
  EXPECT_EQ(GetUTF8CharacterCount(hello, 3), 2);
  EXPECT_EQ(GetUTF8CharacterCount(hello, 100), 5);
  EXPECT_EQ(GetUTF8CharacterCount(hello, 0), 0);
  EXPECT_EQ(GetUTF8CharacterCount(nullptr, 5), 0);
  EXPECT_EQ(GetUTF8CharacterCount(AsciiToUTF8Impl("a\xE4\xB8"), 9), 2);
  for (unsigned lead = 0xF8; lead <= 0xFF; ++lead) {
    const unsigned char text[] = {'a', static_cast<unsigned char>(lead), 0x80, 0x80, 0x80, 0x80, 0};
    EXPECT_EQ(GetUTF8ByteCount(text, 3), -1);
    EXPECT_EQ(GetUTF8CharacterCount(text, 6), -1);
  }
}

TEST(UTF16Helpers, LengthAndSurrogateClasses) {
  EXPECT_EQ(UTF16StrLen(nullptr), 0);
  EXPECT_EQ(UTF16StrLen(U16({0}).c_str()), 0);
  EXPECT_EQ(UTF16StrLen(U16({0x61, 0x62, 0xD800}).c_str()), 3);
  const std::pair<UTF16Char, UnicodeSurrogateT> classes[] = {
      {0xD7FF, kNotSurrogate}, {0xD800, kHighSurrogate}, {0xDBFF, kHighSurrogate},
      {0xDC00, kLowSurrogate}, {0xDFFF, kLowSurrogate},  {0xE000, kNotSurrogate}};
  for (const auto& [unit, expected] : classes)
    EXPECT_EQ(UnicodeSurrogate(unit), expected) << unsigned{unit};
}

}  // namespace
}  // namespace kelcore::utility
