#include <kelcore/filesupport/CRCByteStream.h>
#include <kelcore/filesupport/CountingByteStream.h>

#include <kelcore/filesupport/StringByteStream.h>

#include <gtest/gtest.h>

#include <cstdint>
#include <random>
#include <string>
#include <vector>

namespace kelcore::filesupport {
namespace {

// Bit-at-a-time CRC-32 (IEEE 802.3), independent of the stream's tables.
std::uint32_t ReferenceCrc(const unsigned char* data, std::size_t size) {
  std::uint32_t reg = 0xFFFFFFFFu;
  for (std::size_t i = 0; i < size; ++i) {
    reg ^= data[i];
    for (int bit = 0; bit < 8; ++bit) reg = (reg >> 1) ^ (0xEDB88320u & (0u - (reg & 1u)));
  }
  return reg ^ 0xFFFFFFFFu;
}

TEST(CRCByteStream, CheckValueAndPassThrough) {
  std::string written;
  OStringByteStream target(written);
  OCRCByteStream crc(target);
  EXPECT_EQ(crc.Value(), 0u);
  for (const char c : std::string("1234")) crc.Put(static_cast<unsigned char>(c));
  crc.WriteBlock(reinterpret_cast<const unsigned char*>("56789"), 5);
  EXPECT_EQ(crc.Value(), 0xCBF43926u);
  EXPECT_EQ(crc.Value(), 0xCBF43926u);  // reading does not reset
  EXPECT_EQ(written, "123456789");
  EXPECT_EQ(crc.CurPos(), 9u);
}

// Blocks of every length around the fast path's thresholds, at odd alignments and split
// across several calls, agree with the bitwise reference.
TEST(CRCByteStream, BlocksAgreeWithTheReference) {
  std::mt19937 random(4);
  std::vector<unsigned char> data(70000);
  for (auto& b : data) b = static_cast<unsigned char>(random());
  for (std::size_t size = 0; size < 300; ++size) {
    const std::size_t offset = size % 13;
    std::string sink;
    OStringByteStream target(sink);
    OCRCByteStream crc(target);
    const std::size_t split = size / 3;
    crc.WriteBlock(data.data() + offset, static_cast<unsigned long>(split));
    if (split < size) crc.Put(data[offset + split]);
    if (split + 1 < size) {
      crc.WriteBlock(data.data() + offset + split + 1,
                     static_cast<unsigned long>(size - split - 1));
    }
    EXPECT_EQ(crc.Value(), ReferenceCrc(data.data() + offset, size)) << size;
  }
  std::string sink;
  OStringByteStream target(sink);
  OCRCByteStream crc(target);
  crc.WriteBlock(data.data() + 1, static_cast<unsigned long>(data.size() - 1));
  EXPECT_EQ(crc.Value(), ReferenceCrc(data.data() + 1, data.size() - 1));
}

TEST(CountingByteStream, CountIsTheHighestPositionWritten) {
  OCountingByteStream back;
  for (int i = 0; i < 10; ++i) back.Put(0);
  back.CurPos(4);
  back.Put(0);
  back.Put(0);
  EXPECT_EQ(back.Count(), 10u);
  EXPECT_EQ(back.CurPos(), 6u);

  OCountingByteStream forward;
  for (int i = 0; i < 10; ++i) forward.Put(0);
  forward.CurPos(12);
  EXPECT_EQ(forward.Count(), 10u);  // seeking alone writes nothing
  forward.WriteBlock(nullptr, 0);
  EXPECT_EQ(forward.Count(), 10u);
  forward.Put(0);
  EXPECT_EQ(forward.Count(), 13u);
}

}  // namespace
}  // namespace kelcore::filesupport
