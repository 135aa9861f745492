#include <kelcore/filesupport/BufferByteStream.h>
#include <kelcore/filesupport/ByteStreamExceptions.h>
#include <kelcore/filesupport/DequeByteStream.h>
#include <kelcore/filesupport/StdByteStream.h>
#include <kelcore/filesupport/StringByteStream.h>

#include <gtest/gtest.h>

#include <sstream>
#include <stdexcept>

namespace kelcore::filesupport {
namespace {

TEST(BufferByteStream, OutputIsBoundedAndCountsTheHighWaterMark) {
  unsigned char data[4] = {};
  OBufferByteStream out(data, sizeof data);
  for (unsigned char b = 1; b <= 4; ++b) out.Put(b);
  EXPECT_THROW(out.Put(5), eof_error);
  EXPECT_EQ(out.Count(), 4u);
  out.CurPos(10);
  EXPECT_EQ(out.Count(), 10u);
  EXPECT_EQ(out.Length(), 4u);
  out.CurPos(1);
  const unsigned char block[] = {7, 8, 9, 10};
  EXPECT_THROW(out.WriteBlock(block, 4), eof_error);  // three fit, as with four Puts
  EXPECT_EQ(data[3], 9);
  EXPECT_EQ(out.CurPos(), 4u);
  EXPECT_EQ(out.Count(), 10u);

  OBufferByteStream empty(nullptr, 0);
  EXPECT_THROW(empty.Put(1), eof_error);
}

TEST(BufferByteStream, InputRaisesEofPastTheEndWherEverThePositionWasSet) {
  const unsigned char data[] = {1, 2, 3};
  IBufferByteStream in(data, sizeof data);
  EXPECT_EQ(in.Get(), 1);
  unsigned char block[4] = {};
  EXPECT_THROW(in.ReadBlock(block, 4), eof_error);
  EXPECT_EQ(block[1], 3);
  EXPECT_TRUE(in.AtTheEnd());
  in.CurPos(1ULL << 62);
  EXPECT_THROW(in.Get(), eof_error);
  EXPECT_THROW(in.ReadBlock(block, 1), eof_error);
  in.CurPos(2);
  EXPECT_EQ(in.Get(), 3);
  IBufferByteStream empty(nullptr, 0);
  EXPECT_THROW(empty.Get(), eof_error);
}

TEST(DequeByteStream, OutputOnlyAppends) {
  std::deque<unsigned char> bytes;
  ODequeByteStream out(bytes);
  out.Put(1);
  out.CurPos(0);
  out.Put(2);
  const unsigned char block[] = {3, 4};
  out.WriteBlock(block, 2);
  EXPECT_EQ(bytes, (std::deque<unsigned char>{1, 2, 3, 4}));
  EXPECT_EQ(out.CurPos(), 4u);

  IDequeByteStream in(bytes);
  in.CurPos(3);
  EXPECT_EQ(in.Get(), 4);
  EXPECT_THROW(in.Get(), eof_error);
  bytes.push_back(5);  // a grown deque becomes readable
  EXPECT_EQ(in.Get(), 5);
  EXPECT_EQ(in.Length(), 5u);
}

TEST(StringByteStream, InputRaisesEofOnTheFourthReadOfThree) {
  std::string text = "abc";
  IStringByteStream in(text);
  EXPECT_EQ(in.Get(), 'a');
  EXPECT_EQ(in.Get(), 'b');
  EXPECT_EQ(in.Get(), 'c');
  EXPECT_THROW(in.Get(), eof_error);
  in.CurPos(1);
  unsigned char block[2];
  in.ReadBlock(block, 2);
  EXPECT_EQ(block[1], 'c');
  EXPECT_EQ(in.Length(), 3u);
}

TEST(StringByteStream, TruncatePadsWithZeroesOrCuts) {
  std::string text;
  OStringByteStream out(text);
  out.Truncate(5);
  EXPECT_EQ(text, std::string(5, '\0'));
  out.Put(0xFF);
  out.CurPos(0);  // ignored
  EXPECT_EQ(out.CurPos(), 6u);
  out.Truncate(2);
  EXPECT_EQ(text, std::string(2, '\0'));
  out.OSFlush();
  EXPECT_THROW(out.Truncate(~0ULL), std::length_error);
}

TEST(StdByteStream, ReadingPastTheEndReturnsFFAndRaisesNothing) {
  std::istringstream source("xyz");
  IStdByteStream in(source);
  EXPECT_EQ(in.Length(), 3u);
  EXPECT_EQ(in.CurPos(), 0u);
  in.CurPos(2);
  EXPECT_EQ(in.Get(), 'z');
  EXPECT_EQ(in.Get(), 0xFF);
  EXPECT_TRUE(source.fail());
}

TEST(StdByteStream, OutputSeeksAndOverwrites) {
  std::ostringstream target;
  OStdByteStream out(target);
  for (const char c : std::string("hello")) out.Put(static_cast<unsigned char>(c));
  out.CurPos(0);
  out.Put('J');
  EXPECT_EQ(out.CurPos(), 1u);
  EXPECT_EQ(target.str(), "Jello");
}

}  // namespace
}  // namespace kelcore::filesupport
