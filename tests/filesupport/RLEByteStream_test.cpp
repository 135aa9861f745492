#include <kelcore/filesupport/RLEByteStream.h>

#include <kelcore/filesupport/BufferByteStream.h>
#include <kelcore/filesupport/ByteStreamExceptions.h>
#include <kelcore/filesupport/StringByteStream.h>

#include <gtest/gtest.h>

#include <random>
#include <string>
#include <vector>

namespace kelcore::filesupport {
namespace {

using Bytes = std::vector<unsigned char>;

Bytes EncodeBytewise(const Bytes& plain) {
  std::string encoded;
  OStringByteStream out(encoded);
  ORLEByteStream rle(out);
  for (const unsigned char b : plain) rle.Put(b);
  rle.Flush();
  return Bytes(encoded.begin(), encoded.end());
}

// Encodes through WriteBlock in chunks of the given sizes (cycled).
Bytes EncodeBlocks(const Bytes& plain, const std::vector<std::size_t>& chunks) {
  std::string encoded;
  OStringByteStream out(encoded);
  ORLEByteStream rle(out);
  std::size_t at = 0;
  for (std::size_t i = 0; at < plain.size(); ++i) {
    const std::size_t n = std::min(chunks[i % chunks.size()], plain.size() - at);
    rle.WriteBlock(plain.data() + at, static_cast<unsigned long>(n));
    at += n;
  }
  rle.Flush();
  return Bytes(encoded.begin(), encoded.end());
}

Bytes Decode(const Bytes& encoded, std::size_t size, bool blockwise) {
  IBufferByteStream in(encoded.data(), encoded.size());
  IRLEByteStream rle(in);
  Bytes plain(size);
  if (blockwise) {
    rle.ReadBlock(plain.data(), static_cast<unsigned long>(size));
  } else {
    for (auto& b : plain) b = rle.Get();
  }
  EXPECT_THROW(rle.Get(), eof_error);
  return plain;
}

Bytes Repeat(unsigned char value, std::size_t n) {
  return Bytes(n, value);
}

Bytes Counting(std::size_t n) {
  Bytes bytes(n);
  for (std::size_t i = 0; i < n; ++i) bytes[i] = static_cast<unsigned char>(i);
  return bytes;
}

// The packet choices, byte for byte (PackBits layout; the writer's fixed decisions).
TEST(RLEByteStream, PacketVectors) {
  Bytes run200 = {0x81, 0x55, 0xB9, 0x55};
  Bytes literal130 = Counting(130);
  // 130 counting bytes: a literal packet of 128, then one of the last two.
  Bytes expected130 = Counting(130);
  expected130.insert(expected130.begin() + 128, 0x01);
  expected130.insert(expected130.begin(), 0x7F);
  const std::pair<Bytes, Bytes> cases[] = {
      {{0x41, 0x41, 0x41, 0x41}, {0xFD, 0x41}},
      {{0x41, 0x42, 0x43}, {0x02, 0x41, 0x42, 0x43}},
      {{0x07}, {0x00, 0x07}},
      {{0x41, 0x42, 0x42, 0x42}, {0x00, 0x41, 0xFE, 0x42}},
      {{0x41, 0x42, 0x42, 0x43}, {0x03, 0x41, 0x42, 0x42, 0x43}},  // a pair stays literal
      {{0x41, 0x41, 0x42}, {0xFF, 0x41, 0x00, 0x42}},
      {{0x41, 0x42, 0x42, 0x42, 0x42, 0x43}, {0x00, 0x41, 0xFD, 0x42, 0x00, 0x43}},
      {Repeat(0x55, 200), run200},
      {literal130, expected130},
      {{}, {}},
  };
  for (const auto& [plain, expected] : cases) {
    EXPECT_EQ(EncodeBytewise(plain), expected);
    EXPECT_EQ(EncodeBlocks(plain, {1000}), expected);
    EXPECT_EQ(Decode(expected, plain.size(), false), plain);
  }
}

TEST(RLEByteStream, ReaderSkipsNoOperationControls) {
  const Bytes encoded = {0x80, 0xFD, 0x41, 0x80, 0x80, 0x01, 0x42, 0x43, 0x80};
  EXPECT_EQ(Decode(encoded, 6, false), (Bytes{0x41, 0x41, 0x41, 0x41, 0x42, 0x43}));
  EXPECT_EQ(Decode(encoded, 6, true), (Bytes{0x41, 0x41, 0x41, 0x41, 0x42, 0x43}));
}

// Data with runs of every length mixed with literals, pairs and triples; the block path
// must choose exactly the packets of the byte path, however the data is cut.
TEST(RLEByteStream, BlockWritesMatchBytewiseAndRoundTrip) {
  std::mt19937 random(1234);
  for (int round = 0; round < 40; ++round) {
    Bytes plain;
    while (plain.size() < 3000) {
      const auto value = static_cast<unsigned char>(random() % (round % 2 == 0 ? 4 : 256));
      plain.insert(plain.end(), random() % 3 == 0 ? random() % 300 : 1 + random() % 3, value);
    }
    const Bytes encoded = EncodeBytewise(plain);
    EXPECT_EQ(EncodeBlocks(plain, {1, 7, 128, 3, 1000}), encoded);
    EXPECT_EQ(EncodeBlocks(plain, {static_cast<std::size_t>(1 + random() % 200)}), encoded);
    EXPECT_EQ(Decode(encoded, plain.size(), false), plain);
    EXPECT_EQ(Decode(encoded, plain.size(), true), plain);
    // The writer never emits the no-operation control.
    for (std::size_t i = 0; i < encoded.size(); i += encoded[i] < 0x80 ? encoded[i] + 2u : 2u) {
      EXPECT_NE(encoded[i], 0x80);
    }
  }
}

TEST(RLEByteStream, DestructionDoesNotFlushAndPositioningIsRefused) {
  std::string encoded;
  OStringByteStream out(encoded);
  {
    ORLEByteStream rle(out);
    rle.Put(1);
    EXPECT_THROW(rle.CurPos(0), byte_stream_exception);
    EXPECT_THROW(static_cast<void>(rle.CurPos()), byte_stream_exception);
  }
  EXPECT_TRUE(encoded.empty());
  IStringByteStream in(encoded);
  IRLEByteStream reader(in);
  EXPECT_EQ(reader.Length(), 0u);
  EXPECT_THROW(reader.CurPos(0), byte_stream_exception);
  EXPECT_THROW(static_cast<void>(reader.CurPos()), byte_stream_exception);
}

// A target that fails (a full buffer) part way through packets: the writer passes the
// error on and stays within its own memory however it is used afterwards.
TEST(RLEByteStream, WriterSurvivesAFailingTarget) {
  std::mt19937 random(5);
  unsigned char buffer[8];
  OBufferByteStream out(buffer, sizeof buffer);
  ORLEByteStream rle(out);
  int failures = 0;
  for (int i = 0; i < 2000; ++i) {
    out.CurPos(0);  // room again for short packets
    Bytes chunk(random() % 200, static_cast<unsigned char>(random() % 2));
    for (auto& b : chunk) b = random() % 3 == 0 ? static_cast<unsigned char>(random()) : b;
    try {
      if (i % 2 == 0) {
        rle.WriteBlock(chunk.data(), static_cast<unsigned long>(chunk.size()));
      } else {
        for (const unsigned char b : chunk) rle.Put(b);
      }
      rle.Flush();
    } catch (const eof_error&) {
      ++failures;
    }
  }
  EXPECT_GT(failures, 0);
}

// Random bytes as encoded input: every read either yields bytes or raises eof_error.
TEST(RLEByteStream, ReaderSurvivesRandomInput) {
  std::mt19937 random(99);
  for (int round = 0; round < 500; ++round) {
    Bytes encoded(random() % 100);
    for (auto& b : encoded) b = static_cast<unsigned char>(random());
    IBufferByteStream in(encoded.data(), encoded.size());
    IRLEByteStream rle(in);
    Bytes sink(300);
    try {
      for (;;) {
        if (round % 2 == 0) {
          rle.Get();
        } else {
          rle.ReadBlock(sink.data(), 1 + random() % 300);
        }
      }
    } catch (const eof_error&) {
    }
  }
}

}  // namespace
}  // namespace kelcore::filesupport
