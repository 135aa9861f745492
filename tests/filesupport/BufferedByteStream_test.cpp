#include <kelcore/filesupport/BufferedByteStream.h>

#include <kelcore/filesupport/BufferByteStream.h>
#include <kelcore/filesupport/ByteStreamExceptions.h>
#include <kelcore/filesupport/ByteStreamOperators.h>
#include <kelcore/filesupport/DequeByteStream.h>

#include <gtest/gtest.h>

#include <numeric>
#include <random>
#include <stdexcept>
#include <string>
#include <vector>

namespace kelcore::filesupport {
namespace {

std::vector<unsigned char> Iota(std::size_t n) {
  std::vector<unsigned char> bytes(n);
  std::iota(bytes.begin(), bytes.end(), static_cast<unsigned char>(0));
  return bytes;
}

// A memory source that logs every positioned block read as "pos+count".
class LoggingSource : public IBufferByteStream {
 public:
  explicit LoggingSource(const std::vector<unsigned char>& bytes)
      : IBufferByteStream(bytes.data(), bytes.size()) {}
  void ReadBlock(unsigned char* dst, unsigned long count) override {
    log += std::to_string(CurPos()) + "+" + std::to_string(count) + " ";
    IBufferByteStream::ReadBlock(dst, count);
  }
  std::string log;
};

TEST(IBufferedByteStream, TenByteSourceWithBufferEightAlignmentFour) {
  const auto bytes = Iota(10);
  IBufferByteStream source(bytes.data(), bytes.size());
  IBufferedByteStream in(source, 8, 4);
  for (unsigned char expected = 0; expected < 10; ++expected) EXPECT_EQ(in.Get(), expected);
  EXPECT_THROW(in.Get(), eof_error);
  EXPECT_TRUE(in.AtTheEnd());
  in.CurPos(10);
  EXPECT_THROW(in.CurPos(11), eof_error);
  EXPECT_EQ(in.CurPos(), 10u);
  in.CurPos(3);
  EXPECT_EQ(in.Get(), 3);
}

// Windows start on the alignment, keep one unit before the position, and reuse what the
// old and new windows share. Source of 32 bytes, buffer 8, alignment 4.
TEST(IBufferedByteStream, RefillsAreAlignedAndReuseOverlappingBytes) {
  const auto bytes = Iota(32);
  LoggingSource source(bytes);
  IBufferedByteStream in(source, 8, 4);
  const struct {
    unsigned long long seek;
    const char* reads;
  } steps[] = {
      {0, "0+8 "},    // window [0, 8)
      {5, ""},        // already there
      {13, "8+8 "},   // [8, 16): start 12 moves back a unit; nothing shared with [0, 8)
      {6, "4+4 "},    // [4, 12): start 4 is not above the alignment; [8, 12) moved up
      {14, "12+4 "},  // [8, 16): [8, 12) moved down, the rest read
      {30, "24+8 "},  // [24, 32)
      {31, ""},
  };
  for (const auto& step : steps) {
    source.log.clear();
    in.CurPos(step.seek);
    EXPECT_EQ(in.Get(), bytes[step.seek]);
    EXPECT_EQ(source.log, step.reads) << "at " << step.seek;
  }
}

TEST(IBufferedByteStream, LargeBlocksBypassTheBuffer) {
  const auto bytes = Iota(64);
  LoggingSource source(bytes);
  IBufferedByteStream in(source, 8, 4);
  EXPECT_EQ(in.Get(), 0);
  unsigned char block[5] = {};
  source.log.clear();
  in.ReadBlock(block, 5);  // more than buffer size - alignment
  EXPECT_EQ(source.log, "1+5 ");
  EXPECT_EQ(block[4], 5);
  source.log.clear();
  in.CurPos(2);
  EXPECT_EQ(in.Get(), 2);  // the buffer still holds [0, 8)
  EXPECT_EQ(source.log, "");
  in.ReadBlock(block, 4);
  EXPECT_EQ(block[0], 3);
  EXPECT_EQ(in.CurPos(), 7u);
}

TEST(IBufferedByteStream, LengthIsTakenOnceAtConstruction) {
  std::deque<unsigned char> bytes = {1, 2};
  IDequeByteStream source(bytes);
  IBufferedByteStream in(source, 16, 4);
  bytes.push_back(3);
  EXPECT_EQ(in.Length(), 2u);
  EXPECT_EQ(in.Get(), 1);
  EXPECT_EQ(in.Get(), 2);
  EXPECT_THROW(in.Get(), eof_error);
  EXPECT_THROW(in.CurPos(3), eof_error);
}

TEST(BufferedByteStream, RefusesUnusableSizes) {
  const auto bytes = Iota(4);
  IBufferByteStream source(bytes.data(), bytes.size());
  EXPECT_THROW(IBufferedByteStream(source, 0, 1), std::invalid_argument);
  EXPECT_THROW(IBufferedByteStream(source, 8, 0), std::invalid_argument);
  EXPECT_THROW(IBufferedByteStream(source, 8, 9), std::invalid_argument);
  unsigned char data[4];
  OBufferByteStream target(data, sizeof data);
  EXPECT_THROW(OBufferedByteStream(target, 0, 1), std::invalid_argument);
}

TEST(OBufferedByteStream, SameBytesAsDirectWritesAndTailWrittenAtDestruction) {
  std::vector<unsigned char> direct(100), buffered(100);
  OBufferByteStream directOut(direct.data(), direct.size());
  OBufferByteStream target(buffered.data(), buffered.size());
  {
    OBufferedByteStream out(target, 16, 4);
    for (unsigned char b = 0; b < 100; ++b) {
      directOut.Put(b);
      out.Put(b);
    }
    EXPECT_EQ(target.Count(), 96u);  // six full buffers so far
    EXPECT_EQ(out.CurPos(), 100u);
  }
  EXPECT_EQ(target.Count(), 100u);
  EXPECT_EQ(buffered, direct);
}

TEST(OBufferedByteStream, DataReachesTheTargetOnlyWhenItMust) {
  std::vector<unsigned char> data(64);
  OBufferByteStream target(data.data(), data.size());
  OBufferedByteStream out(target, 8, 1);
  out << 0x01020304u;
  out.CurPos(0);  // inside the buffered range: no write
  out.Put(9);
  out.CurPos(4);  // the end of the range is inside too
  EXPECT_EQ(target.Count(), 0u);
  out.CurPos(20);  // outside: flushes
  EXPECT_EQ(std::vector<unsigned char>(data.begin(), data.begin() + 5),
            (std::vector<unsigned char>{9, 2, 3, 4, 0}));
  const std::vector<unsigned char> big(9, 7);
  out.Put(1);
  out.WriteBlock(big.data(), big.size());  // larger than the buffer: flush, then direct
  EXPECT_EQ(target.Count(), 30u);
  EXPECT_EQ(data[20], 1);
  EXPECT_EQ(data[29], 7);
}

TEST(OBufferedByteStream, TargetErrorsPassAndKeepTheBytesBuffered) {
  unsigned char data[4] = {};
  OBufferByteStream target(data, sizeof data);
  auto* out = new OBufferedByteStream(target, 8, 1);
  const unsigned char bytes[6] = {1, 2, 3, 4, 5, 6};
  out->WriteBlock(bytes, 6);
  EXPECT_THROW(out->Flush(), eof_error);
  EXPECT_THROW(out->Flush(), eof_error);  // still buffered, tried again
  EXPECT_THROW(delete out, eof_error);    // and once more at destruction
  EXPECT_EQ(data[3], 4);
}

// A subclass that overrides Put must see every byte, typed operators included.
TEST(OBufferedByteStream, SubclassOverridesSeeEveryCall) {
  struct CountingPuts : OBufferedByteStream {
    using OBufferedByteStream::OBufferedByteStream;
    void Put(unsigned char byte) override {
      ++puts;
      OBufferedByteStream::Put(byte);
    }
    int puts = 0;
  };
  std::vector<unsigned char> data(16);
  OBufferByteStream target(data.data(), data.size());
  CountingPuts out(target, 8, 1);
  out << 0x01020304u << 0x0506070809101112ull;
  EXPECT_EQ(out.puts, 12);
  out.Flush();
  EXPECT_EQ(data[11], 0x12);
}

std::vector<unsigned char> RandomBytes(std::mt19937& random, std::size_t n) {
  std::vector<unsigned char> bytes(n);
  for (auto& b : bytes) b = static_cast<unsigned char>(random());
  return bytes;
}

struct Geometry {
  unsigned long bufferSize, alignment;
};
constexpr Geometry kGeometries[] = {{1, 1}, {7, 3}, {8, 4}, {16, 1}, {64, 16}, {100, 100}};

// Random seeks, Gets, blocks and typed reads against the same reads on the memory source.
TEST(IBufferedByteStream, RandomReadsMatchTheSource) {
  std::mt19937 random(20240611);
  const auto bytes = RandomBytes(random, 1000);
  for (const auto [size, alignment] : kGeometries) {
    IBufferByteStream source(bytes.data(), bytes.size());
    IBufferedByteStream in(source, size, alignment);
    IBufferByteStream reference(bytes.data(), bytes.size());
    for (int op = 0; op < 3000; ++op) {
      const auto pos = reference.CurPos();
      switch (random() % 5) {
        case 0: {
          const auto target = random() % (bytes.size() + 1);
          in.CurPos(target);
          reference.CurPos(target);
          break;
        }
        case 1:
          if (pos < bytes.size()) {
            ASSERT_EQ(in.Get(), reference.Get());
          } else {
            EXPECT_THROW(in.Get(), eof_error);
          }
          break;
        case 2: {
          const unsigned long n = random() % 40;
          if (pos + n > bytes.size()) break;
          std::vector<unsigned char> got(n), expected(n);
          in.ReadBlock(got.data(), n);
          reference.ReadBlock(expected.data(), n);
          ASSERT_EQ(got, expected);
          break;
        }
        default: {
          if (pos + 8 > bytes.size()) break;
          unsigned int a = 0, b = 0;
          unsigned short c = 0, d = 0;
          in >> a >> c;
          reference >> b >> d;
          ASSERT_EQ(a, b);
          ASSERT_EQ(c, d);
        }
      }
      ASSERT_EQ(in.CurPos(), reference.CurPos()) << "buffer " << size << " op " << op;
    }
  }
}

// Random seeks, Puts, blocks, typed writes and flushes against the same writes made
// directly on a memory buffer.
TEST(OBufferedByteStream, RandomWritesMatchDirectWrites) {
  std::mt19937 random(7);
  constexpr std::size_t kCapacity = 600;
  for (const auto [size, alignment] : kGeometries) {
    std::vector<unsigned char> expected(kCapacity), got(kCapacity);
    OBufferByteStream reference(expected.data(), kCapacity);
    OBufferByteStream target(got.data(), kCapacity);
    {
      OBufferedByteStream out(target, size, alignment);
      for (int op = 0; op < 3000; ++op) {
        if (reference.CurPos() > kCapacity - 60) {  // keep clear of the end of the buffers
          out.CurPos(0);
          reference.CurPos(0);
        }
        switch (random() % 5) {
          case 0: {
            const auto pos = random() % (kCapacity - 60);
            out.CurPos(pos);
            reference.CurPos(pos);
            break;
          }
          case 1: {
            const auto byte = static_cast<unsigned char>(random());
            out.Put(byte);
            reference.Put(byte);
            break;
          }
          case 2: {
            const auto block = RandomBytes(random, random() % 40);
            out.WriteBlock(block.data(), static_cast<unsigned long>(block.size()));
            reference.WriteBlock(block.data(), static_cast<unsigned long>(block.size()));
            break;
          }
          case 3: {
            const auto value = static_cast<unsigned int>(random());
            const std::string text(random() % 5, 'x');
            out << value << text;
            reference << value << text;
            break;
          }
          default:
            if (random() % 4 == 0) out.Flush();
        }
        ASSERT_EQ(out.CurPos(), reference.CurPos()) << "buffer " << size << " op " << op;
      }
    }
    EXPECT_EQ(got, expected) << "buffer " << size;
  }
}

}  // namespace
}  // namespace kelcore::filesupport
