#include <kelcore/filesupport/ByteStream.h>

#include <kelcore/filesupport/BufferByteStream.h>
#include <kelcore/filesupport/ByteStreamExceptions.h>
#include <kelcore/filesupport/DequeByteStream.h>

#include <gtest/gtest.h>

#include <stdexcept>
#include <vector>

namespace kelcore::filesupport {
namespace {

TEST(ByteStreamBase, ExtensionWordsGrowWithZeroes) {
  const unsigned char none = 0;
  IBufferByteStream stream(&none, 0);
  stream.iword(5) = 9;
  for (int i = 0; i < 5; ++i) EXPECT_EQ(stream.iword(i), 0);
  EXPECT_EQ(stream.iword(5), 9);
  EXPECT_EQ(stream.pword(3), nullptr);
  stream.pword(3) = &stream;
  EXPECT_EQ(stream.pword(3), &stream);
  EXPECT_THROW(stream.iword(-1), std::out_of_range);
  EXPECT_THROW(stream.pword(-1), std::out_of_range);
}

TEST(ByteStreamBase, XallocHandsOutConsecutiveIndices) {
  const int first = ByteStream_base::xalloc();
  EXPECT_GE(first, 0);
  EXPECT_EQ(ByteStream_base::xalloc(), first + 1);
  EXPECT_EQ(ByteStream_base::xalloc(), first + 2);
}

std::vector<std::pair<int, int>> gCalls;  // (event, index) in call order

void Record(ByteStream_base::event e, ByteStream_base& stream, int index) {
  gCalls.emplace_back(static_cast<int>(e), index);
  stream.iword(index);  // the stream is still usable during the callback
}

TEST(ByteStreamBase, DestructionCallsCallbacksInRegistrationOrder) {
  gCalls.clear();
  {
    std::deque<unsigned char> bytes;
    ODequeByteStream stream(bytes);
    stream.register_callback(Record, 4);
    stream.register_callback(Record, 1);
    stream.register_callback(Record, 4);
    EXPECT_TRUE(gCalls.empty());
  }
  EXPECT_EQ(gCalls, (std::vector<std::pair<int, int>>{{0, 4}, {0, 1}, {0, 4}}));
}

// The base defaults: ReadBlock/WriteBlock go through Get/Put, AtTheEnd compares with
// Length, and Length is unknown.
class CountingInput : public IByteStream {
 public:
  unsigned char Get() override {
    if (position_ == 3) throw eof_error();
    return static_cast<unsigned char>(10 + position_++);
  }
  void CurPos(unsigned long long pos) override { position_ = pos; }
  unsigned long long CurPos() const override { return position_; }

 private:
  unsigned long long position_ = 0;
};

TEST(ByteStreamBase, DefaultBlockReadAndEnd) {
  CountingInput in;
  EXPECT_EQ(in.Length(), 0u);
  EXPECT_TRUE(in.AtTheEnd());  // position 0 equals the unknown length 0
  unsigned char block[5] = {};
  in.ReadBlock(block, 0);
  EXPECT_EQ(in.CurPos(), 0u);
  EXPECT_THROW(in.ReadBlock(block, 5), eof_error);
  EXPECT_EQ(block[0], 10);
  EXPECT_EQ(block[2], 12);
  EXPECT_EQ(block[3], 0);
}

TEST(ByteStreamBaseDeathTest, FlushOnAStreamWithoutDestinationIsAProgramFault) {
  std::deque<unsigned char> bytes;
  ODequeByteStream stream(bytes);
  EXPECT_DEATH(stream.OSFlush(), "OSFlush");
  EXPECT_DEATH(stream.Truncate(0), "Truncate");
}

}  // namespace
}  // namespace kelcore::filesupport
