#include <kelcore/utility/HashValue.h>

#include <gtest/gtest.h>

#include <cstring>
#include <sstream>
#include <string>
#include <vector>

namespace {

using kelcore::UTF16String;
using kelcore::utility::HashValue;
using kelcore::utility::MixHash;

// Expected words computed once with an independent straightforward Python
// re-implementation of Bob Jenkins' lookup2 followed by the second mix over
// (c, word 1, word 2). For reference, plain lookup2 of "" with seed 0 gives 0xBD49D10D.
struct HashVector {
  std::string input;
  HashValue expected;
};

std::string Bytes0To34() {
  std::string bytes;
  for (int i = 0; i < 35; ++i) bytes.push_back(static_cast<char>(i));
  return bytes;
}

const HashVector kVectors[] = {
    {"", {{0xC9406768, 0x5E36C31C, 0x21300AF3}}},
    {"a", {{0x1A19EECF, 0x33F84BBA, 0xA0C6C2E2}}},
    {"abc", {{0x71EC6358, 0x17F8B848, 0xD1BB343C}}},
    {"hello world!", {{0xDD0A03A8, 0x77D8757A, 0x446470B3}}},   // one whole block
    {"hello world!!", {{0x954F4E01, 0x7255DB2E, 0x882F6DFD}}},  // block and 1 byte
    {"Four score and seven years ago", {{0xFCB64B0B, 0xF78271F3, 0x4CB3B251}}},
    {Bytes0To34(), {{0x523F1E5A, 0xA728BA63, 0x3E5E0EA6}}},  // 2 blocks, 11 bytes
};

TEST(HashValue, Lookup2VectorsOnAlignedAndUnalignedData) {
  for (const HashVector& v : kVectors) {
    // The same bytes at every offset within a word, so both block paths run.
    alignas(16) unsigned char buffer[64];
    for (std::size_t offset = 0; offset < 4; ++offset) {
      std::memcpy(buffer + offset, v.input.data(), v.input.size());
      HashValue value;
      MixHash::MixInBytes(value, buffer + offset, v.input.size());
      EXPECT_EQ(value, v.expected) << "input size " << v.input.size() << " offset " << offset;
    }
    HashValue viaString;
    MixHash::MixIn(viaString, v.input);
    EXPECT_EQ(viaString, v.expected);
  }
}

TEST(HashValue, SeedsAndSequences) {
  HashValue seeded{{1, 2, 3}};
  MixHash::MixIn(seeded, std::string("abc"));
  EXPECT_EQ(seeded, (HashValue{{0x5F8E5504, 0xE7200B6E, 0x455BE004}}));

  HashValue pieces;
  MixHash::MixIn(pieces, std::string("ab"));
  MixHash::MixIn(pieces, std::string("c"));
  EXPECT_EQ(pieces, (HashValue{{0x7B5A1E69, 0x2F5C6CCC, 0xACE6E7B6}}));

  HashValue text;
  MixHash::MixIn(text, UTF16String(u"Ab"));  // bytes 41 00 62 00
  EXPECT_EQ(text, (HashValue{{0x9B18B1A0, 0xC7500FF6, 0x0E1FA6D3}}));
  HashValue number;
  MixHash::MixIn(number, std::uint32_t{0x01020304});  // bytes 04 03 02 01
  EXPECT_EQ(number, (HashValue{{0x9CBE560E, 0xC66A5E30, 0x1F1ADC02}}));
}

TEST(HashValue, StreamsRoundTripAndRejectBadText) {
  const HashValue value{{0xC9406768, 0, 4294967295u}};
  std::stringstream stream;
  stream << value;
  EXPECT_EQ(stream.str(), "3376441192 0 4294967295");
  HashValue read;
  EXPECT_TRUE(stream >> read);
  EXPECT_EQ(read, value);

  for (const char* bad : {"1 2", "1 2 4294967296", "1 -2 3", "x y z"}) {
    std::istringstream in(bad);
    HashValue untouched{{7, 8, 9}};
    EXPECT_FALSE(in >> untouched) << bad;
    EXPECT_EQ(untouched, (HashValue{{7, 8, 9}})) << bad;
  }
}

}  // namespace
